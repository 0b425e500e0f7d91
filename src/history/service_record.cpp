#include "history/service_record.h"

#include <sqlite3.h>

#include <cstdlib>
#include <filesystem>
#include <system_error>

namespace zx917 {

namespace {

constexpr int kBusyTimeoutMs = 15000;  // other processes writing their attempts at once

constexpr const char* kColumns =
    "started, ended, duration_ms, front_end, program_version, user, host, port, line_settings, "
    "identity, revision_before, revision_announced, revision_confirmed, file_name, file_path, "
    "file_size, file_sha256, outcome, records_sent, resends, restarts, trace_file";

// The steps from each schema version to the next, by the version they start from.
constexpr const char* kMigrations[kHistorySchemaVersion] = {
    "CREATE TABLE attempts ("
    " id INTEGER PRIMARY KEY,"
    " started TEXT NOT NULL, ended TEXT, duration_ms INTEGER,"
    " front_end TEXT NOT NULL, program_version TEXT NOT NULL, user TEXT, host TEXT,"
    " port TEXT, line_settings TEXT, identity TEXT,"
    " revision_before TEXT, revision_announced TEXT, revision_confirmed TEXT,"
    " file_name TEXT, file_path TEXT, file_size INTEGER, file_sha256 TEXT,"
    " outcome TEXT NOT NULL, records_sent INTEGER, resends INTEGER, restarts INTEGER,"
    " trace_file TEXT);"
    "CREATE INDEX attempts_started ON attempts(started);",
};

// A prepared statement that finalizes itself.
class Statement {
public:
    Statement(sqlite3* db, const std::string& sql) {
        if (sqlite3_prepare_v2(db, sql.c_str(), -1, &s_, nullptr) != SQLITE_OK) s_ = nullptr;
    }
    ~Statement() { sqlite3_finalize(s_); }
    Statement(const Statement&) = delete;
    Statement& operator=(const Statement&) = delete;
    explicit operator bool() const { return s_ != nullptr; }
    sqlite3_stmt* get() const { return s_; }

    // Every text as a bound parameter, byte for byte.
    void bind(int i, const std::string& text) {
        sqlite3_bind_text(s_, i, text.data(), static_cast<int>(text.size()), SQLITE_TRANSIENT);
    }
    void bind(int i, int64_t value) { sqlite3_bind_int64(s_, i, value); }
    std::string text(int column) const {
        const auto* p = reinterpret_cast<const char*>(sqlite3_column_text(s_, column));
        return p ? std::string(p, static_cast<std::size_t>(sqlite3_column_bytes(s_, column)))
                 : std::string();
    }
    int64_t integer(int column) const { return sqlite3_column_int64(s_, column); }

private:
    sqlite3_stmt* s_ = nullptr;
};

// Binds an attempt's fields to parameters 1 to 22, in the order of kColumns.
void bindAttempt(Statement& s, const Attempt& a) {
    int i = 1;
    s.bind(i++, a.started);
    if (a.ended.empty()) {
        sqlite3_bind_null(s.get(), i++);
        sqlite3_bind_null(s.get(), i++);
    } else {
        s.bind(i++, a.ended);
        s.bind(i++, a.durationMs);
    }
    for (const std::string* t :
         {&a.frontEnd, &a.programVersion, &a.user, &a.host, &a.port, &a.lineSettings, &a.identity,
          &a.revisionBefore, &a.revisionAnnounced, &a.revisionConfirmed, &a.fileName, &a.filePath})
        s.bind(i++, *t);
    s.bind(i++, a.fileSize);
    s.bind(i++, a.fileSha256);
    s.bind(i++, a.outcome);
    s.bind(i++, a.recordsSent);
    s.bind(i++, a.resends);
    s.bind(i++, a.restarts);
    s.bind(i++, a.traceFile);
}

Attempt attemptOf(const Statement& s) {
    Attempt a;
    int c = 0;
    a.id = s.integer(c++);
    a.started = s.text(c++);
    a.ended = s.text(c++);
    a.durationMs = s.integer(c++);
    for (std::string* t :
         {&a.frontEnd, &a.programVersion, &a.user, &a.host, &a.port, &a.lineSettings, &a.identity,
          &a.revisionBefore, &a.revisionAnnounced, &a.revisionConfirmed, &a.fileName, &a.filePath})
        *t = s.text(c++);
    a.fileSize = s.integer(c++);
    a.fileSha256 = s.text(c++);
    a.outcome = s.text(c++);
    a.recordsSent = s.integer(c++);
    a.resends = s.integer(c++);
    a.restarts = s.integer(c++);
    a.traceFile = s.text(c++);
    return a;
}

int userVersion(sqlite3* db) {
    Statement s(db, "PRAGMA user_version");
    return s && sqlite3_step(s.get()) == SQLITE_ROW ? static_cast<int>(s.integer(0)) : -1;
}

std::string reason(sqlite3* db) {
    return db ? sqlite3_errmsg(db) : "out of memory";
}

}  // namespace

std::string DefaultHistoryPath() {
    if (const char* p = std::getenv("ZX917_HISTORY"); p != nullptr && *p) return p;
    std::string data;
    if (const char* x = std::getenv("XDG_DATA_HOME"); x != nullptr && *x == '/') {
        data = x;
    } else if (const char* home = std::getenv("HOME"); home != nullptr && *home) {
        data = std::string(home) + "/.local/share";
    } else {
        return {};
    }
    return data + "/zx917/history.sqlite";
}

ServiceRecord::ServiceRecord(std::string path, Warn warn)
    : path_(std::move(path)), warn_(std::move(warn)) {}

ServiceRecord::~ServiceRecord() {
    sqlite3_close(db_);
}

void ServiceRecord::problem(const std::string& what) {
    if (failed_) return;
    failed_ = true;
    if (warn_) warn_("service record " + path_ + ": " + what + "; this download is not recorded");
}

bool ServiceRecord::open() {
    if (db_ != nullptr) return true;
    if (failed_) return false;
    if (path_.empty()) {
        problem("no place for it (neither ZX917_HISTORY, XDG_DATA_HOME nor HOME is set)");
        return false;
    }
    std::error_code ec;
    const auto folder = std::filesystem::path(path_).parent_path();
    if (!folder.empty()) std::filesystem::create_directories(folder, ec);
    if (sqlite3_open_v2(path_.c_str(), &db_, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE, nullptr) !=
        SQLITE_OK) {
        problem("cannot be opened (" + reason(db_) + ")");
        sqlite3_close(db_);
        db_ = nullptr;
        return false;
    }
    sqlite3_busy_timeout(db_, kBusyTimeoutMs);
    const int version = userVersion(db_);
    if (version < 0) {
        problem("cannot be read (" + reason(db_) + ")");
    } else if (version > kHistorySchemaVersion) {
        problem("was written by a newer version of the program; it is read, never written");
    } else if (version < kHistorySchemaVersion) {
        // The first writer makes the schema; the others wait for it and find it made.
        bool ok = sqlite3_exec(db_, "BEGIN IMMEDIATE", nullptr, nullptr, nullptr) == SQLITE_OK;
        for (int v = ok ? userVersion(db_) : kHistorySchemaVersion; ok && v < kHistorySchemaVersion;
             ++v) {
            ok =
                v >= 0 && sqlite3_exec(db_, kMigrations[v], nullptr, nullptr, nullptr) == SQLITE_OK;
        }
        const std::string done = "PRAGMA user_version = " + std::to_string(kHistorySchemaVersion);
        ok = ok && sqlite3_exec(db_, done.c_str(), nullptr, nullptr, nullptr) == SQLITE_OK &&
             sqlite3_exec(db_, "COMMIT", nullptr, nullptr, nullptr) == SQLITE_OK;
        if (!ok) {
            problem("cannot be set up (" + reason(db_) + ")");
            sqlite3_exec(db_, "ROLLBACK", nullptr, nullptr, nullptr);
        }
    }
    if (failed_) {
        sqlite3_close(db_);
        db_ = nullptr;
        return false;
    }
    // Several programs append at once; each keeps its writes short.
    sqlite3_exec(db_, "PRAGMA journal_mode = WAL", nullptr, nullptr, nullptr);
    return true;
}

int64_t ServiceRecord::start(const Attempt& attempt) {
    if (!open()) return 0;
    const std::string marks = "?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?,?";
    Statement s(db_, std::string("INSERT INTO attempts (") + kColumns + ") VALUES (" + marks + ")");
    if (!s) {
        problem("cannot be written (" + reason(db_) + ")");
        return 0;
    }
    bindAttempt(s, attempt);
    if (sqlite3_step(s.get()) != SQLITE_DONE) {
        problem("cannot be written (" + reason(db_) + ")");
        return 0;
    }
    return sqlite3_last_insert_rowid(db_);
}

void ServiceRecord::update(const Attempt& attempt) {
    if (attempt.id == 0 || !open()) return;
    std::string sql = "UPDATE attempts SET ";
    const std::string columns = kColumns;
    std::size_t from = 0;
    for (int i = 1;; ++i) {
        const std::size_t comma = columns.find(", ", from);
        sql += columns.substr(from, comma - from) + " = ?" + std::to_string(i);
        if (comma == std::string::npos) break;
        sql += ", ";
        from = comma + 2;
    }
    sql += " WHERE id = ?23";
    Statement s(db_, sql);
    if (!s) {
        problem("cannot be written (" + reason(db_) + ")");
        return;
    }
    bindAttempt(s, attempt);
    s.bind(23, attempt.id);
    if (sqlite3_step(s.get()) != SQLITE_DONE) problem("cannot be written (" + reason(db_) + ")");
}

std::optional<std::vector<Attempt>> ServiceRecord::Read(const std::string& path,
                                                        const HistoryFilter& filter,
                                                        std::string& error) {
    std::error_code ec;
    if (!std::filesystem::exists(path, ec)) return std::vector<Attempt>{};
    sqlite3* db = nullptr;
    if (sqlite3_open_v2(path.c_str(), &db, SQLITE_OPEN_READONLY, nullptr) != SQLITE_OK) {
        error = path + " cannot be opened: " + reason(db);
        sqlite3_close(db);
        return std::nullopt;
    }
    sqlite3_busy_timeout(db, kBusyTimeoutMs);
    std::optional<std::vector<Attempt>> out;
    const int version = userVersion(db);
    if (version < 0) {
        error = path + " is not a service record: " + reason(db);
    } else if (version == 0) {
        out.emplace();  // made, but no attempt written yet
    } else {
        std::string sql = std::string("SELECT id, ") + kColumns +
                          " FROM attempts WHERE instr(identity, ?1) > 0 AND started >= ?2"
                          " ORDER BY started DESC, id DESC";
        if (filter.limit) sql += " LIMIT " + std::to_string(*filter.limit);
        Statement s(db, sql);
        if (!s) {
            error = path + " cannot be read: " + reason(db);
        } else {
            s.bind(1, filter.instrument);
            s.bind(2, filter.since);
            out.emplace();
            int rc = SQLITE_ROW;
            while ((rc = sqlite3_step(s.get())) == SQLITE_ROW) out->push_back(attemptOf(s));
            if (rc != SQLITE_DONE) {
                error = path + " cannot be read: " + reason(db);
                out.reset();
            }
        }
    }
    sqlite3_close(db);
    return out;
}

}  // namespace zx917
