// Identification of the instrument and its current revision; the estimate before a download.
#include "firmware/operations.h"
#include "firmware/progress.h"
#include "firmware/revision.h"

namespace zx917 {

bool FirmwareOperations::ReadCurrentRevision() {
    AppState& app = p_.app;
    p_.view.setSettingsControlsEnabled(false);
    // The settings to put back later are the engineer's, also when the instrument is identified
    // without the download mode (the switch to the download speed saves them again).
    app.PortSettings = p_.port.settings();
    app.PortHandshaking = p_.port.handshaking();
    app.NewRevision = kPlaceholderRevision;
    app.StepResult = false;
    p_.engine.RunStage(kStageIdentify, 0);
    if (!app.StepResult) {
        app.CurrentRevision = kUnknownRevision;
        p_.view.setCurrentRevisionLabel(app.CurrentRevision.str());
        app.StepResult = false;
        p_.engine.RunStage(kStageIdnOnly, 0);
        if (app.StepResult) {
            // Identified without the download mode: the port keeps the user's settings.
            p_.view.setCurrentRevisionLabel(app.CurrentRevision.str());
            p_.view.setSettingsControlsEnabled(true);
            return true;
        }
    }
    app.StepResult = false;
    p_.engine.RunStage(kStageEnterDownload, 0);
    if (!app.StepResult) {
        p_.dialogs.critical(p_.texts.MessageTable[kMsgPortMissing]);
        p_.view.setSettingsControlsEnabled(true);
        p_.port.setSettings(app.PortSettings);
        p_.port.setHandshaking(app.PortHandshaking);
        return false;
    }
    p_.view.setCurrentRevisionLabel(app.CurrentRevision.str());
    p_.view.setSettingsControlsEnabled(true);
    return true;
}

bool FirmwareOperations::PrepareDownload() {
    if (!CheckDownloadFile(checkParts(), p_.app.FilePath, 0)) {
        p_.view.GoToPage(2);
        return false;
    }
    p_.app.NewRevision = StripFillers(p_.app.SelectedRevision.str());
    EstimatedTime = EstimateSeconds(TotalSize1());
    p_.view.setRemainingTime(2, RemTimeFormat(0));
    return true;
}

std::string FirmwareOperations::RemTimeFormat(int32_t bytes) const {
    return FormatRemainingTime(EstimatedTime, bytes);
}

}  // namespace zx917
