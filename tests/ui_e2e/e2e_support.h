// End to end with the real program: the Qt serial adapter, real timers and real message boxes,
// offscreen, against zx917-sim on a pseudo-terminal.
#pragma once

#include <gtest/gtest.h>

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QLineEdit>
#include <QMessageBox>
#include <QProcess>
#include <QPushButton>
#include <QTest>
#include <QTimer>
#include <deque>
#include <filesystem>
#include <functional>
#include <string>

#include "common/download_files.h"
#include "support/pty.h"
#include "ui/chooser/frm_new_sel.h"
#include "ui/wizard/program.h"

namespace zx917::test {

inline const std::string kBuildDir = ZX917_BUILD_DIR;
inline const std::string kProgramDir = ZX917_PROGRAM_DIR;

// zx917-sim on a pseudo-terminal, linked at DIR/com1.
class SimProcess {
public:
    SimProcess(const std::string& dir, const QStringList& args) : link_(dir + "/com1") {
        report_ = dir + "/report.json";
        QStringList all = {"--link", QString::fromStdString(link_), "--report",
                           QString::fromStdString(report_)};
        all << args;
        proc_.setProgram(QString::fromStdString(kBuildDir + "/tools/zx917-sim"));
        proc_.setArguments(all);
        proc_.setProcessChannelMode(QProcess::ForwardedErrorChannel);
        proc_.start();
        for (int i = 0; i < 100 && !std::filesystem::exists(link_); ++i) QTest::qWait(20);
    }
    ~SimProcess() { stop(); }
    bool ready() const { return std::filesystem::exists(link_); }
    // The instrument's side of the line goes at once, as when the adapter is pulled.
    void pull() {
        proc_.kill();
        proc_.waitForFinished(5000);
    }
    const std::string& link() const { return link_; }
    // Ends the simulator and returns its report.
    std::string stop() {
        if (proc_.state() != QProcess::NotRunning) {
            proc_.terminate();
            proc_.waitForFinished(5000);
        }
        QFile f(QString::fromStdString(report_));
        return f.open(QIODevice::ReadOnly) ? f.readAll().toStdString() : std::string();
    }

private:
    std::string link_, report_;
    QProcess proc_;
};

// Answers the modal windows as an engineer would, and notes what they said.
class ModalAnswerer {
public:
    ModalAnswerer() {
        timer_.setInterval(20);
        QObject::connect(&timer_, &QTimer::timeout, [this] { look(); });
        timer_.start();
    }
    std::deque<bool> answers;                     // questions: OK when true; Cancel when empty
    std::function<void(ui::FrmNewSel&)> chooser;  // what to do in the file chooser
    std::vector<std::string> texts;               // every message box's text

private:
    void look() {
        QWidget* modal = QApplication::activeModalWidget();
        if (modal == nullptr || modal == seen_) return;
        if (auto* box = qobject_cast<QMessageBox*>(modal)) {
            seen_ = box;
            texts.push_back(box->text().toStdString());
            const bool question = box->button(QMessageBox::Cancel) != nullptr;
            bool ok = true;
            if (question) {
                ok = !answers.empty() && answers.front();
                if (!answers.empty()) answers.pop_front();
            }
            QTest::keyClick(box, ok ? Qt::Key_Return : Qt::Key_Escape);
        } else if (auto* c = dynamic_cast<ui::FrmNewSel*>(modal)) {
            seen_ = c;
            if (chooser) chooser(*c);
        }
    }
    QTimer timer_;
    QWidget* seen_ = nullptr;
};

// A program folder with our help file and clip, and the download file in "HEX".
struct ProgramFolder {
    ProgramFolder() {
        for (const char* f : {"ZX917A.HLP", "Filemove.avi"})
            std::filesystem::copy_file(kProgramDir + "/" + f, dir.path() + "/" + f);
    }
    gen::TempDir dir;
};

// A download file of our records made by zx917-mkfile; returns its path.
inline std::string MakeDownloadFile(const std::string& path, const char* revision) {
    QProcess::execute(QString::fromStdString(kBuildDir + "/tools/zx917-mkfile"),
                      {"--revision", revision, "--bytes", "12000", QString::fromStdString(path)});
    return path;
}

// Turns the event loop until the condition holds or the time is up.
inline bool waitFor(const std::function<bool()>& done, int ms) {
    QElapsedTimer t;
    t.start();
    while (!done() && t.elapsed() < ms) QTest::qWait(10);
    return done();
}

}  // namespace zx917::test
