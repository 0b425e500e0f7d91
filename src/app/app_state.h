// The one program-wide state record that every room reads and writes.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "app/rev7.h"

namespace zx917 {

inline constexpr int16_t kNoRun = 9;  // ScriptStep value while no dialogue runs

struct AppState {
    std::string HexFolder;
    std::string SelectedFileName;
    std::string FilePath;
    Rev7 SelectedRevision;
    Rev7 NewRevision;
    Rev7 CurrentRevision;
    std::string Terminator;
    std::string PortSettings;
    int16_t PortHandshaking = 0;
    int16_t SpeedSwitchPending = 0;
    int16_t ScriptStage = 0;
    int16_t ScriptStep = 0;
    bool StepResult = false;
    std::string LineBuffer;
    std::string LastCommand;
    int16_t AnswerTimeout = 0;
    int16_t ElapsedTicks = 0;
    int16_t MaxResends = 0;
    int16_t Resends = 0;
    int16_t WaitTicks = 0;
    bool RestartRequested = false;
    int16_t RestartCount = 0;
    int32_t RestartPosition = 0;
    std::vector<uint8_t> RecordBytes;
    std::string AmpsSectionFlag;
    int32_t ProgressCount = 0;
    int32_t DownloadFileLength = 0;
};

// Serial defaults of every start: nothing is kept between runs.
inline constexpr const char* kDefaultSettings = "9600,n,8,1";
inline constexpr const char* kDefaultTerminator = "\r\n";

// The values start-up gives the shared state (the serial port gets its own in start-up).
void InitDefaults(AppState& app, const std::string& programFolder);

}  // namespace zx917
