// What the firmware operations change on the pages while they run.
#include "ui/common/qt_text.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

namespace {
// Ten changes a second are more than the eye follows; every repaint costs the event loop time
// that the line's next record waits for.
constexpr int kProgressRefreshMs = 100;
}  // namespace

void FrmMain::showProgressSoon() {
    if (!progressShown_.isValid() || progressShown_.elapsed() >= kProgressRefreshMs) {
        showProgressNow();
    } else if (!progressTimer_.isActive()) {
        progressTimer_.start(kProgressRefreshMs - static_cast<int>(progressShown_.elapsed()));
    }
}

void FrmMain::showProgressNow() {
    progressTimer_.stop();
    if (pendingValue_) ProgressBar->setValue(*pendingValue_);
    if (pendingBytes_) SetCaption(RedByte4, *pendingBytes_);
    if (pendingRemaining_) SetCaption(RemTime[4], *pendingRemaining_);
    pendingValue_.reset();
    pendingBytes_.reset();
    pendingRemaining_.reset();
    progressShown_.start();
}

void FrmMain::setSettingsControlsEnabled(bool enabled) {
    settings->setListsEnabled(enabled);
    CmdExit[1]->setEnabled(enabled);
    CmdNext[1]->setEnabled(enabled);
}

void FrmMain::setCurrentRevisionLabel(const std::string& text) {
    SetCaption(CurFirmInfo[2], FromLatin1(text));
}

void FrmMain::setProgressRange(int32_t minimum, int32_t maximum) {
    showProgressNow();
    ProgressBar->setRange(minimum, maximum);
}

void FrmMain::setProgressValue(int32_t value) {
    pendingValue_ = value;
    showProgressSoon();
}

void FrmMain::setByteLabel(const std::string& text) {
    pendingBytes_ = FromLatin1(text);
    showProgressSoon();
}

void FrmMain::setRemainingTime(int page, const std::string& text) {
    if (page == 2) SetCaption(RemTime[2], FromLatin1(text));
    if (page == 4) {
        pendingRemaining_ = FromLatin1(text);
        showProgressSoon();
    }
}

void FrmMain::setAnimationPlaying(bool playing) {
    if (playing) {
        Animation1->play();
    } else {
        Animation1->stop();
        showProgressNow();  // the transfer has ended: its last figures show at once
    }
}

}  // namespace zx917::ui
