#include "link/engine.h"

namespace zx917 {

Engine::Engine(const EngineParts& p)
    : app_(p.app),
      script_(p.script),
      port_(p.port),
      retry_(p.retry),
      rsRetry_(p.rsRetry),
      timer1_(p.timer1),
      pump_(p.pump),
      file_(p.file) {
    port_.setOnComm([this] { MSComm1_OnComm(); });
    retry_.setOnTick([this] { Retry_Timer(); });
    rsRetry_.setOnTick([this] { RS_Retry_Timer(); });
    timer1_.setOnTick([this] { Timer1_Timer(); });
}

const ScriptEntry& Engine::entry(int16_t stage, int16_t step) const {
    static const ScriptEntry kEmpty{};
    if (stage < 0 || stage >= kStages || step < 0 || step >= kSteps) return kEmpty;
    return script_[stage][step];
}

void Engine::RunStage(int16_t stage, int16_t step, const std::function<void()>& onTurn) {
    app_.ScriptStage = stage;
    app_.ScriptStep = step;
    RunCurrentStep(onTurn);
}

void Engine::RunCurrentStep(const std::function<void()>& onTurn) {
    log_.abortedByInstrument = false;
    log_.portLost = false;
    SendStep();
    WaitForRunEnd(onTurn);
}

void Engine::WaitForRunEnd(const std::function<void()>& onTurn) {
    while (running()) {
        pump_.processNextEvent();
        if (onTurn) onTurn();
    }
}

void Engine::FailRun(const std::string& why) {
    note("run failed: " + why);
    app_.StepResult = false;
    retry_.setEnabled(false);
    app_.ScriptStep = kNoRun;
    app_.LineBuffer.clear();
    app_.LastCommand.clear();
    forgetRun();
}

void Engine::failPort(const std::string& why) {
    log_.portLost = true;
    FailRun(why);
}

void Engine::forgetRun() {
    // A switch left pending would move the next run's first command to the download speed.
    app_.SpeedSwitchPending = 0;
    flippedSettings_.clear();
}

void Engine::MSComm1_OnComm() {
    app_.WaitTicks = 0;  // any event ends a wait in progress
    if (port_.commEvent() == kCommEvFailed) {
        if (running()) failPort("serial port failed: " + port_.errorText());
        return;
    }
    dsrBranch();
    sendBranch();
    receiveBranch();
}

}  // namespace zx917
