// ZX917A: the firmware download wizard.
#include <QApplication>
#include <QCommandLineParser>
#include <QFileInfo>
#include <iostream>

#include "app/identity.h"
#include "ui/wizard/instance_lock.h"
#include "ui/wizard/program.h"
#include "ui/wizard/program_icon.h"

namespace {

constexpr const char* kDescription =
    "The ZX917 firmware download wizard. Com1 and Com2 are $ZX917_COM1 and $ZX917_COM2 when\n"
    "set, else the first and second serial port the system lists (USB and ACM adapters first).";

// The options, read before any window exists: --help and --version need no display.
struct Arguments {
    zx917::ui::ProgramOptions options;
    std::optional<int> exitNow;  // the exit status when the program ends here
};

Arguments parse(int argc, char** argv) {
    QStringList args;
    for (int i = 0; i < argc; ++i) args << QString::fromLocal8Bit(argv[i]);
    const QString name = QFileInfo(args.value(0, "ZX917A")).fileName();
    QCommandLineParser parser;
    parser.setApplicationDescription(kDescription);
    // Help of its own: the toolkit's options are none of the engineer's business.
    const QCommandLineOption help({"h", "help"}, "Show this help and end.");
    const QCommandLineOption version({"v", "version"}, "Show the version and end.");
    parser.addOption(help);
    parser.addOption(version);
    const QCommandLineOption trace(
        "trace",
        "Write every byte on the line, with its time, direction and line settings, and every "
        "time-out, resend, abort and restart to <file>.",
        "file");
    parser.addOption(trace);
    // Without an application object the parser cannot know the program's name.
    const QString usage = parser.helpText().replace("<executable_name>", name);
    Arguments out;
    if (!parser.parse(args) || !parser.positionalArguments().isEmpty()) {
        const QString why = parser.errorText().isEmpty()
                                ? "unexpected argument " + parser.positionalArguments().first()
                                : parser.errorText();
        std::cerr << name.toStdString() << ": " << why.toStdString() << "\n" << usage.toStdString();
        out.exitNow = 2;
    } else if (parser.isSet(help)) {
        std::cout << usage.toStdString();
        out.exitNow = 0;
    } else if (parser.isSet(version)) {
        std::cout << name.toStdString() << " " << zx917::kVersion << "\n";
        out.exitNow = 0;
    }
    out.options.traceFile = parser.value(trace).toStdString();
    return out;
}

}  // namespace

int main(int argc, char** argv) {
    const Arguments arguments = parse(argc, argv);
    if (arguments.exitNow) return *arguments.exitNow;
    // A second copy ends at once: no window, no message, no folder, no change to the port.
    zx917::ui::InstanceLock lock;
    if (!lock.acquire()) return 0;

    QApplication app(argc, argv);
    QApplication::setApplicationName("ZX917A");
    QApplication::setApplicationVersion(zx917::kVersion);
    QApplication::setWindowIcon(zx917::ui::ProgramIcon());
    QGuiApplication::setDesktopFileName(zx917::kAppId);
    zx917::ui::Program program(arguments.options);
    program.Main();
    return QApplication::exec();
}
