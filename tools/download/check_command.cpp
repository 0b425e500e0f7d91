// zx917-download check: the download-file check of the file chooser, plus a walk of every
// record with its checksum, for each file given.
#include <iostream>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "download/commands.h"
#include "download/file_scan.h"
#include "firmware/download_file.h"
#include "firmware/revision.h"
#include "terminal_dialogs.h"

namespace zx917 {

namespace {

bool checkOne(const std::string& path, const TextTables& texts) {
    AppState app;
    FileSlot file;
    TerminalDialogs dialogs;
    std::cout << path << ":\n";
    if (!CheckDownloadFile({app, file, dialogs, texts}, path, 0)) {
        std::cout << "  rejected: " << TerminalLines(dialogs.lastMessage()) << "\n";
        return false;
    }
    std::cout << "  revision: " << Latin1ToUtf8(StripFillers(app.NewRevision.str())) << "\n";
    std::cout << "  length: " << app.DownloadFileLength << " bytes\n";
    const FileScan scan = ScanDownloadFile(path, true);
    for (const SectionScan& s : scan.sections) {
        std::cout << "  " << s.name << ": " << s.records << " records, " << s.bytes << " bytes\n";
    }
    if (!scan.ok) {
        std::cout << "  read failure in section " << scan.section << " at offset " << scan.offset
                  << ": " << scan.error << "\n";
        std::cerr << path << ": " << scan.error << " (section " << scan.section << ", offset "
                  << scan.offset << ")\n";
    }
    return scan.ok;
}

}  // namespace

int RunCheckCommand(const std::vector<std::string>& files) {
    if (files.empty()) {
        std::cerr << "zx917-download check: no file given\n";
        return 2;
    }
    TextTables texts;
    InitMessages(texts);
    bool all = true;
    for (const std::string& f : files) all = checkOne(f, texts) && all;
    return all ? 0 : 1;
}

}  // namespace zx917
