// The previous-instance test: a lock held for the life of the process. The kernel lets go of it
// when the process ends, however it ends, so a crashed copy never blocks the next start.
#pragma once

#include <string>

namespace zx917::ui {

class InstanceLock {
public:
    // The lock file of this user: $XDG_RUNTIME_DIR/ZX917A.lock, else in the temporary folder.
    static std::string DefaultPath();

    explicit InstanceLock(std::string path = DefaultPath()) : path_(std::move(path)) {}
    InstanceLock(const InstanceLock&) = delete;
    InstanceLock& operator=(const InstanceLock&) = delete;
    ~InstanceLock();

    // False when another running copy holds the lock.
    bool acquire();

private:
    std::string path_;
    int fd_ = -1;
};

}  // namespace zx917::ui
