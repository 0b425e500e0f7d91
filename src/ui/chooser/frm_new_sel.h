// The file chooser "Open": drive, folder and file lists, the name and type boxes, and the
// revision of the file under consideration beside the instrument's. It hands its result back
// through the shared state.
#pragma once

#include <QComboBox>
#include <QDialog>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "ui/chooser/dir_list.h"
#include "ui/common/enter_clicks.h"

namespace zx917::ui {

struct ChooserParts {
    AppState& app;
    const TextTables& texts;
    FileSlot& file;
    Dialogs& dialogs;
    std::string programFolder;
    std::function<void(int32_t context)> showHelp;  // F1
    // The names of a folder's plain files; nothing when it cannot be listed. PlainFiles when
    // empty; a test stands in a folder that refuses to be read.
    std::function<std::optional<std::vector<std::string>>(const std::string& folder)> listFiles;
};

inline constexpr int32_t kChooserHelpContext = 21;

class FrmNewSel : public QDialog {
public:
    explicit FrmNewSel(const ChooserParts& parts, QWidget* owner = nullptr);

    void Form_Load();
    void FillFileList();
    void drvlist_Change();
    void dirlist_Change();
    void File_Click();
    // Enter in the name box. Typed characters reach the box through its validator, which
    // upper-cases them and refuses "*", " ", "/", ":" and "\".
    void FileName_KeyPress();
    // Enter in the type box; its validator applies the type box's own key rule.
    void RetFile_KeyDown(int key);
    void RetFile_Click();
    void OpenCom_Click();
    void CanselCom_Click();
    void FirmRevInfo(const std::string& path);

    // The current folder joined with a name shown in the lists (the real file's path).
    std::string joinCurrent(const QString& shownName) const;
    // The real name behind a file list entry.
    static std::string RealName(const QListWidgetItem& entry);

    QLabel* Label1;
    QComboBox* drvlist;
    DirList* dirlist;
    QListWidget* File;
    QLabel* Label2;
    QLineEdit* FileName;
    QLabel* Label3;
    QComboBox* RetFile;
    QPushButton* OpenCom;
    QPushButton* CanselCom;
    QGroupBox* Frame1;
    QLabel* FirmRev1;
    QLabel* FirmRev2;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    // The file that the last check accepted, or the choice the chooser opened with: "&Open"
    // commits exactly this file with its revision, and only while the current folder and the
    // name box still name it.
    struct Accepted {
        std::string folder;
        QString name;
        std::string path;
        Rev7 revision;
    };

    bool loadFolders();
    // Shows the volume of a folder in the drive list without raising its change.
    void showDriveOf(const std::string& folder);
    void couldNotRead();
    void setDrive(const std::string& root);
    void updateOpen();

    ChooserParts p_;
    EnterClicks enterClicks_;
    bool fillFailed_ = false;
    bool folderChanged_ = false;  // the folder change handler ran (load step 8)
    std::string shownDrive_;      // the volume the drive list shows
    bool pressedOnSelected_ = false;
    std::optional<Accepted> accepted_;
};

}  // namespace zx917::ui
