// Abort and restart requests, the rise of DSR and a failing port, in every state.
#include <gtest/gtest.h>

#include "common/download_files.h"
#include "support/sim_world.h"

namespace zx917 {
namespace {

using test::SimWorld;

const std::vector<uint8_t> kRecord = {0x00, 0x08, 0x3A, 0x02, 0x00, 0x10, 0x00, 0xAA, 0xBB, 0x99};

void start(SimWorld& w, int16_t stage, int16_t step) {
    w.app.NewRevision = "B.02.10";
    w.app.RecordBytes = kRecord;
    w.app.ScriptStage = stage;
    w.app.ScriptStep = step;
    w.engine.SendStep();
}

void runUntil(SimWorld& w, int64_t ms) {
    while (w.clock.nextAt() <= ms) w.pump.processNextEvent();
}

TEST(Engine_Abort, EndsTheRunInEveryStateAndBetweenRuns) {
    const std::pair<int16_t, int16_t> steps[] = {{0, 2}, {1, 0}, {2, 0}, {3, 0}, {3, 1}, {4, 0},
                                                 {4, 4}, {5, 6}, {7, 8}, {8, 0}, {8, 1}};
    for (const auto& [stage, step] : steps) {
        SCOPED_TRACE(std::to_string(stage) + "," + std::to_string(step));
        SimWorld w({}, false);
        start(w, stage, step);
        w.app.StepResult = true;
        w.port.inject("stop: ABORT requested\r\n", 500);
        w.engine.WaitForRunEnd();
        EXPECT_EQ(w.clock.now(), 500);
        EXPECT_FALSE(w.app.StepResult);
        EXPECT_FALSE(w.retry.enabled());
        EXPECT_TRUE(w.app.LineBuffer.empty());
    }
    SimWorld idle({}, false);
    idle.app.StepResult = true;
    idle.port.inject("ABORT\r\n", 500);
    runUntil(idle, 500);
    EXPECT_EQ(idle.app.ScriptStep, kNoRun);
    EXPECT_FALSE(idle.app.StepResult);
    EXPECT_TRUE(idle.port.sent.empty());
}

TEST(Engine_Restart, GrantedTwiceInAnAreaElseAbortOrIgnored) {
    enum class R { Restart, Abort, Ignore };
    struct Case {
        int16_t stage;
        int16_t step;
        std::string line;
        int16_t grantedBefore;
        R outcome;
    };
    const Case cases[] = {
        {4, 4, "RESTART:P2", 0, R::Restart}, {4, 4, "RESTART:P2", 1, R::Restart},
        {4, 4, "RESTART:P2", 2, R::Abort},   {4, 0, "RESTART:P2", 0, R::Ignore},
        {5, 4, "RESTART:P2", 0, R::Ignore},  {5, 6, "RESTART:P3", 0, R::Restart},
        {6, 4, "RESTART:P4", 0, R::Restart}, {7, 8, "RESTART:P1", 0, R::Restart},
        {4, 4, "RESTART:P2x", 0, R::Ignore}, {3, 1, "RESTART:", 0, R::Abort},
        {1, 0, "RESTART:", 0, R::Ignore},    {0, 2, "RESTART:*,", 0, R::Abort},
        {8, 1, "RESTART:RE", 0, R::Abort},   {8, 1, "RESTART:P2", 0, R::Ignore},
    };
    gen::TempDir dir;
    const std::string path = dir.write("F.HEX", std::string(100, 'x'));
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.stage) + "," + std::to_string(c.step) + " " + c.line);
        SimWorld w({}, false);
        ASSERT_TRUE(w.file.open(path));
        w.file.seek(60);
        w.app.RestartPosition = 1;
        w.app.RestartCount = c.grantedBefore;
        start(w, c.stage, c.step);
        const int16_t step = w.app.ScriptStep;
        const int16_t maxResends = w.app.MaxResends;
        w.app.StepResult = true;
        w.port.inject(c.line + "\r\n", 500);
        runUntil(w, 500);
        const std::string last = w.port.sent.back().text();
        switch (c.outcome) {
            case R::Restart:
                EXPECT_TRUE(w.app.RestartRequested);
                EXPECT_EQ(w.app.RestartCount, c.grantedBefore + 1);
                EXPECT_EQ(w.app.MaxResends, maxResends + 1);
                EXPECT_EQ(w.app.ScriptStep, kNoRun);
                EXPECT_TRUE(w.app.StepResult);
                EXPECT_TRUE(w.retry.enabled());
                EXPECT_EQ(last, "\r\n" + c.line + "\r\n");
                EXPECT_EQ(w.file.nextPosition(), 1);
                break;
            case R::Abort:
                EXPECT_FALSE(w.app.RestartRequested);
                EXPECT_EQ(w.app.ScriptStep, kNoRun);
                EXPECT_FALSE(w.app.StepResult);
                EXPECT_EQ(w.file.nextPosition(), 60);
                break;
            case R::Ignore:
                EXPECT_FALSE(w.app.RestartRequested);
                EXPECT_EQ(w.app.ScriptStep, step);
                EXPECT_EQ(w.file.nextPosition(), 60);
                break;
        }
    }
}

TEST(Engine_Dsr, RiseEndsTheRunAndOnlyRebootKeepsItsResult) {
    struct Case {
        const char* name;
        int16_t stage;
        int16_t step;
        bool resultBefore;
        bool resultAfter;
    };
    const Case cases[] = {
        {"record waiting", 4, 4, true, false},
        {"OPEN waiting", 3, 1, true, false},
        {"REBOOT after a good REVC", 8, 2, true, true},
        {"REBOOT after a refused REVC", 8, 2, false, false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        SimWorld w({}, false);
        start(w, c.stage, c.step);  // REBOOT goes out after its 40 s wait
        w.app.StepResult = c.resultBefore;
        const int64_t at = w.clock.now() + 500;
        w.port.inject("P2", 200);  // a line begun before the restart can never end
        w.port.raiseDsr(500);
        w.engine.WaitForRunEnd();
        EXPECT_EQ(w.app.StepResult, c.resultAfter);
        EXPECT_FALSE(w.retry.enabled());
        EXPECT_TRUE(w.app.LineBuffer.empty());
        EXPECT_TRUE(w.port.portOpen());  // reopened at the next tick of the wait timer
        EXPECT_GT(w.clock.now(), at);
        EXPECT_LE(w.clock.now(), at + 1000);
    }
}

// While the DSR recovery waits with the port closed, a resend falling due must not fail the run:
// the instrument restarting after "REBOOT" is the download's success.
TEST(Engine_Dsr, ResendFallingDueDuringTheRecoveryChangesNothing) {
    for (const int64_t riseMs : {4200, 4500, 4900}) {  // REBOOT's resend is due 5 s after it
        SCOPED_TRACE(riseMs);
        SimWorld w({}, false);
        start(w, 8, 2);
        const int64_t rebootAt = w.clock.now();
        w.app.StepResult = true;  // REVC confirmed the new revision
        w.port.raiseDsr(riseMs);
        w.engine.WaitForRunEnd();
        EXPECT_TRUE(w.app.StepResult);
        EXPECT_EQ(w.port.sent.size(), 1u);  // REBOOT once, no resend on the closed port
        EXPECT_TRUE(w.port.portOpen());
        EXPECT_FALSE(w.retry.enabled());
        EXPECT_LE(w.clock.now(), rebootAt + riseMs + 1000);
    }
}

// A restart request while the peer holds the line stopped: the output never drains, so the
// drain must end with the run (its give-up), not turn the event loop for ever.
TEST(Engine_Restart, DrainEndsWithTheRunOnAHeldLine) {
    SimWorld w({}, false);
    start(w, 4, 4);  // a record on its way
    w.port.lineHeld = true;
    w.port.inject("RESTART:P2\r\n", 1);
    w.app.StepResult = true;
    w.engine.WaitForRunEnd();
    EXPECT_FALSE(w.app.StepResult);
    EXPECT_FALSE(w.app.RestartRequested);
    EXPECT_EQ(w.clock.now(), 21000);  // the record's own give-up
    EXPECT_FALSE(w.retry.enabled());
}

TEST(Engine_PortFailure, VanishedPortOrFailedWriteEndsTheRun) {
    {
        SimWorld w({}, false);
        start(w, 4, 4);
        w.app.StepResult = true;
        w.port.vanish(1500);
        w.engine.WaitForRunEnd();
        EXPECT_EQ(w.clock.now(), 1500);
        EXPECT_FALSE(w.app.StepResult);
        EXPECT_FALSE(w.retry.enabled());
    }
    {
        SimWorld w({}, false);
        w.port.failWrites = true;
        w.app.StepResult = true;
        w.engine.RunStage(3, 1);
        EXPECT_FALSE(w.app.StepResult);
        EXPECT_EQ(w.clock.now(), 0);
        EXPECT_FALSE(w.retry.enabled());
    }
}

TEST(Engine_Timer1, ProgressStopsAtTheLargestCount) {
    SimWorld w({}, false);
    w.app.ProgressCount = 2147483600;
    w.engine.Timer1_Timer();
    EXPECT_EQ(w.app.ProgressCount, 2147483647);
    w.engine.Timer1_Timer();
    EXPECT_EQ(w.app.ProgressCount, 2147483647);
}

}  // namespace
}  // namespace zx917
