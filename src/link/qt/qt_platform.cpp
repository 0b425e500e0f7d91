#include "link/qt/qt_platform.h"

namespace zx917 {

QtTimer::QtTimer(int intervalMs) {
    timer_.setInterval(intervalMs);
    timer_.setTimerType(Qt::PreciseTimer);
    QObject::connect(&timer_, &QTimer::timeout, [this] { tick(); });
}

void QtTimer::setEnabled(bool on) {
    if (on == timer_.isActive()) return;  // switching a running timer on keeps its phase
    if (on) {
        timer_.start();
    } else {
        timer_.stop();
    }
}

}  // namespace zx917
