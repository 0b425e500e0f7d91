// The Qt serial adapter on a pseudo-terminal: the DSR poll through the modem-line seam, and the
// engine's DSR recovery through the real adapter, timers and event loop.
#include "link/qt/qt_serial_port.h"

#include <gtest/gtest.h>
#include <sys/ioctl.h>

#include <QCoreApplication>
#include <QElapsedTimer>
#include <cstdlib>
#include <vector>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "link/command_script.h"
#include "link/engine.h"
#include "link/qt/qt_platform.h"
#include "support/pty.h"

namespace zx917 {
namespace {

// Modem lines as a test sets them.
struct FakeLines {
    int bits = 0;
    QtSerialPort::ModemLineReader reader() {
        return [this](int, int& out) {
            out = bits;
            return true;
        };
    }
};

void pumpFor(int ms) {
    QElapsedTimer t;
    t.start();
    while (t.elapsed() < ms) QCoreApplication::processEvents(QEventLoop::AllEvents, 20);
}

TEST(QtSerialPort_Dsr, PollRaisesAndDropsThroughTheSeam) {
    test::Pty pty;
    ::setenv("ZX917_COM1", pty.path().c_str(), 1);
    QtSerialPort port;
    FakeLines lines;
    port.readModemLines = lines.reader();
    std::vector<std::pair<int16_t, bool>> events;
    port.setOnComm([&] { events.emplace_back(port.commEvent(), port.dsrHolding()); });
    ASSERT_TRUE(port.setPortOpen(true)) << port.errorText();
    EXPECT_FALSE(port.dsrHolding());

    lines.bits = TIOCM_DSR | TIOCM_CTS;
    pumpFor(350);
    lines.bits = TIOCM_DSR;  // a change of another line alone raises nothing
    pumpFor(250);
    lines.bits = 0;
    pumpFor(250);
    lines.bits = TIOCM_DSR;
    pumpFor(250);
    const std::vector<std::pair<int16_t, bool>> want = {
        {kCommEvDsr, true}, {kCommEvDsr, false}, {kCommEvDsr, true}};
    EXPECT_EQ(events, want);
    port.setPortOpen(false);
    lines.bits = 0;
    pumpFor(250);
    EXPECT_EQ(events.size(), 3u);  // a closed port polls nothing
}

TEST(QtSerialPort_Dsr, NoModemLinesMeansNoDsrEvents) {
    test::Pty pty;  // the real reader: a pseudo-terminal has no modem lines
    ::setenv("ZX917_COM1", pty.path().c_str(), 1);
    QtSerialPort port;
    int dsrEvents = 0;
    port.setOnComm([&] { dsrEvents += port.commEvent() == kCommEvDsr; });
    ASSERT_TRUE(port.setPortOpen(true)) << port.errorText();
    pumpFor(300);
    EXPECT_EQ(dsrEvents, 0);
    EXPECT_FALSE(port.dsrHolding());
}

// The instrument restarts while a record waits for its answer: the engine closes the real port,
// waits a second and opens it again, and the run ends as a failure.
TEST(QtSerialPort_Dsr, EngineRecoveryThroughTheRealAdapter) {
    test::Pty pty;
    ::setenv("ZX917_COM1", pty.path().c_str(), 1);
    AppState app;
    InitDefaults(app, "/tmp");
    CommandScript script;
    InitCommandScript(script);
    FileSlot file;
    QtSerialPort port;
    FakeLines lines;
    port.readModemLines = lines.reader();
    QtTimer retry(kRetryIntervalMs), rsRetry(kRsRetryIntervalMs), timer1(kTimer1IntervalMs);
    QtEventPump pump;
    Engine engine(EngineParts{app, script, port, retry, rsRetry, timer1, pump, file});
    ASSERT_TRUE(port.setPortOpen(true));
    ASSERT_TRUE(port.setSettings("38400,E,8,1"));

    app.RecordBytes = {0x00, 0x06, 0x3A, 0x00, 0x00, 0x00, 0x01, 0xFF};
    app.ScriptStage = 4;
    app.ScriptStep = kStepRecord;
    app.StepResult = true;
    QElapsedTimer t;
    t.start();
    QTimer::singleShot(300, [&] { lines.bits = TIOCM_DSR; });
    engine.RunCurrentStep();
    const auto took = t.elapsed();
    EXPECT_FALSE(app.StepResult);
    EXPECT_FALSE(retry.enabled());
    EXPECT_TRUE(port.portOpen());  // opened again after the wait
    EXPECT_EQ(port.settings(), "38400,E,8,1");
    EXPECT_GE(took, 300);
    EXPECT_LT(took, 2500);
    EXPECT_EQ(pty.readAll().substr(0, 8),
              std::string(app.RecordBytes.begin(), app.RecordBytes.end()));
}

}  // namespace
}  // namespace zx917
