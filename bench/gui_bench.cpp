// zx917-gui-bench: the wizard's whole download, driven by clicks with the real adapter, timers
// and message boxes; prints the transfer's wall time and the program's CPU time over it.
//   zx917-gui-bench DEVICE FILE       (offscreen unless a display is set)
#include <sys/resource.h>

#include <QApplication>
#include <QElapsedTimer>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "common/download_files.h"
#include "firmware/download_file.h"
#include "ui/wizard/program.h"

namespace {

double cpuSeconds() {
    rusage u{};
    ::getrusage(RUSAGE_SELF, &u);
    return u.ru_utime.tv_sec + u.ru_stime.tv_sec + (u.ru_utime.tv_usec + u.ru_stime.tv_usec) / 1e6;
}

bool waitFor(const std::function<bool()>& done, int ms) {
    QElapsedTimer t;
    t.start();
    while (!done() && t.elapsed() < ms) QTest::qWait(100);
    return done();
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 3) {
        std::fprintf(stderr, "usage: zx917-gui-bench DEVICE FILE\n");
        return 2;
    }
    if (!std::getenv("DISPLAY") && !std::getenv("WAYLAND_DISPLAY"))
        ::setenv("QT_QPA_PLATFORM", "offscreen", 0);
    ::setenv("ZX917_COM1", argv[1], 1);
    QApplication app(argc, argv);
    zx917::gen::TempDir folder;
    zx917::ui::ProgramOptions o;
    o.programFolder = folder.path();
    // The clip plays during the transfer, as it does for the engineer.
    std::filesystem::copy_file(ZX917_PROGRAM_DIR "/Filemove.avi", folder.path() + "/Filemove.avi");
    zx917::ui::Program program(o);
    program.endProcess = [] {};
    program.Main();
    auto& w = *program.window;
    // Every question is answered OK; anything else is a failure of the run.
    QTimer answer;
    bool unexpected = false;
    QObject::connect(&answer, &QTimer::timeout, [&] {
        if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
            unexpected |= box->button(QMessageBox::Cancel) == nullptr;
            QTest::keyClick(box, Qt::Key_Return);
        }
    });
    answer.start(100);  // the harness's own cost stays small beside the program's
    auto click = [](QPushButton* b) {
        QTimer::singleShot(0, b, [b] { QTest::mouseClick(b, Qt::LeftButton); });
    };
    click(w.CmdNext[0]);
    if (!waitFor([&] { return w.currentPage() == 1; }, 5000)) return 1;
    click(w.CmdNext[1]);
    if (!waitFor([&] { return w.currentPage() == 2; }, 120000)) return 1;
    // The file as the chooser's "&Open" leaves it.
    program.app.FilePath = std::filesystem::absolute(argv[2]).string();
    program.app.SelectedFileName = "BENCH.HEX";
    if (!zx917::CheckDownloadFile({program.app, program.file, program.dialogs, program.texts},
                                  program.app.FilePath, 0))
        return 1;
    program.app.SelectedRevision = program.app.NewRevision;
    w.CmdNext[2]->setEnabled(true);
    click(w.CmdNext[2]);
    if (!waitFor([&] { return w.currentPage() == 3; }, 5000)) return 1;
    const double cpu0 = cpuSeconds();
    QElapsedTimer wall;
    wall.start();
    click(w.CmdNext[3]);
    if (!waitFor([&] { return w.currentPage() == 5 || w.currentPage() == 0; }, 3600000)) return 1;
    const double seconds = wall.elapsed() / 1000.0;
    const double cpu = cpuSeconds() - cpu0;
    std::printf("%.3f %.3f %d\n", seconds, cpu, w.currentPage() == 5 && !unexpected ? 1 : 0);
    return w.currentPage() == 5 ? 0 : 1;
}
