// The drives of the chooser on Linux: the mounted volumes a user keeps files on.
#pragma once

#include <QString>
#include <optional>
#include <string>
#include <vector>

namespace zx917::ui {

struct Volume {
    std::string root;  // mount point, e.g. "/" or "/media/usb0"
    QString shown;     // the mount point, with the volume's name when it has one
};

// Mounted volumes without the system's pseudo file systems, by mount point.
std::vector<Volume> MountedVolumes();

// The mount point of the volume that holds an existing path; nothing when it does not exist.
std::optional<std::string> VolumeOf(const std::string& path);

// True for file systems that hold no user files (proc, sysfs, cgroup, ...).
bool IsPseudoFileSystem(const std::string& type, const std::string& root);

}  // namespace zx917::ui
