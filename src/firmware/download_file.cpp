#include "firmware/download_file.h"

#include <limits>
#include <string_view>

#include "firmware/revision.h"
#include "link/wildcard.h"

namespace zx917 {

namespace {

bool failRead(const FileCheckParts& p) {
    p.file.close();
    p.dialogs.beep();
    p.dialogs.critical(p.texts.MessageTable[kMsgCouldNotRead]);
    return false;
}

bool failNotDownload(const FileCheckParts& p) {
    p.file.close();
    p.dialogs.beep();
    p.dialogs.critical(p.texts.MessageTable[kMsgNotDownloadFile]);
    return false;
}

}  // namespace

std::optional<bool> CheckFileHeader(const FileCheckParts& p) {
    const int64_t length = p.file.length();
    p.app.DownloadFileLength = static_cast<int32_t>(length);
    if (length < kMinDownloadFileLength) return false;
    std::string field;
    if (!p.file.readField(field) || !p.file.readField(field)) return std::nullopt;
    if (!field.starts_with(SectionTable[0].tag)) return false;
    for (std::size_t i = 1; i < SectionTable.size(); ++i) {
        if (!p.file.readField(field)) return std::nullopt;
        if (!field.starts_with(SectionTable[i].tag)) return false;
    }
    if (!p.file.seek(1)) return std::nullopt;
    return true;
}

bool CheckDownloadFile(const FileCheckParts& p, const std::string& path, int16_t ask) {
    // An exact path test: wildcard characters in the path are plain characters.
    if (!p.file.open(path)) return failRead(p);
    // Positions and counts are 32-bit: a larger file is no download file we can read.
    if (p.file.length() > std::numeric_limits<int32_t>::max()) return failRead(p);

    const std::optional<bool> header = CheckFileHeader(p);
    if (!header) return failRead(p);
    if (!*header) return failNotDownload(p);

    std::string field;
    if (!p.file.readField(field)) return failRead(p);
    p.app.NewRevision = std::string_view(field).substr(0, 7);

    std::string line;
    if (!p.file.seek(p.file.length() - 5) || !p.file.readLine(line)) return failRead(p);
    if (!WildcardMatch(line, kEndMarkerPattern)) return failNotDownload(p);
    p.file.close();

    if (ask == 1 && NeedsHardwareChange(p.app.CurrentRevision, p.app.NewRevision)) {
        p.dialogs.beep();
        return p.dialogs.question(p.texts.MessageTable[kMsgHardwareChange]);
    }
    return true;
}

}  // namespace zx917
