// Animation1: plays our transfer clip at its frame rate while a transfer runs. A missing or
// unplayable clip leaves it empty; the program goes on without it.
#pragma once

#include <QImage>
#include <QTimer>
#include <QWidget>
#include <string>
#include <vector>

namespace zx917::ui {

class ClipPlayer : public QWidget {
public:
    explicit ClipPlayer(QWidget* parent = nullptr);

    // False when the file is no clip we can play; the player is then empty.
    bool open(const std::string& path);
    void play();
    void stop();

    bool loaded() const { return !frames_.empty(); }
    bool playing() const { return timer_.isActive(); }
    int frame() const { return current_; }
    int frameCount() const { return static_cast<int>(frames_.size()); }
    int intervalMs() const { return timer_.interval(); }

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    std::vector<QImage> frames_;
    QTimer timer_;
    int current_ = 0;
};

}  // namespace zx917::ui
