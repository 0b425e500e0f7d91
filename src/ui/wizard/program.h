// The program's one world on Qt: the shared state and tables, the download file slot, the
// serial port, the three timers, the event pump, the engine, the message boxes and the main
// window. main() makes one; the end-to-end tests make their own.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "history/download_recorder.h"
#include "link/command_script.h"
#include "link/engine.h"
#include "link/qt/qt_platform.h"
#include "link/qt/qt_serial_port.h"
#include "link/qt/trace_writer.h"
#include "ui/common/qt_dialogs.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

struct ProgramOptions {
    std::string programFolder;  // the executable's folder when empty
    // Where the download folder goes when the program's folder is not the user's to write:
    // the application's data folder (~/.local/share/ZX917A) when empty.
    std::string userDataFolder;
    std::string traceFile;    // support trace of the line; none when empty
    std::string historyPath;  // the service record; DefaultHistoryPath() when empty
    int tickMs = 1000;        // the 1000 ms tick; only tests shorten it
};

class Program {
public:
    explicit Program(const ProgramOptions& options);
    ~Program();

    // Start-up after the previous-instance test: the "HEX" folder, the main window and its
    // load step, the serial defaults, the window shown modeless.
    void Main();

    // Ends the process at once; a test replaces it.
    std::function<void()> endProcess;

    const std::string programFolder;
    const std::string userDataFolder;
    AppState app;
    TextTables texts;
    CommandScript script;
    FileSlot file;
    QtSerialPort port;
    QtTimer retry;
    QtTimer rsRetry;
    QtTimer timer1;
    QtEventPump pump;
    Engine engine;
    QtDialogs dialogs;
    std::unique_ptr<TraceWriter> trace;
    std::unique_ptr<DownloadRecorder> recorder;
    std::unique_ptr<FrmMain> window;
};

}  // namespace zx917::ui
