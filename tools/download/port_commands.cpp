// identify and download: the program's own operations on Qt's core event loop and the Qt
// serial adapter, with the messages and questions on the terminal.
#include <QCoreApplication>
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <memory>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "app/identity.h"
#include "app/texts.h"
#include "download/cli_view.h"
#include "download/commands.h"
#include "firmware/download_file.h"
#include "firmware/operations.h"
#include "firmware/revision.h"
#include "history/download_recorder.h"
#include "link/command_script.h"
#include "link/engine.h"
#include "link/line_settings.h"
#include "link/qt/qt_platform.h"
#include "link/qt/qt_serial_port.h"
#include "link/qt/trace_writer.h"
#include "terminal_dialogs.h"

namespace zx917 {

namespace {

// The test build can run the timers faster (ZX917_TICK_MS: the length of a 1000 ms tick), so
// that the fault matrix's time-outs pass in seconds; the shipped program keeps real time.
int tickMs(int normalMs) {
#ifdef ZX917_TEST_TICK
    if (const char* t = std::getenv("ZX917_TICK_MS"); t != nullptr && std::atoi(t) > 0) {
        return std::max(1, normalMs * std::atoi(t) / 1000);
    }
#endif
    return normalMs;
}

struct Options {
    std::string port, settings = kDefaultSettings, terminator = kDefaultTerminator, trace, file;
    bool xon = false;
    bool yes = false;
    int tries = 1;  // identifications, as an engineer pressing Next again after a failure
};

bool parse(const std::vector<std::string>& args, bool download, Options& o) {
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if (a == "--port" && hasValue)
            o.port = args[++i];
        else if (a == "--settings" && hasValue)
            o.settings = args[++i];
        else if (a == "--trace" && hasValue)
            o.trace = args[++i];
        else if (a == "--file" && hasValue && download)
            o.file = args[++i];
        else if (a == "--terminator" && hasValue) {
            const std::string t = args[++i];
            if (t != "crlf" && t != "cr" && t != "lf") return false;
            o.terminator = t == "cr" ? "\r" : t == "lf" ? "\n" : "\r\n";
        } else if (a == "--xon")
            o.xon = true;
        else if (a == "--yes" && download)
            o.yes = true;
        else if (a == "--tries" && hasValue) {
            o.tries = std::atoi(args[++i].c_str());
            if (o.tries < 1 || o.tries > 100) return false;
        } else
            return false;
    }
    return !o.port.empty() && (!download || !o.file.empty()) && ParseLineSettings(o.settings);
}

// One program world on Qt's event loop.
class Session {
public:
    explicit Session(const Options& o)
        : opt_(o),
          engine(EngineParts{.app = app,
                             .script = script,
                             .port = port,
                             .retry = retry,
                             .rsRetry = rsRetry,
                             .timer1 = timer1,
                             .pump = pump,
                             .file = file}),
          dialogs(o.yes),
          ops(FirmwareParts{.app = app,
                            .texts = texts,
                            .dialogs = dialogs,
                            .file = file,
                            .engine = engine,
                            .port = port,
                            .timer1 = timer1,
                            .view = view}) {
        InitMessages(texts);
        InitCommandScript(script);
        InitDefaults(app, ProgramFolder());
        if (!o.trace.empty()) {
            trace = std::make_unique<TraceWriter>(o.trace);
            AttachTrace(*trace, port, engine);
        }
    }
    ~Session() {
        if (trace) trace->flush();
    }

    // Opens the port as the settings page applies the engineer's choice.
    bool openPort() {
        ::setenv("ZX917_COM1", opt_.port.c_str(), 1);
        port.setCommPort(1);
        if (!port.setPortOpen(true)) {
            dialogs.critical(texts.MessageTable[kMsgPortMissing]);
            std::cerr << "(" << port.errorText() << ")" << std::endl;
            return false;
        }
        const bool applied =
            port.setSettings(opt_.settings) && port.setHandshaking(opt_.xon ? 1 : 0);
        app.Terminator = opt_.terminator;
        if (trace) {
            trace->event("port " + opt_.port + " open at " + port.settings() +
                         (applied ? "" : " (settings refused: " + port.errorText() + ")"));
        }
        return true;
    }

    // Identification as the wizard repeats it: a failure closes the port (page 0), the next
    // try opens it again with the engineer's settings (page 1).
    bool identify() {
        for (int n = 1;; ++n) {
            if (!openPort()) return false;
            if (ops.ReadCurrentRevision()) return true;
            if (n >= opt_.tries) return false;
            close();
            std::cerr << "identification failed; trying again (" << n + 1 << " of " << opt_.tries
                      << ")" << std::endl;
        }
    }

    // The trace shows the settings the operations left on the port, then the port is closed
    // and given the engineer's settings for whatever opens it next.
    void putPortBack() {
        close();
        port.setSettings(opt_.settings);
        port.setHandshaking(opt_.xon ? 1 : 0);
    }

    void close() {
        if (trace)
            trace->event("port closed at " + port.settings() + " handshaking " +
                         std::to_string(port.handshaking()));
        port.setPortOpen(false);
    }

    const Options opt_;
    AppState app;
    TextTables texts;
    CommandScript script;
    FileSlot file;
    QtSerialPort port;
    QtTimer retry{tickMs(kRetryIntervalMs)};
    QtTimer rsRetry{tickMs(kRsRetryIntervalMs)};
    QtTimer timer1{tickMs(kTimer1IntervalMs)};
    QtEventPump pump;
    Engine engine;
    TerminalDialogs dialogs;
    CliView view;
    FirmwareOperations ops;
    std::unique_ptr<TraceWriter> trace;
};

int usage(const char* command) {
    std::cerr << "zx917-download " << command << ": bad options (see --help)\n";
    return 2;
}

QCoreApplication& qtCore() {
    static int argc = 1;
    static char name[] = "zx917-download";
    static char* argv[] = {name, nullptr};
    static QCoreApplication app(argc, argv);
    return app;
}

void printRevision(const Session& s) {
    std::cout << "current revision: " << Latin1ToUtf8(StripFillers(s.app.CurrentRevision.str()))
              << "\n";
    if (s.app.AmpsSectionFlag.empty()) {
        std::cout << "AMPS flag: not read (identified without the download mode)\n";
    } else {
        std::cout << "AMPS flag: " << Latin1ToUtf8(s.app.AmpsSectionFlag) << "\n";
    }
}

}  // namespace

int RunIdentifyCommand(const std::vector<std::string>& args) {
    Options o;
    if (!parse(args, false, o)) return usage("identify");
    qtCore();
    Session s(o);
    const bool ok = s.identify();
    if (ok) printRevision(s);
    s.putPortBack();
    return ok ? 0 : 1;
}

int RunDownloadCommand(const std::vector<std::string>& args) {
    Options o;
    if (!parse(args, true, o)) return usage("download");
    qtCore();
    Session s(o);
    AppState& app = s.app;
    // The service record: this attempt from now on; a record that cannot be written is said
    // once and changes nothing else.
    DownloadRecorder record(
        {.app = app,
         .engine = s.engine,
         .frontEnd = "command line",
         .historyPath = {},
         .traceFile = o.trace.empty() ? "" : std::filesystem::absolute(o.trace).string(),
         .portDevice = [&o] { return o.port; },
         .warn =
             [](const std::string& why) {
                 std::cerr << "zx917-download: warning: " << why << std::endl;
             }});
    record.begin();
    // Every way out: the instrument's confirmation, the engineer's Cancel, or a failure.
    auto finish = [&](bool confirmed) {
        record.end(!confirmed && s.dialogs.declined() ? kOutcomeCancelled
                                                      : OutcomeOf(confirmed, s.engine.lineLog()));
        return confirmed ? 0 : 1;
    };
    if (!s.identify()) {
        s.putPortBack();
        return finish(false);
    }
    printRevision(s);
    // The file chooser's check, with the hardware question, and what "&Open" keeps.
    const std::filesystem::path path = std::filesystem::absolute(o.file);
    if (!CheckDownloadFile({app, s.file, s.dialogs, s.texts}, path.string(), 1)) {
        s.putPortBack();
        return finish(false);
    }
    app.FilePath = path.string();
    app.SelectedFileName = path.filename().string();
    app.HexFolder = path.parent_path().string();
    app.SelectedRevision = app.NewRevision;
    std::cout << "new revision: " << Latin1ToUtf8(StripFillers(app.SelectedRevision.str())) << " ("
              << app.SelectedFileName << ")\n";
    if (CurrentIsNewerOrEqual(app.CurrentRevision, app.SelectedRevision) &&
        !s.dialogs.question(s.texts.MessageTable[kMsgCurrentIsNewer])) {
        s.putPortBack();
        return finish(false);
    }
    if (!s.ops.PrepareDownload()) {
        s.putPortBack();
        return finish(false);
    }
    std::cout << "download time: " << s.view.estimate << std::endl;
    if (!s.dialogs.question(s.texts.QuestionTable[kQstStart])) {
        s.putPortBack();
        return finish(false);
    }
    record.update();  // what a transfer cut short leaves behind
    const bool ok = s.ops.StartDownload();
    if (ok) std::cout << "Download successfully completed." << std::endl;
    s.close();
    return finish(ok);
}

}  // namespace zx917
