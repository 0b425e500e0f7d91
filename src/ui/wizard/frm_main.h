// The main window: the six wizard pages and their flow. It is the view the firmware operations
// update and the owner of the help viewer; the port, timers and engine come from the program.
#pragma once

#include <QElapsedTimer>
#include <QGroupBox>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QStringList>
#include <QTimer>
#include <QWidget>
#include <array>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "firmware/download_view.h"
#include "firmware/operations.h"
#include "history/download_recorder.h"
#include "link/command_script.h"
#include "link/engine.h"
#include "ui/common/enter_clicks.h"
#include "ui/common/name_label.h"
#include "ui/settings/settings_page.h"
#include "ui/wizard/clip_player.h"
#include "ui/wizard/help_viewer.h"
#include "ui/wizard/page_table.h"

namespace zx917::ui {

struct WizardParts {
    AppState& app;
    TextTables& texts;
    CommandScript& script;
    SerialPort& port;
    Timer& timer1;
    Engine& engine;
    FileSlot& file;
    Dialogs& dialogs;
    std::string programFolder;
    // The screen's font names in the platform's order (REV_Font); the system's when empty.
    std::function<QStringList()> fontFamilies;
    // The family the system draws for a font name (QFontInfo) when empty.
    std::function<QString(const QString&)> drawnFamily;
    // Device path and description of "Com<n>", for the settings page.
    std::function<std::string(int16_t)> describePort;
    // Ends the process at once; closing the window calls it from wherever the program waits.
    std::function<void()> endProcess;
    // Shows the file chooser modally and returns when the engineer has left it; the chooser
    // FrmNewSel when empty.
    std::function<void()> showFileChooser;
    // The service record of each download started with Execute; none when empty.
    DownloadRecorder* recorder = nullptr;
};

class FrmMain : public QWidget, public DownloadView {
public:
    explicit FrmMain(const WizardParts& parts);
    ~FrmMain() override;

    void Form_Load();
    void CmdNext_Click(int16_t index);
    void CmdBack_Click(int16_t index);
    void CmdExit_Click(int16_t index);
    void CmdHelp_Click(int16_t index);
    void CmdFirmSelect_Click();
    void Form_Unload();

    void GoToPage(int page) override;
    // The page procedures: each shows or hides its page and does the page's own work.
    void SetPage0(bool show) { SetPage(0, show); }
    void SetPage1(bool show) { SetPage(1, show); }
    void SetPage2(bool show) { SetPage(2, show); }
    void SetPage3(bool show) { SetPage(3, show); }
    void SetPage4(bool show) { SetPage(4, show); }
    void SetPage5(bool show) { SetPage(5, show); }
    void SetTabOrder();
    void REV_Font();
    // The page shown: the one whose container is visible.
    int currentPage() const;

    // DownloadView: what the firmware operations change on the pages.
    void setSettingsControlsEnabled(bool enabled) override;
    void setCurrentRevisionLabel(const std::string& text) override;
    void setProgressRange(int32_t minimum, int32_t maximum) override;
    void setProgressValue(int32_t value) override;
    void setByteLabel(const std::string& text) override;
    void setRemainingTime(int page, const std::string& text) override;
    void setAnimationPlaying(bool playing) override;

    std::string helpFile() const { return helpFile_; }
    HelpViewer& helpViewer() { return help_; }
    FirmwareOperations& operations() { return ops_; }
    const WizardParts& parts() const { return p_; }

    // The controls, by the names of the design; an index set has nullptr where a page has no
    // member.
    std::array<QWidget*, kPages> Picture4{};
    std::array<QPushButton*, kPages> CmdNext{};
    std::array<QPushButton*, kPages> CmdExit{};
    std::array<QPushButton*, kPages> CmdHelp{};
    std::array<QPushButton*, kPages> CmdBack{};
    std::array<QLabel*, kPages> CurFirmInfo{};
    std::array<QLabel*, kPages> NewFirmInfo{};
    std::array<NameLabel*, kPages> NewFirmFile{};
    std::array<QLabel*, kPages> RemTime{};
    QLabel* RedByte4 = nullptr;
    QProgressBar* ProgressBar = nullptr;
    QPushButton* CmdFirmSelect = nullptr;
    QGroupBox* Frame1 = nullptr;
    QGroupBox* Frame2 = nullptr;
    ClipPlayer* Animation1 = nullptr;
    SettingsPage* settings = nullptr;  // page 1's container

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void buildPages();
    void buildButtonRow(int page);
    void buildSummary(int page, const SummaryRow& summary);
    void SetPage(int page, bool show);
    // The transfer page's bar, byte count and remaining time change with every record; they are
    // shown at most every kProgressRefresh, the latest values always.
    void showProgressSoon();
    void showProgressNow();

    WizardParts p_;
    FirmwareOperations ops_;
    HelpViewer help_;
    EnterClicks enterClicks_;
    std::string helpFile_;
    std::array<std::vector<QWidget*>, kPages> tabStops_;  // each page's, in tab order
    QTimer progressTimer_;
    QElapsedTimer progressShown_;
    std::optional<int32_t> pendingValue_;
    std::optional<QString> pendingBytes_;
    std::optional<QString> pendingRemaining_;
};

// Sets a label's caption; a label designed to size itself to its text does so, a label that
// shows a name elides it.
void SetCaption(QLabel* label, const QString& text);

}  // namespace zx917::ui
