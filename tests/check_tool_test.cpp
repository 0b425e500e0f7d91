// zx917-download check on generated good and bad download files.
#include <gtest/gtest.h>

#include "common/download_files.h"
#include "support/run_tool.h"

namespace zx917 {
namespace {

using gen::Bytes;

std::string check(const std::string& path, int& status) {
    const auto r = test::RunTool(std::string(ZX917_DOWNLOAD_TOOL) + " check '" + path + "'");
    status = r.status;
    return r.out;
}

TEST(CheckTool_Verdicts, CountsRecordsAndFindsBadOnes) {
    gen::TempDir dir;
    struct Case {
        const char* name;
        gen::FileLayout layout;
        int status;
        std::vector<std::string> expect;  // lines the output must hold
    };
    gen::FileLayout intel;
    intel.sections = gen::StandardSections(3);
    gen::FileLayout srec;
    srec.sections = gen::StandardSections(5, true, 20);
    gen::FileLayout badSum = intel;
    badSum.sections[1].records[1].back() ^= 0x01;
    gen::FileLayout cut = intel;
    cut.sections[3].records.pop_back();  // MPU has no end record: runs into the end marker
    gen::FileLayout noAmps = intel;
    noAmps.sections.erase(noAmps.sections.begin() + 2);
    gen::FileLayout oneRecord = intel;
    oneRecord.sections[0].records = {gen::IntelEnd()};

    const Case cases[] = {
        {"intel",
         intel,
         0,
         {"revision: A.01.02", "MDSP: 4 records, 80 bytes", "MPU: 4 records, 80 bytes"}},
        {"srec", srec, 0, {"CDMA: 6 records, 154 bytes"}},
        {"one-record section", oneRecord, 0, {"MDSP: 1 records, 8 bytes"}},
        {"bad checksum", badSum, 1, {"read failure in section CDMA at offset", "checksum"}},
        {"cut short", cut, 1, {"read failure in section MPU"}},
        {"no AMPS marker", noAmps, 1, {"read failure in section AMPS", "no [AMPS] marker"}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        int status = 0;
        const std::string out = check(dir.write("T.HEX", gen::Build(c.layout)), status);
        EXPECT_EQ(status, c.status) << out;
        for (const auto& line : c.expect) EXPECT_NE(out.find(line), std::string::npos) << out;
    }
}

TEST(CheckTool_Verdicts, RejectedFileShowsTheMessage) {
    gen::TempDir dir;
    int status = 0;
    std::string out = check(dir.write("S.HEX", std::string("short")), status);
    EXPECT_EQ(status, 1);
    EXPECT_NE(out.find("This is not the download file."), std::string::npos) << out;
    out = check(dir.path() + "/MISSING.HEX", status);
    EXPECT_EQ(status, 1);
    EXPECT_NE(out.find("Could not read file."), std::string::npos) << out;
}

}  // namespace
}  // namespace zx917
