// Identification: the three stages, what the page shows and where the port is left.
#include <gtest/gtest.h>

#include "support/firmware_rig.h"

namespace zx917 {
namespace {

using test::FirmwareRig;

TEST(Identify_Outcomes, StagesRevisionAndPortSettings) {
    struct Case {
        const char* name;
        InstrumentOptions options;
        bool instrument;
        bool ok;
        std::string label;
        std::string portAfter;
        bool maintenanceSent;
        int64_t seconds;  // simulated time, when it is set by time-outs
    };
    InstrumentOptions normal;
    normal.revision = "B.01.07";
    InstrumentOptions idnOnly;
    idnOnly.idnOnly = true;
    InstrumentOptions noDownload;
    noDownload.noDownloadMode = true;
    InstrumentOptions ampsOff;
    ampsOff.ampsFlag = '0';
    const Case cases[] = {
        {"stage 0 succeeds", normal, true, true, "B.01.07", "38400,E,8,1", true, -1},
        {"identity only", idnOnly, true, true, "A.01.02", "9600,n,8,1", false, 9},
        {"no download mode", noDownload, true, false, "", "9600,n,8,1", true, 54},
        // Error query 9 s, identity 21 s, download mode 54 s.
        {"nothing answers", {}, false, false, "?.??.??", "9600,n,8,1", true, 84},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        FirmwareRig r(c.options, c.instrument);
        EXPECT_EQ(r.ops.ReadCurrentRevision(), c.ok);
        EXPECT_EQ(r.view.currentRevision, c.label);
        EXPECT_EQ(r.world.port.settings(), c.portAfter);
        EXPECT_EQ(!r.world.sendsOf("MAINTENANCE:DOWNLOAD").empty(), c.maintenanceSent);
        EXPECT_EQ(r.view.enabledHistory, (std::vector<bool>{false, true}));
        if (c.seconds >= 0) {
            EXPECT_GE(r.world.clock.now(), c.seconds * 1000);
            EXPECT_LE(r.world.clock.now(), c.seconds * 1000 + 500);
        }
        if (c.ok) {
            EXPECT_TRUE(r.dialogs.shown.empty());
        } else {
            const std::vector<test::FakeDialogs::Shown> want = {
                {"critical", r.texts.MessageTable[kMsgPortMissing]}};
            EXPECT_EQ(r.dialogs.shown, want);
        }
    }
    FirmwareRig amps(ampsOff);
    ASSERT_TRUE(amps.ops.ReadCurrentRevision());
    EXPECT_EQ(amps.world.app.AmpsSectionFlag, "0");
}

TEST(Identify_Outcomes, IdentifiedWithoutDownloadModeKeepsTheUsersSettings) {
    InstrumentOptions o;
    o.idnOnly = true;
    o.userLine = LineSettings{19200, 'e', 7, "1"};
    FirmwareRig r(o);
    r.world.port.setSettings("19200,e,7,1");
    r.world.port.setHandshaking(1);
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(2);
    r.choose(gen::Build(layout));
    EXPECT_FALSE(r.download());  // not in download mode: "REVD" is never answered
    EXPECT_EQ(r.view.pages.back(), 0);
    EXPECT_EQ(r.world.port.settings(), "19200,e,7,1");
    EXPECT_EQ(r.world.port.handshaking(), 1);
}

TEST(Identify_Prepare, EstimateShownAndBadFileSendsBackToPageTwo) {
    FirmwareRig r;
    gen::FileLayout layout;
    layout.sections = gen::StandardSections(2);
    r.choose(gen::Build(layout), "A.02.00");
    EXPECT_TRUE(r.ops.PrepareDownload());
    EXPECT_EQ(r.world.app.NewRevision.str(), "A.02.00");
    EXPECT_EQ(r.ops.EstimatedTime, 160);
    EXPECT_EQ(r.view.remTime2, "02:40");
    r.choose(gen::Bytes{'x'});
    EXPECT_FALSE(r.ops.PrepareDownload());
    EXPECT_EQ(r.view.pages.back(), 2);
    EXPECT_EQ(r.dialogs.shown.back().text, "This is not the download file.");
}

}  // namespace
}  // namespace zx917
