#include "history/history_report.h"

#include <algorithm>
#include <cstdio>
#include <functional>

#include "firmware/revision.h"

namespace zx917 {

namespace {

// The identity as the instrument sent it: single-byte (Latin-1) text.
std::string latin1(const std::string& bytes) {
    std::u32string text;
    for (const char c : bytes) text.push_back(static_cast<unsigned char>(c));
    return EncodeUtf8(text);
}

// Names and paths: UTF-8 as they are; a byte that is not valid UTF-8 shows as U+FFFD.
std::string utf8(const std::string& bytes) {
    return EncodeUtf8(DecodeUtf8(bytes));
}

std::string revisions(const Attempt& a) {
    return StripFillers(a.revisionBefore) + " -> " + StripFillers(a.revisionAnnounced);
}

struct Field {
    const char* name;
    std::function<std::string(const Attempt&)> text;
    bool number = false;
};

const std::vector<Field>& fields() {
    static const std::vector<Field> kFields = {
        {"id", [](const Attempt& a) { return std::to_string(a.id); }, true},
        {"started", [](const Attempt& a) { return a.started; }},
        {"ended", [](const Attempt& a) { return a.ended; }},
        {"duration_ms",
         [](const Attempt& a) { return a.ended.empty() ? "" : std::to_string(a.durationMs); },
         true},
        {"front_end", [](const Attempt& a) { return a.frontEnd; }},
        {"program_version", [](const Attempt& a) { return a.programVersion; }},
        {"user", [](const Attempt& a) { return utf8(a.user); }},
        {"host", [](const Attempt& a) { return utf8(a.host); }},
        {"port", [](const Attempt& a) { return utf8(a.port); }},
        {"line_settings", [](const Attempt& a) { return a.lineSettings; }},
        {"identity", [](const Attempt& a) { return latin1(a.identity); }},
        {"revision_before", [](const Attempt& a) { return latin1(a.revisionBefore); }},
        {"revision_announced", [](const Attempt& a) { return latin1(a.revisionAnnounced); }},
        {"revision_confirmed", [](const Attempt& a) { return latin1(a.revisionConfirmed); }},
        {"file_name", [](const Attempt& a) { return utf8(a.fileName); }},
        {"file_path", [](const Attempt& a) { return utf8(a.filePath); }},
        {"file_size", [](const Attempt& a) { return std::to_string(a.fileSize); }, true},
        {"file_sha256", [](const Attempt& a) { return a.fileSha256; }},
        {"outcome", [](const Attempt& a) { return a.outcome; }},
        {"records_sent", [](const Attempt& a) { return std::to_string(a.recordsSent); }, true},
        {"resends", [](const Attempt& a) { return std::to_string(a.resends); }, true},
        {"restarts", [](const Attempt& a) { return std::to_string(a.restarts); }, true},
        {"trace_file", [](const Attempt& a) { return utf8(a.traceFile); }},
    };
    return kFields;
}

std::size_t width(const std::string& utf8Text) {
    return DecodeUtf8(utf8Text).size();
}

std::string csvField(const std::string& text) {
    if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
    std::string out = "\"";
    for (const char c : text) {
        if (c == '"') out += '"';
        out += c;
    }
    return out + '"';
}

std::string jsonString(const std::string& text) {
    std::string out = "\"";
    for (const char c : text) {
        const auto u = static_cast<unsigned char>(c);
        if (c == '"' || c == '\\') {
            out += '\\';
            out += c;
        } else if (u < 0x20 || u == 0x7F) {
            char escaped[8];
            std::snprintf(escaped, sizeof escaped, "\\u%04x", u);
            out += escaped;
        } else {
            out += c;
        }
    }
    return out + '"';
}

}  // namespace

std::string HistoryTable(const std::vector<Attempt>& attempts) {
    const std::vector<std::pair<const char*, std::function<std::string(const Attempt&)>>> columns =
        {{"STARTED (UTC)", [](const Attempt& a) { return a.started; }},
         {"FRONT END", [](const Attempt& a) { return a.frontEnd; }},
         {"OUTCOME", [](const Attempt& a) { return a.outcome; }},
         {"INSTRUMENT", [](const Attempt& a) { return latin1(a.identity); }},
         {"REVISION", [](const Attempt& a) { return latin1(revisions(a)); }},
         {"FILE", [](const Attempt& a) { return utf8(a.fileName); }},
         {"SHA-256", [](const Attempt& a) { return a.fileSha256; }}};
    std::vector<std::vector<std::string>> rows(1);
    for (const auto& [name, text] : columns) rows[0].push_back(name);
    for (const Attempt& a : attempts) {
        rows.emplace_back();
        for (const auto& [name, text] : columns) rows.back().push_back(text(a));
    }
    std::vector<std::size_t> widths(columns.size(), 0);
    for (const auto& row : rows) {
        for (std::size_t c = 0; c < row.size(); ++c) widths[c] = std::max(widths[c], width(row[c]));
    }
    std::string out;
    for (const auto& row : rows) {
        std::string line;
        for (std::size_t c = 0; c < row.size(); ++c) {
            line += row[c];
            if (c + 1 < row.size()) line += std::string(widths[c] - width(row[c]) + 2, ' ');
        }
        out += line + "\n";
    }
    return out;
}

std::string HistoryCsv(const std::vector<Attempt>& attempts) {
    std::string out;
    for (std::size_t i = 0; i < fields().size(); ++i)
        out += std::string(i ? "," : "") + fields()[i].name;
    out += "\r\n";
    for (const Attempt& a : attempts) {
        for (std::size_t i = 0; i < fields().size(); ++i)
            out += std::string(i ? "," : "") + csvField(fields()[i].text(a));
        out += "\r\n";
    }
    return out;
}

std::string HistoryJson(const std::vector<Attempt>& attempts) {
    std::string out = "[";
    for (std::size_t r = 0; r < attempts.size(); ++r) {
        out += r ? ",\n  {" : "\n  {";
        for (std::size_t i = 0; i < fields().size(); ++i) {
            const Field& f = fields()[i];
            const std::string value = f.text(attempts[r]);
            out += std::string(i ? ", " : "") + jsonString(f.name) + ": ";
            const std::string name = f.name;
            if ((name == "ended" || name == "duration_ms") && attempts[r].ended.empty()) {
                out += "null";
            } else {
                out += f.number ? value : jsonString(value);
            }
        }
        out += "}";
    }
    return out + (attempts.empty() ? "]\n" : "\n]\n");
}

}  // namespace zx917
