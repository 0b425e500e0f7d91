#include "ui/wizard/program.h"

#include <unistd.h>

#include <QStandardPaths>
#include <cstdio>
#include <filesystem>

#include "app/identity.h"
#include "app/startup.h"
#include "link/port_defaults.h"
#include "link/qt/port_list.h"
#include "ui/common/qt_text.h"

namespace zx917::ui {

namespace {
int scaled(int normalMs, int tickMs) {
    return std::max(1, normalMs * tickMs / 1000);
}
}  // namespace

Program::Program(const ProgramOptions& o)
    : programFolder(o.programFolder.empty() ? ProgramFolder() : o.programFolder),
      userDataFolder(!o.userDataFolder.empty() ? o.userDataFolder
                                               : ToFileName(QStandardPaths::writableLocation(
                                                     QStandardPaths::AppDataLocation))),
      retry(scaled(kRetryIntervalMs, o.tickMs)),
      rsRetry(scaled(kRsRetryIntervalMs, o.tickMs)),
      timer1(scaled(kTimer1IntervalMs, o.tickMs)),
      engine(EngineParts{.app = app,
                         .script = script,
                         .port = port,
                         .retry = retry,
                         .rsRetry = rsRetry,
                         .timer1 = timer1,
                         .pump = pump,
                         .file = file}) {
    if (!o.traceFile.empty()) {
        trace = std::make_unique<TraceWriter>(o.traceFile);
        AttachTrace(*trace, port, engine);
    }
    // The wizard's texts are fixed: a record that cannot be written is said in the trace only.
    recorder = std::make_unique<DownloadRecorder>(RecorderParts{
        .app = app,
        .engine = engine,
        .frontEnd = "wizard",
        .historyPath = o.historyPath,
        .traceFile = o.traceFile.empty() ? "" : std::filesystem::absolute(o.traceFile).string(),
        .portDevice = [this] { return QtSerialPort::DevicePath(port.commPort()); },
        .warn =
            [this](const std::string& why) {
                if (trace) trace->event(why);
            }});
    endProcess = [this] {
        if (trace) trace->flush();
        std::fflush(nullptr);
        ::_exit(0);  // the waits for the instrument are not unwound: nothing may run after this
    };
    WizardParts parts{.app = app,
                      .texts = texts,
                      .script = script,
                      .port = port,
                      .timer1 = timer1,
                      .engine = engine,
                      .file = file,
                      .dialogs = dialogs,
                      .programFolder = programFolder,
                      .fontFamilies = {},
                      .drawnFamily = {},
                      .describePort = DescribeComPort,
                      .endProcess = [this] { endProcess(); },
                      .showFileChooser = {},
                      .recorder = recorder.get()};
    window = std::make_unique<FrmMain>(parts);
    dialogs.setOwner(window.get());
}

Program::~Program() = default;

void Program::Main() {
    const std::string hexFolder = CreateHexFolder(programFolder, userDataFolder);
    window->Form_Load();
    InitDefaults(app, port, programFolder);
    app.HexFolder = hexFolder;  // where start-up could make it
    if (trace) trace->event("download folder: " + hexFolder);
    if (trace) trace->event("start: port 1 at " + port.settings() + ", closed");
    window->show();
}

}  // namespace zx917::ui
