// The file chooser on its own: shared state as the wizard leaves it on page 2, a program folder
// with its "HEX" folder, and the message boxes answered by the test.
#pragma once

#include <QApplication>
#include <QTest>
#include <filesystem>
#include <memory>

#include "app/texts.h"
#include "common/download_files.h"
#include "support/fake_dialogs.h"
#include "ui/chooser/frm_new_sel.h"

namespace zx917::test {

struct ChooserRig {
    ChooserRig() {
        InitMessages(texts);
        InitDefaults(app, folder.path());
        std::filesystem::create_directory(app.HexFolder);
        app.CurrentRevision = "A.01.02";
    }

    // Loads a fresh chooser, as every click on the file-selection button does.
    ui::FrmNewSel& open() {
        chooser = std::make_unique<ui::FrmNewSel>(
            ui::ChooserParts{.app = app,
                             .texts = texts,
                             .file = file,
                             .dialogs = dialogs,
                             .programFolder = folder.path(),
                             .showHelp = [this](int32_t c) { helpAsked.push_back(c); },
                             .listFiles = listFiles});
        chooser->Form_Load();
        chooser->show();
        QApplication::setActiveWindow(chooser.get());
        EXPECT_TRUE(QTest::qWaitForWindowActive(chooser.get()));
        return *chooser;
    }

    // Keys as a keyboard sends them: to the widget that has the focus, after a click into box.
    void type(QWidget* box, const QString& text) {
        box->setFocus(Qt::MouseFocusReason);
        for (const QChar c : text) QTest::keyClick(QApplication::focusWidget(), c.toLatin1());
    }
    void key(Qt::Key k, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        QTest::keyClick(QApplication::focusWidget(), k, modifiers);
    }

    std::string hex() const { return app.HexFolder; }

    QStringList listed() const {
        QStringList out;
        for (int i = 0; i < chooser->File->count(); ++i) out << chooser->File->item(i)->text();
        return out;
    }

    // A click on a listed file.
    void pick(const QString& shown) {
        const auto found = chooser->File->findItems(shown, Qt::MatchExactly);
        ASSERT_EQ(found.size(), 1) << shown.toStdString();
        QTest::mouseClick(chooser->File->viewport(), Qt::LeftButton, {},
                          chooser->File->visualItemRect(found.front()).center());
    }

    // A double click on a folder of the folder list, by its name.
    void enterFolder(const QString& name) {
        ui::DirList* list = chooser->dirlist;
        for (int i = 0; i < list->count(); ++i) {
            if (list->item(i)->text().trimmed() != name) continue;
            // A double click is a click, then the second press of the pair.
            const QPoint at = list->visualItemRect(list->item(i)).center();
            QTest::mouseClick(list->viewport(), Qt::LeftButton, {}, at);
            QTest::mouseDClick(list->viewport(), Qt::LeftButton, {}, at);
            return;
        }
        ADD_FAILURE() << "no folder " << name.toStdString();
    }

    gen::TempDir folder;  // the program folder
    AppState app;
    TextTables texts;
    FileSlot file;
    FakeDialogs dialogs;
    std::unique_ptr<ui::FrmNewSel> chooser;
    std::vector<int32_t> helpAsked;
    // The file listing; the real one when empty.
    std::function<std::optional<std::vector<std::string>>(const std::string&)> listFiles;
};

}  // namespace zx917::test
