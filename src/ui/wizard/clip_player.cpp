#include "ui/wizard/clip_player.h"

#include <QPainter>

#include "clip/avi_clip.h"

namespace zx917::ui {

ClipPlayer::ClipPlayer(QWidget* parent) : QWidget(parent) {
    // Each frame paints the whole box itself: the page behind it is not painted again with
    // every frame, which the transfer's event loop would pay for.
    setAttribute(Qt::WA_OpaquePaintEvent);
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
    QPainter p(this);
    const QRect box = rect();
    if (frames_.empty()) {
        p.fillRect(box, palette().color(QPalette::Window));
        return;
    }
    const QImage& f = frames_[current_];
    const QRect at((width() - f.width()) / 2, (height() - f.height()) / 2, f.width(), f.height());
    // Around the frame the page shows; the frame covers the rest.
    const QRegion around = QRegion(box).subtracted(at);
    for (const QRect& r : around) p.fillRect(r, palette().color(QPalette::Window));
    p.drawImage(at.topLeft(), f);
}

}  // namespace zx917::ui
