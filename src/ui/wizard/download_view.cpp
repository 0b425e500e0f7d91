// What the firmware operations change on the pages while they run.
#include "ui/common/qt_text.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

void FrmMain::setSettingsControlsEnabled(bool enabled) {
    settings->setListsEnabled(enabled);
    CmdExit[1]->setEnabled(enabled);
    CmdNext[1]->setEnabled(enabled);
}

void FrmMain::setCurrentRevisionLabel(const std::string& text) {
    SetCaption(CurFirmInfo[2], FromLatin1(text));
}

void FrmMain::setProgressRange(int32_t minimum, int32_t maximum) {
    ProgressBar->setRange(minimum, maximum);
}

void FrmMain::setProgressValue(int32_t value) {
    ProgressBar->setValue(value);
}

void FrmMain::setByteLabel(const std::string& text) {
    SetCaption(RedByte4, FromLatin1(text));
}

void FrmMain::setRemainingTime(int page, const std::string& text) {
    if (page == 2 || page == 4) SetCaption(RemTime[page], FromLatin1(text));
}

void FrmMain::setAnimationPlaying(bool playing) {
    if (playing) {
        Animation1->play();
    } else {
        Animation1->stop();
    }
}

}  // namespace zx917::ui
