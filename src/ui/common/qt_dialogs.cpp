#include "ui/common/qt_dialogs.h"

#include <QApplication>
#include <QMessageBox>

#include "app/identity.h"
#include "ui/common/qt_text.h"

namespace zx917::ui {

namespace {

QMessageBox::StandardButton show(QWidget* owner, QMessageBox::Icon icon, const std::string& text,
                                 QMessageBox::StandardButtons buttons) {
    QMessageBox box(icon, QString::fromLatin1(kAppTitle), FromLatin1(text), buttons, owner);
    box.setTextFormat(Qt::PlainText);
    // Escape and the close box answer Cancel where there is one.
    if (buttons & QMessageBox::Cancel) box.setEscapeButton(QMessageBox::Cancel);
    box.setDefaultButton(QMessageBox::Ok);
    return static_cast<QMessageBox::StandardButton>(box.exec());
}

}  // namespace

void QtDialogs::critical(const std::string& text) {
    show(owner_, QMessageBox::Critical, text, QMessageBox::Ok);
}

bool QtDialogs::question(const std::string& text) {
    return show(owner_, QMessageBox::Question, text, QMessageBox::Ok | QMessageBox::Cancel) ==
           QMessageBox::Ok;
}

void QtDialogs::information(const std::string& text) {
    show(owner_, QMessageBox::Information, text, QMessageBox::Ok);
}

void QtDialogs::beep() {
    QApplication::beep();
}

}  // namespace zx917::ui
