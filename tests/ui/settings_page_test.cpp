// The settings page: the probe of Com1 and Com2, the lists filled from the port's settings,
// Preset, and the choice applied to the port.
#include <gtest/gtest.h>

#include <QApplication>
#include <QLineEdit>

#include "support/wizard_rig.h"

namespace zx917 {
namespace {

using test::WizardRig;
using Shown = test::FakeDialogs::Shown;

QStringList items(QComboBox* list) {
    QStringList out;
    for (int i = 0; i < list->count(); ++i) out << list->itemText(i);
    return out;
}

std::vector<QWidget*> lists(const ui::SettingsPage& s) {
    return {s.cboPort,   s.cboSpeed, s.cboDataBits, s.cboStopBits,
            s.cboParity, s.cboXon,   s.cboEoc,      s.cmdReset};
}

// The page shows the probe's result: the ports found, the one selected with its device as the
// tooltip, and the lists filled; or the message when there is none.
TEST(Settings_Page, ShowsTheProbe) {
    struct Case {
        const char* name;
        std::set<int16_t> absent;
        int16_t previous;
        QStringList listed;
        int selected;
    };
    const Case cases[] = {
        {"both, previous 2", {}, 2, {"Com1", "Com2"}, 1},
        {"only port 2", {1}, 1, {"Com2"}, 0},
        {"none", {1, 2}, 1, {}, -1},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        WizardRig r;
        r.world.port.setCommPort(c.previous);
        r.world.port.absent = c.absent;
        auto& s = *r.w().settings;
        s.cboSpeed->addItem("kept");  // the other lists are not touched on failure
        EXPECT_EQ(s.ProtSettings(), c.selected >= 0);
        EXPECT_EQ(items(s.cboPort), c.listed);
        EXPECT_EQ(s.cboPort->currentIndex(), c.selected);
        if (c.selected >= 0) {
            EXPECT_TRUE(r.shown().empty());
            EXPECT_EQ(items(s.cboSpeed), QStringList({"9600", "19200"}));
            EXPECT_EQ(items(s.cboDataBits), QStringList({"7", "8"}));
            EXPECT_EQ(items(s.cboStopBits), QStringList({"1", "2"}));
            EXPECT_EQ(items(s.cboParity), QStringList({"Even", "Odd", "None"}));
            EXPECT_EQ(items(s.cboXon), QStringList({"None", "Xon/Xoff"}));
            EXPECT_EQ(items(s.cboEoc), QStringList({"LF", "CR", "CR+LF"}));
            const QString n = s.cboPort->currentText().mid(3);
            EXPECT_EQ(s.cboPort->toolTip(),
                      "/dev/ttyUSB" + QString::number(n.toInt() - 1) + " - test adapter");
        } else {
            EXPECT_EQ(r.shown(),
                      (std::vector<Shown>{{"beep", ""},
                                          {"critical", "Communication port not available."}}));
            EXPECT_EQ(items(s.cboSpeed), QStringList({"kept"}));
        }
    }
}

TEST(Settings_Page, ListsShowThePortsSettings) {
    struct Case {
        std::string settings;
        std::string terminator;
        int16_t handshaking;
        QString speed, parity, dataBits, stopBits, eoc, xon;
    };
    const Case cases[] = {
        {"19200,o,7,2", "\r", 1, "19200", "Odd", "7", "2", "CR", "Xon/Xoff"},
        {"9600,E,8,1", "\n", 0, "9600", "", "8", "1", "LF", "None"},
        {"4800,n,8,1.5", "\r\n", 0, "4800", "None", "8", "", "CR+LF", "None"},
        {"1,n", "\r", 1, "", "", "", "", "CR", "Xon/Xoff"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.settings);
        WizardRig r;
        r.world.port.anySettingsText = true;
        ASSERT_TRUE(r.world.port.setSettings(c.settings));
        r.world.port.setHandshaking(c.handshaking);
        r.world.app.Terminator = c.terminator;
        auto& s = *r.w().settings;
        ASSERT_TRUE(s.ProtSettings());
        EXPECT_EQ(s.cboSpeed->currentText(), c.speed);
        EXPECT_EQ(s.cboParity->currentText(), c.parity);
        EXPECT_EQ(s.cboDataBits->currentText(), c.dataBits);
        EXPECT_EQ(s.cboStopBits->currentText(), c.stopBits);
        EXPECT_EQ(s.cboEoc->currentText(), c.eoc);
        EXPECT_EQ(s.cboXon->currentText(), c.xon);
    }
}

TEST(Settings_Apply, TheChoiceReachesThePort) {
    struct Case {
        const char* name;
        std::function<void(ui::SettingsPage&)> choose;
        std::string settings;
        std::string terminator;
        int16_t handshaking;
    };
    const Case cases[] = {
        {"Preset after other choices",
         [](ui::SettingsPage& s) {
             ui::SetListText(s.cboSpeed, "19200");
             ui::SetListText(s.cboDataBits, "7");
             ui::SetListText(s.cboParity, "Odd");
             ui::SetListText(s.cboStopBits, "2");
             ui::SetListText(s.cboEoc, "LF");
             s.cboXon->setCurrentIndex(1);
             QTest::mouseClick(s.cmdReset, Qt::LeftButton);
         },
         "9600,n,8,1", "\r\n", 0},
        {"a typed rate with blanks around it",
         [](ui::SettingsPage& s) {
             s.cboSpeed->setEditText("  19200 ");
             ui::SetListText(s.cboEoc, "LF");
         },
         "19200,n,8,1", "\n", 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        WizardRig r({}, false);
        r.click(r.w().CmdNext[0]);
        ASSERT_EQ(r.page(), 1);
        c.choose(*r.w().settings);
        ASSERT_TRUE(r.w().settings->ProtSettingsApply());
        EXPECT_TRUE(r.world.port.portOpen());
        EXPECT_EQ(r.world.port.settings(), c.settings);
        EXPECT_EQ(r.world.port.handshaking(), c.handshaking);
        EXPECT_EQ(r.world.app.Terminator, c.terminator);
        EXPECT_TRUE(r.shown().empty());
        // The identification's queries end with the chosen terminator.
        r.world.engine.RunStage(kStageIdnOnly, 0);
        ASSERT_FALSE(r.world.port.sent.empty());
        EXPECT_EQ(r.world.port.sent.front().text(), "*IDN?" + c.terminator);
        EXPECT_EQ(r.world.port.sent.front().settings, c.settings);
    }
}

// Real keys go to the focus widget: a speed typed and Enter is used, not added to the list;
// Enter presses Preset; the port's tooltip follows the port chosen by keys.
TEST(Settings_Keys, TypedSpeedEnterPresetAndPortTooltip) {
    WizardRig r;
    r.w().activateWindow();
    QApplication::setActiveWindow(&r.w());
    ASSERT_TRUE(QTest::qWaitForWindowActive(&r.w()));
    r.click(r.w().CmdNext[0]);
    ASSERT_EQ(r.page(), 1);
    auto& s = *r.w().settings;
    auto keys = [](QWidget* w, const std::vector<int>& ks) {
        w->setFocus(Qt::TabFocusReason);
        for (int k : ks) QTest::keyClick(QApplication::focusWidget(), static_cast<Qt::Key>(k));
    };
    EXPECT_TRUE(s.cboPort->toolTip().contains("/dev/ttyUSB0"))
        << s.cboPort->toolTip().toStdString();
    keys(s.cboPort, {Qt::Key_Down});
    ASSERT_EQ(s.cboPort->currentText(), "Com2");
    EXPECT_TRUE(s.cboPort->toolTip().contains("/dev/ttyUSB1"))
        << s.cboPort->toolTip().toStdString();

    keys(s.cboSpeed, {});
    s.cboSpeed->lineEdit()->selectAll();
    keys(s.cboSpeed, {Qt::Key_4, Qt::Key_8, Qt::Key_0, Qt::Key_0, Qt::Key_Return});
    EXPECT_EQ(items(s.cboSpeed), QStringList({"9600", "19200"}));
    EXPECT_EQ(s.cboSpeed->currentText(), "4800");
    ui::SetListText(s.cboDataBits, "7");
    keys(s.cmdReset, {Qt::Key_Return});
    EXPECT_EQ(s.cboSpeed->currentText(), "9600");
    EXPECT_EQ(s.cboDataBits->currentText(), "8");
    EXPECT_EQ(r.page(), 1);
}

// While the instrument is asked for its revision, nothing on page 1 but help takes a click.
TEST(Settings_Apply, PageLockedWhileTheInstrumentIsAsked) {
    WizardRig r;
    r.click(r.w().CmdNext[0]);
    std::vector<bool> enabledDuring;
    r.world.port.onSent = [&](const test::Sent&) {
        auto& s = *r.w().settings;
        for (QWidget* w : lists(s)) enabledDuring.push_back(w->isEnabled());
        enabledDuring.push_back(r.w().CmdNext[1]->isEnabled());
        enabledDuring.push_back(r.w().CmdExit[1]->isEnabled());
        EXPECT_TRUE(r.w().CmdHelp[1]->isEnabled());
    };
    r.click(r.w().CmdNext[1]);
    ASSERT_EQ(r.page(), 2);
    ASSERT_FALSE(enabledDuring.empty());
    EXPECT_EQ(std::count(enabledDuring.begin(), enabledDuring.end(), true), 0);
    // Enabled again for the next visit (the page itself is now hidden and disabled).
    for (QWidget* w : lists(*r.w().settings)) EXPECT_TRUE(w->isEnabledTo(r.w().Picture4[1]));
}

}  // namespace
}  // namespace zx917
