// Whole downloads against the in-process instrument, and every way one can fail.
#include <gtest/gtest.h>

#include "firmware/progress.h"
#include "support/firmware_rig.h"

namespace zx917 {
namespace {

using gen::Bytes;
using test::FirmwareRig;

// The records the instrument must hold per area, from the file's sections.
std::map<std::string, std::vector<Bytes>> expectedAreas(const gen::FileLayout& layout,
                                                        bool amps = true) {
    const char* areas[] = {"P2", "P3", "P4", "P1"};
    std::map<std::string, std::vector<Bytes>> out;
    for (int i = 0; i < 4; ++i) {
        if (i == 2 && !amps) continue;
        out[areas[i]] = layout.sections[i].records;
    }
    return out;
}

void expectUserPortAndQuietTimers(const FirmwareRig& r) {
    EXPECT_EQ(r.world.port.settings(), "9600,n,8,1");
    EXPECT_EQ(r.world.port.handshaking(), 0);
    EXPECT_FALSE(r.world.timer1.enabled());
    EXPECT_FALSE(r.world.file.isOpen());
}

TEST(Download_Success, FilesArriveByteExactInTheirAreas) {
    struct Case {
        const char* name;
        gen::FileLayout layout;
        InstrumentOptions options;
        bool amps;
    };
    gen::FileLayout intel;
    intel.sections = gen::StandardSections(6);
    gen::FileLayout srec;
    srec.sections = gen::StandardSections(4, true, 24);
    gen::FileLayout single = intel;
    single.sections[1].records = {gen::IntelEnd()};
    gen::FileLayout bigRecords;
    bigRecords.sections = gen::StandardSections(2, false, 250);
    InstrumentOptions noAmps;
    noAmps.ampsFlag = '0';
    InstrumentOptions noisy;
    noisy.noise = true;
    InstrumentOptions restartTwice;
    Fault f;
    ParseFault("restart:P3:3:2", f);
    restartTwice.faults = {f};
    const Case cases[] = {
        {"Intel HEX", intel, {}, true},
        {"S-records", srec, {}, true},
        {"AMPS left out", intel, noAmps, false},
        {"section of one record", single, {}, true},
        {"255-byte records", bigRecords, {}, true},
        {"noise between answers", intel, noisy, true},
        {"two restarts granted", intel, restartTwice, true},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        FirmwareRig r(c.options);
        r.choose(gen::Build(c.layout));
        EXPECT_TRUE(r.download());
        EXPECT_EQ(r.view.pages.back(), 5);
        EXPECT_TRUE(r.dialogs.shown.empty());
        EXPECT_TRUE(r.world.instrument->confirmed());
        EXPECT_EQ(r.world.instrument->revision(), "A.02.00");
        EXPECT_EQ(r.world.instrument->areas(), expectedAreas(c.layout, c.amps));
        EXPECT_EQ(r.view.remTime4, "00:00");
        EXPECT_EQ(r.world.sendsOf("REBOOT").size(), 1u);
        EXPECT_EQ(r.world.port.sent.back().text(), "REBOOT\n");
        expectUserPortAndQuietTimers(r);
        if (!c.amps) {
            EXPECT_TRUE(r.world.sendsOf("SP4").empty());
        }
    }
}

TEST(Download_Success, ByteCountStepsBackAfterARestart) {
    InstrumentOptions o;
    Fault f;
    ParseFault("restart:P2:4:1", f);
    o.faults = {f};
    FirmwareRig r(o);
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(6);
    r.choose(gen::Build(layout));
    ASSERT_TRUE(r.download());
    const auto& v = r.view.progressValues;
    bool steppedBack = false;
    for (std::size_t i = 1; i < v.size(); ++i) steppedBack |= v[i] < v[i - 1] && v[i] > 0;
    EXPECT_TRUE(steppedBack);
    EXPECT_EQ(r.world.sendsOf("\r\nRESTART:P2\r\n").size(), 1u);
    EXPECT_EQ(r.world.sendsOf("SP2").size(), 1u);  // no second select after a restart
    // The shown count is a file position: it never reaches the length (end marker unread).
    EXPECT_LT(v.back(), r.view.progressMax);
    EXPECT_EQ(r.view.progressMax, static_cast<int32_t>(gen::Build(layout).size()));
}

TEST(Download_Failure, EveryFaultEndsWithTheMessageOnPageZero) {
    struct Case {
        const char* name;
        std::string fault;  // instrument fault, or empty
        InstrumentOptions options;
        int64_t maxSeconds;
    };
    InstrumentOptions wrongRevc;
    wrongRevc.wrongRevc = true;
    const Case cases[] = {
        {"third restart in one area", "restart:P3:2:3", {}, 60},
        {"abort at OPEN", "abort:OPEN", {}, 60},
        {"abort at a record", "abort:DL:5", {}, 60},
        {"abort at the last record", "abort:DLE:2", {}, 60},
        {"abort at EP", "abort:EP:3", {}, 60},
        {"abort at CLOSE", "abort:CLOSE", {}, 60},
        {"abort at REVC", "abort:REVC", {}, 60},
        {"silent at OPEN", "silent:OPEN", {}, 970},
        {"silent at SP3", "silent:SP3", {}, 60},
        {"silent at a record", "silent:DL:5", {}, 60},
        {"silent at a last record", "silent:DLE:1", {}, 200},
        {"silent at EP", "silent:EP", {}, 60},
        {"silent at CLOSE", "silent:CLOSE", {}, 60},
        {"silent at REVC", "silent:REVC", {}, 60},
        {"silent at REBOOT", "silent:REBOOT", {}, 120},
        {"erase refused", "refuse:EP:2", {}, 60},
        {"record garbled", "garble:DL:3", {}, 60},
        {"DSR while a record waits", "dsr:DL:4", {}, 60},
        {"line hangs up", "hangup:DL:6", {}, 60},
        {"wrong revision on REVC", "", wrongRevc, 60},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        InstrumentOptions o = c.options;
        if (!c.fault.empty()) {
            Fault f;
            ASSERT_TRUE(ParseFault(c.fault, f));
            o.faults = {f};
        }
        FirmwareRig r(o);
        gen::FileLayout layout;
        layout.sections = gen::StandardSections(6);
        r.choose(gen::Build(layout));
        EXPECT_FALSE(r.download());
        const std::vector<test::FakeDialogs::Shown> want = {{"critical", "Download failed."}};
        EXPECT_EQ(r.dialogs.shown, want);
        EXPECT_EQ(r.view.pages.back(), 0);
        EXPECT_FALSE(r.world.instrument->confirmed());
        EXPECT_EQ(r.view.animation, (std::vector<bool>{true, false}));
        EXPECT_LE(r.world.clock.now(), c.maxSeconds * 1000);
        if (c.fault != "hangup:DL:6") expectUserPortAndQuietTimers(r);
    }
}

// The instrument asks to restart an area while the line is stopped by its flow control.
TEST(Download_Failure, RestartOnAHeldLineEndsWithTheMessage) {
    FirmwareRig r;
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(6);
    r.choose(gen::Build(layout));
    ASSERT_TRUE(r.ops.ReadCurrentRevision());
    ASSERT_TRUE(r.ops.PrepareDownload());
    auto& port = r.world.port;
    int records = 0;
    port.onSent = [&](const test::Sent& s) {
        if (r.world.app.ScriptStage != 4 || s.bytes.size() < 3 || s.bytes[2] != 0x3A) return;
        if (++records != 3) return;
        port.lineHeld = true;  // the third record stays queued
        port.inject("RESTART:P2\r\n", 1);
    };
    const int64_t from = r.world.clock.now();
    EXPECT_FALSE(r.ops.StartDownload());
    EXPECT_EQ(r.dialogs.shown.back().text, "Download failed.");
    EXPECT_EQ(r.view.pages.back(), 0);
    EXPECT_LE(r.world.clock.now() - from, 30000);
    port.lineHeld = false;
    expectUserPortAndQuietTimers(r);
}

TEST(Download_Failure, BadFileContentEndsTheTransferCleanly) {
    struct Case {
        const char* name;
        std::function<void(gen::FileLayout&)> spoil;
    };
    const Case cases[] = {
        {"sections out of order",
         [](gen::FileLayout& s) { std::swap(s.sections[0], s.sections[1]); }},
        {"record cut by the end marker",
         [](gen::FileLayout& s) { s.sections[3].records.pop_back(); }},
        {"record length below 6",
         [](gen::FileLayout& s) {
             s.sections[1].records[2] = {0x3A, 0x00, 0x00, 0x00, 0x00};
         }},
        {"marker missing", [](gen::FileLayout& s) { s.sections[2].marker = "[AMP]"; }},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        FirmwareRig r;
        gen::FileLayout layout;
        layout.sections = gen::StandardSections(4);
        c.spoil(layout);
        r.choose(gen::Build(layout));
        EXPECT_FALSE(r.download());
        const std::vector<test::FakeDialogs::Shown> want = {{"critical", "Download failed."}};
        EXPECT_EQ(r.dialogs.shown, want);
        EXPECT_EQ(r.view.pages.back(), 0);
        EXPECT_TRUE(r.world.sendsOf("CLOSE").empty());
        expectUserPortAndQuietTimers(r);
    }
}

TEST(Download_Failure, FileGoneBeforeTheStart) {
    FirmwareRig r;
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(2);
    r.choose(gen::Build(layout));
    ASSERT_TRUE(r.ops.ReadCurrentRevision());
    ASSERT_TRUE(r.ops.PrepareDownload());
    std::remove(r.world.app.FilePath.c_str());
    const auto sentBefore = r.world.port.sent.size();
    EXPECT_FALSE(r.ops.StartDownload());
    const std::vector<test::FakeDialogs::Shown> want = {{"beep", ""},
                                                        {"critical", "Could not read file."}};
    EXPECT_EQ(r.dialogs.shown, want);
    EXPECT_EQ(r.view.pages.back(), 2);
    EXPECT_EQ(r.world.port.sent.size(), sentBefore);
}

TEST(Download_Progress, ProgrammingClimbsBy255UpToTheMaximum) {
    InstrumentOptions o;
    o.programDelayMs = 3000;
    FirmwareRig r(o);
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(300);
    r.choose(gen::Build(layout));
    ASSERT_TRUE(r.download());
    // While an area is programmed the label climbs 255 a tick, never past the bar's maximum.
    int climbs = 0;
    const auto& labels = r.view.byteLabels;
    for (std::size_t i = 1; i < labels.size(); ++i) {
        const int a = std::stoi(labels[i - 1]);
        const int b = std::stoi(labels[i]);
        climbs += b - a == 255;
        EXPECT_LE(b, r.view.progressMax);
    }
    // About 29 ticks in each 3 s programming delay; the last area starts too near the end.
    EXPECT_GE(climbs, 3 * 25);
    EXPECT_EQ(labels.front(), "0Byte");
}

TEST(Progress_Format, EstimatesAndRemainingTimes) {
    struct Case {
        int32_t fileLength;
        int32_t bytesDone;
        const char* text;
    };
    const Case cases[] = {
        {1000000, 0, "11:00"}, {1000, 0, "02:40"},          {3000, 0, "02:42"},
        {0, 0, "02:40"},       {1000000, 1000000, "02:40"}, {1000000, 370000, "07:55"},
        {0, 330000, "00:00"},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(FormatRemainingTime(EstimateSeconds(c.fileLength), c.bytesDone), c.text)
            << c.fileLength << " " << c.bytesDone;
    }
    EXPECT_EQ(FormatRemainingTime(6000, 0), "100:00");
    EXPECT_EQ(FormatRemainingTime(185, 0), "03:05");
    EXPECT_EQ(FormatRemainingTime(754, 0), "12:34");
    EXPECT_EQ(ByteLabel(12345), "12345Byte");
    EXPECT_EQ(ByteLabel(0), "0Byte");
}

}  // namespace
}  // namespace zx917
