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
            ui::ChooserParts{app, texts, file, dialogs, folder.path(),
                             [this](int32_t c) { helpAsked.push_back(c); }});
        chooser->Form_Load();
        chooser->show();
        return *chooser;
    }

    std::string hex() const { return app.HexFolder; }

    QStringList listed() const {
        QStringList out;
        for (int i = 0; i < chooser->File->count(); ++i) out << chooser->File->item(i)->text();
        return out;
    }

    // Selects a listed file as a click does.
    void pick(const QString& shown) {
        const auto found = chooser->File->findItems(shown, Qt::MatchExactly);
        ASSERT_EQ(found.size(), 1) << shown.toStdString();
        chooser->File->setCurrentItem(found.front());
    }

    gen::TempDir folder;  // the program folder
    AppState app;
    TextTables texts;
    FileSlot file;
    FakeDialogs dialogs;
    std::unique_ptr<ui::FrmNewSel> chooser;
    std::vector<int32_t> helpAsked;
};

}  // namespace zx917::test
