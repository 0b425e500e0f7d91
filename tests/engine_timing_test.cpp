// Resends and give-ups of every kind of step, in simulated time against a silent instrument.
#include <gtest/gtest.h>

#include "support/sim_world.h"

namespace zx917 {
namespace {

using test::SimWorld;

const std::vector<uint8_t> kRecord = {0x00, 0x08, 0x3A, 0x02, 0x00, 0x10, 0x00, 0xAA, 0xBB, 0x99};
const std::vector<uint8_t> kLastRecord = {0x00, 0x06, 0x3A, 0x00, 0x00, 0x00, 0x01, 0xFF};

TEST(Engine_Resends, EveryStepKindResendsAndGivesUpOnTime) {
    struct Case {
        const char* name;
        int16_t stage;
        int16_t step;
        std::vector<int64_t> sendsMs;
        int64_t giveUpMs;
    };
    const Case cases[] = {
        {"SYSTem:ERRor?", 0, 2, {0, 3000, 6000}, 9000},
        {"*IDN?", 1, 0, {0, 7000, 14000}, 21000},
        {"MAINTENANCE:DOWNLOAD", 2, 0, {0, 27000}, 54000},
        {"REVD", 3, 0, {0, 5000, 10000}, 15000},
        {"OPEN", 3, 1, {0, 322000, 644000}, 966000},
        {"SP2", 4, 0, {0}, 7000},
        {"DLS", 4, 2, {0, 42000, 84000}, 126000},
        {"DL", 4, 4, {0, 7000, 14000}, 21000},
        {"DLE stage 4", 4, 6, {0, 42000, 84000}, 126000},
        {"DLE stage 5", 5, 6, {0, 322000, 644000}, 966000},
        {"DLE stage 6", 6, 6, {0, 322000, 644000}, 966000},
        {"DLE stage 7", 7, 6, {0, 307000, 614000}, 921000},
        {"EP", 7, 8, {0}, 7000},
        {"SP1", 7, 0, {0}, 7000},
        {"CLOSE", 8, 0, {0, 5000, 10000}, 15000},
        {"REVC", 8, 1, {0, 5000, 10000}, 15000},
        {"REBOOT after its 40 s wait", 8, 2, {40000, 45000}, 50000},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        SimWorld w({}, false);
        w.app.RecordBytes = c.step == 6 ? kLastRecord : kRecord;
        w.app.StepResult = true;
        w.engine.RunStage(c.stage, c.step);
        std::vector<int64_t> times;
        for (const auto& s : w.port.sent) times.push_back(s.atMs);
        EXPECT_EQ(times, c.sendsMs);
        EXPECT_EQ(w.clock.now(), c.giveUpMs);
        EXPECT_FALSE(w.app.StepResult);
        EXPECT_EQ(w.app.ScriptStep, kNoRun);
        EXPECT_FALSE(w.retry.enabled());
        // Every resend repeats the first send byte for byte.
        for (const auto& s : w.port.sent) EXPECT_EQ(s.bytes, w.port.sent.front().bytes);
    }
}

TEST(Engine_Resends, RefusedLineRestartsTheTimeOut) {
    SimWorld w({}, false);
    w.port.inject("REV short\r\n", 2500);  // matches "REV" but is not 14 characters
    w.engine.RunStage(3, 0);
    std::vector<int64_t> times;
    for (const auto& s : w.port.sent) times.push_back(s.atMs);
    // The refusal at 2.5 s sets the count back: the resend comes at the 5th tick after it,
    // not at the 5th after the send.
    EXPECT_EQ(times, (std::vector<int64_t>{0, 7000, 12000}));
    EXPECT_EQ(w.clock.now(), 17000);
}

TEST(Engine_Resends, MaintenanceResendFlipsParity) {
    struct Case {
        std::string user;
        std::string resendAt;
    };
    const Case cases[] = {
        {"9600,e,8,1", "9600,O,8,1"}, {"9600,o,8,1", "9600,E,8,1"}, {"19200,n,8,1", "19200,n,8,1"}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.user);
        SimWorld w({}, false);
        w.port.setPortOpen(false);
        w.port.setSettings(c.user);
        w.port.setHandshaking(1);
        w.port.setPortOpen(true);
        w.engine.RunStage(2, 0);
        ASSERT_EQ(w.port.sent.size(), 2u);
        EXPECT_EQ(w.port.sent[0].settings, c.user);
        EXPECT_EQ(w.port.sent[1].settings, c.resendAt);
        EXPECT_EQ(w.port.sent[1].handshaking, 1);
        EXPECT_EQ(w.port.sent[1].text(), "MAINTENANCE:DOWNLOAD\n");
        // After each send the line goes to the download speed.
        EXPECT_EQ(w.port.settings(), "38400,E,8,1");
        EXPECT_EQ(w.port.handshaking(), 3);
        // Nobody answered the flipped parity: the settings kept for the way back are the user's.
        EXPECT_EQ(w.app.PortSettings, c.user);
    }
}

}  // namespace
}  // namespace zx917
