// The ZX917 as a model: it takes the bytes the program sends and says what it answers and when.
// The in-process test instrument and zx917-sim both run it.
#pragma once

#include <cstdint>
#include <map>
#include <span>
#include <string>
#include <vector>

#include "link/line_settings.h"

namespace zx917 {

enum class FaultAction {
    Silent,   // no answer
    Abort,    // "ABORT" instead of the answer
    Garble,   // a wrong answer line
    Refuse,   // erase refused: "EPnN"
    Dsr,      // raises DSR instead of answering
    Hangup,   // the line goes dead (zx917-sim closes its terminal)
    Restart,  // "RESTART:Pn" instead of acknowledging a record
};

struct Fault {
    FaultAction action = FaultAction::Silent;
    std::string command;  // "*IDN?", "OPEN", "SP2", "DL" (any record), "DLE" (last record), ...
                          // for Restart: "P1".."P4", the area
    int from = 1;         // fires from this occurrence on (for Restart: the area's record number)
    int times = 0;        // how often at most; 0 = every time
    int fired = 0;
};

// Parses "ACTION:COMMAND[:FROM[:TIMES]]", for example "silent:OPEN" or "restart:P2:3:2".
bool ParseFault(const std::string& text, Fault& fault);

struct InstrumentOptions {
    std::string revision = "A.01.02";
    // The identity answer's first 39 characters (maker, model, serial number); the revision
    // follows. Cut or padded with "-".
    std::string identity = "Quorvex,ZX917,SN0001234567,FW";
    char ampsFlag = '1';
    LineSettings userLine;            // 9600,n,8,1
    std::string terminator = "\r\n";  // the line end the engineer set up on both sides
    int answerDelayMs = 2;
    int openDelayMs = 20;
    int programDelayMs = 100;     // after the last record of an area
    bool idnOnly = false;         // answers "*IDN?" and nothing else
    bool noDownloadMode = false;  // ignores "MAINTENANCE:DOWNLOAD"
    bool wrongRevc = false;       // "REVC" answers with another revision
    bool noise = false;           // noise lines and control characters before every answer
    int readyAfterRevcMs = -1;    // an empty line this long after the REVC answer; -1: none
    std::vector<Fault> faults;
};

struct Emission {
    enum Kind { Data, DsrRise, Hangup } kind = Data;
    int64_t atMs = 0;
    std::vector<uint8_t> bytes;
};

struct CommandLog {
    std::string command;
    std::string settings;  // line settings the command arrived at
    int64_t atMs = 0;
};

class Instrument {
public:
    explicit Instrument(InstrumentOptions options);

    // Bytes from the program. lineOk: they arrived at the instrument's own line settings;
    // otherwise they come out garbled and are lost.
    void receive(std::span<const uint8_t> bytes, bool lineOk, const std::string& settings,
                 int64_t nowMs);
    std::vector<Emission> takeEmissions();

    // The line settings the instrument's port runs at now.
    const LineSettings& line() const { return line_; }
    bool inDownloadMode() const { return downloadMode_; }

    const std::vector<CommandLog>& commands() const { return log_; }
    // Records accepted per area ("P1".."P4"), without their length bytes, latest pass only.
    const std::map<std::string, std::vector<std::vector<uint8_t>>>& areas() const { return areas_; }
    const std::string& revision() const { return revision_; }
    char ampsFlag() const { return opt_.ampsFlag; }
    bool rebooted() const { return rebooted_; }
    // "REVC" confirmed the announced revision and "REBOOT" was answered.
    bool confirmed() const { return confirmed_; }
    int restartsSent() const { return restartsSent_; }
    std::string reportJson() const;

    // The transfer window, from "REVD" with the new revision to "CLOSE": its length, the bytes
    // each way and the delays the instrument itself took (answers, OPEN, programming).
    struct Window {
        int64_t startMs = -1, endMs = -1, bytesIn = 0, bytesOut = 0, delaysMs = 0;
    };
    const Window& window() const { return window_; }

private:
    void handleLine(const std::string& line, int64_t now);
    void handleRecordBytes(uint8_t b, int64_t now);
    void handleRecord(int64_t now);
    void answer(const std::string& text, int64_t now, int delayMs = -1);
    Fault* faultFor(const std::string& command, int occurrence);
    bool applyFault(Fault* f, int64_t now);
    std::string identity() const;
    std::string revAnswer(const std::string& revision) const;

    InstrumentOptions opt_;
    LineSettings line_;
    std::string revision_;
    std::string announced_;
    bool downloadMode_ = false;
    bool opened_ = false;
    bool rebooted_ = false;
    bool confirmed_ = false;
    bool revcOk_ = false;
    std::string area_;           // "P2" while records are expected
    bool awaitingEcho_ = false;  // after a restart request, until "RESTART:Pn" comes back
    int areaRecord_ = 0;
    std::vector<uint8_t> rec_;  // record being received, length bytes first
    std::string text_;          // text line being received
    std::string echo_;          // bytes received while the restart echo is awaited
    std::map<std::string, int> occurrences_;
    std::map<std::string, std::vector<std::vector<uint8_t>>> areas_;
    std::vector<CommandLog> log_;
    std::vector<Emission> out_;
    std::string lastSettings_;
    int64_t busyUntil_ = 0;   // answers keep their order
    int64_t restartAt_ = -1;  // when the instrument has restarted after REBOOT
    int restartsSent_ = 0;
    bool dead_ = false;
    Window window_;
    bool inWindow_ = false;
};

}  // namespace zx917
