// Help at each page's topic and with F1, a missing help file, and the transfer clip playing
// exactly while a transfer runs.
#include <gtest/gtest.h>

#include <QAbstractTextDocumentLayout>
#include <QApplication>
#include <QFile>
#include <QScrollBar>
#include <QTextBlock>
#include <filesystem>

#include "support/wizard_rig.h"

namespace zx917 {
namespace {

using test::DownloadFile;
using test::WizardRig;

const std::string kProgramDir = ZX917_PROGRAM_DIR;

// A rig whose program folder holds our help file and clip.
void installFiles(WizardRig& r) {
    for (const char* f : {"ZX917A.HLP", "Filemove.avi"}) {
        std::filesystem::copy_file(kProgramDir + "/" + f, r.folder.path() + "/" + f,
                                   std::filesystem::copy_options::overwrite_existing);
    }
    r.w().Form_Load();  // the load step opens the clip and names the help file
}

TEST(Help_File, HasEveryTopic) {
    QFile f(QString::fromStdString(kProgramDir + "/ZX917A.HLP"));
    ASSERT_TRUE(f.open(QIODevice::ReadOnly));
    const QString html = QString::fromUtf8(f.readAll());
    for (int context : {1, 18, 19, 20, 21, 22, 23, 24}) {
        EXPECT_TRUE(html.contains("<a name=\"" + ui::HelpAnchor(context) + "\">")) << context;
    }
    for (const char* message :
         {"Communication port not available.", "Communication port does not exist,",
          "Could not read file.", "This is not the download file.", "Download failed.", "dialout",
          "ZX917_COM1"}) {
        EXPECT_TRUE(html.contains(message)) << message;
    }
}

// The topic shown: its anchor stands at the top of the view, or as near the top as the end of
// the document lets the view scroll.
::testing::AssertionResult TopicAtTop(ui::HelpViewer& help, int32_t context) {
    QTextBrowser* view = help.window();
    if (view == nullptr || !view->isVisible()) return ::testing::AssertionFailure() << "no window";
    QApplication::processEvents();
    const QString anchor = ui::HelpAnchor(context);
    QTextDocument* doc = view->document();
    // An empty anchor before a heading names the heading's block.
    auto named = [&](const QTextBlock& b) {
        if (b.charFormat().anchorNames().contains(anchor)) return true;
        for (auto it = b.begin(); !it.atEnd(); ++it) {
            if (it.fragment().charFormat().anchorNames().contains(anchor)) return true;
        }
        return false;
    };
    for (QTextBlock b = doc->begin(); b.isValid(); b = b.next()) {
        if (!named(b)) continue;
        const int top = static_cast<int>(doc->documentLayout()->blockBoundingRect(b).top());
        const QScrollBar* bar = view->verticalScrollBar();
        const bool atTop = std::abs(bar->value() - top) <= 2;
        const bool asFarAsItGoes = bar->value() == bar->maximum() && top > bar->value() &&
                                   top < bar->value() + view->viewport()->height();
        if (atTop || asFarAsItGoes) return ::testing::AssertionSuccess();
        return ::testing::AssertionFailure()
               << anchor.toStdString() << " at " << top << ", view at " << bar->value();
    }
    return ::testing::AssertionFailure() << "no anchor " << anchor.toStdString();
}

TEST(Help_Buttons, EachPageAtItsTopicAndF1AtTheContents) {
    WizardRig r;
    installFiles(r);
    const int32_t contexts[] = {18, 19, 20, 22, 23, 24};
    for (int n = 0; n < ui::kPages; ++n) {
        SCOPED_TRACE(n);
        r.w().GoToPage(n);
        r.click(r.w().CmdHelp[n]);
        auto& help = r.w().helpViewer();
        EXPECT_TRUE(help.fileRead());
        EXPECT_TRUE(TopicAtTop(help, contexts[n]));
        EXPECT_EQ(r.page(), n);  // the wizard stays on its page
    }
    // The topics' links work: the contents link of a topic leads to the contents.
    QTextBrowser* view = r.w().helpViewer().window();
    view->setSource(QUrl(view->source().toString(QUrl::RemoveFragment) + "#context-1"));
    EXPECT_TRUE(TopicAtTop(r.w().helpViewer(), 1));
    view->backward();
    EXPECT_TRUE(TopicAtTop(r.w().helpViewer(), 24));
    r.w().GoToPage(3);
    r.click(r.w().CmdHelp[3]);  // away from the contents first
    r.w().activateWindow();
    QApplication::setActiveWindow(&r.w());
    ASSERT_TRUE(QTest::qWaitForWindowActive(&r.w()));
    r.w().CmdHelp[3]->setFocus(Qt::TabFocusReason);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_F1);
    EXPECT_TRUE(TopicAtTop(r.w().helpViewer(), 1));
    EXPECT_EQ(r.page(), 3);
    EXPECT_TRUE(r.shown().empty());
}

TEST(Help_Buttons, MissingHelpFileKeepsThePage) {
    WizardRig r;  // the program folder holds no help file
    r.w().GoToPage(2);
    r.click(r.w().CmdHelp[2]);
    auto& help = r.w().helpViewer();
    EXPECT_FALSE(help.fileRead());
    ASSERT_NE(help.window(), nullptr);
    EXPECT_TRUE(help.window()->toPlainText().contains(
        QString::fromStdString(r.folder.path() + "/ZX917A.HLP")));
    EXPECT_EQ(r.page(), 2);
}

TEST(Clip_Transfer, PlaysWhileTheTransferRunsAndStopsOnEveryEnd) {
    struct Case {
        const char* name;
        std::string fault;
        int page;
    };
    const Case cases[] = {
        {"confirmed", "", 5}, {"aborted", "abort:DL:3", 0}, {"silent at CLOSE", "silent:CLOSE", 0}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        InstrumentOptions o;
        if (!c.fault.empty()) {
            Fault f;
            ParseFault(c.fault, f);
            o.faults = {f};
        }
        WizardRig r(o);
        installFiles(r);
        ui::ClipPlayer& clip = *r.w().Animation1;
        ASSERT_TRUE(clip.loaded());
        EXPECT_EQ(clip.frameCount(), 16);
        EXPECT_EQ(clip.intervalMs(), 100);
        EXPECT_FALSE(clip.playing());
        ASSERT_TRUE(r.toPage2());
        r.choose(DownloadFile("A.02.00", 6), "A.02.00");
        r.click(r.w().CmdNext[2]);
        bool playedDuring = false;
        bool helpDuring = false;
        r.world.port.onSent = [&](const test::Sent&) {
            playedDuring = playedDuring || clip.playing();
            if (r.world.app.ScriptStage == 5 && !helpDuring) {
                // Help during the transfer: it opens and the transfer goes on.
                r.click(r.w().CmdHelp[4]);
                helpDuring = TopicAtTop(r.w().helpViewer(), 23);
            }
        };
        r.dialogs.answers = {true};
        r.click(r.w().CmdNext[3]);
        EXPECT_TRUE(playedDuring);
        EXPECT_FALSE(clip.playing());
        EXPECT_EQ(r.page(), c.page);
        if (c.page == 5) {
            EXPECT_TRUE(helpDuring);
        }
    }
}

TEST(Clip_Transfer, MissingOrBrokenClipLeavesThePlayerEmpty) {
    WizardRig r;
    r.folder.write("Filemove.avi", std::string("RIFF\x10\0\0\0AVI LIST", 16));
    r.w().Form_Load();
    EXPECT_FALSE(r.w().Animation1->loaded());
    r.w().setAnimationPlaying(true);
    EXPECT_FALSE(r.w().Animation1->playing());
    std::filesystem::remove(r.folder.path() + "/Filemove.avi");
    EXPECT_FALSE(r.w().Animation1->open(r.folder.path() + "/Filemove.avi"));
}

}  // namespace
}  // namespace zx917
