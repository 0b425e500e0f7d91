// The pages as designed, read back from the widgets: names, captions, places in twips, fonts,
// which page shows them, the tab chain of each page, and the revision font.
#include <gtest/gtest.h>

#include <QAbstractButton>
#include <QApplication>
#include <QFontInfo>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <set>

#include "support/wizard_rig.h"
#include "ui/common/centre.h"
#include "ui/common/twips.h"

namespace zx917 {
namespace {

using test::WizardRig;

struct Control {
    const char* name;
    int page;
    const char* caption;           // nullptr: not checked (set at run time, or a list)
    int left, top, width, height;  // width -1: sized to its text
};

const Control kControls[] = {
    {"Label12_2", 0,
     "This is a program to download the Quorvex ZX917 Firmware by using RS-232C\ncommunication."
     "\n\n  1. On the ZX917, press the \"PRESET\" key, then press the\n     \"CONFIGURATION\" "
     "softkey. (Go to the CONFIGURATION Screen.)\n  2. Connect the \"SERIAL INTERFACE\" port on "
     "the back left side of the\n      ZX917 and the Comm Port of your PC with RS-232C cross "
     "cable.\n      Be careful not to use the \"SERVICE USE ONLY\" port.\n     (Quorvex "
     "Technologies recommends Quorvex VN6120 RS232 Cable Kit )\n  3. After checking the "
     "connection, click \"Next>\"",
     360, 960, 7695, 2415},
    {"CmdNext_0", 0, "&Next >", 3960, 3960, 1215, 375},
    {"CmdExit_0", 0, "&Cancel", 5760, 3960, 1215, 375},
    {"CmdHelp_0", 0, "&Help", 7080, 3960, 1215, 375},
    {"Label7_1", 1,
     "Select the Comm Port and set the settings to be same as the\nZX917's serial port settings.",
     480, 240, 7455, 615},
    {"Label3", 1, "Comm Port:", 480, 960, 1215, 375},
    {"cboPort", 1, nullptr, 1800, 960, 1215, -1},
    {"Frame3", 1, "Settings", 3960, 720, 3375, 3015},
    {"Label1_1", 1, "Baud Rate:", 480, 360, -1, -1},
    {"cboSpeed", 1, nullptr, 1800, 360, 1215, -1},
    {"Label2_1", 1, "Data Length:", 360, 720, -1, -1},
    {"cboDataBits", 1, nullptr, 1800, 720, 1215, -1},
    {"Label9_1", 1, "Stop Bits:", 600, 1080, -1, -1},
    {"cboStopBits", 1, nullptr, 1800, 1080, 1215, -1},
    {"Label10", 1, "Parity:", 960, 1440, -1, -1},
    {"cboParity", 1, nullptr, 1800, 1440, 1215, -1},
    {"Label4_0", 1, "Xcontrol:", 720, 1800, -1, -1},
    {"cboXon", 1, nullptr, 1800, 1800, 1215, -1},
    {"Label4_1", 1, "Terminator:", 480, 2160, -1, -1},
    {"cboEoc", 1, nullptr, 1800, 2160, 1215, -1},
    {"cmdReset", 1, "&Preset", 1800, 2520, 1215, 375},
    {"CmdNext_1", 1, "&Next >", 3960, 3960, 1215, 375},
    {"CmdExit_1", 1, "&Cancel", 5760, 3960, 1215, 375},
    {"CmdHelp_1", 1, "&Help", 7080, 3960, 1215, 375},
    {"Frame1", 2, "Current Firmware Information", 240, 600, 7935, 1215},
    {"CurFirmInfo_2", 2, nullptr, 3240, 480, 1932, 612},
    {"Frame2", 2, "New Firmware Information", 240, 2160, 7935, 1455},
    {"CmdFirmSelect", 2, "&Select the Download File\nfor the New Firmware", 240, 480, 2895, 735},
    {"NewFirmInfo_2", 2, nullptr, 3240, 600, 1812, 612},
    {"Label5_9", 2, "(", 5160, 720, -1, -1},
    {"NewFirmFile_2", 2, nullptr, 5280, 720, 1572, 252},
    {"Label5_8", 2, ")", 6960, 720, -1, -1},
    {"CmdNext_2", 2, "&Next >", 3960, 3960, 1215, 375},
    {"CmdExit_2", 2, "&Cancel", 5760, 3960, 1215, 375},
    {"CmdHelp_2", 2, "&Help", 7080, 3960, 1215, 375},
    {"Label1_0", 3, "Current Firmware", 360, 495, -1, -1},
    {"CurFirmInfo_3", 3, nullptr, 2640, 500, -1, -1},
    {"Label2_0", 3, "New Firmware", 360, 1095, -1, -1},
    {"NewFirmInfo_3", 3, nullptr, 2640, 1104, -1, -1},
    {"Label5_11", 3, "(", 3720, 1100, -1, -1},
    {"NewFirmFile_3", 3, nullptr, 3840, 1080, 1692, -1},
    {"Label5_10", 3, ")", 5640, 1080, -1, -1},
    {"Label6", 3, "To start the download, click the Execute button.", 600, 2040, 7215, 375},
    {"Label7_0", 3, "Download time:", 2400, 3360, -1, -1},
    {"RemTime_2", 3, nullptr, 4080, 3360, -1, -1},
    {"CmdBack_3", 3, "<&Back", 2760, 3960, 1215, 375},
    {"CmdNext_3", 3, "&Execute >", 3960, 3960, 1215, 375},
    {"CmdExit_3", 3, "&Cancel", 5760, 3960, 1215, 375},
    {"CmdHelp_3", 3, "&Help", 7080, 3960, 1215, 375},
    {"Label1_2", 4, "Current Firmware", 360, 495, -1, -1},
    {"CurFirmInfo_4", 4, nullptr, 2640, 480, -1, -1},
    {"Label2_2", 4, "New Firmware", 360, 1080, -1, -1},
    {"NewFirmInfo_4", 4, nullptr, 2640, 1104, -1, -1},
    {"Label5_1", 4, "(", 3720, 1100, -1, -1},
    {"NewFirmFile_4", 4, nullptr, 3840, 1080, 1812, -1},
    {"Label5_0", 4, ")", 5760, 1080, -1, -1},
    {"Label5_2", 4, "Downloading....\nDO NOT turn off the ZX917 or PC!", 2280, 1560, 3855, 495},
    {"Animation1", 4, nullptr, 2280, 2040, 3255, 855},
    {"Label11_1", 4, "Progress", 240, 3000, -1, -1},
    {"ProgressBar", 4, nullptr, 1200, 3000, 6735, 255},
    {"Label8_0", 4, "Transferred bytes:", 1080, 3360, -1, -1},
    {"RedByte_4", 4, nullptr, 3000, 3360, -1, -1},
    {"Label7_2", 4, "Remaining time:", 4560, 3360, -1, -1},
    {"RemTime_4", 4, nullptr, 6240, 3360, -1, -1},
    {"CmdHelp_4", 4, "&Help", 7080, 3960, 1215, 375},
    {"Label1_4", 5, "Current Firmware", 360, 495, -1, -1},
    {"CurFirmInfo_5", 5, nullptr, 2640, 495, -1, -1},
    {"Label2_4", 5, "New Firmware", 360, 1080, -1, -1},
    {"NewFirmInfo_5", 5, nullptr, 2640, 1100, -1, -1},
    {"Label5_4", 5, "(", 3720, 1100, -1, -1},
    {"NewFirmFile_5", 5, nullptr, 3840, 1080, 1692, -1},
    {"Label5_3", 5, ")", 5640, 1080, -1, -1},
    {"Label12_0", 5, "Download successfully completed.", 600, 2040, 7215, 375},
    {"CmdNext_5", 5, "&Confirm", 3960, 3960, 1215, 375},
    {"CmdHelp_5", 5, "&Help", 7080, 3960, 1215, 375},
};

const char* const kCentred[] = {"CurFirmInfo_2", "NewFirmInfo_2", "NewFirmFile_2", "NewFirmFile_3",
                                "NewFirmFile_4", "NewFirmFile_5", "Label6",        "Label12_0"};

QString caption(QWidget* w) {
    if (auto* l = qobject_cast<QLabel*>(w)) return l->text();
    if (auto* b = qobject_cast<QAbstractButton*>(w)) return b->text();
    if (auto* g = qobject_cast<QGroupBox*>(w)) return g->title();
    return {};
}

// Within the rounding of one pixel.
void expectTwips(int pixels, int twips, const char* what) {
    EXPECT_LE(std::abs(pixels * ui::kTwipsPerPixel - twips), ui::kTwipsPerPixel / 2) << what;
}

TEST(Wizard_Pages, EveryControlAsDesigned) {
    WizardRig r;
    EXPECT_EQ(r.w().windowTitle(), "Quorvex ZX917 Download Program Ver.02.01");
    EXPECT_EQ(r.w().size(), QSize(559, 294));  // 8388 x 4416 twips
    EXPECT_EQ(r.w().minimumSize(), r.w().maximumSize());
    EXPECT_FALSE(r.w().windowFlags() & Qt::WindowMinimizeButtonHint);
    EXPECT_FALSE(r.w().windowFlags() & Qt::WindowMaximizeButtonHint);
    for (int n = 0; n < ui::kPages; ++n) {
        expectTwips(r.w().Picture4[n]->width(), 8295, "page width");
        expectTwips(r.w().Picture4[n]->height(), n == 1 ? 4455 : 4335, "page height");
    }
    for (int shown = 0; shown < ui::kPages; ++shown) {
        r.w().GoToPage(shown);
        EXPECT_EQ(r.page(), shown);
        for (int n = 0; n < ui::kPages; ++n) {
            EXPECT_EQ(r.w().Picture4[n]->isVisibleTo(&r.w()), n == shown);
            EXPECT_EQ(r.w().Picture4[n]->isEnabled(), n == shown);
        }
        for (const Control& c : kControls) {
            SCOPED_TRACE(c.name);
            auto* w = r.w().findChild<QWidget*>(c.name);
            ASSERT_NE(w, nullptr);
            EXPECT_TRUE(r.w().Picture4[c.page]->isAncestorOf(w));
            EXPECT_EQ(w->isVisibleTo(&r.w()), c.page == shown);
            if (shown != c.page) continue;
            if (c.caption) {
                EXPECT_EQ(caption(w), QString::fromLatin1(c.caption));
            }
            expectTwips(w->x(), c.left, "left");
            expectTwips(w->y(), c.top, "top");
            if (c.width >= 0) expectTwips(w->width(), c.width, "width");
            if (c.height >= 0) expectTwips(w->height(), c.height, "height");
            const bool large =
                std::string(c.name) == "CurFirmInfo_2" || std::string(c.name) == "NewFirmInfo_2";
            if (qobject_cast<QLabel*>(w) || qobject_cast<QAbstractButton*>(w)) {
                EXPECT_EQ(w->font().bold(), !large);
                if (!large) {
                    EXPECT_NEAR(w->font().pointSizeF(), 9.6, 0.01);
                }
            }
            if (auto* l = qobject_cast<QLabel*>(w)) {
                const bool centred =
                    std::find_if(std::begin(kCentred), std::end(kCentred), [&](const char* n) {
                        return std::string(n) == c.name;
                    }) != std::end(kCentred);
                EXPECT_EQ(bool(l->alignment() & Qt::AlignHCenter), centred);
            }
        }
    }
}

// Where a control draws, in page coordinates: a label, aligned at its top, only as far down as
// its text.
QRect drawn(QWidget* w, QWidget* page) {
    QSize size = w->size();
    if (auto* l = qobject_cast<QLabel*>(w)) {
        const int text = l->wordWrap() ? l->heightForWidth(l->width()) : l->sizeHint().height();
        size.setHeight(std::min(l->height(), text));
    }
    return {w->mapTo(page, QPoint()), size};
}

// What the geometry table cannot see: in the shipped font, every caption fits its control, and
// no two controls of a page overlap but Back and Execute, which the design makes touch. The
// labels filled at run time hold long values.
TEST(Wizard_Pages, CaptionsFitAndNothingOverlaps) {
    WizardRig r;
    r.w().settings->ProtSettings();
    ui::SetCaption(r.w().CurFirmInfo[2], "W.88.88");
    ui::SetCaption(r.w().NewFirmInfo[2], "W.88.88");
    ui::SetCaption(r.w().NewFirmFile[2], "WWWWWWWW.HEX");
    ui::SetCaption(r.w().RemTime[2], "999:59");
    r.w().setByteLabel("99999999Byte");
    r.w().setRemainingTime(4, "999:59");
    const std::set<std::pair<QString, QString>> touching = {{"CmdBack_3", "CmdNext_3"}};
    for (int n = 0; n < ui::kPages; ++n) {
        SCOPED_TRACE(n);
        r.w().GoToPage(n);
        QWidget* page = r.w().Picture4[n];
        std::vector<QWidget*> controls;
        for (QWidget* w : page->findChildren<QWidget*>()) {
            if (w->objectName().isEmpty() || w->objectName().startsWith("qt_")) continue;
            if (!w->isVisibleTo(page)) continue;
            controls.push_back(w);
            const QSize hint = w->sizeHint();
            if (auto* l = qobject_cast<QLabel*>(w); l && l->wordWrap()) {
                EXPECT_LE(l->heightForWidth(l->width()), l->height())
                    << l->objectName().toStdString();
            } else if (qobject_cast<QLabel*>(w) || qobject_cast<QPushButton*>(w)) {
                EXPECT_LE(hint.width(), w->width()) << w->objectName().toStdString();
                EXPECT_LE(hint.height(), w->height()) << w->objectName().toStdString();
            } else if (auto* g = qobject_cast<QGroupBox*>(w)) {
                EXPECT_LT(g->fontMetrics().horizontalAdvance(g->title()), g->width());
            }
        }
        for (std::size_t i = 0; i < controls.size(); ++i) {
            for (std::size_t j = i + 1; j < controls.size(); ++j) {
                QWidget* a = controls[i];
                QWidget* b = controls[j];
                if (a->isAncestorOf(b) || b->isAncestorOf(a)) continue;
                const QRect ra = drawn(a, page);
                const QRect rb = drawn(b, page);
                if (!ra.intersects(rb)) continue;
                const auto pair = std::minmax(a->objectName(), b->objectName());
                EXPECT_TRUE(touching.contains({pair.first, pair.second}))
                    << a->objectName().toStdString() << " overlaps "
                    << b->objectName().toStdString();
            }
        }
    }
}

// Pages 3, 4 and 5 copy page 2 as it is when they are shown, and only then.
TEST(Wizard_Pages, SummaryCopiedWhenShown) {
    WizardRig r;
    ui::SetCaption(r.w().CurFirmInfo[2], "A.01.02");
    ui::SetCaption(r.w().NewFirmInfo[2], "A.02.00");
    ui::SetCaption(r.w().NewFirmFile[2], "NEW.HEX");
    ui::SetCaption(r.w().RemTime[2], "02:41");
    for (int n = 3; n <= 5; ++n) {
        r.w().GoToPage(n);
        EXPECT_EQ(r.w().CurFirmInfo[n]->text(), "A.01.02");
        EXPECT_EQ(r.w().NewFirmInfo[n]->text(), "A.02.00");
        EXPECT_EQ(r.w().NewFirmFile[n]->text(), "NEW.HEX");
    }
    EXPECT_EQ(r.w().RemTime[4]->text(), "02:41");
    ui::SetCaption(r.w().NewFirmFile[2], "OTHER.HEX");
    EXPECT_EQ(r.w().NewFirmFile[3]->text(), "NEW.HEX");
    r.w().GoToPage(3);
    EXPECT_EQ(r.w().NewFirmFile[3]->text(), "OTHER.HEX");
    EXPECT_EQ(r.w().NewFirmFile[5]->text(), "NEW.HEX");
}

// The name of the control that has the focus (an editable list's own text box counts as it).
std::string focused() {
    for (QWidget* w = QApplication::focusWidget(); w != nullptr; w = w->parentWidget()) {
        if (!w->objectName().isEmpty() && !w->objectName().startsWith("qt_"))
            return w->objectName().toStdString();
    }
    return "";
}

TEST(Wizard_Pages, TabCyclesThroughTheShownPageOnly) {
    WizardRig r;
    r.w().activateWindow();
    QApplication::setActiveWindow(&r.w());
    ASSERT_TRUE(QTest::qWaitForWindowActive(&r.w()));
    // Lists are filled as the page is entered; page 2's forward button enabled by a choice.
    r.w().settings->ProtSettings();
    const std::vector<std::vector<std::string>> cycles = {
        {"CmdNext_0", "CmdExit_0", "CmdHelp_0"},
        {"cboPort", "cboSpeed", "cboDataBits", "cboStopBits", "cboParity", "cboXon", "cboEoc",
         "cmdReset", "CmdNext_1", "CmdExit_1", "CmdHelp_1"},
        {"CmdFirmSelect", "CmdNext_2", "CmdExit_2", "CmdHelp_2"},
        {"CmdNext_3", "CmdExit_3", "CmdHelp_3", "CmdBack_3"},
        {"CmdHelp_4"},
        {"CmdNext_5", "CmdHelp_5"},
    };
    for (int n = 0; n < ui::kPages; ++n) {
        SCOPED_TRACE(n);
        r.w().GoToPage(n);
        auto* first = r.w().findChild<QWidget*>(QString::fromStdString(cycles[n][0]));
        first->setFocus(Qt::TabFocusReason);
        std::vector<std::string> seen;
        for (std::size_t i = 0; i <= cycles[n].size(); ++i) {
            seen.push_back(focused());
            QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        }
        std::vector<std::string> want = cycles[n];
        want.push_back(cycles[n][0]);  // and round again
        EXPECT_EQ(seen, want);
    }
    // A disabled forward button is passed over.
    r.w().GoToPage(2);
    r.w().CmdNext[2]->setEnabled(false);
    r.w().CmdFirmSelect->setFocus(Qt::TabFocusReason);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    EXPECT_EQ(focused(), "CmdExit_2");
}

// Enter on a focused button presses it, as Space does, on every page.
TEST(Wizard_Pages, EnterPressesEveryButton) {
    WizardRig probe;
    std::vector<std::pair<int, QString>> buttons;  // page and name
    for (int n = 0; n < ui::kPages; ++n) {
        for (QPushButton* b : probe.w().Picture4[n]->findChildren<QPushButton*>())
            buttons.emplace_back(n, b->objectName());
    }
    ASSERT_EQ(buttons.size(), 18u);
    for (const auto& [page, name] : buttons) {
        SCOPED_TRACE(name.toStdString());
        WizardRig r;
        r.w().activateWindow();
        QApplication::setActiveWindow(&r.w());
        ASSERT_TRUE(QTest::qWaitForWindowActive(&r.w()));
        r.w().GoToPage(page);
        auto* b = r.w().findChild<QPushButton*>(name);
        b->setEnabled(true);
        b->setFocus(Qt::TabFocusReason);
        ASSERT_EQ(QApplication::focusWidget(), b);
        int clicks = 0;
        QObject::connect(b, &QPushButton::clicked, [&clicks] { ++clicks; });
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
        EXPECT_EQ(clicks, 1);
    }
}

TEST(Wizard_Pages, RevisionFontFromTheFontList) {
    struct Case {
        const char* name;
        QStringList families;
        QString drawnForArial;  // the family the system draws for "Arial"
        QString family;
        qreal size;
    };
    const Case cases[] = {
        {"no Arial", {"DejaVu Sans", "Liberation Sans", "Times"}, "DejaVu Sans", "System", 10},
        {"Arial Black before Arial",
         {"Courier", "Arial Black", "Arial"},
         "Liberation Sans",
         "Arial Black",
         20},
        {"Arial", {"Arial", "Arial Narrow"}, "Arial", "Arial", 20},
        {"case matters", {"arial", "ARIAL"}, "DejaVu Sans", "System", 10},
        {"empty list", {}, "DejaVu Sans", "System", 10},
        // A system without Arial whose fonts stand in for it with the same metrics.
        {"Liberation Sans serves Arial",
         {"DejaVu Sans", "Liberation Sans"},
         "Liberation Sans",
         "Liberation Sans",
         20},
        {"Arimo serves Arial", {"Arimo", "DejaVu Sans"}, "Arimo", "Arimo", 20},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        WizardRig r(
            {}, true,
            {.families = [&c] { return c.families; },
             .drawn = [&c](const QString& f) { return f == "Arial" ? c.drawnForArial : f; }});
        for (int n = 0; n < ui::kPages; ++n) {
            if (r.w().CurFirmInfo[n] == nullptr) continue;
            const bool large = n == 2;
            EXPECT_EQ(r.w().CurFirmInfo[n]->font().family(), large ? c.family : "Arial");
            EXPECT_EQ(r.w().NewFirmInfo[n]->font().family(), large ? c.family : "Arial");
            if (large) {
                EXPECT_EQ(r.w().CurFirmInfo[n]->font().pointSizeF(), c.size);
                EXPECT_EQ(r.w().NewFirmInfo[n]->font().pointSizeF(), c.size);
            }
        }
    }
}

// The system's own fonts (fonts-liberation2 is a dependency): the page 2 revisions are large.
TEST(Wizard_Pages, RevisionLargeWithTheSystemsFonts) {
    WizardRig r;
    for (const QLabel* l : {r.w().CurFirmInfo[2], r.w().NewFirmInfo[2]}) {
        EXPECT_EQ(l->font().pointSizeF(), 20);
        const QString drawn = QFontInfo(l->font()).family();
        EXPECT_TRUE(drawn.startsWith("Arial") || drawn == "Liberation Sans" || drawn == "Arimo")
            << drawn.toStdString();
    }
}

// Names that do not fit their box keep both ends, with an ellipsis between them, the brackets
// clear of them, and the whole name in the tooltip.
TEST(Wizard_Pages, LongFileNamesElidedInTheMiddle) {
    const QString names[] = {"GOOD_SMALL.HEX", "WWWWWWWW.HEX", "A_VERY_LONG_FIRMWARE_NAME.HEX",
                             "NEW.HEX"};
    for (const QString& full : names) {
        SCOPED_TRACE(full.toStdString());
        WizardRig r;
        ui::SetCaption(r.w().NewFirmFile[2], full);
        for (int n : {2, 3, 4, 5}) {
            r.w().GoToPage(n);
            const ui::NameLabel* l = r.w().NewFirmFile[n];
            const QString shown = l->text();
            const QFontMetrics fm(l->font());
            EXPECT_LE(fm.horizontalAdvance(shown), l->contentsRect().width()) << n;
            EXPECT_EQ(l->toolTip(), full);
            EXPECT_EQ(l->name(), full);
            if (fm.horizontalAdvance(full) <= l->contentsRect().width()) {
                EXPECT_EQ(shown, full);
            } else {
                EXPECT_TRUE(shown.contains(QChar(0x2026))) << shown.toStdString();
                EXPECT_EQ(shown.front(), full.front());
                EXPECT_TRUE(shown.endsWith("X")) << shown.toStdString();
            }
            // The brackets stand beside the box, not over it.
            int brackets = 0;
            for (const QLabel* b :
                 l->parentWidget()->findChildren<QLabel*>(Qt::FindDirectChildrenOnly)) {
                if (b->text() != "(" && b->text() != ")") continue;
                ++brackets;
                EXPECT_FALSE(l->geometry().intersects(b->geometry()))
                    << b->objectName().toStdString();
            }
            EXPECT_EQ(brackets, 2);
        }
    }
}

TEST(Wizard_Window, CentredButNeverOffTheScreen) {
    struct Case {
        const char* name;
        QRect screen, available;
        QSize window;
        QPoint at;
    };
    const Case cases[] = {
        {"fits", {0, 0, 1024, 768}, {0, 0, 1024, 740}, {559, 294}, {232, 237}},
        {"wider than the screen", {0, 0, 512, 384}, {0, 0, 512, 384}, {559, 294}, {0, 45}},
        {"taller than the available area",
         {0, 0, 800, 300},
         {0, 24, 800, 276},
         {559, 320},
         {120, 24}},
        {"second screen", {1024, 0, 800, 600}, {1024, 0, 800, 600}, {559, 294}, {1144, 153}},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(ui::CentredPosition(c.screen, c.available, c.window), c.at) << c.name;
    }
}

}  // namespace
}  // namespace zx917
