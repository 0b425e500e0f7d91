#include "ui/wizard/clip_player.h"

#include <QPainter>

#include "ui/wizard/avi_clip.h"

namespace zx917::ui {

ClipPlayer::ClipPlayer(QWidget* parent) : QWidget(parent) {
    timer_.setTimerType(Qt::CoarseTimer);
    QObject::connect(&timer_, &QTimer::timeout, this, [this] {
        current_ = (current_ + 1) % frameCount();
        update();
    });
}

bool ClipPlayer::open(const std::string& path) {
    stop();
    frames_.clear();
    current_ = 0;
    const auto clip = ReadAviFile(path);
    if (clip) {
        for (const auto& f : clip->frames) {
            QImage image(reinterpret_cast<const uchar*>(f.data()), clip->width, clip->height,
                         clip->width * 4, QImage::Format_RGB32);
            frames_.push_back(image.copy());  // the image owns its pixels
        }
        timer_.setInterval(std::max(10, clip->microsecondsPerFrame / 1000));
    }
    update();
    return loaded();
}

void ClipPlayer::play() {
    if (!loaded() || playing()) return;
    timer_.start();
}

void ClipPlayer::stop() {
    timer_.stop();
    current_ = 0;
    update();
}

void ClipPlayer::paintEvent(QPaintEvent*) {
    if (frames_.empty()) return;
    const QImage& f = frames_[current_];
    QPainter p(this);
    p.drawImage((width() - f.width()) / 2, (height() - f.height()) / 2, f);
}

}  // namespace zx917::ui
