// zx917-download: the download program's operations from the command line.
#include <iostream>
#include <string>
#include <vector>

#include "app/identity.h"
#include "download/commands.h"

namespace {

constexpr const char* kUsage = R"(usage: zx917-download COMMAND [OPTIONS]

Commands:
  check FILE...         check download files as the file chooser does, then read every
                        record of every section and verify its checksum; prints the revision,
                        the length and the records and bytes each section sends.
                        Exit status 0 when every file passed, 1 otherwise.
  identify --port DEV [--settings 9600,n,8,1] [--terminator crlf|cr|lf] [--xon]
                        [--trace FILE] [--tries N]
                        identify the instrument and read its current firmware revision;
                        --tries N tries the identification up to N times, closing and
                        reopening the port in between (the instrument switched on late).
  download --port DEV --file FILE [same options] [--yes]
                        identify, check the file and send it to the instrument.
                        Exit status 0 only when the instrument confirmed the new revision.
                        Every attempt is kept in the service record.
  history [--limit N | --all] [--instrument TEXT] [--since DATE] [--json | --csv]
                        the service record of every download, by the wizard and by this
                        command, newest first (20 unless --limit or --all): when, which
                        instrument, from which revision to which, which file (SHA-256), and
                        the outcome. --instrument keeps the attempts whose identity holds
                        TEXT, --since those started on or after DATE (2026-12-01, UTC).
                        The record is $ZX917_HISTORY, else
                        $XDG_DATA_HOME/zx917/history.sqlite (~/.local/share/zx917/...).
  --help                show this text.
  --version             show the version.
)";

}  // namespace

int main(int argc, char** argv) {
    std::vector<std::string> args(argv + 1, argv + argc);
    if (args.empty() || args[0] == "--help" || args[0] == "-h" || args[0] == "help") {
        std::cout << kUsage;
        return args.empty() ? 2 : 0;
    }
    if (args[0] == "--version") {
        std::cout << "zx917-download " << zx917::kVersion << "\n";
        return 0;
    }
    const std::string command = args[0];
    args.erase(args.begin());
    for (const auto& a : args) {
        if (a == "--help" || a == "-h") {
            std::cout << kUsage;
            return 0;
        }
    }
    if (command == "check") return zx917::RunCheckCommand(args);
    if (command == "identify") return zx917::RunIdentifyCommand(args);
    if (command == "download") return zx917::RunDownloadCommand(args);
    if (command == "history") return zx917::RunHistoryCommand(args);
    std::cerr << "zx917-download: unknown command '" << command << "'\n" << kUsage;
    return 2;
}
