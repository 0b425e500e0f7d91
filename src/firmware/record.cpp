#include "firmware/record.h"

#include "link/wildcard.h"

namespace zx917 {

bool FindSectionMarker(FileSlot& file, const char* markerPattern) {
    std::string line;
    while (file.readLine(line)) {
        if (WildcardMatch(line, markerPattern)) return true;
    }
    return false;
}

bool ReadRecord(FileSlot& file, std::vector<uint8_t>& bytes) {
    bytes.clear();
    if (!file.readBytes(2, bytes)) return false;
    const int n = bytes[0] * 256 + bytes[1];
    if (n < kMinRecordLength || n > kMaxRecordLength) return false;
    return file.readBytes(static_cast<std::size_t>(n), bytes);
}

std::string RecordKindText(std::span<const uint8_t> bytes) {
    static constexpr char kHex[] = "0123456789ABCDEF";
    std::string kind;
    for (std::size_t i = 2; i < bytes.size() && i < 8; ++i) {
        const uint8_t b = bytes[i];
        if (b == 0x3A) {
            kind += ':';
        } else if (b == 0x53) {
            kind += 'S';
        } else {
            if (b >= 16) kind += kHex[b >> 4];
            kind += kHex[b & 15];
        }
    }
    return kind;
}

bool IsLastRecordKind(const std::string& kind) {
    return kind.starts_with(":0001") || kind.starts_with("S7") || kind.starts_with("S8");
}

}  // namespace zx917
