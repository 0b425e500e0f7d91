// The service record: every download attempt as a row of a local SQLite file, written when the
// attempt starts (as "interrupted") and brought up to date when it ends, so that a crash or a
// power cut leaves evidence. A record that cannot be written never changes a download: each
// problem is said once through the warning and the download goes on.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

struct sqlite3;

namespace zx917 {

inline constexpr int kHistorySchemaVersion = 1;

// The outcomes an attempt can have.
inline constexpr const char* kOutcomeSuccess = "success";
inline constexpr const char* kOutcomeFailed = "failed";
inline constexpr const char* kOutcomeAborted = "aborted by instrument";
inline constexpr const char* kOutcomePortLost = "port lost";
inline constexpr const char* kOutcomeCancelled = "cancelled";
inline constexpr const char* kOutcomeInterrupted = "interrupted";

// One download attempt. Texts are kept byte for byte as they came: the identity as the
// instrument sent it (single-byte text), names and paths as the file system holds them.
struct Attempt {
    int64_t id = 0;
    std::string started;  // UTC, ISO 8601 ("2026-12-06T21:54:03Z")
    std::string ended;    // empty while the attempt runs or when it never ended
    int64_t durationMs = 0;
    std::string frontEnd;  // "wizard" or "command line"
    std::string programVersion, user, host;
    std::string port;          // the device path
    std::string lineSettings;  // "9600,n,8,1", handshaking and terminator as the engineer set them
    std::string identity;      // the answer to "*IDN?", empty when none came
    std::string revisionBefore, revisionAnnounced, revisionConfirmed;
    std::string fileName, filePath;
    int64_t fileSize = 0;
    std::string fileSha256;
    std::string outcome = kOutcomeInterrupted;
    int64_t recordsSent = 0, resends = 0, restarts = 0;
    std::string traceFile;
};

struct HistoryFilter {
    std::optional<int> limit = 20;  // newest first; nothing: all
    std::string instrument;         // a part of the identity; empty: any
    std::string since;              // attempts started on or after this UTC date or time
};

// $ZX917_HISTORY, else $XDG_DATA_HOME/zx917/history.sqlite, else
// ~/.local/share/zx917/history.sqlite.
std::string DefaultHistoryPath();

class ServiceRecord {
public:
    using Warn = std::function<void(const std::string&)>;

    // Nothing is opened before the first attempt starts.
    ServiceRecord(std::string path, Warn warn);
    ~ServiceRecord();
    ServiceRecord(const ServiceRecord&) = delete;
    ServiceRecord& operator=(const ServiceRecord&) = delete;

    // Writes a new attempt as "interrupted"; its id, or 0 when it could not be written.
    int64_t start(const Attempt& attempt);
    // Brings an attempt's row up to date.
    void update(const Attempt& attempt);

    // The attempts the filter lets through, newest first; nothing, with the reason in error,
    // when the file cannot be read. A file that is not there holds no attempts.
    static std::optional<std::vector<Attempt>> Read(const std::string& path,
                                                    const HistoryFilter& filter,
                                                    std::string& error);

private:
    bool open();
    void problem(const std::string& what);

    std::string path_;
    Warn warn_;
    sqlite3* db_ = nullptr;
    bool failed_ = false;  // said once; nothing more is tried
};

}  // namespace zx917
