// Both windows open centred on the screen when they are in the normal window state.
#pragma once

#include <QGuiApplication>
#include <QScreen>
#include <QWidget>

namespace zx917::ui {

inline void CentreOnScreen(QWidget& window) {
    if (window.windowState() != Qt::WindowNoState) return;
    if (const QScreen* screen = QGuiApplication::primaryScreen()) {
        const QRect s = screen->geometry();
        window.move(s.x() + (s.width() - window.width()) / 2,
                    s.y() + (s.height() - window.height()) / 2);
    }
}

}  // namespace zx917::ui
