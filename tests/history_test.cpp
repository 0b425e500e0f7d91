// The service record without a window: the hash of the file, rows written and read back byte
// for byte, the problems that must never change a download, and each attempt's outcome and
// counts as the engine saw them in simulated time.
#include <gtest/gtest.h>
#include <sqlite3.h>

#include <filesystem>

#include "history/download_recorder.h"
#include "history/history_report.h"
#include "history/sha256.h"
#include "support/firmware_rig.h"

namespace zx917 {
namespace {

TEST(History_Sha256, KnownDigests) {
    auto of = [](const std::string& s) {
        return Sha256Hex(std::span(reinterpret_cast<const uint8_t*>(s.data()), s.size()));
    };
    EXPECT_EQ(of(""), "e3b0c44298fc1c149afbf4c8996fb92427ae41e4649b934ca495991b7852b855");
    EXPECT_EQ(of("abc"), "ba7816bf8f01cfea414140de5dae2223b00361a396177a9cb410ff61f20015ad");
    EXPECT_EQ(of("abcdbcdecdefdefgefghfghighijhijkijkljklmklmnlmnomnopnopq"),
              "248d6a61d20638b8e5c026930c3e6039a33ce45964ff2167f6ecedd419db06c1");
    EXPECT_EQ(of(std::string(1000000, 'a')),
              "cdc76e5c9914fb9281a1c7e284d73e67f1809a48a497200e046d39ccc7112cd0");
    gen::TempDir d;
    const std::string file = d.write("F.HEX", std::string(70000, 'q'));  // blocks and a tail
    EXPECT_EQ(Sha256OfFile(file), of(std::string(70000, 'q')));
    EXPECT_FALSE(Sha256OfFile(d.path() + "/missing"));
    EXPECT_FALSE(Sha256OfFile(d.path()));
}

// Texts that SQL, CSV and JSON each take apart: kept byte for byte.
Attempt awkward() {
    Attempt a;
    a.started = "2026-12-06T10:00:00Z";
    a.frontEnd = "command line";
    a.programVersion = "2.1.0.0";
    a.identity = "Quorvex,\"ZX917\";SN'); DROP TABLE attempts; --\xe9";
    a.fileName = "NEW,\"x\";\xc3\xa9.HEX";
    a.filePath = "/tmp/a b/" + a.fileName;
    a.fileSha256 = std::string(64, 'a');
    return a;
}

TEST(History_Record, RowsComeBackAsWritten) {
    gen::TempDir d;
    const std::string path = d.path() + "/sub/history.sqlite";
    std::vector<std::string> warnings;
    {
        ServiceRecord record(path, [&](const std::string& w) { warnings.push_back(w); });
        Attempt a = awkward();
        a.id = record.start(a);
        ASSERT_GT(a.id, 0);
        a.ended = "2026-12-06T10:01:10Z";
        a.durationMs = 70000;
        a.outcome = kOutcomeSuccess;
        a.recordsSent = 7400;
        record.update(a);
        Attempt b = a;
        b.started = "2026-12-07T08:00:00Z";
        b.identity = "Quorvex,ZX917,SN0000000002";
        b.ended.clear();
        b.outcome = kOutcomeInterrupted;
        b.id = record.start(b);
        ASSERT_GT(b.id, a.id);
    }
    EXPECT_TRUE(warnings.empty());
    std::string error;
    HistoryFilter everything;
    everything.limit.reset();
    const auto all = ServiceRecord::Read(path, everything, error);
    ASSERT_TRUE(all) << error;
    ASSERT_EQ(all->size(), 2u);
    EXPECT_EQ((*all)[0].identity, "Quorvex,ZX917,SN0000000002");  // newest first
    const Attempt& first = (*all)[1];
    EXPECT_EQ(first.identity, awkward().identity);
    EXPECT_EQ(first.fileName, awkward().fileName);
    EXPECT_EQ(first.outcome, "success");
    EXPECT_EQ(first.durationMs, 70000);
    EXPECT_EQ(first.recordsSent, 7400);
    EXPECT_EQ((*all)[0].ended, "");

    struct Case {
        const char* name;
        HistoryFilter filter;
        std::size_t rows;
    };
    const Case cases[] = {
        {"limit", {1, "", ""}, 1},
        {"instrument", {20, "DROP TABLE", ""}, 1},
        {"instrument, no such", {20, "SN9", ""}, 0},
        {"since a date", {20, "", "2026-12-07"}, 1},
        {"since before both", {20, "", "2026-01-01"}, 2},
    };
    for (const Case& c : cases) {
        const auto rows = ServiceRecord::Read(path, c.filter, error);
        ASSERT_TRUE(rows) << c.name;
        EXPECT_EQ(rows->size(), c.rows) << c.name;
    }
    // The report formats quote what needs it; the identity is single-byte text.
    const std::string csv = HistoryCsv(*all);
    EXPECT_NE(csv.find("\"Quorvex,\"\"ZX917\"\";SN'); DROP TABLE attempts; --\xc3\xa9\""),
              std::string::npos);
    EXPECT_NE(csv.find("\r\n"), std::string::npos);
    const std::string json = HistoryJson(*all);
    EXPECT_NE(json.find(R"("file_name": "NEW,\"x\";)"
                        "\xc3\xa9"
                        R"(.HEX")"),
              std::string::npos);
    EXPECT_NE(json.find(R"("ended": null)"), std::string::npos);
    EXPECT_NE(HistoryTable(*all).find(awkward().fileName), std::string::npos);
}

// A record that cannot be opened or written is said once, and nothing is written.
TEST(History_Record, ProblemsSaidOnceAndNothingWritten) {
    struct Case {
        const char* name;
        std::function<std::string(const gen::TempDir&)> make;  // the path of the record
        const char* said;
    };
    const Case cases[] = {
        {"a folder that cannot be made",
         [](const gen::TempDir& d) {
             d.write("plain", std::string("x"));
             return d.path() + "/plain/history.sqlite";
         },
         "cannot be opened"},
        {"a file of garbage",
         [](const gen::TempDir& d) { return d.write("h.sqlite", std::string(4096, '\x5a')); },
         "cannot be read"},
        {"a newer version's file",
         [](const gen::TempDir& d) {
             const std::string p = d.path() + "/h.sqlite";
             sqlite3* db = nullptr;
             sqlite3_open(p.c_str(), &db);
             sqlite3_exec(db,
                          "CREATE TABLE attempts (id INTEGER PRIMARY KEY, started TEXT);"
                          "PRAGMA user_version = 99;",
                          nullptr, nullptr, nullptr);
             sqlite3_close(db);
             return p;
         },
         "newer version"},
        {"no place at all", [](const gen::TempDir&) { return std::string(); }, "no place"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        gen::TempDir d;
        const std::string path = c.make(d);
        std::vector<std::string> warnings;
        ServiceRecord record(path, [&](const std::string& w) { warnings.push_back(w); });
        Attempt a = awkward();
        a.id = record.start(a);
        EXPECT_EQ(a.id, 0);
        a.outcome = kOutcomeSuccess;
        record.update(a);
        record.start(a);
        ASSERT_EQ(warnings.size(), 1u);
        EXPECT_NE(warnings[0].find(c.said), std::string::npos) << warnings[0];
    }
    // Reading: a garbage file is an error to say; a newer file is read; none is no rows.
    gen::TempDir d;
    std::string error;
    EXPECT_FALSE(ServiceRecord::Read(d.write("g", std::string(4096, 'Z')), {}, error));
    EXPECT_NE(error.find("not a service record"), std::string::npos) << error;
    const auto none = ServiceRecord::Read(d.path() + "/none.sqlite", {}, error);
    ASSERT_TRUE(none);
    EXPECT_TRUE(none->empty());
}

// What a download leaves in the record, by the outcome of the run that ended it.
TEST(History_Recorder, OutcomeAndCountsOfEachEnd) {
    struct Case {
        const char* name;
        std::string fault;
        bool portVanishes;
        std::string outcome;
        bool confirmed;
        bool resent;
        int restarts;
    };
    const Case cases[] = {
        {"confirmed", "", false, kOutcomeSuccess, true, false, 0},
        {"a resend", "silent:DL:3:1", false, kOutcomeSuccess, true, true, 0},
        {"a restart granted", "restart:P2:3:1", false, kOutcomeSuccess, true, false, 1},
        {"the instrument aborts", "abort:DL:4", false, kOutcomeAborted, false, false, 0},
        {"silent at CLOSE", "silent:CLOSE", false, kOutcomeFailed, false, true, 0},
        {"the port vanishes", "", true, kOutcomePortLost, false, false, 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        InstrumentOptions o;
        o.revision = "A.01.00";
        if (!c.fault.empty()) {
            Fault f;
            ASSERT_TRUE(ParseFault(c.fault, f));
            o.faults = {f};
        }
        test::FirmwareRig r(o);
        const gen::Bytes file = test::DownloadFile("A.02.00", 6);
        r.choose(file);
        std::vector<std::string> warnings;
        DownloadRecorder rec({.app = r.world.app,
                              .engine = r.world.engine,
                              .frontEnd = "wizard",
                              .historyPath = r.dir.path() + "/h.sqlite",
                              .traceFile = {},
                              .portDevice = [] { return std::string("/dev/ttyUSB0"); },
                              .warn = [&](const std::string& w) { warnings.push_back(w); }});
        ASSERT_TRUE(r.ops.ReadCurrentRevision());
        ASSERT_TRUE(r.ops.PrepareDownload());
        rec.begin();
        if (c.portVanishes) r.world.port.vanish(50);
        const bool confirmed = r.ops.StartDownload();
        EXPECT_EQ(confirmed, c.confirmed);
        rec.end(OutcomeOf(confirmed, r.world.engine.lineLog()));
        EXPECT_TRUE(warnings.empty());
        std::string error;
        const auto rows = ServiceRecord::Read(r.dir.path() + "/h.sqlite", {}, error);
        ASSERT_TRUE(rows && rows->size() == 1) << error;
        const Attempt& a = rows->front();
        EXPECT_EQ(a.outcome, c.outcome);
        EXPECT_EQ(a.identity, "Quorvex,ZX917,SN0001234567,FW----------A.01.00");
        EXPECT_EQ(a.revisionBefore, "A.01.00");
        EXPECT_EQ(a.revisionAnnounced, "A.02.00");
        EXPECT_EQ(a.revisionConfirmed, c.confirmed ? "A.02.00" : "");
        EXPECT_EQ(a.port, "/dev/ttyUSB0");
        EXPECT_EQ(a.lineSettings, "9600,n,8,1 CR+LF");
        EXPECT_EQ(a.fileSha256, Sha256Hex(file));
        EXPECT_EQ(a.fileSize, static_cast<int64_t>(file.size()));
        EXPECT_FALSE(a.ended.empty());
        EXPECT_GT(a.recordsSent, 0);
        // Every data and end record once; a restart sends the area's records again.
        if (c.confirmed) {
            EXPECT_EQ(a.recordsSent > 4 * 6 + 4, c.restarts > 0);
            EXPECT_GE(a.recordsSent, 4 * 6 + 4);
        }
        EXPECT_EQ(a.resends > 0, c.resent);
        EXPECT_EQ(a.restarts, c.restarts);
    }
}

}  // namespace
}  // namespace zx917
