// A simulated world with the firmware operations on top: dialogs, view and a download file.
#pragma once

#include "app/texts.h"
#include "common/download_files.h"
#include "firmware/operations.h"
#include "support/fake_dialogs.h"
#include "support/fake_view.h"
#include "support/sim_world.h"

namespace zx917::test {

// A download file of our records with this revision in its header.
inline gen::Bytes DownloadFile(const std::string& revision, int records = 3) {
    gen::FileLayout layout;
    layout.header = revision + "\r\nMDSP:" + revision + "\r\nCDMA:" + revision +
                    "\r\nAMPS:" + revision + "\r\nMPU:" + revision + "\r\n";
    layout.sections = gen::StandardSections(records);
    return gen::Build(layout);
}

struct FirmwareRig {
    explicit FirmwareRig(InstrumentOptions options = {}, bool withInstrument = true)
        : world(std::move(options), withInstrument),
          ops(FirmwareParts{.app = world.app,
                            .texts = texts,
                            .dialogs = dialogs,
                            .file = world.file,
                            .engine = world.engine,
                            .port = world.port,
                            .timer1 = world.timer1,
                            .view = view}) {
        InitMessages(texts);
    }

    // Chooses the file as "&Open" does after its check.
    void choose(const gen::Bytes& content, const std::string& revision = "A.02.00") {
        world.app.FilePath = dir.write("NEW.HEX", content);
        world.app.SelectedFileName = "NEW.HEX";
        world.app.SelectedRevision = revision;
    }

    // The wizard's road from page 1 to the end of the download.
    bool download() {
        if (!ops.ReadCurrentRevision()) return false;
        if (!ops.PrepareDownload()) return false;
        return ops.StartDownload();
    }

    TextTables texts;
    FakeDialogs dialogs;
    FakeView view;
    SimWorld world;
    FirmwareOperations ops;
    gen::TempDir dir;
};

}  // namespace zx917::test
