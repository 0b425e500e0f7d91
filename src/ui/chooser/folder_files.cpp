#include "ui/chooser/folder_files.h"

#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <system_error>

#include "app/identity.h"
#include "firmware/file_choice.h"
#include "ui/common/qt_text.h"

namespace zx917::ui {

namespace fs = std::filesystem;

namespace {

std::optional<std::vector<FolderEntry>> list(const std::string& folder, bool folders) {
    std::error_code ec;
    fs::directory_iterator it(folder, ec);
    if (ec) return std::nullopt;
    std::vector<FolderEntry> out;
    for (const fs::directory_entry& e : it) {
        const std::string name = e.path().filename().string();
        if (name.empty() || name[0] == '.') continue;
        std::error_code sec;
        const bool isFolder = e.is_directory(sec);
        const bool isFile = !isFolder && e.is_regular_file(sec);
        if (folders ? !isFolder : !isFile) continue;
        out.push_back({name, FromFileName(name)});
    }
    return out;
}

}  // namespace

std::optional<std::vector<std::string>> PlainFiles(const std::string& folder) {
    const auto entries = list(folder, false);
    if (!entries) return std::nullopt;
    std::vector<std::string> names;
    for (const FolderEntry& e : *entries) names.push_back(e.name);
    return names;
}

std::optional<std::vector<FolderEntry>> Subfolders(const std::string& folder) {
    auto out = list(folder, true);
    if (out) {
        std::sort(out->begin(), out->end(), [](const FolderEntry& a, const FolderEntry& b) {
            return QString::compare(a.shown, b.shown, Qt::CaseInsensitive) < 0;
        });
    }
    return out;
}

std::string ResolveFileName(const std::string& folder, const QString& shownName) {
    const std::string exact = ToFileName(shownName);
    std::error_code ec;
    if (fs::is_regular_file(JoinPath(folder, exact), ec)) return exact;
    if (const auto files = PlainFiles(folder)) {
        if (auto same = SameNameRegardlessOfCase(*files, shownName.toStdString())) return *same;
    }
    return exact;
}

bool IsFolder(const std::string& path) {
    std::error_code ec;
    return !path.empty() && fs::is_directory(path, ec);
}

bool IsReadableFolder(const std::string& path) {
    std::error_code ec;
    return !path.empty() && fs::is_directory(path, ec) && ::access(path.c_str(), R_OK | X_OK) == 0;
}

}  // namespace zx917::ui
