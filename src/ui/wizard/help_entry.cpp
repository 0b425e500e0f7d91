// The two ways out of the main window: help, and the file chooser of page 2.
#include "firmware/revision.h"
#include "ui/chooser/frm_new_sel.h"
#include "ui/common/qt_text.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

namespace {
constexpr int32_t kPageContext[kPages] = {18, 19, 20, 22, 23, 24};
}

void FrmMain::CmdHelp_Click(int16_t index) {
    if (index < 0 || index >= kPages) return;
    help_.show(helpFile_, kPageContext[index]);
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

}  // namespace zx917::ui
