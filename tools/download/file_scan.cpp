#include "download/file_scan.h"

#include "app/file_slot.h"
#include "firmware/download_file.h"
#include "firmware/record.h"

namespace zx917 {

bool RecordChecksumOk(const std::vector<uint8_t>& record) {
    if (record.size() < 3) return false;
    unsigned sum = 0;
    if (record[2] == 0x3A) {
        // count, address (2), type, data, checksum: the two's-complement sum is 0.
        const std::size_t body = record.size() - 3;
        if (body < 5 || record[3] + 5u != body) return false;
        for (std::size_t i = 3; i < record.size(); ++i) sum += record[i];
        return (sum & 0xFF) == 0;
    }
    if (record[2] == 0x53) {
        // type, count, address, data, checksum: the ones'-complement sum of count..data.
        if (record.size() < 6 || record[3] > 9) return false;
        const std::size_t body = record.size() - 4;
        if (record[4] + 1u != body) return false;
        for (std::size_t i = 4; i < record.size(); ++i) sum += record[i];
        return (sum & 0xFF) == 0xFF;
    }
    return false;
}

FileScan ScanDownloadFile(const std::string& path, bool verifyChecksums) {
    FileScan scan;
    FileSlot file;
    if (!file.open(path)) {
        scan.error = "could not open the file";
        return scan;
    }
    std::vector<uint8_t> record;
    for (const Section& s : SectionTable) {
        std::string name(s.tag);
        name.pop_back();  // drop the colon
        scan.section = name;
        if (!FindSectionMarker(file, s.marker)) {
            scan.error = "no [" + name + "] marker line";
            scan.offset = file.bytesRead();
            return scan;
        }
        SectionScan sec{name};
        for (;;) {
            const int64_t at = file.bytesRead();
            if (!ReadRecord(file, record)) {
                scan.error = "record cut short or length out of range";
                scan.offset = at;
                return scan;
            }
            if (verifyChecksums && !RecordChecksumOk(record)) {
                scan.error = "record checksum does not match";
                scan.offset = at;
                return scan;
            }
            ++sec.records;
            sec.bytes += static_cast<int64_t>(record.size());
            if (IsLastRecordKind(RecordKindText(record))) break;
        }
        scan.sections.push_back(sec);
    }
    scan.ok = true;
    scan.section.clear();
    return scan;
}

}  // namespace zx917
