// The whole wizard by clicks and keys, with the real adapter, timers and message boxes,
// against zx917-sim; closing it while it waits; one copy at a time.
#include <fcntl.h>
#include <signal.h>
#include <sys/file.h>
#include <unistd.h>

#include <QRegularExpression>

#include "history/service_record.h"
#include "history/sha256.h"
#include "ui_e2e/e2e_support.h"

namespace zx917 {
namespace {

using test::ModalAnswerer;
using test::ProgramFolder;
using test::SimProcess;

// The longest a step of the page flow may take on a loaded machine; waits end as soon as their
// condition holds.
constexpr int kStep = 30000;

const std::string kPortMissing =
    "Communication port does not exist,\npossibly because of wrong Comm Port setting\nor "
    "RS-232C cable not connected.\nCheck Comm Port setting and cable connection.";

struct E2e {
    explicit E2e(int tickMs = 1000) {
        ui::ProgramOptions o;
        o.programFolder = folder.dir.path();
        o.traceFile = folder.dir.path() + "/trace.txt";
        o.historyPath = folder.dir.path() + "/history.sqlite";
        o.tickMs = tickMs;
        program = std::make_unique<ui::Program>(o);
        program->endProcess = [this] { ++ended; };
        program->Main();
    }
    ui::FrmMain& w() { return *program->window; }
    // A click; the handler may wait for the instrument, so it runs from the event loop.
    void click(QPushButton* b) {
        QTimer::singleShot(0, b, [b] { QTest::mouseClick(b, Qt::LeftButton); });
    }
    bool waitPage(int page, int ms) {
        return test::waitFor([&] { return w().currentPage() == page; }, ms);
    }
    // Identified, the file chosen as "&Open" leaves it (A.02.00), page 3 shown.
    bool toPage3(const std::string& file) {
        click(w().CmdNext[0]);
        if (!waitPage(1, kStep)) return false;
        click(w().CmdNext[1]);
        if (!waitPage(2, kStep)) return false;
        program->app.FilePath = file;
        program->app.SelectedFileName = "NEW.HEX";
        program->app.SelectedRevision = "A.02.00";
        w().CmdNext[2]->setEnabled(true);
        click(w().CmdNext[2]);
        return waitPage(3, kStep);
    }

    ProgramFolder folder;
    std::unique_ptr<ui::Program> program;
    int ended = 0;
};

TEST(E2e_Wizard, IdentifiesTheSimulatorAndShowsItsRevision) {
    gen::TempDir dir;
    SimProcess sim(dir.path(), {"--revision", "B.03.07"});
    ASSERT_TRUE(sim.ready());
    ::setenv("ZX917_COM1", sim.link().c_str(), 1);
    ModalAnswerer answer;
    E2e e;
    EXPECT_TRUE(e.w().isVisible());
    EXPECT_FALSE(e.program->port.portOpen());
    e.click(e.w().CmdNext[0]);
    ASSERT_TRUE(e.waitPage(1, kStep));
    EXPECT_EQ(e.w().settings->cboPort->currentText(), "Com1");
    EXPECT_TRUE(e.w().settings->cboPort->toolTip().contains(QString::fromStdString(sim.link())));
    e.click(e.w().CmdNext[1]);
    ASSERT_TRUE(e.waitPage(2, kStep));
    EXPECT_EQ(e.w().CurFirmInfo[2]->text(), "B.03.07");
    EXPECT_TRUE(e.program->port.portOpen());
    EXPECT_EQ(e.program->port.settings(), "38400,E,8,1");
    EXPECT_TRUE(answer.texts.empty());
    const std::string report = sim.stop();
    EXPECT_NE(report.find("\"command\": \"REVD X.XX.XX\""), std::string::npos);
    // The support trace: every byte with its settings, and the speed switch.
    e.program->trace->flush();
    QFile trace(QString::fromStdString(e.folder.dir.path() + "/trace.txt"));
    ASSERT_TRUE(trace.open(QIODevice::ReadOnly));
    const QString t = QString::fromUtf8(trace.readAll());
    EXPECT_TRUE(t.contains("TX [9600,n,8,1] *CLS\\n")) << t.toStdString();
    EXPECT_TRUE(t.contains("-- switch to 38400,E,8,1"));
    EXPECT_TRUE(t.contains(QRegularExpression("RX \\[38400,E,8,1 hs3\\] [^\\n]*REV B\\.03\\.07")))
        << t.toStdString();
}

TEST(E2e_Wizard, SilentInstrumentBackOnPageZeroWithThePortClosed) {
    test::Pty silent;  // a line nobody answers on
    ::setenv("ZX917_COM1", silent.path().c_str(), 1);
    ModalAnswerer answer;
    E2e e(20);  // 20 ms ticks: the 84 s of time-outs pass in under 2 s
    e.click(e.w().CmdNext[0]);
    ASSERT_TRUE(e.waitPage(1, kStep));
    e.click(e.w().CmdNext[1]);
    // The message comes before page 0 is shown again.
    ASSERT_TRUE(e.waitPage(0, kStep));
    EXPECT_EQ(answer.texts, std::vector<std::string>{kPortMissing});
    EXPECT_FALSE(e.program->port.portOpen());
    EXPECT_EQ(e.program->port.settings(), "9600,n,8,1");
    EXPECT_TRUE(e.w().settings->cboPort->isEnabledTo(e.w().Picture4[1]));
}

// Page 0 to page 5 by clicks and keys: the chooser reached from page 2, the name typed, Enter to
// check, Enter to open; the simulator holds every record byte for byte.
TEST(E2e_Wizard, WholeDownloadByClicksAndKeys) {
    gen::TempDir dir;
    ModalAnswerer answer;
    const std::string file = test::MakeDownloadFile(dir.path() + "/NEW.HEX", "A.02.00");
    SimProcess sim(dir.path(),
                   {"--revision", "A.01.02", "--expect", QString::fromStdString(file), "--once"});
    ASSERT_TRUE(sim.ready());
    ::setenv("ZX917_COM1", sim.link().c_str(), 1);
    E2e e;
    std::filesystem::copy_file(file, e.folder.dir.path() + "/HEX/new.hex");
    e.click(e.w().CmdNext[0]);
    ASSERT_TRUE(e.waitPage(1, kStep));
    e.click(e.w().CmdNext[1]);
    ASSERT_TRUE(e.waitPage(2, kStep));
    answer.chooser = [](ui::FrmNewSel& c) {
        EXPECT_EQ(c.File->count(), 1);
        EXPECT_EQ(c.File->item(0)->text(), "NEW.HEX");
        c.FileName->setFocus();
        QTest::keyClicks(QApplication::focusWidget(), "new.hex");
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);  // checks
        EXPECT_EQ(c.FirmRev2->text(), "A.02.00");
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);  // "&Open" has the focus
    };
    e.click(e.w().CmdFirmSelect);
    ASSERT_TRUE(test::waitFor([&] { return e.w().CmdNext[2]->isEnabled(); }, kStep));
    EXPECT_EQ(e.w().NewFirmInfo[2]->text(), "A.02.00");
    EXPECT_EQ(e.w().NewFirmFile[2]->text(), "NEW.HEX");
    EXPECT_EQ(e.program->app.FilePath, e.folder.dir.path() + "/HEX/new.hex");
    e.click(e.w().CmdNext[2]);
    ASSERT_TRUE(e.waitPage(3, kStep));
    EXPECT_FALSE(e.w().RemTime[2]->text().isEmpty());
    answer.answers = {true};
    bool clipPlayed = false;
    QTimer watch;
    QObject::connect(&watch, &QTimer::timeout, [&] { clipPlayed |= e.w().Animation1->playing(); });
    watch.start(50);
    e.click(e.w().CmdNext[3]);
    ASSERT_TRUE(e.waitPage(5, 60000));
    EXPECT_TRUE(clipPlayed);
    EXPECT_FALSE(e.w().Animation1->playing());
    EXPECT_EQ(answer.texts, std::vector<std::string>{"OK to start the download?"});
    EXPECT_EQ(e.w().ProgressBar->maximum(), static_cast<int>(std::filesystem::file_size(file)));
    const std::string report = sim.stop();
    EXPECT_NE(report.find("\"verdict\": \"success\""), std::string::npos) << report;
    e.click(e.w().CmdNext[5]);
    ASSERT_TRUE(test::waitFor([&] { return e.ended == 1; }, kStep));
    EXPECT_EQ(answer.texts.back(), "OK to exit the download program?");
    EXPECT_FALSE(e.program->port.portOpen());

    // The service record holds the wizard's download; one by the command line joins it.
    const std::string record = e.folder.dir.path() + "/history.sqlite";
    std::filesystem::create_directory(dir.path() + "/cli");
    SimProcess cliSim(dir.path() + "/cli", {"--revision", "A.01.02"});
    ASSERT_TRUE(cliSim.ready());
    QProcess cli;
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.insert("ZX917_HISTORY", QString::fromStdString(record));
    cli.setProcessEnvironment(env);
    cli.start(QString::fromStdString(test::kBuildDir + "/tools/zx917-download"),
              {"download", "--port", QString::fromStdString(cliSim.link()), "--file",
               QString::fromStdString(file), "--yes"});
    ASSERT_TRUE(cli.waitForFinished(kStep));
    EXPECT_EQ(cli.exitCode(), 0) << cli.readAllStandardError().toStdString();
    std::string error;
    const auto rows = ServiceRecord::Read(record, {}, error);
    ASSERT_TRUE(rows && rows->size() == 2) << error;
    const std::string sha = Sha256OfFile(file).value_or("?");
    for (const Attempt& a : *rows) {
        EXPECT_EQ(a.outcome, "success");
        EXPECT_EQ(a.identity, "Quorvex,ZX917,SN0001234567,FW----------A.01.02");
        EXPECT_EQ(a.revisionBefore, "A.01.02");
        EXPECT_EQ(a.revisionAnnounced, "A.02.00");
        EXPECT_EQ(a.revisionConfirmed, "A.02.00");
        EXPECT_EQ(a.fileSha256, sha);
    }
    EXPECT_EQ((*rows)[1].frontEnd, "wizard");
    EXPECT_EQ((*rows)[1].filePath, e.folder.dir.path() + "/HEX/new.hex");
    EXPECT_EQ((*rows)[0].frontEnd, "command line");
}

TEST(E2e_Wizard, AbortMidTransferEndsOnPageZero) {
    gen::TempDir dir;
    ModalAnswerer answer;
    const std::string file = test::MakeDownloadFile(dir.path() + "/NEW.HEX", "A.02.00");
    SimProcess sim(dir.path(),
                   {"--expect", QString::fromStdString(file), "--fault", "abort:DL:40"});
    ASSERT_TRUE(sim.ready());
    ::setenv("ZX917_COM1", sim.link().c_str(), 1);
    E2e e;
    ASSERT_TRUE(e.toPage3(file));
    answer.answers = {true};
    bool transferShown = false;  // the click waits inside: watch from the event loop
    QTimer watch;
    QObject::connect(&watch, &QTimer::timeout, [&] { transferShown |= e.w().currentPage() == 4; });
    watch.start(5);
    e.click(e.w().CmdNext[3]);
    ASSERT_TRUE(e.waitPage(0, 60000));
    EXPECT_TRUE(transferShown);
    EXPECT_EQ(answer.texts,
              (std::vector<std::string>{"OK to start the download?", "Download failed."}));
    EXPECT_FALSE(e.program->port.portOpen());
    EXPECT_FALSE(e.w().Animation1->playing());
    const std::string report = sim.stop();
    EXPECT_NE(report.find("\"verdict\": \"failure\""), std::string::npos);
}

// The adapter pulled in the middle of the transfer: "Download failed." and page 0, within the
// time-out of the record on the line, with nothing reported as done.
TEST(E2e_Wizard, PulledAdapterMidTransferEndsOnPageZero) {
    gen::TempDir dir;
    ModalAnswerer answer;
    const std::string file = test::MakeDownloadFile(dir.path() + "/NEW.HEX", "A.02.00");
    SimProcess sim(dir.path(), {"--expect", QString::fromStdString(file), "--line-rate"});
    ASSERT_TRUE(sim.ready());
    ::setenv("ZX917_COM1", sim.link().c_str(), 1);
    E2e e;
    ASSERT_TRUE(e.toPage3(file));
    answer.answers = {true};
    // Pulled once records are on their way, from the event loop inside the transfer's wait.
    QElapsedTimer pulledAt;
    QTimer puller;
    QObject::connect(&puller, &QTimer::timeout, [&] {
        if (!pulledAt.isValid() && e.w().ProgressBar->value() > 0) {
            sim.pull();
            pulledAt.start();
        }
    });
    puller.start(10);
    e.click(e.w().CmdNext[3]);
    ASSERT_TRUE(e.waitPage(0, 60000));
    ASSERT_TRUE(pulledAt.isValid());
    EXPECT_LE(pulledAt.elapsed(), 21000);  // within the record's own give-up, 21 s
    EXPECT_EQ(answer.texts,
              (std::vector<std::string>{"OK to start the download?", "Download failed."}));
    EXPECT_FALSE(e.program->port.portOpen());
    EXPECT_EQ(e.program->port.settings(), "9600,n,8,1");
}

// The window closed during the transfer ends the program there (the test only counts the end):
// the service record says the engineer stopped it.
TEST(E2e_Wizard, ClosedMidTransferRecordedAsCancelled) {
    gen::TempDir dir;
    ModalAnswerer answer;
    const std::string file = test::MakeDownloadFile(dir.path() + "/NEW.HEX", "A.02.00");
    SimProcess sim(dir.path(), {"--expect", QString::fromStdString(file), "--line-rate"});
    ASSERT_TRUE(sim.ready());
    ::setenv("ZX917_COM1", sim.link().c_str(), 1);
    E2e e(20);  // 20 ms ticks: the transfer left running after the close gives up at once
    ASSERT_TRUE(e.toPage3(file));
    answer.answers = {true};
    QTimer closer;  // from the event loop, inside the transfer's wait
    QObject::connect(&closer, &QTimer::timeout, [&] {
        if (e.ended == 0 && e.w().ProgressBar->value() > 0) e.w().close();
    });
    closer.start(10);
    e.click(e.w().CmdNext[3]);
    ASSERT_TRUE(test::waitFor([&] { return e.ended == 1 && e.w().currentPage() == 0; }, kStep));
    std::string error;
    const auto rows = ServiceRecord::Read(e.folder.dir.path() + "/history.sqlite", {}, error);
    ASSERT_TRUE(rows && rows->size() == 1) << error;
    EXPECT_EQ(rows->front().outcome, "cancelled");
    EXPECT_EQ(rows->front().frontEnd, "wizard");
    EXPECT_GT(rows->front().recordsSent, 0);
}

// Closing the window while the program waits for the instrument ends the process at once:
// long before the identification's 84 s of time-outs would have returned.
TEST(E2e_WizardDeathTest, ClosingWhileWaitingEndsTheProcess) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    test::Pty silent;
    ::setenv("ZX917_COM1", silent.path().c_str(), 1);
    QElapsedTimer t;
    t.start();
    EXPECT_EXIT(
        {
            ui::ProgramOptions o;
            test::ProgramFolder folder;
            o.programFolder = folder.dir.path();
            ui::Program program(o);  // the real end of the process
            program.Main();
            auto* w = program.window.get();
            QTimer::singleShot(0, [w] { QTest::mouseClick(w->CmdNext[0], Qt::LeftButton); });
            test::waitFor([w] { return w->currentPage() == 1; }, kStep);
            // Closed once the identification waits for an answer that never comes: the check
            // runs from the event loop, inside the wait of the click's handler.
            QTimer closer;
            QObject::connect(&closer, &QTimer::timeout, [&program, w] {
                if (program.port.portOpen() && program.app.ScriptStep != 9) w->close();
            });
            closer.start(20);
            QTimer::singleShot(0, [w] { QTest::mouseClick(w->CmdNext[1], Qt::LeftButton); });
            QTest::qWait(60000);
            std::exit(3);  // not reached when closing ended the process
        },
        ::testing::ExitedWithCode(0), "");
    EXPECT_LT(t.elapsed(), 60000);
}

// True while another process holds the lock file.
bool lockHeld(const std::string& path) {
    const int fd = ::open(path.c_str(), O_RDWR | O_CLOEXEC);
    if (fd < 0) return false;
    const bool held = ::flock(fd, LOCK_EX | LOCK_NB) != 0;
    ::close(fd);
    return held;
}

TEST(E2e_Instance, OneCopyAtATime) {
    gen::TempDir runtime;
    const std::string lock = runtime.path() + "/ZX917A.lock";
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.insert("QT_QPA_PLATFORM", "offscreen");
    env.insert("XDG_RUNTIME_DIR", QString::fromStdString(runtime.path()));
    env.insert("ZX917_COM1", "/nonexistent");
    const QString exe = QString::fromStdString(test::kProgramDir + "/ZX917A");
    auto start = [&](QProcess& p) {
        p.setProcessEnvironment(env);
        p.setProgram(exe);
        p.start();
        return p.waitForStarted(kStep);
    };
    QProcess first;
    ASSERT_TRUE(start(first));
    ASSERT_TRUE(test::waitFor([&] { return lockHeld(lock); }, kStep));
    QProcess second;
    ASSERT_TRUE(start(second));
    ASSERT_TRUE(second.waitForFinished(kStep));
    EXPECT_EQ(second.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(second.exitCode(), 0);
    EXPECT_TRUE(second.readAll().isEmpty());
    EXPECT_EQ(first.state(), QProcess::Running);
    // A copy that crashed leaves nothing that blocks the next start.
    ::kill(static_cast<pid_t>(first.processId()), SIGKILL);
    first.waitForFinished(kStep);
    QProcess third;
    ASSERT_TRUE(start(third));
    ASSERT_TRUE(test::waitFor([&] { return lockHeld(lock); }, kStep));
    EXPECT_EQ(third.state(), QProcess::Running);
    third.kill();
    third.waitForFinished(kStep);
}

}  // namespace
}  // namespace zx917
