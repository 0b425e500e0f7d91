// A label that shows a file name or a path: a name too wide for the box is elided in the
// middle, so that its start and its extension stay readable, and the whole name is its tooltip.
#pragma once

#include <QLabel>
#include <QResizeEvent>

namespace zx917::ui {

class NameLabel : public QLabel {
public:
    using QLabel::QLabel;

    void setName(const QString& name) {
        name_ = name;
        setToolTip(name.trimmed().isEmpty() ? QString() : name);
        elide();
    }
    // The whole name; text() is what the box shows of it.
    const QString& name() const { return name_; }

protected:
    void resizeEvent(QResizeEvent* event) override {
        QLabel::resizeEvent(event);
        elide();
    }

private:
    void elide() {
        const int room = contentsRect().width() - 2 * margin();
        setText(fontMetrics().elidedText(name_, Qt::ElideMiddle, room));
    }

    QString name_;
};

}  // namespace zx917::ui
