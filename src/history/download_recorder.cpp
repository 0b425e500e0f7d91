#include "history/download_recorder.h"

#include <pwd.h>
#include <unistd.h>

#include <ctime>
#include <filesystem>

#include "app/identity.h"
#include "history/sha256.h"

namespace zx917 {

namespace {

std::string utcNow() {
    const std::time_t now = std::time(nullptr);
    std::tm t{};
    gmtime_r(&now, &t);
    char text[32];
    std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%SZ", &t);
    return text;
}

std::string userName() {
    if (const passwd* pw = ::getpwuid(::geteuid()); pw != nullptr && pw->pw_name)
        return pw->pw_name;
    const char* user = std::getenv("USER");
    return user ? user : "";
}

std::string hostName() {
    char name[256] = {};
    return ::gethostname(name, sizeof name - 1) == 0 ? name : "";
}

// A revision field as shown: without the padding of its fixed width.
std::string revision(const Rev7& r) {
    std::string s = r.str();
    while (!s.empty() && (s.back() == '\0' || s.back() == ' ')) s.pop_back();
    return s;
}

std::string terminatorName(const std::string& t) {
    return t == "\n" ? "LF" : t == "\r" ? "CR" : t == "\r\n" ? "CR+LF" : "?";
}

}  // namespace

std::string OutcomeOf(bool confirmed, const LineLog& line) {
    if (confirmed) return kOutcomeSuccess;
    if (line.portLost) return kOutcomePortLost;
    if (line.abortedByInstrument) return kOutcomeAborted;
    return kOutcomeFailed;
}

DownloadRecorder::DownloadRecorder(RecorderParts parts)
    : p_(std::move(parts)),
      record_(p_.historyPath.empty() ? DefaultHistoryPath() : p_.historyPath, p_.warn) {}

void DownloadRecorder::begin() {
    attempt_ = Attempt{};
    attempt_.started = utcNow();
    attempt_.frontEnd = p_.frontEnd;
    attempt_.programVersion = kVersion;
    attempt_.user = userName();
    attempt_.host = hostName();
    attempt_.traceFile = p_.traceFile;
    // The line's counts and the confirmation are this attempt's own.
    p_.engine.lineLog().confirmedRevision.clear();
    atBegin_ = p_.engine.lineLog();
    hashedPath_.clear();
    began_ = std::chrono::steady_clock::now();
    gather();
    attempt_.id = record_.start(attempt_);
    inProgress_ = true;
}

void DownloadRecorder::gather() {
    const AppState& app = p_.app;
    const LineLog& line = p_.engine.lineLog();
    attempt_.port = p_.portDevice ? p_.portDevice() : "";
    attempt_.lineSettings = app.PortSettings + (app.PortHandshaking == 1 ? " Xon/Xoff" : "") + " " +
                            terminatorName(app.Terminator);
    attempt_.identity = line.identity;
    attempt_.revisionBefore = revision(app.CurrentRevision);
    attempt_.revisionAnnounced = revision(app.NewRevision);
    attempt_.revisionConfirmed = line.confirmedRevision;
    attempt_.recordsSent = line.recordsSent - atBegin_.recordsSent;
    attempt_.resends = line.resends - atBegin_.resends;
    attempt_.restarts = line.restarts - atBegin_.restarts;
    if (!app.FilePath.empty() && app.FilePath != hashedPath_) {
        hashedPath_ = app.FilePath;
        attempt_.filePath = app.FilePath;
        attempt_.fileName = std::filesystem::path(app.FilePath).filename().string();
        std::error_code ec;
        const auto size = std::filesystem::file_size(app.FilePath, ec);
        attempt_.fileSize = ec ? 0 : static_cast<int64_t>(size);
        attempt_.fileSha256 = Sha256OfFile(app.FilePath).value_or("");
    }
}

void DownloadRecorder::update() {
    if (!inProgress_) return;
    gather();
    record_.update(attempt_);
}

void DownloadRecorder::end(const std::string& outcome) {
    if (!inProgress_) return;
    gather();
    attempt_.outcome = outcome;
    attempt_.ended = utcNow();
    attempt_.durationMs = std::chrono::duration_cast<std::chrono::milliseconds>(
                              std::chrono::steady_clock::now() - began_)
                              .count();
    record_.update(attempt_);
    inProgress_ = false;
}

}  // namespace zx917
