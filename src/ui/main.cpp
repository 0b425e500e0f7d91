// ZX917A: the firmware download wizard.
#include <QApplication>
#include <cstring>
#include <iostream>

#include "ui/wizard/instance_lock.h"
#include "ui/wizard/program.h"

namespace {

constexpr const char* kUsage =
    "usage: ZX917A [--trace FILE]\n"
    "The ZX917 firmware download wizard. Com1 and Com2 are $ZX917_COM1 and $ZX917_COM2 when\n"
    "set, else the first and second serial port the system lists (USB and ACM adapters first).\n"
    "  --trace FILE   write every byte on the line, with its time, direction and line\n"
    "                 settings, and every time-out, resend, abort and restart to FILE.\n";

}  // namespace

int main(int argc, char** argv) {
    zx917::ui::ProgramOptions options;
    for (int i = 1; i < argc; ++i) {
        if (std::strcmp(argv[i], "--help") == 0 || std::strcmp(argv[i], "-h") == 0) {
            std::cout << kUsage;
            return 0;
        }
        if (std::strcmp(argv[i], "--trace") == 0 && i + 1 < argc) options.traceFile = argv[++i];
    }
    // A second copy ends at once: no window, no message, no folder, no change to the port.
    zx917::ui::InstanceLock lock;
    if (!lock.acquire()) return 0;

    QApplication app(argc, argv);
    QApplication::setApplicationName("ZX917A");
    QApplication::setWindowIcon(zx917::ui::ProgramIcon());
    zx917::ui::Program program(options);
    program.Main();
    return QApplication::exec();
}
