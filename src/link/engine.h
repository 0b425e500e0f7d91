// The protocol engine: puts the command script on the line, matches the answers, keeps the
// time-outs and handles the instrument's abort, restart and DSR signals. One per process.
#pragma once

#include <functional>
#include <string>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "link/command_script.h"
#include "link/event_pump.h"
#include "link/serial_port.h"
#include "link/timer.h"

namespace zx917 {

inline constexpr const char* kDownloadSettings = "38400,E,8,1";
inline constexpr int16_t kDownloadHandshaking = 3;

// What the line showed of the runs, for the service record of a download.
struct LineLog {
    std::string identity;           // the last identity answer accepted, as received
    std::string confirmedRevision;  // the revision named by the last answer to "REVC"
    int32_t recordsSent = 0;        // records put on the line (again after a restart), not resends
    int32_t resends = 0;
    int32_t restarts = 0;              // restarts of a memory area granted
    bool abortedByInstrument = false;  // the last run: the instrument's request ended it
    bool portLost = false;             // the last run: the port failed under it
};

struct EngineParts {
    AppState& app;
    const CommandScript& script;
    SerialPort& port;
    Timer& retry;    // 1000 ms: answer time-outs
    Timer& rsRetry;  // 1000 ms: waits
    Timer& timer1;   // 100 ms: progress while an area is programmed
    EventPump& pump;
    FileSlot& file;  // the download file, rewound on a restart
};

class Engine {
public:
    explicit Engine(const EngineParts& parts);
    Engine(const Engine&) = delete;
    Engine& operator=(const Engine&) = delete;

    // Runs one stage from a step and waits until it has ended; the result is in StepResult.
    // onTurn runs after every turn of the event loop while the stage runs.
    void RunStage(int16_t stage, int16_t step, const std::function<void()>& onTurn = {});
    // Sends the step already set up and waits for the run to end.
    void RunCurrentStep(const std::function<void()>& onTurn = {});
    // Turns the event loop until the run in progress has ended.
    void WaitForRunEnd(const std::function<void()>& onTurn = {});

    // Ends the run in progress as a failure (port failure, unreadable file).
    void FailRun(const std::string& why);

    // Events: time-outs, resends, aborts, restarts, DSR, port failures; for a trace file.
    void setTrace(std::function<void(const std::string&)> trace) { trace_ = std::move(trace); }

    // Handlers and operations, by the names of the dialogue's design.
    void MSComm1_OnComm();
    bool ReadLine();
    void MatchAnswer();
    bool CheckErrorAnswer();
    bool CheckIdnAnswer();
    bool CheckRevAnswer();
    bool CheckNewRevision();
    bool CheckAreaAnswer();
    void SendStep();
    void BuildRevisionCommand();
    void Retry_Timer();
    void RS_Retry_Timer();
    void Timer1_Timer();
    void CheckAbortRestart();

    bool running() const { return app_.ScriptStep < kNoRun; }
    LineLog& lineLog() { return log_; }

private:
    const ScriptEntry& entry(int16_t stage, int16_t step) const;
    const ScriptEntry& current() const { return entry(app_.ScriptStage, app_.ScriptStep); }
    void arm(int16_t maxResends, int16_t timeout);
    // Puts one step on the line; false when the run ended instead.
    bool sendCommand(const ScriptEntry& e, bool firstSend);
    bool sendText(const std::string& text);
    bool sendBytes(const std::vector<uint8_t>& bytes);
    bool reopenForResend();
    bool restartWait();
    void sendBranch();
    void receiveBranch();
    void dsrBranch();
    void abortRun(const std::string& why);
    // Ends the run because the port failed under it.
    void failPort(const std::string& why);
    // Every way a run ends: nothing of it may act on the next run.
    void forgetRun();
    void keepFlippedParity();
    void restartArea(const std::string& request);
    void note(const std::string& text) const {
        if (trace_) trace_(text);
    }

    AppState& app_;
    const CommandScript& script_;
    SerialPort& port_;
    Timer& retry_;
    Timer& rsRetry_;
    Timer& timer1_;
    EventPump& pump_;
    FileSlot& file_;
    bool resending_ = false;  // SendStep called by Retry_Timer for a resend
    // The settings of the last resend of "MAINTENANCE:DOWNLOAD", at the flipped parity; empty
    // when the line has not been flipped in this run.
    std::string flippedSettings_;
    std::function<void(const std::string&)> trace_;
    LineLog log_;
};

}  // namespace zx917
