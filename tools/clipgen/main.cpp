// zx917-clipgen: draws our transfer clip, a sheet flying from one folder to another, and writes
// it as an RLE8 AVI file.
//   zx917-clipgen OUTPUT.avi
#include <cmath>
#include <cstdio>
#include <fstream>
#include <iostream>

#include "clip/avi_clip.h"

namespace {

constexpr int kWidth = 208;
constexpr int kHeight = 52;
constexpr int kFrames = 16;
constexpr int32_t kFrameUs = 100000;  // ten frames a second: calm, and cheap to show

enum Colour : uint8_t { kBack, kFolder, kFolderDark, kOutline, kSheet, kText, kTab };

class Canvas {
public:
    std::vector<uint8_t> px = std::vector<uint8_t>(kWidth * kHeight, kBack);
    void fill(int x0, int y0, int x1, int y1, uint8_t c) {
        for (int y = std::max(0, y0); y < std::min(kHeight, y1); ++y)
            for (int x = std::max(0, x0); x < std::min(kWidth, x1); ++x) px[y * kWidth + x] = c;
    }
    void frame(int x0, int y0, int x1, int y1, uint8_t c) {
        fill(x0, y0, x1, y0 + 1, c);
        fill(x0, y1 - 1, x1, y1, c);
        fill(x0, y0, x0 + 1, y1, c);
        fill(x1 - 1, y0, x1, y1, c);
    }
};

// An open folder: back, tab, and the front flap lower down.
void folder(Canvas& c, int x) {
    const int top = 16, bottom = 48;
    c.fill(x + 2, top - 5, x + 16, top, kTab);
    c.frame(x + 2, top - 5, x + 16, top + 1, kOutline);
    c.fill(x, top, x + 44, bottom, kFolderDark);
    c.frame(x, top, x + 44, bottom, kOutline);
    c.fill(x + 3, top + 10, x + 47, bottom, kFolder);
    c.frame(x + 3, top + 10, x + 47, bottom, kOutline);
}

void sheet(Canvas& c, int x, int y) {
    c.fill(x, y, x + 16, y + 20, kSheet);
    c.frame(x, y, x + 16, y + 20, kOutline);
    for (int line = 0; line < 4; ++line)
        c.fill(x + 3, y + 4 + 4 * line, x + 13, y + 5 + 4 * line, kText);
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::cerr << "usage: zx917-clipgen OUTPUT.avi\n";
        return 2;
    }
    zx917::AviPaletteClip clip;
    clip.width = kWidth;
    clip.height = kHeight;
    clip.microsecondsPerFrame = kFrameUs;
    clip.palette = {0xF0F0F0, 0xF5C542, 0xD9A21B, 0x404040, 0xFFFFFF, 0x5078B4, 0xE8B530};
    const int fromX = 18, toX = kWidth - 18 - 16;
    for (int f = 0; f < kFrames; ++f) {
        Canvas c;
        folder(c, 4);
        folder(c, kWidth - 52);
        // The sheet rises out of the left folder, flies in an arc and drops into the right one.
        const double t = static_cast<double>(f) / (kFrames - 1);
        const int x = static_cast<int>(std::lround(fromX + (toX - fromX) * t));
        const int y = static_cast<int>(std::lround(22 - 20 * std::sin(t * 3.14159265358979)));
        sheet(c, x, y);
        // The folders' front flaps stay in front of the sheet near either end.
        if (t < 0.12 || t > 0.88) {
            const int fx = t < 0.5 ? 4 : kWidth - 52;
            c.fill(fx + 3, 26, fx + 47, 48, kFolder);
            c.frame(fx + 3, 26, fx + 47, 48, kOutline);
        }
        clip.frames.push_back(c.px);
    }
    const auto bytes = zx917::WriteAvi(clip, true);
    std::ofstream out(argv[1], std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()),
              static_cast<std::streamsize>(bytes.size()));
    if (!out) {
        std::cerr << "zx917-clipgen: cannot write " << argv[1] << "\n";
        return 1;
    }
    return 0;
}
