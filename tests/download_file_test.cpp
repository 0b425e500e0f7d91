// The download-file check: verdicts, messages, revision and the hardware question.
#include "firmware/download_file.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "app/app_state.h"
#include "app/texts.h"
#include "common/download_files.h"
#include "firmware/record.h"
#include "support/fake_dialogs.h"

namespace zx917 {
namespace {

using gen::Bytes;
using test::FakeDialogs;

const std::string kHeader = "A.01.02\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n";  // 36 bytes
const std::string kEnd = "[EOF]\r\n";                                          // 7 bytes

std::string padded(const std::string& header, std::size_t total, const std::string& end = kEnd) {
    return header + std::string(total - header.size() - end.size(), 'x') + end;
}

class CheckFile : public ::testing::Test {
protected:
    CheckFile() { InitMessages(texts); }
    bool check(const std::string& path, int16_t ask) {
        return CheckDownloadFile({app, file, dialogs, texts}, path, ask);
    }
    std::vector<FakeDialogs::Shown> failure(int index) {
        return {{"beep", ""}, {"critical", texts.MessageTable[index]}};
    }
    AppState app;
    FileSlot file;
    FakeDialogs dialogs;
    TextTables texts;
    gen::TempDir dir;
};

TEST_F(CheckFile, Verdicts_ByContent) {
    struct Case {
        const char* name;
        std::string content;
        bool ok;
        int message;  // -1: none
        const char* revision;
    };
    const std::string full = kHeader + "[MDSP]\r\n";
    const Case cases[] = {
        {"exactly 66 bytes", padded(kHeader, 66), true, -1, "A.01.02"},
        {"65 bytes", padded(kHeader, 65), false, kMsgNotDownloadFile, nullptr},
        {"byte after end marker", padded(kHeader, 80, "[EOF]\r\n\x1a"), false, kMsgNotDownloadFile,
         "A.01.02"},
        {"second CR LF after end marker", padded(kHeader, 80, "[EOF]\r\n\r\n"), false,
         kMsgNotDownloadFile, "A.01.02"},
        {"no end marker", padded(kHeader, 80, "[END]\r\n"), false, kMsgNotDownloadFile, "A.01.02"},
        {"lower-case tag", padded("A.01.02\r\nmdsp:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n", 80), false,
         kMsgNotDownloadFile, nullptr},
        {"MPU tag missing", padded("A.01.02\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMCU:\r\n", 80), false,
         kMsgNotDownloadFile, nullptr},
        {"comma in revision line", padded("A.01,02\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n", 80),
         false, kMsgNotDownloadFile, nullptr},
        {"tags on one line", padded("A.01.02,MDSP:x,CDMA:y,AMPS:z,MPU:w\r\n", 80), true, -1,
         "A.01.02"},
        {"quoted revision", padded("\"B.02.10\"\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n", 80), true,
         -1, "B.02.10"},
        {"3-character revision", padded("A.1\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n", 80), true, -1,
         "A.1    "},
        {"10-character revision", padded("A.01.02XYZ\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\n", 80),
         true, -1, "A.01.02"},
        {"ends inside the header", "A.01.02\r\nMDSP:" + std::string(70, 'x'), false,
         kMsgCouldNotRead, nullptr},
        {"full file with sections", full + std::string(40, 'y') + kEnd, true, -1, "A.01.02"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        app = AppState{};
        app.NewRevision = "Z.ZZ.ZZ";
        dialogs.shown.clear();
        const std::string path = dir.write("F.HEX", c.content);
        EXPECT_EQ(check(path, 0), c.ok);
        if (c.message < 0) {
            EXPECT_TRUE(dialogs.shown.empty());
        } else {
            EXPECT_EQ(dialogs.shown, failure(c.message));
        }
        if (c.revision) {
            EXPECT_EQ(app.NewRevision.str(), c.revision);
        }
        EXPECT_EQ(app.DownloadFileLength, static_cast<int32_t>(c.content.size()));
        EXPECT_FALSE(file.isOpen());
    }
}

TEST_F(CheckFile, Paths_MissingFolderAndWildcard) {
    dir.write("A.HEX", padded(kHeader, 80));
    std::filesystem::create_directory(dir.path() + "/SUB.HEX");
    for (const std::string& path : {dir.path() + "/NONE.HEX", dir.path() + "/SUB.HEX",
                                    dir.path() + "/*.HEX", dir.path() + "/?.HEX"}) {
        SCOPED_TRACE(path);
        dialogs.shown.clear();
        EXPECT_FALSE(check(path, 1));
        EXPECT_EQ(dialogs.shown, failure(kMsgCouldNotRead));
        EXPECT_FALSE(file.isOpen());
    }
}

TEST_F(CheckFile, HardwareQuestion_AskedOnlyWhenItApplies) {
    const std::string path = dir.write("A.HEX", padded(kHeader, 80));  // revision A.01.02
    struct Case {
        const char* current;
        int16_t ask;
        bool answer;
        bool asked;
        bool ok;
    };
    const Case cases[] = {
        {"B.01.00", 1, true, true, true},   {"B.01.00", 1, false, true, false},
        {"B.01.00", 0, false, false, true}, {"B.01.00", 2, false, false, true},
        {"?.??.??", 1, false, false, true}, {"A.09.99", 1, false, false, true},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.current) + " ask " + std::to_string(c.ask));
        app.CurrentRevision = c.current;
        dialogs.shown.clear();
        dialogs.answers = {c.answer};
        EXPECT_EQ(check(path, c.ask), c.ok);
        if (c.asked) {
            const std::vector<FakeDialogs::Shown> want = {
                {"beep", ""}, {"question", texts.MessageTable[kMsgHardwareChange]}};
            EXPECT_EQ(dialogs.shown, want);
        } else {
            EXPECT_TRUE(dialogs.shown.empty());
        }
    }
}

TEST(Record_Reader, LengthLimitsAndCutShort) {
    gen::TempDir dir;
    struct Case {
        const char* name;
        Bytes bytes;
        bool ok;
        std::size_t size;
    };
    auto rec = [](int n, int have) {
        Bytes b{static_cast<uint8_t>(n >> 8), static_cast<uint8_t>(n & 0xFF)};
        b.resize(2 + have, 0x3A);
        return b;
    };
    const Case cases[] = {
        {"N 5", rec(5, 5), false, 0},
        {"N 6", rec(6, 6), true, 8},
        {"N 261 (01 05)", rec(0x105, 0x105), true, 263},
        {"N 32767", rec(32767, 32767), true, 32769},
        {"N 32768", rec(32768, 32768), false, 0},
        {"cut short", rec(20, 19), false, 0},
        {"one length byte", Bytes{0x00}, false, 0},
        {"empty", Bytes{}, false, 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        FileSlot f;
        ASSERT_TRUE(f.open(dir.write("R.BIN", c.bytes)));
        Bytes out;
        EXPECT_EQ(ReadRecord(f, out), c.ok);
        if (c.ok) {
            EXPECT_EQ(out.size(), c.size);
        }
    }
}

TEST(Record_KindText, LastRecordRule) {
    struct Case {
        Bytes record;  // unframed
        const char* kind;
        bool last;
    };
    const Case cases[] = {
        {{0x3A, 0x00, 0x00, 0x00, 0x01, 0xFF}, ":0001FF", true},
        {gen::IntelRecord(0, 0x1234, {1, 2}), ":2123401", false},
        {{0x53, 0x07, 0x05, 0x00, 0x00, 0x00}, "S75000", true},
        {{0x53, 0x08, 0x04, 0x00, 0x00, 0x00}, "S84000", true},
        {{0x53, 0x09, 0x03, 0x00, 0x00, 0xFC}, "S9300FC", false},
        {{0x53, 0x01, 0x13, 0x00, 0x00, 0x00}, "S113000", false},
        {{0x07, 0xFF, 0x10, 0x0A, 0x00, 0x00}, "7FF10A00", false},
    };
    for (const Case& c : cases) {
        const Bytes framed = gen::Framed(c.record);
        const std::string kind = RecordKindText(framed);
        EXPECT_EQ(kind, c.kind);
        EXPECT_EQ(IsLastRecordKind(kind), c.last) << kind;
    }
}

}  // namespace
}  // namespace zx917
