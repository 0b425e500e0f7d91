// The firmware operations of the main window: identification, the estimate before a download,
// and the download itself with its progress display.
#pragma once

#include <cstdint>
#include <string>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"
#include "firmware/download_file.h"
#include "firmware/download_view.h"
#include "link/engine.h"

namespace zx917 {

struct FirmwareParts {
    AppState& app;
    const TextTables& texts;
    Dialogs& dialogs;
    FileSlot& file;
    Engine& engine;
    SerialPort& port;
    Timer& timer1;
    DownloadView& view;
};

class FirmwareOperations {
public:
    explicit FirmwareOperations(const FirmwareParts& parts) : p_(parts) {}

    // Identifies the instrument, brings it into download mode and reads its revision.
    // False (after entry 0 has been shown) when it did not answer as expected.
    bool ReadCurrentRevision();
    // Checks the chosen file again and shows the estimate; false (back on page 2) when the
    // file fails its check.
    bool PrepareDownload();
    // Runs the whole download and shows page 5 on success, page 0 or 2 otherwise.
    // True when the instrument confirmed the new revision.
    bool StartDownload();
    void TransferFirmware();

    int32_t TotalSize1() const { return p_.app.DownloadFileLength; }
    std::string RemTimeFormat(int32_t bytes) const;
    int32_t EstimatedTime = 0;

private:
    FileCheckParts checkParts() const { return {p_.app, p_.file, p_.dialogs, p_.texts}; }
    bool sendSection(const Section& section, int32_t& shown);
    void recordRefresh(int32_t n);
    void programmingRefresh();
    void restoreUserPort();

    FirmwareParts p_;
    int32_t progressMax_ = 0;
};

}  // namespace zx917
