// The page flow row by row: each event from each page, with the questions answered by the test
// and the instrument in simulated time.
#include <gtest/gtest.h>

#include <filesystem>

#include "support/wizard_rig.h"

namespace zx917 {
namespace {

using test::DownloadFile;
using test::FakeDialogs;
using test::WizardRig;
using Shown = FakeDialogs::Shown;

const std::string kPortMissing =
    "Communication port does not exist,\r\npossibly because of wrong Comm Port setting\r\nor "
    "RS-232C cable not connected.\r\nCheck Comm Port setting and cable connection.";
const std::string kNewer = "The Current Firmware Revision is newer.\r\nOK to continue?";

// From page 0 to page 3 with a file of this revision.
void toPage3(WizardRig& r, const std::string& revision = "A.02.00") {
    ASSERT_TRUE(r.toPage2());
    r.choose(DownloadFile(revision), revision);
    r.click(r.w().CmdNext[2]);
    ASSERT_EQ(r.page(), 3);
}

TEST(Wizard_Flow, TransitionsRowByRow) {
    struct Case {
        const char* name;
        std::function<void(InstrumentOptions&)> instrument;
        bool withInstrument;
        std::function<void(WizardRig&)> act;
        int page;
        std::vector<Shown> shown;  // every box shown, in order
        bool portOpen;
        int ended;
    };
    InstrumentOptions abortMid;
    const Case cases[] = {
        {"0 Next, ports present",
         nullptr,
         true,
         [](WizardRig& r) { r.click(r.w().CmdNext[0]); },
         1,
         {},
         false,
         0},
        {"0 Next, no port",
         nullptr,
         true,
         [](WizardRig& r) {
             r.world.port.absent = {1, 2};
             r.click(r.w().CmdNext[0]);
         },
         0,
         {{"beep", ""}, {"critical", "Communication port not available."}},
         false,
         0},
        {"1 Next, port taken by another program meanwhile",
         nullptr,
         true,
         [](WizardRig& r) {
             r.click(r.w().CmdNext[0]);
             r.w().settings->cboPort->setCurrentIndex(1);  // Com2
             r.world.port.absent = {2};
             r.click(r.w().CmdNext[1]);
             EXPECT_EQ(r.world.port.commPort(), 1);  // the number is back
         },
         1,
         {{"critical", kPortMissing}},
         false,
         0},
        {"1 Next, instrument silent",
         nullptr,
         false,
         [](WizardRig& r) {
             EXPECT_FALSE(r.toPage2());
             EXPECT_GE(r.world.clock.now(), 84000);
         },
         0,
         {{"critical", kPortMissing}},
         false,
         0},
        {"1 Next, identified",
         nullptr,
         true,
         [](WizardRig& r) {
             r.world.app.SelectedFileName = "OLD.HEX";
             r.world.app.SelectedRevision = "A.00.01";
             ASSERT_TRUE(r.toPage2());
             EXPECT_FALSE(r.w().CmdNext[2]->isEnabled());
             EXPECT_EQ(r.w().NewFirmInfo[2]->text(), " ");
             EXPECT_EQ(r.w().NewFirmFile[2]->text(), " ");
             EXPECT_EQ(r.w().CurFirmInfo[2]->text(), "A.01.02");
             EXPECT_EQ(r.world.app.SelectedFileName, "");
             EXPECT_EQ(r.world.app.SelectedRevision.str(), "       ");
         },
         2,
         {},
         true,
         0},
        {"2 Next, older instrument",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r, "A.02.00");
             EXPECT_EQ(r.w().RemTime[2]->text(), "02:40");
         },
         3,
         {},
         true,
         0},
        {"2 Next, same revision, OK",
         nullptr,
         true,
         [](WizardRig& r) {
             r.dialogs.answers = {true};
             toPage3(r, "A.01.02");
         },
         3,
         {{"question", kNewer}},
         true,
         0},
        {"2 Next, newer instrument, Cancel",
         nullptr,
         true,
         [](WizardRig& r) {
             ASSERT_TRUE(r.toPage2());
             r.choose(DownloadFile("B.01.00"), "B.01.00");
             r.click(r.w().CmdNext[2]);
         },
         2,
         {{"question", kNewer}},
         true,
         0},
        {"2 Next, file turned bad after its choice",
         nullptr,
         true,
         [](WizardRig& r) {
             ASSERT_TRUE(r.toPage2());
             r.choose(DownloadFile("A.02.00"), "A.02.00");
             r.folder.write("NEW.HEX", test::NotADownloadFile());
             r.click(r.w().CmdNext[2]);
         },
         2,
         {{"beep", ""}, {"critical", "This is not the download file."}},
         true,
         0},
        {"3 Back keeps the choice and asks again",
         nullptr,
         true,
         [](WizardRig& r) {
             r.dialogs.answers = {true};
             toPage3(r, "A.01.02");
             r.click(r.w().CmdBack[3]);
             EXPECT_EQ(r.page(), 2);
             EXPECT_EQ(r.w().NewFirmFile[2]->text(), "NEW.HEX");
             EXPECT_TRUE(r.w().CmdNext[2]->isEnabled());
             r.click(r.w().CmdNext[2]);  // asked again, answered Cancel
         },
         2,
         {{"question", kNewer}, {"question", kNewer}},
         true,
         0},
        {"3 Execute, Cancel: nothing sent",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r);
             const auto sent = r.world.port.sent.size();
             r.click(r.w().CmdNext[3]);
             EXPECT_EQ(r.world.port.sent.size(), sent);
         },
         3,
         {{"question", "OK to start the download?"}},
         true,
         0},
        {"3 Execute, OK, confirmed",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r);
             r.dialogs.answers = {true};
             r.click(r.w().CmdNext[3]);
             EXPECT_TRUE(r.world.instrument->confirmed());
             EXPECT_EQ(r.w().RemTime[4]->text(), "00:00");
             EXPECT_FALSE(r.w().Animation1->playing());
         },
         5,
         {{"question", "OK to start the download?"}},
         true,
         0},
        {"3 Execute, OK, instrument aborts mid-transfer",
         [](InstrumentOptions& o) {
             Fault f;
             ParseFault("abort:DL:5", f);
             o.faults = {f};
         },
         true,
         [](WizardRig& r) {
             toPage3(r);
             r.dialogs.answers = {true};
             r.click(r.w().CmdNext[3]);
             EXPECT_FALSE(r.world.instrument->confirmed());
             EXPECT_EQ(r.world.port.settings(), "9600,n,8,1");
         },
         0,
         {{"question", "OK to start the download?"}, {"critical", "Download failed."}},
         false,
         0},
        {"3 Execute, file removed",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r);
             std::filesystem::remove(r.world.app.FilePath);
             r.dialogs.answers = {true};
             r.click(r.w().CmdNext[3]);
         },
         2,
         {{"question", "OK to start the download?"},
          {"beep", ""},
          {"critical", "Could not read file."}},
         true,
         0},
        {"5 Confirm ends the program",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r);
             r.dialogs.answers = {true};
             r.click(r.w().CmdNext[3]);
             ASSERT_EQ(r.page(), 5);
             r.click(r.w().CmdNext[5]);
         },
         5,
         {{"question", "OK to start the download?"},
          {"information", "OK to exit the download program?"}},
         false,
         1},
        {"2 Cancel, OK: port closed, program ends",
         nullptr,
         true,
         [](WizardRig& r) {
             ASSERT_TRUE(r.toPage2());
             r.dialogs.answers = {true};
             r.click(r.w().CmdExit[2]);
         },
         2,
         {{"question", "OK to quit the download?"}},
         false,
         1},
        {"1 Cancel, Cancel: stays",
         nullptr,
         true,
         [](WizardRig& r) {
             r.click(r.w().CmdNext[0]);
             r.click(r.w().CmdExit[1]);
         },
         1,
         {{"question", "OK to quit the download?"}},
         false,
         0},
        {"window closed during the transfer",
         nullptr,
         true,
         [](WizardRig& r) {
             toPage3(r);
             r.dialogs.answers = {true};
             // Closed by the frame while a record waits for its answer.
             r.world.port.onSent = [&r](const test::Sent&) {
                 if (r.world.app.ScriptStage == 5 && r.ended == 0) {
                     r.world.port.onSent = nullptr;
                     r.w().close();
                 }
             };
             r.click(r.w().CmdNext[3]);
             EXPECT_FALSE(r.portOpenAtEnd);
         },
         -1,
         {{"question", "OK to start the download?"}},
         false,
         1},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        InstrumentOptions o;
        if (c.instrument) c.instrument(o);
        WizardRig r(o, c.withInstrument);
        ASSERT_EQ(r.page(), 0);
        c.act(r);
        if (c.page >= 0) {
            EXPECT_EQ(r.page(), c.page);
        }
        if (c.ended == 0 || c.page >= 0) {
            EXPECT_EQ(r.shown(), c.shown);
        } else {
            ASSERT_GE(r.shown().size(), c.shown.size());
            EXPECT_EQ(r.shown().front(), c.shown.front());
        }
        EXPECT_EQ(r.world.port.portOpen(), c.portOpen);
        EXPECT_EQ(r.ended, c.ended);
        // Exactly one page visible and enabled, whatever happened.
        int visible = 0;
        for (QWidget* page : r.w().Picture4)
            visible += page->isVisibleTo(&r.w()) && page->isEnabled();
        if (c.ended == 0) {
            EXPECT_EQ(visible, 1);
        }
    }
}

// The forward button of page 2 follows the chooser's result, whichever way it was left.
TEST(Wizard_FileChoice, ForwardButtonFollowsTheSelectedRevision) {
    WizardRig r;
    ASSERT_TRUE(r.toPage2());
    struct Step {
        const char* name;
        std::optional<std::string> revision;  // nothing: cancelled (AppState unchanged)
        bool enabled;
        QString label;
    };
    const Step steps[] = {
        {"cancelled on the first visit", std::nullopt, false, ""},
        {"a file opened", "A.02.00", true, "A.02.00"},
        {"reopened and cancelled", std::nullopt, true, "A.02.00"},
        {"only fillers", "  _ __ ", false, ""},
        {"a revision of four characters", "B.1", true, "B.1"},
    };
    for (const Step& s : steps) {
        SCOPED_TRACE(s.name);
        r.onChooser = [&r, &s] {
            if (!s.revision) return;
            r.world.app.SelectedRevision = *s.revision;
            r.world.app.SelectedFileName = "A.HEX";
        };
        r.click(r.w().CmdFirmSelect);
        EXPECT_EQ(r.w().CmdNext[2]->isEnabled(), s.enabled);
        EXPECT_EQ(r.w().NewFirmInfo[2]->text(), s.label);
    }
    EXPECT_EQ(r.chooserShown, 5);
}

}  // namespace
}  // namespace zx917
