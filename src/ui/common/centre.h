// Both windows open centred on the screen when they are in the normal window state, never with
// their top-left corner off the screen's available area (a window larger than the screen).
#pragma once

#include <QGuiApplication>
#include <QScreen>
#include <QWidget>
#include <algorithm>

namespace zx917::ui {

// Where a window of this size goes: centred on the screen, moved right and down as far as the
// available area (without panels) needs to show its top-left corner.
inline QPoint CentredPosition(const QRect& screen, const QRect& available, const QSize& window) {
    const int left = screen.x() + (screen.width() - window.width()) / 2;
    const int top = screen.y() + (screen.height() - window.height()) / 2;
    return {std::max(left, available.x()), std::max(top, available.y())};
}

inline void CentreOnScreen(QWidget& window) {
    if (window.windowState() != Qt::WindowNoState) return;
    if (const QScreen* screen = QGuiApplication::primaryScreen()) {
        window.move(
            CentredPosition(screen->geometry(), screen->availableGeometry(), window.size()));
    }
}

}  // namespace zx917::ui
