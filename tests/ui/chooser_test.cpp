// The file chooser: its first opening, the listing and its pattern, the key filters, the
// check of a file, "&Open" and "&Cancel", reopening, and its recovery from a lost folder.
#include <gtest/gtest.h>

#include <QClipboard>
#include <QDir>
#include <QPushButton>

#include "support/chooser_rig.h"
#include "support/wizard_rig.h"

namespace zx917 {
namespace {

using test::ChooserRig;
using test::DownloadFile;
using Shown = test::FakeDialogs::Shown;

TEST(Chooser_Open, FirstOpeningState) {
    ChooserRig r;
    r.folder.write("HEX/FIRST.HEX", DownloadFile("A.02.00"));
    auto& c = r.open();
    EXPECT_EQ(c.windowTitle(), "Open");
    EXPECT_EQ(c.dirlist->path(), r.hex());
    EXPECT_EQ(c.FileName->text(), "");
    EXPECT_EQ(c.FirmRev2->text(), "");
    EXPECT_EQ(c.FirmRev1->text(), "A.01.02");
    EXPECT_EQ(c.RetFile->currentText(), "*.HEX");
    ASSERT_EQ(c.RetFile->count(), 2);
    EXPECT_EQ(c.RetFile->itemText(0), "*.HEX");
    EXPECT_EQ(c.RetFile->itemText(1), "*.*");
    EXPECT_FALSE(c.OpenCom->isEnabled());
    EXPECT_EQ(r.listed(), QStringList({"FIRST.HEX"}));  // the folder's files, checked by none
    EXPECT_TRUE(r.dialogs.shown.empty());
    // F1 opens the chooser's own help topic.
    c.File->setFocus(Qt::TabFocusReason);
    r.key(Qt::Key_F1);
    EXPECT_EQ(r.helpAsked, std::vector<int32_t>{21});
    // The file list reaches down to the folder list's bottom.
    EXPECT_EQ(c.File->y(), c.drvlist->y());
    EXPECT_EQ(c.File->y() + c.File->height(), c.dirlist->y() + c.dirlist->height());
    // Enter in the name box must never press a button.
    for (QPushButton* b : c.findChildren<QPushButton*>()) {
        EXPECT_FALSE(b->isDefault());
        EXPECT_FALSE(b->autoDefault());
    }
}

// Keys go to the focus widget as a keyboard sends them; pasted text gives what typing it gives.
// (The rules themselves are tested without a window.)
TEST(Chooser_Keys, TypedAndPastedAlike) {
    struct Case {
        const char* name;
        bool typeBox;
        QString text;
        QString result;
    };
    const Case cases[] = {
        {"name box", false, "a b*.hex", "AB.HEX"},
        {"name box separators", false, "a/b:c\\d", "ABCD"},
        {"type box", true, "s* x", "S*X"},
        {"type box limit", true, "ABCDEFGHIJKLMN", "ABCDEFGHIJKL"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        ChooserRig r;
        auto& ch = r.open();
        QWidget* box = c.typeBox ? static_cast<QWidget*>(ch.RetFile) : ch.FileName;
        QLineEdit* text = c.typeBox ? ch.RetFile->lineEdit() : ch.FileName;
        text->clear();
        r.type(box, c.text);
        EXPECT_EQ(text->text(), c.result) << "typed";
        text->clear();
        QApplication::clipboard()->setText(c.text);
        r.key(Qt::Key_V, Qt::ControlModifier);
        EXPECT_EQ(text->text(), c.result) << "pasted";
    }
    // Backspace is always taken, also in a full type box.
    ChooserRig r;
    auto& ch = r.open();
    ch.RetFile->lineEdit()->setText("ABCDEFGHIJKL");
    r.type(ch.RetFile, "Z");
    r.key(Qt::Key_Backspace);
    r.type(ch.RetFile, "z");
    EXPECT_EQ(ch.RetFile->currentText(), "ABCDEFGHIJKZ");
}

// The pattern typed into the type box and Enter: the list shows that pattern's files, the name
// box and the new revision are cleared.
TEST(Chooser_Keys, TypedPatternAndEnterRefillsTheList) {
    ChooserRig r;
    r.folder.write("HEX/A.HEX", DownloadFile("A.02.00"));
    r.folder.write("HEX/notes.txt", std::string("x"));
    auto& c = r.open();
    r.pick("A.HEX");
    ASSERT_EQ(c.FirmRev2->text(), "A.02.00");
    c.RetFile->lineEdit()->clear();
    r.type(c.RetFile, "*.txt");
    r.key(Qt::Key_Return);
    EXPECT_EQ(c.RetFile->currentText(), "*.TXT");
    EXPECT_EQ(r.listed(), QStringList({"NOTES.TXT"}));
    EXPECT_EQ(c.FileName->text(), "");
    EXPECT_EQ(c.FirmRev2->text(), "");
    EXPECT_FALSE(c.OpenCom->isEnabled());
    EXPECT_EQ(c.RetFile->count(), 2);  // the typed pattern is no new item
    EXPECT_TRUE(c.isVisible());        // and Enter pressed no button
    // An item of the list chosen: its pattern lists.
    c.RetFile->setCurrentIndex(1);
    emit c.RetFile->activated(1);
    QStringList listed = r.listed();
    listed.sort();
    EXPECT_EQ(listed, QStringList({"A.HEX", "NOTES.TXT"}));
}

TEST(Chooser_Check, EnterChecksAndASecondEnterOpens) {
    ChooserRig r;
    r.folder.write("HEX/a.hex", DownloadFile("A.02.00"));
    auto& c = r.open();
    // Enter in an empty box: nothing to check, "&Open" off.
    c.OpenCom->setEnabled(true);
    c.FirmRev2->setText("X");
    c.FileName->setFocus(Qt::MouseFocusReason);
    r.key(Qt::Key_Return);
    EXPECT_FALSE(c.OpenCom->isEnabled());
    EXPECT_EQ(c.FirmRev2->text(), "");
    EXPECT_EQ(r.app.NewRevision.str(), "       ");
    EXPECT_TRUE(c.isVisible());
    // A name typed in lower case is shown in upper case and opens the real file.
    r.type(c.FileName, "a.hex");
    r.key(Qt::Key_Return);
    EXPECT_TRUE(c.isVisible());  // Enter only checks
    EXPECT_EQ(c.FirmRev2->text(), "A.02.00");
    EXPECT_TRUE(c.OpenCom->isEnabled());
    EXPECT_EQ(c.focusWidget(), c.OpenCom);
    EXPECT_TRUE(r.dialogs.shown.empty());
    r.key(Qt::Key_Return);
    EXPECT_FALSE(c.isVisible());
    EXPECT_EQ(c.result(), QDialog::Accepted);
    EXPECT_EQ(r.app.FilePath, r.hex() + "/a.hex");
    EXPECT_EQ(r.app.SelectedFileName, "A.HEX");
    EXPECT_EQ(r.app.HexFolder, r.hex());
    EXPECT_EQ(r.app.SelectedRevision.str(), "A.02.00");
}

TEST(Chooser_Check, FirmRevInfoOutcomes) {
    struct Case {
        const char* name;
        std::string current;
        std::string file;  // content's revision; empty: not a download file
        bool create;       // false: the name is typed for a file that does not exist
        std::deque<bool> answers;
        bool accepted;
        std::vector<Shown> shown;
    };
    const std::string hw =
        "To download this firmware, you need to change the hardware.\r\nDid you change the "
        "hardware?";
    const Case cases[] = {
        {"same hardware", "A.01.02", "A.02.00", true, {}, true, {}},
        {"other hardware, OK",
         "B.01.02",
         "A.02.00",
         true,
         {true},
         true,
         {{"beep", ""}, {"question", hw}}},
        {"other hardware, Cancel",
         "B.01.02",
         "A.02.00",
         true,
         {false},
         false,
         {{"beep", ""}, {"question", hw}}},
        {"unknown instrument revision: never asked", "?.??.??", "C.02.00", true, {}, true, {}},
        {"not a download file",
         "A.01.02",
         "",
         true,
         {},
         false,
         {{"beep", ""}, {"critical", "This is not the download file."}}},
        {"no such file",
         "A.01.02",
         "A.02.00",
         false,
         {},
         false,
         {{"beep", ""}, {"critical", "Could not read file."}}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        ChooserRig r;
        r.app.CurrentRevision = c.current;
        if (c.create) {
            if (c.file.empty()) {
                r.folder.write("HEX/F.HEX", test::NotADownloadFile());
            } else {
                r.folder.write("HEX/F.HEX", DownloadFile(c.file));
            }
        }
        auto& ch = r.open();
        r.dialogs.answers = c.answers;
        r.type(ch.FileName, "f.hex");
        r.key(Qt::Key_Return);
        EXPECT_EQ(r.dialogs.shown, c.shown);
        EXPECT_EQ(ch.OpenCom->isEnabled(), c.accepted);
        EXPECT_EQ(ch.FirmRev2->text(), c.accepted ? QString::fromStdString(c.file) : "");
        EXPECT_EQ(ch.FileName->text(), c.accepted ? "F.HEX" : "");
    }
}

// Names on Linux: shown in upper case, opened as they are on disk.
TEST(Chooser_Names, UpperCaseResolvesToTheRealFile) {
    ChooserRig r;
    r.folder.write("HEX/lower.hex", DownloadFile("A.02.00"));
    r.folder.write("HEX/two.hex", DownloadFile("A.03.00"));
    r.folder.write("HEX/TWO.HEX", DownloadFile("A.04.00"));       // the exact name wins
    r.folder.write("HEX/\xff\xfe.hex", DownloadFile("A.05.00"));  // not valid UTF-8
    auto& c = r.open();
    const std::vector<std::pair<std::string, std::string>> picks = {{"LOWER.HEX", "lower.hex"},
                                                                    {"TWO.HEX", "TWO.HEX"}};
    for (const auto& [shown, real] : picks) {
        SCOPED_TRACE(shown);
        r.pick(QString::fromStdString(shown));
        EXPECT_TRUE(c.OpenCom->isEnabled());
        EXPECT_EQ(c.joinCurrent(QString::fromStdString(shown)), r.hex() + "/" + real);
    }
    EXPECT_EQ(c.FirmRev2->text(), "A.04.00");
    EXPECT_EQ(r.listed().count("TWO.HEX"), 1);  // one entry, one file
    // The name that is not valid text is listed, checked and opened.
    QString odd;
    for (const QString& s : r.listed()) {
        if (!s.contains("LOWER") && !s.contains("TWO")) odd = s;
    }
    ASSERT_FALSE(odd.isEmpty());
    r.pick(odd);
    EXPECT_EQ(c.FirmRev2->text(), "A.05.00");
    QTest::mouseClick(c.OpenCom, Qt::LeftButton);
    EXPECT_EQ(r.app.FilePath, r.hex() + "/\xff\xfe.hex");
    EXPECT_TRUE(r.dialogs.shown.empty());
}

TEST(Chooser_Reopen, StartsWhereTheLastFileWasOpened) {
    ChooserRig r;
    const std::string other = r.folder.path() + "/elsewhere";
    std::filesystem::create_directory(other);
    r.folder.write("elsewhere/NEXT.HEX", DownloadFile("A.03.00"));
    auto& first = r.open();
    ASSERT_TRUE(first.dirlist->setPath(other));
    r.pick("NEXT.HEX");
    QTest::mouseClick(first.OpenCom, Qt::LeftButton);
    ASSERT_EQ(r.app.HexFolder, other);

    auto& again = r.open();
    EXPECT_EQ(again.dirlist->path(), other);
    EXPECT_EQ(again.FileName->text(), "NEXT.HEX");
    EXPECT_EQ(again.FirmRev2->text(), "A.03.00");
    EXPECT_TRUE(again.OpenCom->isEnabled());
    EXPECT_EQ(r.listed(), QStringList({"NEXT.HEX"}));  // each name once

    // Cancel after checking another file leaves the choice as it was.
    r.folder.write("elsewhere/LATER.HEX", DownloadFile("A.09.00"));
    again.FillFileList();
    r.pick("LATER.HEX");
    QTest::mouseClick(again.CanselCom, Qt::LeftButton);
    EXPECT_EQ(again.result(), QDialog::Rejected);
    EXPECT_EQ(r.app.FilePath, other + "/NEXT.HEX");
    EXPECT_EQ(r.app.SelectedFileName, "NEXT.HEX");
    EXPECT_EQ(r.app.SelectedRevision.str(), "A.03.00");
}

TEST(Chooser_Recovery, RemovedFolderAtLoad) {
    ChooserRig r;
    r.folder.write("AT_HOME.HEX", std::string("x"));
    r.app.HexFolder = r.folder.path() + "/gone";
    r.app.SelectedFileName = "OLD.HEX";
    r.app.SelectedRevision = "A.01.00";
    auto& c = r.open();
    EXPECT_EQ(r.dialogs.shown, (std::vector<Shown>{{"critical", "Could not read file."}}));
    EXPECT_EQ(c.dirlist->path(), r.folder.path());
    EXPECT_EQ(r.app.HexFolder, r.folder.path());
    EXPECT_EQ(r.app.SelectedFileName, "");
    EXPECT_EQ(r.app.SelectedRevision.str(), "       ");
    EXPECT_EQ(c.FileName->text(), "");
    EXPECT_FALSE(c.OpenCom->isEnabled());
    EXPECT_EQ(r.listed(), QStringList({"AT_HOME.HEX"}));
}

TEST(Chooser_Recovery, FolderGoneWhileOpen) {
    ChooserRig r;
    const std::string sub = r.hex() + "/sub";
    std::filesystem::create_directory(sub);
    auto& c = r.open();
    // The folder list shows "sub"; it disappears before it is double-clicked.
    QListWidgetItem* item = nullptr;
    for (int i = 0; i < c.dirlist->count(); ++i) {
        if (c.dirlist->item(i)->text().trimmed() == "sub") item = c.dirlist->item(i);
    }
    ASSERT_NE(item, nullptr);
    std::filesystem::remove(sub);
    c.dirlist->setCurrentItem(item);
    c.dirlist->setFocus(Qt::MouseFocusReason);
    r.key(Qt::Key_Return);
    EXPECT_EQ(r.dialogs.shown, (std::vector<Shown>{{"critical", "Could not read file."}}));
    EXPECT_EQ(c.dirlist->path(), r.hex());
    // The folder shown is the one highlighted again.
    ASSERT_NE(c.dirlist->currentItem(), nullptr);
    EXPECT_EQ(c.dirlist->currentItem()->text().trimmed(), "HEX");
    // Entering a folder that is there lists it.
    std::filesystem::create_directory(sub);
    r.folder.write("HEX/sub/IN.HEX", std::string("x"));
    ASSERT_TRUE(c.dirlist->setPath(sub));
    EXPECT_EQ(r.listed(), QStringList({"IN.HEX"}));
}

}  // namespace
}  // namespace zx917
