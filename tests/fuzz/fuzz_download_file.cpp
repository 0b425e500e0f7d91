// Fuzz target: the download-file check and the record reader over arbitrary files.
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "firmware/download_file.h"
#include "firmware/record.h"

namespace {

struct NoDialogs : zx917::Dialogs {
    void critical(const std::string&) override {}
    bool question(const std::string&) override { return true; }
    void information(const std::string&) override {}
    void beep() override {}
};

const std::string& scratch() {
    static const std::string path = "/tmp/zx917-fuzz-" + std::to_string(::getpid()) + ".HEX";
    return path;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    std::FILE* f = std::fopen(scratch().c_str(), "wb");
    if (f == nullptr) return 0;
    std::fwrite(data, 1, size, f);
    std::fclose(f);

    static zx917::TextTables texts = [] {
        zx917::TextTables t;
        zx917::InitMessages(t);
        return t;
    }();
    NoDialogs dialogs;
    zx917::AppState app;
    app.CurrentRevision = "B.00.00";
    zx917::FileSlot file;
    zx917::CheckDownloadFile({app, file, dialogs, texts}, scratch(), 1);
    if (file.isOpen()) __builtin_trap();  // the check closes the file on every path

    // The transfer's reading: every section's marker, then records up to the last one.
    if (!file.open(scratch())) return 0;
    std::vector<uint8_t> record;
    for (const zx917::Section& s : zx917::SectionTable) {
        if (!zx917::FindSectionMarker(file, s.marker)) break;
        while (zx917::ReadRecord(file, record)) {
            if (record.size() < 8 || record.size() > 32769) __builtin_trap();
            if (zx917::IsLastRecordKind(zx917::RecordKindText(record))) break;
        }
    }
    file.seek(1);
    std::string field;
    while (file.readField(field)) {
    }
    return 0;
}
