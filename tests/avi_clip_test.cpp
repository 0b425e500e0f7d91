// The clip reader on our own clips and on truncated, oversized and corrupt ones: it plays what
// it can, refuses the rest, and never reads outside the bytes (the sanitizer build checks).
#include "clip/avi_clip.h"

#include <gtest/gtest.h>

#include <random>

namespace zx917 {
namespace {

AviPaletteClip sampleClip() {
    AviPaletteClip c;
    c.width = 13;  // odd: rows are padded
    c.height = 7;
    c.microsecondsPerFrame = 50000;
    c.palette = {0x102030, 0xFF0000, 0x00FF00, 0x0000FF};
    for (int f = 0; f < 5; ++f) {
        std::vector<uint8_t> px(c.width * c.height);
        for (int i = 0; i < c.width * c.height; ++i) px[i] = static_cast<uint8_t>((i / 3 + f) % 4);
        c.frames.push_back(px);
    }
    return c;
}

std::vector<uint32_t> expectedFrame(const AviPaletteClip& c, int f) {
    std::vector<uint32_t> out;
    for (uint8_t i : c.frames[f]) out.push_back(0xFF000000u | c.palette[i]);
    return out;
}

TEST(Avi_Read, OurClipsRoundTrip) {
    const AviPaletteClip clip = sampleClip();
    for (bool rle : {true, false}) {
        SCOPED_TRACE(rle ? "RLE8" : "uncompressed");
        const auto bytes = WriteAvi(clip, rle);
        const auto read = ReadAvi(bytes);
        ASSERT_TRUE(read);
        EXPECT_EQ(read->width, 13);
        EXPECT_EQ(read->height, 7);
        EXPECT_EQ(read->microsecondsPerFrame, 50000);
        ASSERT_EQ(read->frames.size(), 5u);
        for (int f = 0; f < 5; ++f) EXPECT_EQ(read->frames[f], expectedFrame(clip, f));
    }
}

// Cut anywhere: no clip, or the frames before the cut exactly.
TEST(Avi_Read, TruncatedAnywhere) {
    const AviPaletteClip clip = sampleClip();
    for (bool rle : {true, false}) {
        const auto bytes = WriteAvi(clip, rle);
        for (std::size_t n = 0; n < bytes.size(); ++n) {
            const auto read = ReadAvi(std::span(bytes.data(), n));
            if (!read) continue;
            ASSERT_LE(read->frames.size(), 5u) << n;
            for (std::size_t f = 0; f + 1 < read->frames.size(); ++f)
                EXPECT_EQ(read->frames[f], expectedFrame(clip, static_cast<int>(f))) << n;
        }
    }
}

// Headers that claim more than a player takes, or formats it does not play.
TEST(Avi_Read, RefusesOversizedAndForeignHeaders) {
    const auto good = WriteAvi(sampleClip(), false);
    // Offsets in our writer's layout: strf's BITMAPINFOHEADER starts after RIFF(12), hdrl
    // LIST(12), avih(8+56), strl LIST(12), strh(8+56) and strf's own 8 bytes.
    const std::size_t bih = 12 + 12 + 64 + 12 + 64 + 8;
    auto patch32 = [&](std::size_t at, uint32_t v) {
        auto b = good;
        for (int i = 0; i < 4; ++i) b[at + i] = static_cast<uint8_t>(v >> (8 * i));
        return b;
    };
    auto patch16 = [&](std::size_t at, uint16_t v) {
        auto b = good;
        b[at] = static_cast<uint8_t>(v);
        b[at + 1] = static_cast<uint8_t>(v >> 8);
        return b;
    };
    struct Case {
        const char* name;
        std::vector<uint8_t> bytes;
        bool plays = false;
    };
    const Case cases[] = {
        {"width 100000", patch32(bih + 4, 100000)},
        {"width 0", patch32(bih + 4, 0)},
        {"negative width", patch32(bih + 4, 0xFFFFFFF0u)},
        {"height 0", patch32(bih + 8, 0)},
        {"height -5000", patch32(bih + 8, static_cast<uint32_t>(-5000))},
        {"16 bits a pixel", patch16(bih + 14, 16)},
        {"another codec", patch32(bih + 16, 0x47504A4D)},  // MJPG
        {"header size past its chunk", patch32(bih, 4000)},
        // A size past the end is read as far as the bytes go.
        {"RIFF size of 4 GB", patch32(4, 0xFFFFFFFFu), true},
        {"hdrl size of 4 GB: swallows the frames", patch32(16, 0xFFFFFFFFu)},
        {"not RIFF", patch32(0, 0x58464952)},
        {"an audio stream", patch32(12 + 12 + 64 + 12 + 8, 0x73647561)},  // "auds"
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        const auto read = ReadAvi(c.bytes);
        ASSERT_EQ(read.has_value(), c.plays);
        if (c.plays) {
            EXPECT_EQ(read->frames.size(), 5u);
        }
    }
}

// Random damage: every answer is allowed but a crash or a read outside the bytes.
TEST(Avi_Read, CorruptClipsNeverCrash) {
    std::mt19937 rng(917);
    for (bool rle : {true, false}) {
        const auto good = WriteAvi(sampleClip(), rle);
        for (int round = 0; round < 3000; ++round) {
            auto b = good;
            const int flips = 1 + static_cast<int>(rng() % 8);
            for (int i = 0; i < flips; ++i) b[rng() % b.size()] = static_cast<uint8_t>(rng());
            if (const auto read = ReadAvi(b)) {
                EXPECT_LE(read->frames.size(), kAviMaxFrames);
                for (const auto& f : read->frames)
                    EXPECT_EQ(f.size(), static_cast<std::size_t>(read->width) * read->height);
            }
        }
    }
}

TEST(Avi_Read, MissingFileIsNoClip) {
    EXPECT_FALSE(ReadAviFile("/nonexistent/Filemove.avi"));
    EXPECT_FALSE(ReadAviFile("/"));
}

}  // namespace
}  // namespace zx917
