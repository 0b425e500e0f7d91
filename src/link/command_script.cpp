#include "link/command_script.h"

#include <cstdint>

namespace zx917 {

namespace {

struct Row {
    int8_t stage;
    int8_t step;
    const char* command;
    const char* answer;
};

constexpr Row kScript[] = {
    {0, 0, "*CLS", ""},
    {0, 1, "DISPlay:CONFigure", ""},
    {0, 2, "SYSTem:ERRor?", "*,\""},
    {0, 3, "*IDN?", "Quorvex"},
    {1, 0, "*IDN?", "Quorvex"},
    {2, 0, "MAINTENANCE:DOWNLOAD", "DOWNLOAD READY"},
    {2, 1, "REVD", "REV"},
    {3, 0, "REVD", "REV"},
    {3, 1, "OPEN", "OPEN"},
    {4, 0, "SP2", "SP2"},
    {4, 2, "DLS", "P2A"},
    {4, 4, "DL", "P2A"},
    {4, 6, "DLE", "P2A"},
    {4, 8, "EP", "EP2"},
    {5, 0, "SP3", "SP3"},
    {5, 2, "DLS", "P3A"},
    {5, 4, "DL", "P3A"},
    {5, 6, "DLE", "P3A"},
    {5, 8, "EP", "EP3"},
    {6, 0, "SP4", "SP4"},
    {6, 2, "DLS", "P4A"},
    {6, 4, "DL", "P4A"},
    {6, 6, "DLE", "P4A"},
    {6, 8, "EP", "EP4"},
    {7, 0, "SP1", "SP1"},
    {7, 2, "DLS", "P1A"},
    {7, 4, "DL", "P1A"},
    {7, 6, "DLE", "P1A"},
    {7, 8, "EP", "EP1"},
    {8, 0, "CLOSE", "CLOSE"},
    {8, 1, "REVC", "REV"},
    {8, 2, "REBOOT", "REBOOT"},
};

}  // namespace

void InitCommandScript(CommandScript& script) {
    for (auto& stage : script) stage.fill(ScriptEntry{});
    for (const Row& r : kScript) script[r.stage][r.step] = ScriptEntry{r.command, r.answer};
}

}  // namespace zx917
