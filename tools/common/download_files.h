// Builds download files of our own records (tests, demo, benchmarks): header, sections of Intel HEX
// or S-records, end marker.
#pragma once

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

namespace zx917::gen {

using Bytes = std::vector<uint8_t>;

// An Intel HEX record in binary form: ':', count, address, type, data, checksum.
inline Bytes IntelRecord(uint8_t type, uint16_t address, const Bytes& data) {
    Bytes r{0x3A, static_cast<uint8_t>(data.size()), static_cast<uint8_t>(address >> 8),
            static_cast<uint8_t>(address & 0xFF), type};
    r.insert(r.end(), data.begin(), data.end());
    unsigned sum = 0;
    for (std::size_t i = 1; i < r.size(); ++i) sum += r[i];
    r.push_back(static_cast<uint8_t>(-sum & 0xFF));
    return r;
}
inline Bytes IntelEnd() {
    return IntelRecord(1, 0, {});
}

// An S-record in binary form: 'S', type, count, address (2, 3 or 4 bytes), data, checksum.
inline Bytes SRecord(uint8_t type, uint32_t address, const Bytes& data) {
    const int addrLen = (type == 2 || type == 8) ? 3 : (type == 3 || type == 7) ? 4 : 2;
    Bytes r{0x53, type, static_cast<uint8_t>(addrLen + data.size() + 1)};
    for (int i = addrLen - 1; i >= 0; --i) r.push_back(static_cast<uint8_t>(address >> (8 * i)));
    r.insert(r.end(), data.begin(), data.end());
    unsigned sum = 0;
    for (std::size_t i = 2; i < r.size(); ++i) sum += r[i];
    r.push_back(static_cast<uint8_t>(~sum & 0xFF));
    return r;
}

// The record with its two big-endian length bytes in front.
inline Bytes Framed(const Bytes& record) {
    Bytes f{static_cast<uint8_t>(record.size() >> 8), static_cast<uint8_t>(record.size() & 0xFF)};
    f.insert(f.end(), record.begin(), record.end());
    return f;
}

inline Bytes DataBytes(std::size_t n, uint8_t seed) {
    Bytes d(n);
    for (std::size_t i = 0; i < n; ++i) d[i] = static_cast<uint8_t>(seed + i * 7);
    return d;
}

struct SectionLayout {
    std::string marker;          // e.g. "[MDSP]"
    std::vector<Bytes> records;  // unframed
};

struct FileLayout {
    std::string header =
        "A.01.02\r\nMDSP:A.01.02\r\nCDMA:A.01.02\r\nAMPS:A.01.02\r\nMPU:A.01.02\r\n";
    std::vector<SectionLayout> sections;
    std::string trailer = "[EOF]\r\n";
};

// Sections of n data records each, ending with an end record. Intel HEX sections carry an
// extended linear address record whenever the upper 16 address bits change; S-records use
// 24-bit addresses (S2) and end with S8.
inline std::vector<SectionLayout> StandardSections(int recordsPerSection, bool srecords = false,
                                                   std::size_t dataLen = 16) {
    std::vector<SectionLayout> out;
    const char* markers[] = {"[MDSP]", "[CDMA]", "[AMPS]", "[MPU]"};
    for (int s = 0; s < 4; ++s) {
        SectionLayout sec{markers[s], {}};
        uint32_t upper = 0;
        for (int i = 0; i < recordsPerSection; ++i) {
            const auto data = DataBytes(dataLen, static_cast<uint8_t>(s * 40 + i));
            const auto addr = static_cast<uint32_t>(i * dataLen);
            if (srecords) {
                sec.records.push_back(SRecord(2, addr, data));
                continue;
            }
            if ((addr >> 16) != upper) {
                upper = addr >> 16;
                sec.records.push_back(IntelRecord(
                    4, 0, {static_cast<uint8_t>(upper >> 8), static_cast<uint8_t>(upper)}));
            }
            sec.records.push_back(IntelRecord(0, static_cast<uint16_t>(addr), data));
        }
        sec.records.push_back(srecords ? SRecord(8, 0, {}) : IntelEnd());
        out.push_back(sec);
    }
    return out;
}

inline Bytes Build(const FileLayout& layout) {
    Bytes out(layout.header.begin(), layout.header.end());
    for (const auto& sec : layout.sections) {
        const std::string line = sec.marker + "\r\n";
        out.insert(out.end(), line.begin(), line.end());
        for (const auto& r : sec.records) {
            const Bytes f = Framed(r);
            out.insert(out.end(), f.begin(), f.end());
        }
    }
    out.insert(out.end(), layout.trailer.begin(), layout.trailer.end());
    return out;
}

// A scratch folder removed with its files when the test ends.
class TempDir {
public:
    TempDir() {
        std::string tmpl = (std::filesystem::temp_directory_path() / "zx917-XXXXXX").string();
        path_ = ::mkdtemp(tmpl.data()) ? tmpl : std::string();
    }
    ~TempDir() {
        std::error_code ec;
        std::filesystem::remove_all(path_, ec);
    }
    std::string write(const std::string& name, const Bytes& bytes) const {
        const std::string p = path_ + "/" + name;
        std::ofstream(p, std::ios::binary)
            .write(reinterpret_cast<const char*>(bytes.data()),
                   static_cast<std::streamsize>(bytes.size()));
        return p;
    }
    std::string write(const std::string& name, const std::string& text) const {
        return write(name, Bytes(text.begin(), text.end()));
    }
    const std::string& path() const { return path_; }

private:
    std::string path_;
};

}  // namespace zx917::gen
