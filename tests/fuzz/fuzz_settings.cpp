// Fuzz target: the serial adapter's settings string parser, and the settings page's taking
// apart of any settings text.
#include <cstdint>
#include <string>

#include "link/line_settings.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    // Taken apart and put together again, a text keeps its length: nothing read outside it.
    if (const auto f = zx917::SettingsFieldsOf(text)) {
        const std::string back =
            zx917::SettingsTextOf(f->speed, f->parity, f->dataBits, f->stopBits);
        if (f->speed.empty() || f->parity.size() != 1 || f->dataBits.size() != 1) __builtin_trap();
        if (back.size() > text.size()) __builtin_trap();
    }
    const auto s = zx917::ParseLineSettings(text);
    if (!s) return 0;
    // What was accepted reads back the same and parses to the same value.
    const auto again = zx917::ParseLineSettings(s->str());
    if (!again || !(*again == *s)) __builtin_trap();
    if (s->baud <= 0 || s->dataBits < 5 || s->dataBits > 8) __builtin_trap();
    return 0;
}
