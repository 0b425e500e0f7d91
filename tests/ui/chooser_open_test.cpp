// Which file "&Open" commits: only the file the last check accepted, with its own revision,
// while the folder and the name box still name it; the drive, folder and file lists agreeing
// after every move the engineer makes.
#include <gtest/gtest.h>

#include <QDir>

#include "support/chooser_rig.h"
#include "support/wizard_rig.h"
#include "ui/chooser/folder_files.h"

namespace zx917 {
namespace {

using test::ChooserRig;
using test::DownloadFile;
using Shown = test::FakeDialogs::Shown;

// SMALL.HEX (A.02.00, same hardware) and OTHER.HEX (B.01.00, other hardware) in "HEX", and a
// subfolder SUB with a file of its own.
void twoFiles(ChooserRig& r) {
    r.folder.write("HEX/SMALL.HEX", DownloadFile("A.02.00"));
    r.folder.write("HEX/OTHER.HEX", DownloadFile("B.01.00"));
    std::filesystem::create_directory(r.hex() + "/SUB");
    r.folder.write("HEX/SUB/IN.HEX", DownloadFile("A.04.00"));
}

TEST(Chooser_Open, OnlyTheFileTheLastCheckAccepted) {
    struct Case {
        const char* name;
        std::function<void(ChooserRig&)> after;  // what the engineer does after the check
        bool open;                               // "&Open" still commits SMALL.HEX
    };
    const Case cases[] = {
        {"nothing", [](ChooserRig&) {}, true},
        {"the name edited to another file",
         [](ChooserRig& r) {
             r.chooser->FileName->selectAll();
             r.type(r.chooser->FileName, "other.hex");
         },
         false},
        {"a letter typed and taken back",
         [](ChooserRig& r) {
             r.type(r.chooser->FileName, "x");
             r.key(Qt::Key_Backspace);
         },
         true},
        {"a subfolder entered", [](ChooserRig& r) { r.enterFolder("SUB"); }, false},
        {"the drive shown picked again",
         [](ChooserRig& r) {
             emit r.chooser->drvlist->activated(r.chooser->drvlist->currentIndex());
         },
         true},
        {"another drive picked",
         [](ChooserRig& r) {
             const std::string other = r.folder.path() + "/other";
             std::filesystem::create_directory(other);
             QComboBox* drives = r.chooser->drvlist;
             drives->addItem("other", QByteArray::fromStdString(other));
             drives->setCurrentIndex(drives->count() - 1);
             emit drives->activated(drives->count() - 1);
             EXPECT_EQ(r.chooser->dirlist->path(), other);
             // That drive picked again is no change either.
             r.type(r.chooser->FileName, "x");
             emit drives->activated(drives->count() - 1);
             EXPECT_EQ(r.chooser->FileName->text(), "X");
         },
         false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        ChooserRig r;
        twoFiles(r);
        auto& ch = r.open();
        r.pick("SMALL.HEX");
        ASSERT_TRUE(ch.OpenCom->isEnabled());
        c.after(r);
        EXPECT_EQ(ch.OpenCom->isEnabled(), c.open);
        QTest::mouseClick(ch.OpenCom, Qt::LeftButton);
        if (c.open) {
            EXPECT_EQ(ch.result(), QDialog::Accepted);
            EXPECT_EQ(r.app.FilePath, r.hex() + "/SMALL.HEX");
            EXPECT_EQ(r.app.SelectedFileName, "SMALL.HEX");
            EXPECT_EQ(r.app.HexFolder, r.hex());
            EXPECT_EQ(r.app.SelectedRevision.str(), "A.02.00");
            EXPECT_EQ(ch.FirmRev2->text(), "A.02.00");
        } else {
            EXPECT_TRUE(ch.isVisible());
            EXPECT_EQ(r.app.FilePath, "");
            EXPECT_EQ(r.app.SelectedRevision.str(), std::string(7, '\0'));
        }
        EXPECT_TRUE(r.dialogs.shown.empty());
    }
}

// A stored choice opens with its own revision, not with that of a file refused since.
TEST(Chooser_Open, StoredChoiceKeepsItsRevision) {
    ChooserRig r;
    twoFiles(r);
    QTest::mouseClick(r.open().OpenCom, Qt::LeftButton);  // disabled: nothing chosen yet
    r.pick("SMALL.HEX");
    QTest::mouseClick(r.chooser->OpenCom, Qt::LeftButton);
    ASSERT_EQ(r.app.SelectedRevision.str(), "A.02.00");
    // Another file is refused at the hardware question; the chooser is left with Cancel.
    auto& second = r.open();
    r.dialogs.answers = {false};
    r.pick("OTHER.HEX");
    EXPECT_EQ(second.FileName->text(), "");
    QTest::mouseClick(second.CanselCom, Qt::LeftButton);
    auto& third = r.open();
    EXPECT_EQ(third.FileName->text(), "SMALL.HEX");
    ASSERT_TRUE(third.OpenCom->isEnabled());
    QTest::mouseClick(third.OpenCom, Qt::LeftButton);
    EXPECT_EQ(r.app.FilePath, r.hex() + "/SMALL.HEX");
    EXPECT_EQ(r.app.SelectedRevision.str(), "A.02.00");
}

// After Cancel at the hardware question, a click on the same entry asks again.
TEST(Chooser_Check, ClickOnTheRefusedEntryChecksAgain) {
    ChooserRig r;
    twoFiles(r);
    auto& c = r.open();
    r.dialogs.answers = {false, true};
    r.pick("OTHER.HEX");
    EXPECT_FALSE(c.OpenCom->isEnabled());
    EXPECT_EQ(c.FileName->text(), "");
    r.pick("OTHER.HEX");
    const auto questions = std::count_if(r.dialogs.shown.begin(), r.dialogs.shown.end(),
                                         [](const Shown& s) { return s.kind == "question"; });
    EXPECT_EQ(questions, 2);
    EXPECT_EQ(c.FileName->text(), "OTHER.HEX");
    EXPECT_EQ(c.FirmRev2->text(), "B.01.00");
    EXPECT_TRUE(c.OpenCom->isEnabled());
}

// A folder that cannot be read becomes the current folder with an empty file list under it:
// no click can check a file of the folder before.
TEST(Chooser_Recovery, UnreadableFolderLeavesAnEmptyList) {
    ChooserRig r;
    twoFiles(r);
    std::filesystem::create_directory(r.hex() + "/LOCKED");
    r.folder.write("HEX/LOCKED/X.HEX", DownloadFile("A.05.00"));
    const std::string locked = r.hex() + "/LOCKED";
    r.listFiles = [locked](const std::string& folder) -> std::optional<std::vector<std::string>> {
        if (folder == locked) return std::nullopt;
        return ui::PlainFiles(folder);
    };
    auto& c = r.open();
    r.pick("SMALL.HEX");
    r.enterFolder("LOCKED");
    EXPECT_EQ(r.dialogs.shown, (std::vector<Shown>{{"critical", "Could not read file."}}));
    EXPECT_EQ(c.dirlist->path(), locked);
    ASSERT_NE(c.dirlist->currentItem(), nullptr);
    EXPECT_EQ(c.dirlist->currentItem()->text().trimmed(), "LOCKED");
    EXPECT_TRUE(r.listed().isEmpty());
    EXPECT_FALSE(c.OpenCom->isEnabled());
}

// The chooser opens in the process's working folder: no folder change fills the list, the load
// step does.
TEST(Chooser_List, FilledWhenTheStartFolderIsTheWorkingFolder) {
    ChooserRig r;
    twoFiles(r);
    const QString before = QDir::currentPath();
    ASSERT_TRUE(QDir::setCurrent(QString::fromStdString(r.hex())));
    r.open();
    QDir::setCurrent(before);
    QStringList listed = r.listed();
    listed.sort();
    EXPECT_EQ(listed, QStringList({"OTHER.HEX", "SMALL.HEX"}));
}

}  // namespace
}  // namespace zx917
