// Times CheckDownloadFile on each file given; prints seconds per check.
#include <chrono>
#include <cstdio>
#include <string>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "firmware/download_file.h"

namespace {
struct SilentDialogs : zx917::Dialogs {
    void critical(const std::string&) override {}
    bool question(const std::string&) override { return true; }
    void information(const std::string&) override {}
    void beep() override {}
};
}  // namespace

int main(int argc, char** argv) {
    zx917::TextTables texts;
    zx917::InitMessages(texts);
    SilentDialogs dialogs;
    constexpr int kRounds = 2000;
    for (int i = 1; i < argc; ++i) {
        zx917::AppState app;
        zx917::FileSlot file;
        bool ok = true;
        const auto start = std::chrono::steady_clock::now();
        for (int r = 0; r < kRounds; ++r) {
            ok = zx917::CheckDownloadFile({app, file, dialogs, texts}, argv[i], 0) && ok;
        }
        const std::chrono::duration<double> d = std::chrono::steady_clock::now() - start;
        std::printf("%s %d %.9f\n", argv[i], ok ? 1 : 0, d.count() / kRounds);
    }
    return 0;
}
