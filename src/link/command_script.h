// The whole dialogue with the instrument as data: 9 stages by 10 steps of command and answer.
#pragma once

#include <array>
#include <string>

namespace zx917 {

struct ScriptEntry {
    std::string Command;  // empty: a run ends at this step
    std::string Answer;   // start of the match pattern; empty: no answer awaited
};

inline constexpr int kStages = 9;
inline constexpr int kSteps = 10;

using CommandScript = std::array<std::array<ScriptEntry, kSteps>, kStages>;

// Stage numbers the callers run.
enum Stage : int16_t {
    kStageIdentify = 0,
    kStageIdnOnly = 1,
    kStageEnterDownload = 2,
    kStageOpen = 3,
    kStageClose = 8,
};
// Steps of the memory-area stages 4 to 7.
enum AreaStep : int16_t {
    kStepSelect = 0,
    kStepFirstRecord = 2,
    kStepRecord = 4,
    kStepLastRecord = 6,
    kStepEndArea = 8,
};

void InitCommandScript(CommandScript& script);

}  // namespace zx917
