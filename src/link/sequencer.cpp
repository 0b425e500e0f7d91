// The sequencer: SendStep puts the current step on the line and arms its time-out; the send
// branch switches the line to the download speed after "MAINTENANCE:DOWNLOAD".
#include "link/engine.h"

namespace zx917 {

namespace {
constexpr int16_t kRestartWaitTicks = 40;
const std::string kLF = "\n";

int16_t lastRecordTimeout(int16_t stage) {
    if (stage == 4) return 40;
    if (stage == 7) return 305;
    return 320;
}
}  // namespace

void Engine::arm(int16_t maxResends, int16_t timeout) {
    app_.MaxResends = maxResends;
    app_.AnswerTimeout = timeout;
    app_.Resends = 0;
    app_.ElapsedTicks = 0;
    retry_.setEnabled(true);
}

void Engine::SendStep() {
    const bool firstSend = !resending_;
    for (;;) {
        if (app_.ScriptStep > kNoRun) {
            app_.ScriptStep = kNoRun;
            return;
        }
        const ScriptEntry& e = current();
        if (e.Command.empty()) return;
        if (!sendCommand(e, firstSend)) return;
        if (!current().Answer.empty()) return;
        ++app_.ScriptStep;
    }
}

bool Engine::sendCommand(const ScriptEntry& e, bool first) {
    const std::string& c = e.Command;
    const int16_t stage = app_.ScriptStage;
    if (c == "SYSTem:ERRor?" || c == "*IDN?") {
        if (first) arm(2, c == "*IDN?" ? 5 : 1);
        app_.LastCommand = c;
        return sendText(app_.LastCommand + app_.Terminator);
    }
    if (c == "MAINTENANCE:DOWNLOAD") {
        if (first) {
            arm(1, 25);
            flippedSettings_.clear();
            app_.SpeedSwitchPending = 1;
            app_.PortSettings = port_.settings();
            app_.PortHandshaking = port_.handshaking();
        } else if (!reopenForResend()) {
            return false;
        }
        app_.LastCommand = c;
        return sendText(app_.LastCommand + kLF);
    }
    if (c == "REVD" || c == "REVC") {
        if (first) arm(2, 3);
        BuildRevisionCommand();
        return sendText(app_.LastCommand + kLF);
    }
    if (c == "OPEN" || c == "CLOSE") {
        if (first) arm(2, c == "OPEN" ? 320 : 3);
        app_.LastCommand = c;
        return sendText(app_.LastCommand + kLF);
    }
    if (c == "REBOOT") {
        if (first) {
            if (!restartWait()) return false;
            arm(1, 3);
        }
        app_.LastCommand = c;
        return sendText(app_.LastCommand + kLF);
    }
    // Records are armed at their first send only, so that the resend limit holds for them.
    if (c == "DLS" || c == "DL") {
        if (first) arm(2, c == "DLS" ? 40 : 5);
        const bool sent = sendBytes(app_.RecordBytes);
        if (sent && first) ++log_.recordsSent;
        return sent;
    }
    if (c == "DLE") {
        if (first) arm(2, lastRecordTimeout(stage));
        const bool sent = sendBytes(app_.RecordBytes);
        if (sent && first) ++log_.recordsSent;
        if (sent) timer1_.setEnabled(true);
        return sent;
    }
    if (c == "EP") {
        arm(0, 5);
        app_.RecordBytes.assign(2, 0);
        const bool sent = sendBytes(app_.RecordBytes);
        timer1_.setEnabled(false);
        return sent;
    }
    if (first) {
        arm(0, c.starts_with("SP") ? 5 : 10);
        app_.LastCommand = c;
    }
    return sendText(app_.LastCommand + kLF);
}

bool Engine::sendText(const std::string& text) {
    if (port_.output(text)) return true;
    failPort("could not send: " + port_.errorText());
    return false;
}

bool Engine::sendBytes(const std::vector<uint8_t>& bytes) {
    if (port_.output(std::span<const uint8_t>(bytes))) return true;
    failPort("could not send: " + port_.errorText());
    return false;
}

// The resend goes out at the user's settings with the parity flipped between even and odd, in
// case the instrument's parity is the other one; the send event switches speed again. The
// user's own settings stay in PortSettings for the way back, unless the instrument answers at
// the flipped parity (see MatchAnswer).
bool Engine::reopenForResend() {
    std::string s = app_.PortSettings;
    if (s.size() >= 5) {
        char& p = s[s.size() - 5];
        if (p == 'E' || p == 'e') {
            p = 'O';
        } else if (p == 'O' || p == 'o') {
            p = 'E';
        }
    }
    flippedSettings_ = s;
    note("resend at " + s);
    port_.setPortOpen(false);
    app_.SpeedSwitchPending = 1;
    bool ok = port_.setSettings(s);
    ok = port_.setHandshaking(app_.PortHandshaking) && ok;
    ok = port_.setPortOpen(true) && ok;
    if (!ok) failPort("could not reopen the port: " + port_.errorText());
    return ok;
}

// Waits up to 40 s before "REBOOT"; any event of the port ends the wait at once.
bool Engine::restartWait() {
    const int16_t stage = app_.ScriptStage;
    const int16_t step = app_.ScriptStep;
    rsRetry_.setEnabled(true);
    app_.WaitTicks = kRestartWaitTicks;
    while (app_.WaitTicks > 0) pump_.processNextEvent();
    // A run ended while waiting (abort, DSR, port failure) sends nothing more.
    return app_.ScriptStage == stage && app_.ScriptStep == step;
}

void Engine::BuildRevisionCommand() {
    app_.LastCommand = current().Command + " " + app_.NewRevision.str() + kLF;
}

void Engine::sendBranch() {
    if (port_.commEvent() != kCommEvSend || app_.SpeedSwitchPending != 1) return;
    if (!running()) {  // the run that asked for the switch has ended
        app_.SpeedSwitchPending = 0;
        return;
    }
    note(std::string("switch to ") + kDownloadSettings);
    port_.setPortOpen(false);
    bool ok = port_.setSettings(kDownloadSettings);
    ok = port_.setHandshaking(kDownloadHandshaking) && ok;
    ok = port_.setPortOpen(true) && ok;
    app_.SpeedSwitchPending = 0;
    if (!ok) failPort("could not switch speed: " + port_.errorText());
}

}  // namespace zx917
