// The Qt serial adapter on a pseudo-terminal: the DSR poll through the modem-line seam, and the
// engine's DSR recovery through the real adapter, timers and event loop.
#include "link/qt/qt_serial_port.h"

#include <gtest/gtest.h>
#include <linux/serial.h>
#include <sys/ioctl.h>

#include <QCoreApplication>
#include <QElapsedTimer>
#include <cstdlib>
#include <optional>
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
    Engine engine(EngineParts{.app = app,
                              .script = script,
                              .port = port,
                              .retry = retry,
                              .rsRetry = rsRetry,
                              .timer1 = timer1,
                              .pump = pump,
                              .file = file});
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

// The driver's serial flags through the seam: low latency asked on open, the old flags back on
// close; a driver that has no flags or refuses leaves the port working, and the trace says so.
TEST(QtSerialPort_LowLatency, AskedOnOpenAndPutBackOnClose) {
    struct Case {
        const char* name;
        std::optional<int> flags;  // the driver's; none: it has no serial flags
        bool refuses;
        std::vector<int> written;
        std::string noted;
    };
    const int other = 0x40;  // a flag of the driver's own that stays as it is
    const Case cases[] = {
        {"an adapter", other, false, {other | ASYNC_LOW_LATENCY, other}, "low latency on"},
        {"already low", other | ASYNC_LOW_LATENCY, false, {}, "low latency already on"},
        {"a refusing driver",
         other,
         true,
         {other | ASYNC_LOW_LATENCY},
         "no low latency: the driver refused it"},
        {"a pseudo-terminal",
         std::nullopt,
         false,
         {},
         "no low latency: the device has no serial flags"},
    };
    test::Pty pty;
    ::setenv("ZX917_COM1", pty.path().c_str(), 1);
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        QtSerialPort port;
        std::vector<int> written;
        std::vector<std::string> notes;
        port.readSerialFlags = [&c](int, int& flags) {
            if (c.flags) flags = *c.flags;
            return c.flags.has_value();
        };
        port.writeSerialFlags = [&](int, int flags) {
            written.push_back(flags);
            return !c.refuses;
        };
        port.onNote = [&notes](const std::string& n) { notes.push_back(n); };
        ASSERT_TRUE(port.setPortOpen(true)) << port.errorText();
        ASSERT_TRUE(port.setPortOpen(false));
        EXPECT_EQ(written, c.written);
        EXPECT_EQ(notes, std::vector<std::string>{c.noted});
    }
    // The real driver calls on a pseudo-terminal: it has no serial flags, and the port opens.
    QtSerialPort real;
    std::vector<std::string> notes;
    real.onNote = [&notes](const std::string& n) { notes.push_back(n); };
    ASSERT_TRUE(real.setPortOpen(true)) << real.errorText();
    EXPECT_EQ(notes, std::vector<std::string>{"no low latency: the device has no serial flags"});
}

}  // namespace
}  // namespace zx917
