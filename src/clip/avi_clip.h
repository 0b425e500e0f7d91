// AVI clips of uncompressed 8- or 24-bit frames or RLE8: read into frames for the transfer
// page's player, and written by our clip generator. The reader never reads outside the bytes it
// is given and refuses clips larger than a small player needs.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace zx917 {

struct AviClip {
    int width = 0;
    int height = 0;
    int32_t microsecondsPerFrame = 100000;
    // Each frame top row first, one 0xAARRGGBB pixel a 32-bit word (alpha always 0xFF).
    std::vector<std::vector<uint32_t>> frames;
};

inline constexpr int kAviMaxSide = 1024;
inline constexpr std::size_t kAviMaxFrames = 2000;
inline constexpr std::size_t kAviMaxPixels = 16u * 1024 * 1024;  // all frames together
inline constexpr std::size_t kAviMaxFileBytes = 32u * 1024 * 1024;

// Nothing when the bytes are no AVI clip we can play (truncated, corrupt, another codec, too
// large). A clip whose header is sound but some frames are not keeps the frames before them.
std::optional<AviClip> ReadAvi(std::span<const uint8_t> bytes);
std::optional<AviClip> ReadAviFile(const std::string& path);

// An 8-bit clip: every frame an index into the palette (up to 256 colours, 0x00RRGGBB), top row
// first. RLE8 or uncompressed frames.
struct AviPaletteClip {
    int width = 0;
    int height = 0;
    int32_t microsecondsPerFrame = 100000;
    std::vector<uint32_t> palette;
    std::vector<std::vector<uint8_t>> frames;
};
std::vector<uint8_t> WriteAvi(const AviPaletteClip& clip, bool rle8);

}  // namespace zx917
