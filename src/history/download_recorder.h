// A download attempt as the front ends record it: what the shared state, the line and the file
// say about it, written to the service record when it starts and brought up to date when it
// ends. Recording never changes the download: every problem goes to the warning, once.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "app/app_state.h"
#include "history/service_record.h"
#include "link/engine.h"

namespace zx917 {

struct RecorderParts {
    AppState& app;
    Engine& engine;
    std::string frontEnd;                     // "wizard" or "command line"
    std::string historyPath;                  // DefaultHistoryPath() when empty
    std::string traceFile;                    // the support trace, when one is written
    std::function<std::string()> portDevice;  // the device path of the port in use
    ServiceRecord::Warn warn;
};

// The outcome of an attempt that ended: confirmed by the instrument, or why not.
std::string OutcomeOf(bool confirmed, const LineLog& line);

class DownloadRecorder {
public:
    explicit DownloadRecorder(RecorderParts parts);

    // The attempt starts: its row is written now, as "interrupted".
    void begin();
    // What is known by now (the identification, the file) goes into the row.
    void update();
    // The attempt ended with this outcome.
    void end(const std::string& outcome);
    bool inProgress() const { return inProgress_; }

private:
    void gather();

    RecorderParts p_;
    ServiceRecord record_;
    Attempt attempt_;
    LineLog atBegin_;
    std::chrono::steady_clock::time_point began_;
    std::string hashedPath_;  // the file whose size and hash the row holds
    bool inProgress_ = false;
};

}  // namespace zx917
