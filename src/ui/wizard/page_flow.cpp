// The page flow: the load step, the forward, back, cancel and help buttons, the file choice of
// page 2, and the unload step.
#include <QCloseEvent>
#include <QShortcut>

#include "app/identity.h"
#include "firmware/revision.h"
#include "ui/chooser/frm_new_sel.h"
#include "ui/common/centre.h"
#include "ui/common/qt_text.h"
#include "ui/common/twips.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

namespace {
constexpr int kClientWidth = 8388;
constexpr int kClientHeight = 4416;
}  // namespace

FrmMain::FrmMain(const WizardParts& parts)
    : QWidget(nullptr, Qt::Dialog | Qt::CustomizeWindowHint | Qt::WindowTitleHint |
                           Qt::WindowCloseButtonHint | Qt::MSWindowsFixedSizeDialogHint),
      p_(parts),
      ops_(FirmwareParts{.app = parts.app,
                         .texts = parts.texts,
                         .dialogs = parts.dialogs,
                         .file = parts.file,
                         .engine = parts.engine,
                         .port = parts.port,
                         .timer1 = parts.timer1,
                         .view = *this}) {
    setObjectName("FrmMain");
    setWindowTitle(QString::fromLatin1(kWindowTitle));
    setFixedSize(px(kClientWidth), px(kClientHeight));
    QFont design("Arial");
    design.setPointSizeF(9.6);
    design.setBold(true);
    setFont(design);
    buildPages();
    enterClicks_.watchAll(this);
    progressTimer_.setSingleShot(true);
    connect(&progressTimer_, &QTimer::timeout, this, [this] { showProgressNow(); });
    auto* f1 = new QShortcut(QKeySequence(Qt::Key_F1), this);
    f1->setContext(Qt::WindowShortcut);
    connect(f1, &QShortcut::activated, this, [this] {
        const int page = currentPage();
        help_.show(helpFile_,
                   page >= 0 ? Picture4[page]->property("helpContext").toInt() : kF1Context);
    });
}

FrmMain::~FrmMain() = default;

void FrmMain::Form_Load() {
    helpFile_ = JoinPath(p_.programFolder, std::string(kExeBaseName) + kHelpFileSuffix);
    for (QWidget* page : Picture4) page->setProperty("helpContext", kF1Context);
    p_.app.ScriptStep = kNoRun;
    InitMessages(p_.texts);
    InitCommandScript(p_.script);
    // A missing or unreadable clip leaves the player empty.
    Animation1->open(JoinPath(p_.programFolder, kClipFileName));
    REV_Font();
    SetTabOrder();
    GoToPage(0);
    CentreOnScreen(*this);
}

void FrmMain::CmdNext_Click(int16_t index) {
    AppState& app = p_.app;
    switch (index) {
        case 0:
            if (settings->ProtSettings()) GoToPage(1);
            break;
        case 1:
            if (!settings->ProtSettingsApply()) break;
            if (!ops_.ReadCurrentRevision()) {
                GoToPage(0);
                break;
            }
            app.SelectedFileName.clear();
            app.FilePath.clear();
            app.SelectedRevision = "       ";
            CmdNext[2]->setEnabled(false);
            SetCaption(NewFirmInfo[2], " ");
            SetCaption(NewFirmFile[2], " ");
            GoToPage(2);
            break;
        case 2:
            if (CurrentIsNewerOrEqual(app.CurrentRevision, app.SelectedRevision) &&
                !p_.dialogs.question(p_.texts.MessageTable[kMsgCurrentIsNewer])) {
                break;
            }
            GoToPage(3);
            ops_.PrepareDownload();
            break;
        case 3: {
            if (!p_.dialogs.question(p_.texts.QuestionTable[kQstStart])) break;
            if (p_.recorder) p_.recorder->begin();
            GoToPage(4);
            const bool confirmed = ops_.StartDownload();
            if (p_.recorder) p_.recorder->end(OutcomeOf(confirmed, p_.engine.lineLog()));
            break;
        }
        case 5:
            p_.dialogs.information(p_.texts.QuestionTable[kQstExit]);
            close();
            break;
        default:
            break;
    }
}

void FrmMain::CmdFirmSelect_Click() {
    if (p_.showFileChooser) {
        p_.showFileChooser();
    } else {
        // Loaded for this use and unloaded when the engineer has left it.
        FrmNewSel chooser(ChooserParts{.app = p_.app,
                                       .texts = p_.texts,
                                       .file = p_.file,
                                       .dialogs = p_.dialogs,
                                       .programFolder = p_.programFolder,
                                       .showHelp = [this](int32_t c) { help_.show(helpFile_, c); },
                                       .listFiles = {}},
                          this);
        chooser.Form_Load();
        chooser.exec();
    }
    const QString revision = FromLatin1(StripFillers(p_.app.SelectedRevision.str()));
    SetCaption(NewFirmInfo[2], revision);
    SetCaption(NewFirmFile[2], FromFileName(p_.app.SelectedFileName));
    CmdNext[2]->setEnabled(!revision.isEmpty());
}

void FrmMain::CmdBack_Click(int16_t index) {
    if (index == 3) GoToPage(2);
}

void FrmMain::CmdHelp_Click(int16_t index) {
    if (index < 0 || index >= kPages) return;
    help_.show(helpFile_, kPageRows[index].helpContext);
}

void FrmMain::CmdExit_Click(int16_t index) {
    if (index < 0 || index > 3) return;
    if (p_.dialogs.question(p_.texts.QuestionTable[kQstQuit])) close();
}

void FrmMain::closeEvent(QCloseEvent* event) {
    event->accept();
    Form_Unload();
}

// The one way the program ends, whatever closed the window and wherever the program waits:
// the port is closed and the process ends without unwinding the waits.
void FrmMain::Form_Unload() {
    // Closed in the middle of a transfer: the engineer stopped it.
    if (p_.recorder && p_.recorder->inProgress()) p_.recorder->end(kOutcomeCancelled);
    if (p_.port.portOpen()) p_.port.setPortOpen(false);
    help_.close();
    if (p_.endProcess) p_.endProcess();
}

}  // namespace zx917::ui
