#include "instrument/instrument.h"

#include <algorithm>
#include <cstdio>
#include <sstream>

namespace zx917 {

namespace {

const LineSettings kDownloadLine{38400, 'e', 8, "1"};

bool isLastRecord(const std::vector<uint8_t>& r) {
    if (r.size() >= 5 && r[0] == 0x3A && r[1] == 0 && r[2] == 0 && r[3] == 0 && r[4] == 1)
        return true;
    return r.size() >= 2 && r[0] == 0x53 && (r[1] == 7 || r[1] == 8);
}

std::string jsonString(const std::string& s) {
    std::string out = "\"";
    for (const char ch : s) {
        const auto c = static_cast<unsigned char>(ch);
        if (c == '"' || c == '\\') {
            out += '\\';
            out += ch;
        } else if (c < 0x20 || c >= 0x7F) {
            char buf[8];
            std::snprintf(buf, sizeof buf, "\\u%04x", c);
            out += buf;
        } else {
            out += ch;
        }
    }
    return out + "\"";
}

}  // namespace

bool ParseFault(const std::string& text, Fault& f) {
    std::vector<std::string> parts;
    std::stringstream ss(text);
    for (std::string p; std::getline(ss, p, ':');) parts.push_back(p);
    // "SYSTem:ERRor?" and "MAINTENANCE:DOWNLOAD" hold a colon themselves.
    if (parts.size() >= 3 && (parts[1] == "SYSTem" || parts[1] == "MAINTENANCE")) {
        parts[1] += ":" + parts[2];
        parts.erase(parts.begin() + 2);
    }
    if (parts.size() < 2 || parts.size() > 4 || parts[1].empty()) return false;
    static const std::map<std::string, FaultAction> kActions = {
        {"silent", FaultAction::Silent},  {"abort", FaultAction::Abort},
        {"garble", FaultAction::Garble},  {"refuse", FaultAction::Refuse},
        {"dsr", FaultAction::Dsr},        {"hangup", FaultAction::Hangup},
        {"restart", FaultAction::Restart}};
    const auto it = kActions.find(parts[0]);
    if (it == kActions.end()) return false;
    f = Fault{};
    f.action = it->second;
    f.command = parts[1];
    try {
        if (parts.size() > 2) f.from = std::stoi(parts[2]);
        if (parts.size() > 3) f.times = std::stoi(parts[3]);
    } catch (...) {
        return false;
    }
    if (f.action == FaultAction::Restart && parts.size() < 4) f.times = 1;
    return f.from >= 1 && f.times >= 0;
}

Instrument::Instrument(InstrumentOptions options)
    : opt_(std::move(options)), line_(opt_.userLine), revision_(opt_.revision) {
    revision_.resize(7, ' ');
}

std::vector<Emission> Instrument::takeEmissions() {
    std::vector<Emission> out;
    out.swap(out_);
    return out;
}

void Instrument::receive(std::span<const uint8_t> bytes, bool lineOk, const std::string& settings,
                         int64_t now) {
    if (dead_) return;
    if (restartAt_ >= 0 && now >= restartAt_) {
        line_ = opt_.userLine;  // restarted: back on its own settings
        restartAt_ = -1;
    }
    lastSettings_ = settings;
    if (!lineOk) {
        text_.clear();  // garbled on the line
        return;
    }
    if (inWindow_) window_.bytesIn += static_cast<int64_t>(bytes.size());
    for (const uint8_t b : bytes) {
        if (awaitingEcho_) {
            // The echo is terminator, request, terminator; records follow right after it.
            echo_.push_back(static_cast<char>(b));
            const std::string want = "RESTART:" + area_ + opt_.terminator;
            if (echo_.ends_with(want)) {
                awaitingEcho_ = false;
                echo_.clear();
                areaRecord_ = 0;
                areas_[area_].clear();
                log_.push_back({"RESTART:" + area_, lastSettings_, now});
            }
        } else if (!area_.empty()) {
            handleRecordBytes(b, now);
        } else if (b == '\r' || b == '\n') {
            if (!text_.empty()) handleLine(text_, now);
            text_.clear();
        } else if (b >= ' ') {
            text_.push_back(static_cast<char>(b));
        }
        if (dead_) return;
    }
}

void Instrument::answer(const std::string& text, int64_t now, int delayMs) {
    const int delay = delayMs < 0 ? opt_.answerDelayMs : delayMs;
    const int64_t at = std::max(now + delay, busyUntil_);
    busyUntil_ = at;
    std::string s;
    if (opt_.noise) s += "\x01# status 0\t\x02\r\n\x07";
    s += text + "\r\n";
    if (inWindow_) {
        window_.bytesOut += static_cast<int64_t>(s.size());
        window_.delaysMs += delay;
    }
    out_.push_back({Emission::Data, at, std::vector<uint8_t>(s.begin(), s.end())});
}

Fault* Instrument::faultFor(const std::string& command, int occurrence) {
    for (Fault& f : opt_.faults) {
        if (f.action == FaultAction::Restart || f.command != command) continue;
        if (occurrence >= f.from && (f.times == 0 || f.fired < f.times)) return &f;
    }
    return nullptr;
}

// Applies a fault in place of the answer; false when the answer is to go out as usual.
bool Instrument::applyFault(Fault* f, int64_t now) {
    if (f == nullptr) return false;
    ++f->fired;
    switch (f->action) {
        case FaultAction::Silent:
            return true;
        case FaultAction::Abort:
            answer("ABORT", now);
            return true;
        case FaultAction::Dsr:
            out_.push_back({Emission::DsrRise, std::max(now + opt_.answerDelayMs, busyUntil_), {}});
            return true;
        case FaultAction::Hangup:
            out_.push_back({Emission::Hangup, now, {}});
            dead_ = true;
            return true;
        default:
            return false;  // Garble and Refuse change the answer text instead
    }
}

std::string Instrument::identity() const {
    std::string id = opt_.identity;
    id.resize(39, '-');
    return id + revision_;
}

std::string Instrument::revAnswer(const std::string& revision) const {
    std::string rev = revision;
    rev.resize(7, ' ');
    return "REV " + rev + " " + opt_.ampsFlag + "0";
}

void Instrument::handleLine(const std::string& line, int64_t now) {
    const std::string cmd = line.substr(0, line.find(' '));
    const std::string arg = line.size() > cmd.size() + 1 ? line.substr(cmd.size() + 1) : "";
    log_.push_back({line, lastSettings_, now});
    const int occurrence = ++occurrences_[cmd];
    Fault* fault = faultFor(cmd, occurrence);
    if (applyFault(fault, now)) return;
    auto reply = [&](const std::string& text, int delay = -1) {
        std::string t = text;
        if (fault && fault->action == FaultAction::Garble) {
            t = cmd == "SYSTem:ERRor?" ? "-113,\"Undefined header\"" : text + "#";
        }
        answer(t, now, delay);
    };

    if (!downloadMode_) {
        if (opt_.idnOnly && cmd != "*IDN?") return;
        if (cmd == "SYSTem:ERRor?") {
            reply("0,\"No error\"");
        } else if (cmd == "*IDN?") {
            reply(identity());
        } else if (cmd == "MAINTENANCE:DOWNLOAD" && !opt_.noDownloadMode) {
            downloadMode_ = true;
            line_ = kDownloadLine;
            reply("DOWNLOAD READY", std::max(opt_.answerDelayMs, 20));
        }
        return;
    }
    if (cmd == "MAINTENANCE:DOWNLOAD") {
        reply("DOWNLOAD READY");
    } else if (cmd == "REVD") {
        if (arg != "X.XX.XX") {
            announced_ = arg;
            inWindow_ = true;
            window_ = Window{};
            window_.startMs = now;
            window_.bytesIn = static_cast<int64_t>(line.size()) + 2;
        }
        reply(revAnswer(revision_));
    } else if (cmd == "OPEN") {
        opened_ = true;
        reply("OPEN", opt_.openDelayMs);
    } else if (cmd.size() == 3 && cmd[0] == 'S' && cmd[1] == 'P' && cmd[2] >= '1' &&
               cmd[2] <= '4' && opened_) {
        area_ = std::string("P") + cmd[2];
        areaRecord_ = 0;
        areas_[area_].clear();
        reply(cmd);
    } else if (cmd == "CLOSE") {
        if (inWindow_) window_.endMs = now;
        inWindow_ = false;
        reply("CLOSE");
    } else if (cmd == "REVC") {
        revcOk_ = !announced_.empty() && arg == announced_;
        reply(revAnswer(opt_.wrongRevc ? "Z.99.99" : announced_));
        if (opt_.readyAfterRevcMs >= 0) {
            out_.push_back({Emission::Data, busyUntil_ + opt_.readyAfterRevcMs, {'\r', '\n'}});
        }
    } else if (cmd == "REBOOT") {
        reply("REBOOT");
        confirmed_ = revcOk_ && !opt_.wrongRevc;
        if (confirmed_) revision_ = announced_;
        rebooted_ = true;
        downloadMode_ = false;
        opened_ = false;
        restartAt_ = busyUntil_ + 50;  // the answer still goes out at the download speed
        out_.push_back({Emission::DsrRise, restartAt_, {}});
    }
}

void Instrument::handleRecordBytes(uint8_t b, int64_t now) {
    rec_.push_back(b);
    if (rec_.size() < 2) return;
    const std::size_t n = rec_[0] * 256u + rec_[1];
    if (n == 0) {
        rec_.clear();
        log_.push_back({"EP", lastSettings_, now});
        const std::string area = area_;
        Fault* fault = faultFor("EP", ++occurrences_["EP"]);
        if (applyFault(fault, now)) return;
        area_.clear();
        const bool refuse = fault && fault->action == FaultAction::Refuse;
        answer("E" + area + (refuse ? "N" : ""), now);
        return;
    }
    if (rec_.size() == n + 2) handleRecord(now);
}

void Instrument::handleRecord(int64_t now) {
    std::vector<uint8_t> record(rec_.begin() + 2, rec_.end());
    rec_.clear();
    const bool last = isLastRecord(record);
    const std::string cmd = last ? "DLE" : "DL";
    log_.push_back({cmd + " " + std::to_string(record.size()), lastSettings_, now});
    ++areaRecord_;
    for (Fault& f : opt_.faults) {
        if (f.action == FaultAction::Restart && f.command == area_ && areaRecord_ == f.from &&
            (f.times == 0 || f.fired < f.times)) {
            ++f.fired;
            ++restartsSent_;
            awaitingEcho_ = true;
            answer("RESTART:" + area_, now);
            return;
        }
    }
    const int dlOccurrence = ++occurrences_["DL"];
    Fault* fault = last ? faultFor("DLE", ++occurrences_["DLE"]) : nullptr;
    if (fault == nullptr) fault = faultFor("DL", dlOccurrence);
    if (applyFault(fault, now)) return;
    areas_[area_].push_back(std::move(record));
    const std::string ack =
        area_ + "A" + (fault && fault->action == FaultAction::Garble ? "#" : "");
    answer(ack, now, last ? opt_.programDelayMs : -1);
}

std::string Instrument::reportJson() const {
    std::ostringstream o;
    o << "{\n  \"commands\": [";
    for (std::size_t i = 0; i < log_.size(); ++i) {
        o << (i ? ",\n" : "\n") << "    {\"command\": " << jsonString(log_[i].command)
          << ", \"settings\": " << jsonString(log_[i].settings) << ", \"ms\": " << log_[i].atMs
          << "}";
    }
    o << "\n  ],\n  \"records\": {";
    bool first = true;
    for (const auto& [area, recs] : areas_) {
        o << (first ? "" : ", ") << jsonString(area) << ": " << recs.size();
        first = false;
    }
    o << "},\n  \"restarts\": " << restartsSent_ << ",\n  \"revision\": " << jsonString(revision_)
      << ",\n  \"confirmed\": " << (confirmed_ ? "true" : "false")
      << ",\n  \"transfer\": {\"ms\": " << (window_.endMs - window_.startMs)
      << ", \"bytes_in\": " << window_.bytesIn << ", \"bytes_out\": " << window_.bytesOut
      << ", \"delays_ms\": " << window_.delaysMs << "}\n}\n";
    return o.str();
}

}  // namespace zx917
