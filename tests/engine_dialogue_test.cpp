// The dialogue against the in-process instrument: framing, line settings and answer checks.
#include <gtest/gtest.h>

#include "support/sim_world.h"

namespace zx917 {
namespace {

using test::SimWorld;

std::vector<std::string> texts(const SimWorld& w) {
    std::vector<std::string> out;
    for (const auto& s : w.port.sent) out.push_back(s.text());
    return out;
}

TEST(Engine_Framing, EveryCommandGoesOutAsItShould) {
    for (const std::string term : {"\r\n", "\r", "\n"}) {
        SCOPED_TRACE(term.size() == 2 ? "CRLF" : term == "\r" ? "CR" : "LF");
        SimWorld w;
        w.app.Terminator = term;
        w.app.NewRevision = "X.XX.XX";
        w.engine.RunStage(0, 0);
        ASSERT_TRUE(w.app.StepResult);
        EXPECT_EQ(w.app.CurrentRevision.str(), "A.01.02");
        w.engine.RunStage(2, 0);
        ASSERT_TRUE(w.app.StepResult);
        EXPECT_EQ(w.app.AmpsSectionFlag, "1");
        w.app.NewRevision = "B.1";  // padded with blanks on the line
        w.engine.RunStage(3, 0);
        ASSERT_TRUE(w.app.StepResult);
        w.engine.RunStage(4, 0);
        ASSERT_TRUE(w.app.StepResult);
        w.app.RecordBytes = {0x00, 0x06, 0x3A, 0x00, 0x00, 0x00, 0x01, 0xFF};
        w.engine.RunStage(4, 6);
        ASSERT_TRUE(w.app.StepResult);
        w.engine.RunStage(4, 8);
        ASSERT_TRUE(w.app.StepResult);
        EXPECT_EQ(w.app.RecordBytes, (std::vector<uint8_t>{0, 0}));
        w.engine.RunStage(8, 0);
        EXPECT_TRUE(w.app.StepResult);
        const std::vector<std::string> want = {"*CLS\n",
                                               "DISPlay:CONFigure\n",
                                               "SYSTem:ERRor?" + term,
                                               "*IDN?" + term,
                                               "MAINTENANCE:DOWNLOAD\n",
                                               "REVD X.XX.XX\n\n",
                                               "REVD B.1    \n\n",
                                               "OPEN\n",
                                               "SP2\n",
                                               std::string("\x00\x06:\x00\x00\x00\x01\xFF", 8),
                                               std::string(2, '\0'),
                                               "CLOSE\n",
                                               "REVC B.1    \n\n",
                                               "REBOOT\n"};
        EXPECT_EQ(texts(w), want);
        // Identification at the user's settings, everything after the switch at 38400 8E1.
        for (std::size_t i = 0; i < w.port.sent.size(); ++i) {
            const bool download = i >= 5;
            EXPECT_EQ(w.port.sent[i].settings, download ? "38400,E,8,1" : "9600,n,8,1") << i;
            EXPECT_EQ(w.port.sent[i].handshaking, download ? 3 : 0) << i;
        }
        EXPECT_TRUE(w.instrument->confirmed());
    }
}

TEST(Engine_Framing, RebootWaitEndsAtTheFirstEvent) {
    SimWorld w;
    w.app.NewRevision = "A.02.00";
    w.engine.RunStage(2, 0);
    w.engine.RunStage(3, 0);
    ASSERT_TRUE(w.app.StepResult);
    w.app.ScriptStage = 8;
    w.app.ScriptStep = 2;
    const int64_t start = w.clock.now();
    w.port.inject("noise\r\n", 3000);  // any event ends the wait
    w.engine.RunCurrentStep();
    const auto reboot = w.sendsOf("REBOOT");
    ASSERT_EQ(reboot.size(), 1u);
    EXPECT_EQ(reboot[0].atMs - start, 3000);
}

enum class Outcome { Accepted, Succeeded, Failed, Refused, Ignored };

struct LineCase {
    const char* name;
    int16_t stage;
    int16_t step;
    std::string line;
    Outcome outcome;
};

TEST(Engine_Reception, AnswerLinesAndTheirChecks) {
    const std::string id46 = "Quorvex,ZX917,SN0001234567,FW----------A.01.02";
    using O = Outcome;
    const LineCase cases[] = {
        {"ready with CR LF", 2, 0, "DOWNLOAD READY\r\n", O::Accepted},
        {"ready with LF CR and blank lines", 2, 0, "\n\nDOWNLOAD READY\n\r", O::Accepted},
        {"ready with a tab", 2, 0, "DOWNLOAD\t READY\r\n", O::Accepted},
        {"ready in lower case", 2, 0, "download ready\r\n", O::Ignored},
        {"ready with control characters", 2, 0,
         "\x01"
         "DOWNLOAD READY\x07\r\n",
         O::Accepted},
        {"P2A", 4, 4, "P2A\r\n", O::Succeeded},
        {"P2A with prefix", 4, 4, "xP2A\r\n", O::Ignored},
        {"P2A with suffix", 4, 4, "P2AX\r\n", O::Refused},
        {"P1A in area 2", 4, 4, "P1A\r\n", O::Ignored},
        {"identity of 46", 1, 0, id46 + "\r\n", O::Succeeded},
        {"identity of 45", 1, 0, id46.substr(0, 45) + "\r\n", O::Refused},
        {"identity of 47", 1, 0, id46 + "X\r\n", O::Refused},
        {"identity of another maker", 1, 0, "Acme" + id46.substr(4) + "\r\n", O::Ignored},
        {"error queue 0", 0, 2, "0,\"No error\"\r\n", O::Accepted},
        {"error queue +0", 0, 2, "+0,\"No error\"\r\n", O::Failed},
        {"error queue -", 0, 2, "-100,\"Command error\"\r\n", O::Failed},
        {"error queue without quote", 0, 2, "0,No error\r\n", O::Ignored},
        {"REV of 14", 3, 0, "REV A.01.02 10\r\n", O::Accepted},
        {"REV of 13", 3, 0, "REV A.01.02 1\r\n", O::Refused},
        {"erase answer", 4, 8, "EP2\r\n", O::Succeeded},
        {"erase answer with more", 4, 8, "EP2 OK\r\n", O::Succeeded},
        {"erase refused", 4, 8, "EP2N\r\n", O::Refused},
        {"REVC same revision", 8, 1, "REV B.02.10 10\r\n", O::Accepted},
        {"REVC other revision", 8, 1, "REV B.02.11 10\r\n", O::Refused},
    };
    for (const LineCase& c : cases) {
        SCOPED_TRACE(c.name);
        SimWorld w({}, false);
        w.app.NewRevision = "B.02.10";
        w.app.RecordBytes = {0x00, 0x06, 0x3A, 0x01, 0x00, 0x00, 0x00, 0xFF};
        w.app.ScriptStage = c.stage;
        w.app.ScriptStep = c.step;
        w.engine.SendStep();
        const int16_t armedStep = w.app.ScriptStep;
        w.app.ElapsedTicks = 1;
        // A refused line must turn a previous success into False, not only restart the count.
        w.app.StepResult = c.outcome == O::Failed || c.outcome == O::Refused;
        w.port.inject(c.line, 100);
        while (w.clock.nextAt() < 1000) w.pump.processNextEvent();
        switch (c.outcome) {
            case O::Accepted:
                EXPECT_GT(w.app.ScriptStep, armedStep);
                EXPECT_LT(w.app.ScriptStep, kNoRun);
                EXPECT_TRUE(w.app.StepResult);
                break;
            case O::Succeeded:
            case O::Failed:
                EXPECT_EQ(w.app.ScriptStep, kNoRun);
                EXPECT_EQ(w.app.StepResult, c.outcome == O::Succeeded);
                EXPECT_FALSE(w.retry.enabled());
                break;
            case O::Refused:
            case O::Ignored:
                EXPECT_EQ(w.app.ScriptStep, armedStep);
                EXPECT_EQ(w.app.ElapsedTicks, c.outcome == O::Refused ? 0 : 1);
                EXPECT_TRUE(w.retry.enabled());
                if (c.outcome == O::Refused) {
                    EXPECT_FALSE(w.app.StepResult);
                }
                break;
        }
    }
}

TEST(Engine_Reception, TwoLinesInOneBurstAreBothHandled) {
    SimWorld w({}, false);
    w.app.NewRevision = "B.02.10";
    w.app.ScriptStage = 8;
    w.app.ScriptStep = 0;
    w.engine.SendStep();
    w.port.inject("CLOSE\r\nREV B.02.10 10\r\n", 100);
    while (w.clock.nextAt() <= 100) w.pump.processNextEvent();  // the first tick comes later
    EXPECT_EQ(w.app.ScriptStep, 2);  // both answers taken: REBOOT's wait is next
}

}  // namespace
}  // namespace zx917
