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
#include <string>

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
    // Key handlers: the character typed; false when the key is cancelled.
    bool FileName_KeyPress(QChar& key);
    bool RetFile_KeyPress(QChar& key);
    void RetFile_KeyDown(int key);
    void RetFile_Click();
    void OpenCom_Click();
    void CanselCom_Click();
    void FirmRevInfo(const std::string& path);

    // The current folder joined with a name shown in the lists (the real file's path).
    std::string joinCurrent(const QString& shownName) const;

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
    bool loadFolders();
    // Shows the volume of a folder in the drive list without raising its change.
    void showDriveOf(const std::string& folder);
    void couldNotRead();
    bool setDrive(const std::string& root);

    ChooserParts p_;
    EnterClicks enterClicks_;
    bool fillFailed_ = false;
};

}  // namespace zx917::ui
