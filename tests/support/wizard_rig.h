// The main window on the simulated world: the engine in simulated time against the in-process
// instrument, the message boxes answered by the test, the file chooser stood in for.
#pragma once

#include <QPushButton>
#include <QTest>
#include <memory>
#include <string>

#include "app/texts.h"
#include "common/download_files.h"
#include "link/port_defaults.h"
#include "support/fake_dialogs.h"
#include "support/firmware_rig.h"
#include "support/sim_world.h"
#include "ui/wizard/frm_main.h"

namespace zx917::test {

// A file with a download file's shape whose header tags are wrong: "This is not the download file."
inline std::string NotADownloadFile() {
    return "A.02.00\r\nMDSP:A\r\nCDMA:A\r\nGPS:A\r\nMPU:A\r\n" + std::string(60, 'x') +
           "\r\n[EOF]\r\n";
}

struct WizardRig {
    // The screen's fonts: its families, and the family it draws for a name.
    struct Fonts {
        std::function<QStringList()> families;
        std::function<QString(const QString&)> drawn;
    };

    explicit WizardRig(InstrumentOptions options = {}, bool withInstrument = true, Fonts fonts = {})
        : world(std::move(options), withInstrument) {
        world.port.setPortOpen(false);
        window = std::make_unique<ui::FrmMain>(ui::WizardParts{
            .app = world.app,
            .texts = texts,
            .script = world.script,
            .port = world.port,
            .timer1 = world.timer1,
            .engine = world.engine,
            .file = world.file,
            .dialogs = dialogs,
            .programFolder = folder.path(),
            .fontFamilies = std::move(fonts.families),
            .drawnFamily = std::move(fonts.drawn),
            .describePort =
                [](int16_t n) { return "/dev/ttyUSB" + std::to_string(n - 1) + " - test adapter"; },
            .endProcess =
                [this] {
                    ++ended;
                    portOpenAtEnd = world.port.portOpen();
                },
            .showFileChooser =
                [this] {
                    ++chooserShown;
                    if (onChooser) onChooser();
                }});
        window->Form_Load();
        InitDefaults(world.app, world.port, folder.path());
        window->show();
    }

    ui::FrmMain& w() { return *window; }
    int page() const { return window->currentPage(); }

    // A click as the engineer's: a disabled button takes none.
    void click(QPushButton* button) { QTest::mouseClick(button, Qt::LeftButton); }

    // Page 0 to page 2 against the instrument; false when page 2 was not reached.
    bool toPage2() {
        click(window->CmdNext[0]);
        if (page() != 1) return false;
        click(window->CmdNext[1]);
        return page() == 2;
    }

    // The chooser's stand-in opens this file as "&Open" would after a successful check.
    void choose(const gen::Bytes& content, const std::string& revision,
                const std::string& name = "NEW.HEX") {
        const std::string path = folder.write(name, content);
        onChooser = [this, path, name, revision] {
            world.app.FilePath = path;
            world.app.SelectedFileName = name;
            world.app.HexFolder = folder.path();
            world.app.SelectedRevision = revision;
        };
        click(window->CmdFirmSelect);
    }

    // Texts shown, in order, with their kinds.
    std::vector<FakeDialogs::Shown> shown() const { return dialogs.shown; }

    gen::TempDir folder;  // the program folder
    SimWorld world;
    TextTables texts;
    FakeDialogs dialogs;
    std::unique_ptr<ui::FrmMain> window;
    std::function<void()> onChooser;
    int chooserShown = 0;
    int ended = 0;
    bool portOpenAtEnd = false;
};

}  // namespace zx917::test
