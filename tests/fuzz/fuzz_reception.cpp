// Fuzz target: line reception and answer matching over arbitrary bytes from the instrument,
// in every stage and step, with the timers running in simulated time.
#include <cstdint>
#include <string>

#include "support/sim_world.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size < 3) return 0;
    zx917::test::SimWorld w({}, false);
    w.pump.limitMs = 2'000'000;
    w.app.NewRevision = "A.01.02";
    w.app.Terminator = data[2] % 3 == 0 ? "\r\n" : data[2] % 3 == 1 ? "\r" : "\n";
    w.app.RecordBytes = {0x00, 0x06, 0x3A, 0x00, 0x00, 0x00, 0x01, 0xFF};
    // A run starts only at a step that has a command, as the callers start them.
    int16_t stage = static_cast<int16_t>(data[0] % 9);
    int16_t step = static_cast<int16_t>(data[1] % 10);
    while (w.script[stage][step].Command.empty()) step = static_cast<int16_t>((step + 1) % 10);
    w.app.ScriptStage = stage;
    w.app.ScriptStep = step;
    // The instrument's bytes arrive in chunks split at 0xFF bytes, 300 ms apart.
    std::string chunk;
    int64_t at = 100;
    for (size_t i = 3; i <= size; ++i) {
        if (i == size || data[i] == 0xFF) {
            w.port.inject(chunk, at);
            if (i % 7 == 0) w.port.raiseDsr(at + 50);
            at += 300;
            chunk.clear();
        } else {
            chunk.push_back(static_cast<char>(data[i]));
        }
    }
    try {
        w.engine.SendStep();
        w.engine.WaitForRunEnd();
    } catch (const std::runtime_error&) {
        __builtin_trap();  // a run that never ends: no time-out left to end it
    }
    // Whatever the instrument said, the run ended, and a line being assembled stays bounded.
    if (w.app.ScriptStep != zx917::kNoRun || w.app.LineBuffer.size() > 4096) __builtin_trap();
    return 0;
}
