// Enter on a focused button presses it, as Space does, without making it a default button
// that Enter in some other control would press.
#pragma once

#include <QAbstractButton>
#include <QEvent>
#include <QKeyEvent>
#include <QObject>
#include <QPushButton>

namespace zx917::ui {

class EnterClicks : public QObject {
public:
    using QObject::QObject;

    void watch(QAbstractButton* button) { button->installEventFilter(this); }
    // Every push button of a window, so that none is left out.
    void watchAll(QWidget* window) {
        for (QPushButton* b : window->findChildren<QPushButton*>()) watch(b);
    }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override {
        if (event->type() != QEvent::KeyPress) return false;
        const int key = static_cast<QKeyEvent*>(event)->key();
        if (key != Qt::Key_Return && key != Qt::Key_Enter) return false;
        auto* button = static_cast<QAbstractButton*>(watched);
        if (button->isEnabled()) button->click();
        return true;
    }
};

}  // namespace zx917::ui
