// Identification: the three stages, what the page shows and where the port is left.
#include <gtest/gtest.h>

#include <optional>

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

// Whatever the instrument did, the way back puts the engineer's own settings on the port.
TEST(Identify_PortBack, UsersSettingsAfterEveryFailure) {
    struct Case {
        const char* name;
        std::string user;
        int16_t handshaking;
        std::optional<LineSettings> instrumentLine;  // nothing: no instrument
        bool download;                               // go on to a whole download
        bool ok;
        std::string after;  // PortSettings and the port's text at the end
    };
    const Case cases[] = {
        {"silent at 9600,e,8,1", "9600,e,8,1", 0, std::nullopt, false, false, "9600,e,8,1"},
        {"silent at 19200,o,7,2 XON", "19200,o,7,2", 1, std::nullopt, false, false, "19200,o,7,2"},
        {"silent at 9600,E,8,1", "9600,E,8,1", 0, std::nullopt, false, false, "9600,E,8,1"},
        // Heard only at the flipped parity: that parity is the instrument's, kept as the page
        // writes it, also for the way back after the download.
        {"answers odd to a user at even", "9600,e,8,1", 0, LineSettings{9600, 'o', 8, "1"}, true,
         true, "9600,o,8,1"},
        {"answers even to a user at odd", "19200,o,8,1", 1, LineSettings{19200, 'e', 8, "1"}, true,
         true, "19200,e,8,1"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        InstrumentOptions o;
        if (c.instrumentLine) o.userLine = *c.instrumentLine;
        FirmwareRig r(o, c.instrumentLine.has_value());
        auto& port = r.world.port;
        port.setPortOpen(false);
        port.setSettings(c.user);
        port.setHandshaking(c.handshaking);
        port.setPortOpen(true);
        if (c.download) {
            gen::FileLayout layout;
            layout.sections = gen::StandardSections(2);
            r.choose(gen::Build(layout));
            EXPECT_EQ(r.download(), c.ok);
            EXPECT_TRUE(r.world.instrument->confirmed());
        } else {
            EXPECT_EQ(r.ops.ReadCurrentRevision(), c.ok);
        }
        EXPECT_EQ(port.settings(), c.after);
        EXPECT_EQ(r.world.app.PortSettings, c.after);
        EXPECT_EQ(port.handshaking(), c.handshaking);
        EXPECT_EQ(r.world.app.SpeedSwitchPending, 0);
    }
}

// A write of "MAINTENANCE:DOWNLOAD" that fails (an adapter pulled) must leave no speed switch
// behind for the next identification.
TEST(Identify_PortBack, SecondIdentificationAfterAFailedWrite) {
    FirmwareRig r;
    auto& port = r.world.port;
    port.failWritesOf = "MAINTENANCE:DOWNLOAD";
    EXPECT_FALSE(r.ops.ReadCurrentRevision());
    EXPECT_EQ(port.settings(), "9600,n,8,1");
    EXPECT_EQ(r.world.app.SpeedSwitchPending, 0);
    port.failWritesOf.clear();
    const std::size_t before = port.sent.size();
    EXPECT_TRUE(r.ops.ReadCurrentRevision());
    EXPECT_EQ(r.view.currentRevision, "A.01.02");
    for (std::size_t i = before; i < port.sent.size(); ++i) {
        const std::string text = port.sent[i].text();
        SCOPED_TRACE(text);
        const bool downloadSpeed = i > before && port.sent[i - 1].text().starts_with("MAINT");
        EXPECT_EQ(port.sent[i].settings, downloadSpeed ? "38400,E,8,1" : "9600,n,8,1");
        if (text.starts_with("MAINT")) {
            EXPECT_EQ(i + 2, port.sent.size());  // REVD follows
        }
    }
    EXPECT_EQ(r.world.app.PortSettings, "9600,n,8,1");
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
