// The program's message boxes on QMessageBox, titled with the application title.
#pragma once

#include <QWidget>

#include "app/dialogs.h"

namespace zx917::ui {

class QtDialogs : public Dialogs {
public:
    explicit QtDialogs(QWidget* owner = nullptr) : owner_(owner) {}
    void setOwner(QWidget* owner) { owner_ = owner; }

    void critical(const std::string& text) override;
    bool question(const std::string& text) override;
    void information(const std::string& text) override;
    void beep() override;

private:
    QWidget* owner_;
};

}  // namespace zx917::ui
