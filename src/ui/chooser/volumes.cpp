#include "ui/chooser/volumes.h"

#include <QStorageInfo>
#include <algorithm>
#include <array>
#include <filesystem>
#include <string_view>

#include "ui/common/qt_text.h"

namespace zx917::ui {

bool IsPseudoFileSystem(const std::string& type, const std::string& root) {
    static constexpr std::array<std::string_view, 24> kPseudo = {
        "proc",       "sysfs",      "devpts",    "devtmpfs",    "cgroup",          "cgroup2",
        "securityfs", "debugfs",    "tracefs",   "mqueue",      "pstore",          "bpf",
        "configfs",   "fusectl",    "hugetlbfs", "autofs",      "binfmt_misc",     "efivarfs",
        "nsfs",       "rpc_pipefs", "squashfs",  "fuse.portal", "fuse.gvfsd-fuse", "ramfs"};
    if (std::find(kPseudo.begin(), kPseudo.end(), type) != kPseudo.end()) return true;
    // The system's own folders; removable media under /run/media stay.
    for (std::string_view prefix : {"/proc", "/sys", "/dev", "/run", "/snap", "/boot/efi"}) {
        if (root == prefix || (root.starts_with(prefix) && root[prefix.size()] == '/')) {
            return !root.starts_with("/run/media/");
        }
    }
    return false;
}

std::vector<Volume> MountedVolumes() {
    std::vector<Volume> out;
    for (const QStorageInfo& v : QStorageInfo::mountedVolumes()) {
        if (!v.isValid() || !v.isReady()) continue;
        const std::string root = ToFileName(v.rootPath());
        if (IsPseudoFileSystem(v.fileSystemType().toStdString(), root)) continue;
        if (std::any_of(out.begin(), out.end(), [&](const Volume& o) { return o.root == root; }))
            continue;
        QString shown = v.rootPath();
        if (!v.name().isEmpty() && v.name() != v.rootPath()) shown += " [" + v.name() + "]";
        out.push_back({root, shown});
    }
    std::sort(out.begin(), out.end(),
              [](const Volume& a, const Volume& b) { return a.root < b.root; });
    return out;
}

std::optional<std::string> VolumeOf(const std::string& path) {
    std::error_code ec;
    if (path.empty() || !std::filesystem::exists(path, ec)) return std::nullopt;
    const QStorageInfo v(FromFileName(path));
    if (!v.isValid()) return std::nullopt;
    return ToFileName(v.rootPath());
}

}  // namespace zx917::ui
