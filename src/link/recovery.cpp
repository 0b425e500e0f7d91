// Timers, resends and recovery: Retry, RS_Retry and Timer1, the instrument's abort and restart
// requests, and the rise of its DSR line.
#include <limits>

#include "link/engine.h"
#include "link/wildcard.h"

namespace zx917 {

namespace {
constexpr int32_t kProgressTick = 255;
}

void Engine::Retry_Timer() {
    if (app_.AnswerTimeout >= app_.ElapsedTicks) {
        ++app_.ElapsedTicks;
        return;
    }
    if (app_.Resends < app_.MaxResends) {
        if (running()) {
            note("time-out, resend " + std::to_string(app_.Resends + 1) + " of " +
                 std::to_string(app_.MaxResends) + ": " + current().Command);
        }
        resending_ = true;
        ++log_.resends;
        SendStep();
        resending_ = false;
        app_.ElapsedTicks = 0;
        ++app_.Resends;
        return;
    }
    if (running()) note("time-out, given up: " + current().Command);
    retry_.setEnabled(false);
    app_.LineBuffer.clear();
    app_.StepResult = false;
    app_.ScriptStep = kNoRun;
    app_.ElapsedTicks = 0;
    forgetRun();
}

void Engine::RS_Retry_Timer() {
    if (app_.WaitTicks != 0) {
        --app_.WaitTicks;
    } else {
        rsRetry_.setEnabled(false);
    }
}

void Engine::Timer1_Timer() {
    constexpr int32_t kMax = std::numeric_limits<int32_t>::max();
    app_.ProgressCount =
        app_.ProgressCount > kMax - kProgressTick ? kMax : app_.ProgressCount + kProgressTick;
}

void Engine::CheckAbortRestart() {
    const std::string line = app_.LineBuffer;
    if (WildcardMatch(line, "*ABORT*")) {
        abortRun("abort requested: " + line);
        return;
    }
    if (!WildcardMatch(line, "RESTART:*") || app_.ScriptStep < 1) return;
    const std::string request = "RESTART:" + entry(app_.ScriptStage, 2).Answer.substr(0, 2);
    if (line != request) return;
    // Outside the memory areas a restart would end the run looking like a success.
    const bool inArea = app_.ScriptStage >= 4 && app_.ScriptStage <= 7;
    if (!inArea) {
        abortRun("restart requested outside the memory areas: " + line);
    } else if (app_.RestartCount < 2) {
        restartArea(request);
    } else {
        abortRun("third restart requested: " + line);
    }
}

void Engine::abortRun(const std::string& why) {
    note(why);
    log_.abortedByInstrument = true;
    app_.StepResult = false;
    retry_.setEnabled(false);
    app_.ScriptStep = kNoRun;
    app_.LineBuffer.clear();
    port_.clearOutBuffer();
    forgetRun();
}

void Engine::restartArea(const std::string& request) {
    note("restart granted: " + request);
    ++log_.restarts;
    app_.LineBuffer.clear();
    // A peer that holds the line stopped keeps the queue full: the run's own give-up (or an
    // abort) must still end the drain, and then the run's end decides.
    while (running() && port_.portOpen() && port_.outBufferCount() > 0) pump_.processNextEvent();
    if (!running()) return;
    port_.clearOutBuffer();
    if (!port_.output(app_.Terminator + request + app_.Terminator)) {
        failPort("could not echo the restart: " + port_.errorText());
        return;
    }
    app_.LastCommand.clear();
    if (file_.isOpen()) file_.seek(app_.RestartPosition);
    ++app_.RestartCount;
    ++app_.MaxResends;
    app_.ScriptStep = kNoRun;
    app_.RestartRequested = true;
}

void Engine::dsrBranch() {
    if (port_.commEvent() != kCommEvDsr || !port_.dsrHolding()) return;
    const bool wasRunning = running();
    // The instrument restarting is the expected end of "REBOOT" only.
    const bool atReboot = wasRunning && current().Command == "REBOOT";
    note("DSR raised");
    // With the port closed no resend or give-up may act: the recovery decides the result.
    retry_.setEnabled(false);
    port_.setPortOpen(false);
    rsRetry_.setEnabled(true);
    app_.WaitTicks = 1;
    while (app_.WaitTicks > 0) pump_.processNextEvent();
    const bool reopened = port_.setPortOpen(true);
    // The rest of a line begun before the restart went with the closed port.
    app_.LineBuffer.clear();
    app_.ScriptStep = kNoRun;
    retry_.setEnabled(false);
    forgetRun();
    if (wasRunning && !atReboot) {
        note("instrument restarted before it answered");
        app_.StepResult = false;
    }
    if (!reopened) note("could not reopen the port: " + port_.errorText());
}

}  // namespace zx917
