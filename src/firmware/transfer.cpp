// The download run: stage 3, the four sections record by record, stage 8, the port put back.
#include <sys/stat.h>

#include <algorithm>

#include "firmware/operations.h"
#include "firmware/progress.h"
#include "firmware/record.h"

namespace zx917 {

namespace {
bool isPlainFile(const std::string& path) {
    struct stat st {};
    return ::stat(path.c_str(), &st) == 0 && S_ISREG(st.st_mode);
}
}  // namespace

bool FirmwareOperations::StartDownload() {
    AppState& app = p_.app;
    if (!isPlainFile(app.FilePath)) {
        p_.dialogs.beep();
        p_.dialogs.critical(p_.texts.MessageTable[kMsgCouldNotRead]);
        p_.view.GoToPage(2);
        return false;
    }
    progressMax_ = TotalSize1();
    p_.view.setProgressRange(0, progressMax_);
    p_.view.setByteLabel(ByteLabel(0));
    p_.view.setAnimationPlaying(true);
    TransferFirmware();
    p_.view.setAnimationPlaying(false);
    if (!app.StepResult) {
        p_.dialogs.critical(p_.texts.MessageTable[kMsgDownloadFailed]);
        p_.view.GoToPage(0);
        return false;
    }
    p_.view.setRemainingTime(4, "00:00");
    p_.view.GoToPage(5);
    return true;
}

void FirmwareOperations::TransferFirmware() {
    AppState& app = p_.app;
    Engine& engine = p_.engine;
    app.RestartPosition = 1;
    app.RestartCount = 0;
    p_.view.setProgressRange(0, progressMax_);
    p_.view.setProgressValue(0);
    int32_t shown = 0;

    if (!p_.file.open(app.FilePath)) {
        engine.FailRun("the download file cannot be opened");
    } else {
        engine.RunStage(kStageOpen, 0);
        for (int index = 0; app.StepResult && index < static_cast<int>(SectionTable.size());
             ++index) {
            if (app.AmpsSectionFlag == "0" && index == kAmpsSection) index = kAmpsSection + 1;
            engine.RunStage(SectionTable[index].stage, kStepSelect);
            if (!app.StepResult || !sendSection(SectionTable[index], shown)) break;
            app.RestartCount = 0;
        }
    }
    p_.file.close();
    // The byte count stops with the transfer, whichever way it ended.
    p_.timer1.setEnabled(false);
    if (app.StepResult) {
        p_.view.setRemainingTime(4, "00:00");
        engine.RunStage(kStageClose, 0);
    }
    restoreUserPort();
}

// Sends one section from its marker line; false when the transfer is to end.
bool FirmwareOperations::sendSection(const Section& section, int32_t& shown) {
    AppState& app = p_.app;
    Engine& engine = p_.engine;
    const auto onTurn = [this] {
        if (p_.app.ScriptStep == kStepLastRecord) programmingRefresh();
    };
    for (;;) {  // entered again after a restart
        app.RestartRequested = false;
        if (!FindSectionMarker(p_.file, section.marker)) {
            engine.FailRun(std::string("no marker line for ") + section.tag);
            return false;
        }
        app.LastCommand.clear();
        bool restart = false;
        for (bool last = false; !last;) {
            app.ScriptStep = kStepRecord;
            if (!ReadRecord(p_.file, app.RecordBytes)) {
                engine.FailRun("a record is cut short or its length is out of range");
                return false;
            }
            if (IsLastRecordKind(RecordKindText(app.RecordBytes))) {
                app.ProgressCount = shown;
                app.ScriptStep = kStepLastRecord;
                last = true;
            }
            engine.RunCurrentStep(onTurn);
            if (!app.StepResult) return false;
            if (app.RestartRequested) {
                restart = true;
                break;
            }
            shown = static_cast<int32_t>(std::min<int64_t>(p_.file.bytesRead(), progressMax_));
            recordRefresh(shown);
        }
        if (restart) continue;
        app.ScriptStep = kStepEndArea;
        engine.RunCurrentStep();
        if (!app.StepResult) return false;
        if (!app.RestartRequested) return true;
    }
}

void FirmwareOperations::recordRefresh(int32_t n) {
    p_.view.setProgressValue(n);
    p_.view.setByteLabel(ByteLabel(n));
    p_.view.setRemainingTime(4, RemTimeFormat(n));
}

void FirmwareOperations::programmingRefresh() {
    const int32_t p = p_.app.ProgressCount;
    if (p < progressMax_) {
        recordRefresh(p);
    } else {
        p_.view.setRemainingTime(4, RemTimeFormat(p));
    }
}

void FirmwareOperations::restoreUserPort() {
    p_.port.setSettings(p_.app.PortSettings);
    p_.port.setHandshaking(p_.app.PortHandshaking);
    p_.port.clearInBuffer();
    p_.port.clearOutBuffer();
}

}  // namespace zx917
