// Line reception and answer matching: the receive branch, ReadLine, MatchAnswer and the checks.
#include <cctype>

#include "link/engine.h"
#include "link/wildcard.h"

namespace zx917 {

namespace {
// A babbling line that never ends keeps no more than this; no answer comes near it.
constexpr std::size_t kLineLimit = 4096;
constexpr const char* kErrorQueueAnswer = "*,\"";
}  // namespace

void Engine::receiveBranch() {
    if (port_.commEvent() != kCommEvReceive) return;
    // Every complete line already received is handled now, not at the next byte.
    while (ReadLine()) {
        CheckAbortRestart();
        MatchAnswer();
        app_.LineBuffer.clear();
    }
}

bool Engine::ReadLine() {
    int32_t waiting = 0;
    do {
        const auto byte = port_.input();
        waiting = port_.inBufferCount();
        if (!byte) continue;
        const auto c = *byte;
        if (c == '\n' || c == '\r') {
            if (!app_.LineBuffer.empty()) return true;
        } else if (c >= ' ' && app_.LineBuffer.size() < kLineLimit) {
            app_.LineBuffer.push_back(static_cast<char>(c));
        }
    } while (waiting > 0);
    return false;
}

void Engine::MatchAnswer() {
    if (!running()) return;
    const ScriptEntry& e = current();
    const std::string& line = app_.LineBuffer;
    if (!WildcardMatch(line, e.Answer + "*")) return;

    bool r = false;
    if (e.Answer == kErrorQueueAnswer) {
        r = CheckErrorAnswer();
        app_.StepResult = r;
        if (!r) {
            note("error queue answer refused: " + line);
            app_.LastCommand.clear();
            app_.ScriptStep = kNoRun;
            retry_.setEnabled(false);
            forgetRun();
            return;
        }
    } else {
        if (e.Answer == "Quorvex") {
            r = CheckIdnAnswer();
        } else if (e.Answer == "REV") {
            r = app_.ScriptStage == kStageClose ? CheckNewRevision() : CheckRevAnswer();
        } else if (e.Answer == "P2A" || e.Answer == "P3A" || e.Answer == "P4A" ||
                   e.Answer == "P1A") {
            r = CheckAreaAnswer();
        } else if (e.Answer == "EP1" || e.Answer == "EP2" || e.Answer == "EP3" ||
                   e.Answer == "EP4") {
            // "EPnN" is the instrument refusing the erase.
            r = !WildcardMatch(line, e.Answer + "N*");
        } else {
            r = true;
        }
        app_.StepResult = r;
    }

    if (r) {
        if (e.Command == "MAINTENANCE:DOWNLOAD" && !flippedSettings_.empty()) {
            keepFlippedParity();
        }
        app_.LastCommand.clear();
        retry_.setEnabled(false);
        ++app_.ScriptStep;
        SendStep();
        if (current().Answer.empty()) {
            app_.LastCommand.clear();
            app_.ScriptStep = kNoRun;
            retry_.setEnabled(false);
            forgetRun();
        }
    } else {
        note("answer refused: " + line);
        app_.ElapsedTicks = 0;
    }
}

// Heard only at the flipped parity: that parity is the instrument's, so the way back keeps it,
// with the lower-case letter the settings page shows.
void Engine::keepFlippedParity() {
    std::string s = flippedSettings_;
    char& p = s[s.size() - 5];
    p = static_cast<char>(std::tolower(static_cast<unsigned char>(p)));
    note("answered at the flipped parity: the way back keeps " + s);
    app_.PortSettings = s;
    flippedSettings_.clear();
}

bool Engine::CheckErrorAnswer() {
    return !app_.LineBuffer.empty() && app_.LineBuffer[0] == '0';
}

bool Engine::CheckIdnAnswer() {
    const std::string& l = app_.LineBuffer;
    if (l.size() != 46) return false;
    app_.CurrentRevision = std::string_view(l).substr(46 - 7);
    log_.identity = l;
    return true;
}

bool Engine::CheckRevAnswer() {
    const std::string& l = app_.LineBuffer;
    if (l.size() != 14) return false;
    app_.CurrentRevision = std::string_view(l).substr(4, 7);
    app_.AmpsSectionFlag = l.substr(12, 1);
    return true;
}

bool Engine::CheckNewRevision() {
    const std::string& l = app_.LineBuffer;
    if (l.size() >= 11) log_.confirmedRevision = l.substr(4, 7);
    return l.size() == 14 && l.compare(4, 7, app_.NewRevision.str()) == 0;
}

bool Engine::CheckAreaAnswer() {
    const std::string& l = app_.LineBuffer;
    const std::size_t from = current().Answer.size();  // 1-based position = answer length
    return from >= 1 && from <= l.size() && l.substr(from - 1) == "A";
}

}  // namespace zx917
