// Walks the sections and records of a download file the way the transfer reads them.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace zx917 {

struct SectionScan {
    std::string name;
    int64_t records = 0;
    int64_t bytes = 0;  // what goes on the line: length bytes and record
};

struct FileScan {
    bool ok = false;
    std::vector<SectionScan> sections;
    std::string error;   // what went wrong, for a person
    int64_t offset = 0;  // file offset (from 0) of the failure
    std::string section;
};

// verifyChecksums also checks each record's own checksum (Intel HEX and S-record).
FileScan ScanDownloadFile(const std::string& path, bool verifyChecksums);

// True when the record (length bytes included) carries a valid Intel HEX or S-record checksum.
bool RecordChecksumOk(const std::vector<uint8_t>& record);

}  // namespace zx917
