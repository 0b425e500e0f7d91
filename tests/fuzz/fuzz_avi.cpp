// The transfer clip's reader on any bytes: no crash, no read outside them, bounded memory.
#include <cstddef>
#include <cstdint>

#include "clip/avi_clip.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (const auto clip = zx917::ReadAvi(std::span(data, size))) {
        std::size_t pixels = 0;
        for (const auto& f : clip->frames) pixels += f.size();
        if (pixels > zx917::kAviMaxPixels) __builtin_trap();
    }
    return 0;
}
