#include "sim/expect.h"

#include "app/file_slot.h"
#include "firmware/download_file.h"
#include "firmware/record.h"

namespace zx917 {

std::string AddExpectation(const std::string& report, const Instrument& inst,
                           const std::string& downloadFile) {
    FileSlot file;
    const bool opened = file.open(downloadFile);
    std::string match;
    bool all = opened;
    for (const Section& s : SectionTable) {
        const std::string area = std::string("P") + s.select[2];
        std::vector<std::vector<uint8_t>> want;
        std::vector<uint8_t> rec;
        if (opened && FindSectionMarker(file, s.marker)) {
            while (ReadRecord(file, rec)) {
                want.emplace_back(rec.begin() + 2, rec.end());
                if (IsLastRecordKind(RecordKindText(rec))) break;
            }
        }
        const auto it = inst.areas().find(area);
        const bool skipped = it == inst.areas().end() && area == "P4" && inst.ampsFlag() == '0';
        const bool ok = skipped || (it != inst.areas().end() && it->second == want);
        all = all && ok;
        match += (match.empty() ? "" : ", ") + ("\"" + area + "\": ") + (ok ? "true" : "false");
    }
    const bool success = all && inst.confirmed();
    std::string out = report.substr(0, report.rfind('}'));
    while (!out.empty() && (out.back() == '\n' || out.back() == ' ')) out.pop_back();
    return out + ",\n  \"match\": {" + match + "},\n  \"verdict\": \"" +
           (success ? "success" : "failure") + "\"\n}\n";
}

}  // namespace zx917
