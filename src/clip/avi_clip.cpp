#include "clip/avi_clip.h"

#include <algorithm>
#include <cstring>
#include <fstream>

namespace zx917 {

namespace {

constexpr uint32_t kBiRgb = 0;
constexpr uint32_t kBiRle8 = 1;

// A bounded view: every read checks that the bytes are there.
class Reader {
public:
    explicit Reader(std::span<const uint8_t> b) : b_(b) {}
    bool has(std::size_t n) const { return n <= b_.size() - pos_; }
    std::size_t pos() const { return pos_; }
    std::size_t size() const { return b_.size(); }
    bool skip(std::size_t n) {
        if (!has(n)) return false;
        pos_ += n;
        return true;
    }
    bool u32(uint32_t& v) {
        if (!has(4)) return false;
        v = b_[pos_] | b_[pos_ + 1] << 8 | b_[pos_ + 2] << 16 |
            static_cast<uint32_t>(b_[pos_ + 3]) << 24;
        pos_ += 4;
        return true;
    }
    bool fourcc(std::string& v) {
        if (!has(4)) return false;
        v.assign(reinterpret_cast<const char*>(b_.data() + pos_), 4);
        pos_ += 4;
        return true;
    }
    std::span<const uint8_t> take(std::size_t n) {
        n = std::min(n, b_.size() - pos_);
        auto s = b_.subspan(pos_, n);
        pos_ += n;
        return s;
    }

private:
    std::span<const uint8_t> b_;
    std::size_t pos_ = 0;
};

uint32_t le32(std::span<const uint8_t> b, std::size_t at) {
    if (at + 4 > b.size()) return 0;
    return b[at] | b[at + 1] << 8 | b[at + 2] << 16 | static_cast<uint32_t>(b[at + 3]) << 24;
}
uint16_t le16(std::span<const uint8_t> b, std::size_t at) {
    if (at + 2 > b.size()) return 0;
    return static_cast<uint16_t>(b[at] | b[at + 1] << 8);
}

struct Chunk {
    std::string id;
    std::string listType;  // for LIST and RIFF
    std::span<const uint8_t> body;
};

// The chunks of a list body, in order; a chunk cut short ends the list with what it holds.
std::vector<Chunk> chunks(std::span<const uint8_t> body) {
    std::vector<Chunk> out;
    Reader r(body);
    while (r.has(8)) {
        Chunk c;
        uint32_t size = 0;
        r.fourcc(c.id);
        r.u32(size);
        if (c.id == "LIST" || c.id == "RIFF") {
            if (size < 4 || !r.fourcc(c.listType)) break;
            size -= 4;
        }
        c.body = r.take(size);
        out.push_back(c);
        if (c.body.size() < size) break;
        if (size % 2 == 1) r.skip(1);  // chunks are word-aligned
    }
    return out;
}

const Chunk* find(const std::vector<Chunk>& list, const char* id, const char* listType = "") {
    for (const Chunk& c : list) {
        if (c.id == id && c.listType == listType) return &c;
    }
    return nullptr;
}

struct Format {
    int width = 0, height = 0;
    bool bottomUp = true;
    int bits = 0;
    uint32_t compression = 0;
    std::vector<uint32_t> palette;
};

std::optional<Format> readFormat(std::span<const uint8_t> strf) {
    if (strf.size() < 40) return std::nullopt;
    const uint32_t headerSize = le32(strf, 0);
    if (headerSize < 40 || headerSize > strf.size()) return std::nullopt;
    Format f;
    const auto w = static_cast<int32_t>(le32(strf, 4));
    const auto h = static_cast<int32_t>(le32(strf, 8));
    f.bits = le16(strf, 14);
    f.compression = le32(strf, 16);
    if (w <= 0 || w > kAviMaxSide || h == 0 || h < -kAviMaxSide || h > kAviMaxSide)
        return std::nullopt;
    f.width = w;
    f.height = h < 0 ? -h : h;
    f.bottomUp = h > 0;
    const bool ok = (f.compression == kBiRgb && (f.bits == 8 || f.bits == 24)) ||
                    (f.compression == kBiRle8 && f.bits == 8 && f.bottomUp);
    if (!ok) return std::nullopt;
    if (f.bits == 8) {
        uint32_t colours = le32(strf, 32);
        if (colours == 0 || colours > 256) colours = 256;
        const std::size_t available = (strf.size() - headerSize) / 4;
        colours = static_cast<uint32_t>(std::min<std::size_t>(colours, available));
        if (colours == 0) return std::nullopt;
        f.palette.resize(256, 0xFF000000u);
        for (uint32_t i = 0; i < colours; ++i) {
            const std::size_t at = headerSize + 4 * i;
            f.palette[i] = 0xFF000000u | strf[at + 2] << 16 | strf[at + 1] << 8 | strf[at];
        }
    }
    return f;
}

// Pixel (x, y) of the stored bitmap, y counted in stored order.
void put(std::vector<uint32_t>& frame, const Format& f, int x, int storedY, uint32_t pixel) {
    const int y = f.bottomUp ? f.height - 1 - storedY : storedY;
    frame[static_cast<std::size_t>(y) * f.width + x] = pixel;
}

bool decodeRaw(std::span<const uint8_t> data, const Format& f, std::vector<uint32_t>& frame) {
    const std::size_t stride =
        ((static_cast<std::size_t>(f.width) * f.bits / 8) + 3) & ~std::size_t{3};
    if (data.size() < stride * f.height) return false;
    for (int y = 0; y < f.height; ++y) {
        const uint8_t* row = data.data() + stride * y;
        for (int x = 0; x < f.width; ++x) {
            uint32_t pixel;
            if (f.bits == 8) {
                pixel = f.palette[row[x]];
            } else {
                const uint8_t* p = row + 3 * x;
                pixel = 0xFF000000u | p[2] << 16 | p[1] << 8 | p[0];
            }
            put(frame, f, x, y, pixel);
        }
    }
    return true;
}

// RLE8 as the DIB format defines it; runs and moves that leave the bitmap are clipped.
bool decodeRle8(std::span<const uint8_t> data, const Format& f, std::vector<uint32_t>& frame) {
    std::fill(frame.begin(), frame.end(), f.palette[0]);
    int x = 0, y = 0;
    std::size_t i = 0;
    auto plot = [&](uint8_t index) {
        if (x >= f.width) return;  // clipped; x never grows past the row
        put(frame, f, x, y, f.palette[index]);
        ++x;
    };
    while (i + 1 < data.size() && y < f.height) {
        const uint8_t count = data[i], value = data[i + 1];
        i += 2;
        if (count > 0) {
            for (int k = 0; k < count; ++k) plot(value);
        } else if (value == 0) {
            x = 0;
            ++y;
        } else if (value == 1) {
            return true;
        } else if (value == 2) {
            if (i + 1 >= data.size()) return false;
            x = std::min(x + data[i], f.width);
            y += data[i + 1];
            i += 2;
        } else {
            if (value > data.size() - i) return false;
            for (int k = 0; k < value; ++k) plot(data[i + k]);
            i += value + (value & 1);
        }
    }
    return true;
}

void moviFrames(std::span<const uint8_t> movi, std::vector<std::span<const uint8_t>>& out) {
    for (const Chunk& c : chunks(movi)) {
        if (out.size() >= kAviMaxFrames) return;
        if (c.id == "LIST" && c.listType == "rec ") {
            moviFrames(c.body, out);
        } else if (c.id.size() == 4 && c.id.compare(0, 2, "00") == 0 &&
                   (c.id.compare(2, 2, "db") == 0 || c.id.compare(2, 2, "dc") == 0)) {
            out.push_back(c.body);
        }
    }
}

}  // namespace

std::optional<AviClip> ReadAvi(std::span<const uint8_t> bytes) {
    const auto top = chunks(bytes);
    const Chunk* riff = find(top, "RIFF", "AVI ");
    if (riff == nullptr) return std::nullopt;
    const auto body = chunks(riff->body);
    const Chunk* hdrl = find(body, "LIST", "hdrl");
    const Chunk* movi = find(body, "LIST", "movi");
    if (hdrl == nullptr || movi == nullptr) return std::nullopt;
    const auto header = chunks(hdrl->body);
    const Chunk* avih = find(header, "avih");
    const Chunk* strl = find(header, "LIST", "strl");
    if (avih == nullptr || strl == nullptr || avih->body.size() < 40) return std::nullopt;
    const auto stream = chunks(strl->body);
    const Chunk* strh = find(stream, "strh");
    const Chunk* strf = find(stream, "strf");
    if (strh == nullptr || strf == nullptr || strh->body.size() < 32) return std::nullopt;
    if (std::memcmp(strh->body.data(), "vids", 4) != 0) return std::nullopt;
    const auto format = readFormat(strf->body);
    if (!format) return std::nullopt;

    AviClip clip;
    clip.width = format->width;
    clip.height = format->height;
    int64_t us = le32(avih->body, 0);
    const uint32_t scale = le32(strh->body, 20), rate = le32(strh->body, 24);
    if (us == 0 && scale > 0 && rate > 0) us = int64_t{1000000} * scale / rate;
    clip.microsecondsPerFrame =
        static_cast<int32_t>(std::clamp<int64_t>(us ? us : 100000, 10000, 2000000));

    std::vector<std::span<const uint8_t>> data;
    moviFrames(movi->body, data);
    const std::size_t pixels = static_cast<std::size_t>(clip.width) * clip.height;
    for (const auto& d : data) {
        if ((clip.frames.size() + 1) * pixels > kAviMaxPixels) break;
        std::vector<uint32_t> frame(pixels, 0xFF000000u);
        const bool ok = format->compression == kBiRle8 ? decodeRle8(d, *format, frame)
                                                       : decodeRaw(d, *format, frame);
        if (!ok) break;
        clip.frames.push_back(std::move(frame));
    }
    if (clip.frames.empty()) return std::nullopt;
    return clip;
}

std::optional<AviClip> ReadAviFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    if (!in) return std::nullopt;
    const std::streamoff size = in.tellg();
    if (size <= 0 || static_cast<std::size_t>(size) > kAviMaxFileBytes) return std::nullopt;
    std::vector<uint8_t> bytes(static_cast<std::size_t>(size));
    in.seekg(0);
    if (!in.read(reinterpret_cast<char*>(bytes.data()), size)) return std::nullopt;
    return ReadAvi(bytes);
}

namespace {

class Writer {
public:
    void fourcc(const char* id) { out.insert(out.end(), id, id + 4); }
    void u32(uint32_t v) {
        for (int i = 0; i < 4; ++i) out.push_back(static_cast<uint8_t>(v >> (8 * i)));
    }
    void u16(uint16_t v) {
        out.push_back(static_cast<uint8_t>(v));
        out.push_back(static_cast<uint8_t>(v >> 8));
    }
    // Starts a chunk (and a list type); end() fills in its size.
    std::size_t begin(const char* id, const char* listType = nullptr) {
        fourcc(id);
        const std::size_t at = out.size();
        u32(0);
        if (listType != nullptr) fourcc(listType);
        return at;
    }
    void end(std::size_t at) {
        const auto size = static_cast<uint32_t>(out.size() - at - 4);
        for (int i = 0; i < 4; ++i) out[at + i] = static_cast<uint8_t>(size >> (8 * i));
        if (size % 2 == 1) out.push_back(0);
    }
    std::vector<uint8_t> out;
};

std::vector<uint8_t> rle8Row(const uint8_t* row, int width) {
    std::vector<uint8_t> out;
    for (int x = 0; x < width;) {
        int run = 1;
        while (x + run < width && run < 255 && row[x + run] == row[x]) ++run;
        out.push_back(static_cast<uint8_t>(run));
        out.push_back(row[x]);
        x += run;
    }
    out.push_back(0);
    out.push_back(0);  // end of line
    return out;
}

std::vector<uint8_t> frameData(const AviPaletteClip& clip, const std::vector<uint8_t>& frame,
                               bool rle8) {
    std::vector<uint8_t> out;
    const std::size_t stride = (static_cast<std::size_t>(clip.width) + 3) & ~std::size_t{3};
    for (int y = clip.height - 1; y >= 0; --y) {  // bottom-up
        const uint8_t* row = frame.data() + static_cast<std::size_t>(y) * clip.width;
        if (rle8) {
            const auto r = rle8Row(row, clip.width);
            out.insert(out.end(), r.begin(), r.end());
        } else {
            out.insert(out.end(), row, row + clip.width);
            out.resize(out.size() + stride - clip.width, 0);
        }
    }
    if (rle8) {
        out.push_back(0);
        out.push_back(1);  // end of bitmap
    }
    return out;
}

}  // namespace

std::vector<uint8_t> WriteAvi(const AviPaletteClip& clip, bool rle8) {
    Writer w;
    const auto frames = static_cast<uint32_t>(clip.frames.size());
    const auto colours = static_cast<uint32_t>(clip.palette.size());
    const std::size_t riff = w.begin("RIFF", "AVI ");
    const std::size_t hdrl = w.begin("LIST", "hdrl");
    const std::size_t avih = w.begin("avih");
    for (uint32_t v :
         {static_cast<uint32_t>(clip.microsecondsPerFrame), 0u, 0u, 0x10u, frames, 0u, 1u, 0u,
          static_cast<uint32_t>(clip.width), static_cast<uint32_t>(clip.height), 0u, 0u, 0u, 0u})
        w.u32(v);
    w.end(avih);
    const std::size_t strl = w.begin("LIST", "strl");
    const std::size_t strh = w.begin("strh");
    w.fourcc("vids");
    w.fourcc(rle8 ? "mrle" : "DIB ");
    for (uint32_t v : {0u, 0u, 0u, static_cast<uint32_t>(clip.microsecondsPerFrame), 1000000u, 0u,
                       frames, 0u, 0xFFFFFFFFu, 0u})
        w.u32(v);
    w.u16(0);
    w.u16(0);
    w.u16(static_cast<uint16_t>(clip.width));
    w.u16(static_cast<uint16_t>(clip.height));
    w.end(strh);
    const std::size_t strf = w.begin("strf");
    w.u32(40);
    w.u32(static_cast<uint32_t>(clip.width));
    w.u32(static_cast<uint32_t>(clip.height));
    w.u16(1);
    w.u16(8);
    w.u32(rle8 ? kBiRle8 : kBiRgb);
    w.u32(0);
    w.u32(0);
    w.u32(0);
    w.u32(colours);
    w.u32(0);
    for (uint32_t c : clip.palette) {
        w.out.push_back(static_cast<uint8_t>(c));
        w.out.push_back(static_cast<uint8_t>(c >> 8));
        w.out.push_back(static_cast<uint8_t>(c >> 16));
        w.out.push_back(0);
    }
    w.end(strf);
    w.end(strl);
    w.end(hdrl);
    const std::size_t movi = w.begin("LIST", "movi");
    std::vector<std::pair<uint32_t, uint32_t>> index;
    for (const auto& frame : clip.frames) {
        const auto data = frameData(clip, frame, rle8);
        index.emplace_back(static_cast<uint32_t>(w.out.size() - movi - 4),
                           static_cast<uint32_t>(data.size()));
        const std::size_t c = w.begin(rle8 ? "00dc" : "00db");
        w.out.insert(w.out.end(), data.begin(), data.end());
        w.end(c);
    }
    w.end(movi);
    const std::size_t idx = w.begin("idx1");
    for (const auto& [offset, size] : index) {
        w.fourcc(rle8 ? "00dc" : "00db");
        w.u32(0x10);  // key frame
        w.u32(offset);
        w.u32(size);
    }
    w.end(idx);
    w.end(riff);
    return w.out;
}

}  // namespace zx917
