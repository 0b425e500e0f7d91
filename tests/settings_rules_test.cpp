// The settings page's rules without a window: the port probe over the simulated port, a
// settings text taken apart to be shown, and the choice put back together.
#include <gtest/gtest.h>

#include "link/line_settings.h"
#include "link/port_probe.h"
#include "support/sim_world.h"

namespace zx917 {
namespace {

TEST(Settings_Probe, PreviousPortElseTheLowestPresent) {
    struct Case {
        const char* name;
        std::set<int16_t> absent;
        int16_t previous;
        std::vector<int16_t> present;
        std::optional<std::size_t> selected;
        int16_t portAfter;
    };
    const Case cases[] = {
        {"only port 2", {1}, 1, {2}, 0, 2},
        {"both, previous 2", {}, 2, {1, 2}, 1, 2},
        {"both, previous 1", {}, 1, {1, 2}, 0, 1},
        {"only port 1, previous 2", {2}, 2, {1}, 0, 1},
        {"previous 5, not probed", {}, 5, {1, 2}, 0, 1},
        {"none: the last number tried", {1, 2}, 1, {}, std::nullopt, 2},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        test::SimWorld w({}, false);
        w.port.setPortOpen(false);
        w.port.setCommPort(c.previous);
        w.port.absent = c.absent;
        const PortProbe probe = ProbePorts(w.port, 2);
        EXPECT_EQ(probe.present, c.present);
        EXPECT_EQ(probe.selected, c.selected);
        EXPECT_EQ(w.port.commPort(), c.portAfter);
        EXPECT_FALSE(w.port.portOpen());
    }
}

TEST(Settings_Text, TakenApartFromTheRight) {
    struct Case {
        std::string settings;
        std::optional<SettingsFields> fields;
    };
    const Case cases[] = {
        {"19200,o,7,2", SettingsFields{"19200", "o", "7", "2"}},
        {"9600,n,8,1", SettingsFields{"9600", "n", "8", "1"}},
        {"9600,E,8,1", SettingsFields{"9600", "E", "8", "1"}},  // no item stands for "E"
        {"4800,n,8,1.5", SettingsFields{"4800", "n", "8", "1.5"}},
        {"115200,n,8,1", SettingsFields{"115200", "n", "8", "1"}},
        {"1,n,8,1", SettingsFields{"1", "n", "8", "1"}},
        // Too short to take apart.
        {"1,n", std::nullopt},
        {"", std::nullopt},
        {"5,n,", std::nullopt},
        {",n,8,1", std::nullopt},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.settings);
        const auto f = SettingsFieldsOf(c.settings);
        ASSERT_EQ(f.has_value(), c.fields.has_value());
        if (!f) continue;
        EXPECT_EQ(f->speed, c.fields->speed);
        EXPECT_EQ(f->parity, c.fields->parity);
        EXPECT_EQ(f->dataBits, c.fields->dataBits);
        EXPECT_EQ(f->stopBits, c.fields->stopBits);
    }
}

TEST(Settings_Text, ChoicePutTogether) {
    struct Case {
        std::string speed, parity, data, stop, settings;
    };
    const Case cases[] = {
        {"9600", "n", "8", "1", "9600,n,8,1"},
        {"  19200 ", "o", "7", "2", "19200,o,7,2"},
        {"57600", "e", "8", "1", "57600,e,8,1"},
        {"abc", "n", "8", "1", "abc,n,8,1"},  // taken as typed: the port refuses it
        {"9600", "", "", "", "9600,,,"},      // lists without a selection
    };
    for (const Case& c : cases) {
        EXPECT_EQ(SettingsTextOf(c.speed, c.parity, c.data, c.stop), c.settings);
    }
    // Every settings text the page can show comes back unchanged.
    for (const char* s : {"9600,n,8,1", "19200,o,7,2", "38400,e,7,1"}) {
        const auto f = SettingsFieldsOf(s);
        ASSERT_TRUE(f);
        EXPECT_EQ(SettingsTextOf(f->speed, f->parity, f->dataBits, f->stopBits), s);
    }
}

TEST(Settings_Terminator, ItemsAndBytes) {
    EXPECT_EQ(TerminatorItem("\n"), 0u);
    EXPECT_EQ(TerminatorItem("\r"), 1u);
    EXPECT_EQ(TerminatorItem("\r\n"), 2u);
    EXPECT_EQ(TerminatorItem(""), 2u);
    EXPECT_EQ(TerminatorItem("\n\r"), 2u);
    EXPECT_EQ(TerminatorOf(0), "\n");
    EXPECT_EQ(TerminatorOf(1), "\r");
    EXPECT_EQ(TerminatorOf(2), "\r\n");
    EXPECT_EQ(TerminatorOf(-1), "\r\n");  // no selection
    for (std::size_t i = 0; i < kTerminatorItems.size(); ++i) {
        EXPECT_EQ(TerminatorItem(TerminatorOf(static_cast<int>(i))), i);
    }
}

}  // namespace
}  // namespace zx917
