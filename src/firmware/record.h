// Records of a download file section: two big-endian length bytes, then N bytes (6..32767).
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "app/file_slot.h"

namespace zx917 {

inline constexpr int kMinRecordLength = 6;
inline constexpr int kMaxRecordLength = 32767;

// Reads lines from the current position until one matches the marker pattern. False when the
// file ends first.
bool FindSectionMarker(FileSlot& file, const char* markerPattern);

// Reads one record, length bytes included, into bytes. False on a read failure: the file ends
// inside the record, or N is out of range.
bool ReadRecord(FileSlot& file, std::vector<uint8_t>& bytes);

// The kind text of a record (length bytes included in `bytes`): its first six bytes, 0x3A as
// ":", 0x53 as "S", every other byte in upper-case hexadecimal without a leading zero.
std::string RecordKindText(std::span<const uint8_t> bytes);

// The Intel HEX end record and the S7 and S8 end records end a section; S9 does not.
bool IsLastRecordKind(const std::string& kind);

}  // namespace zx917
