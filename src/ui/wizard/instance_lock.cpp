#include "ui/wizard/instance_lock.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>

#include "app/identity.h"

namespace zx917::ui {

std::string InstanceLock::DefaultPath() {
    const std::string name = std::string(kExeBaseName) + ".lock";
    if (const char* runtime = std::getenv("XDG_RUNTIME_DIR"); runtime != nullptr && *runtime) {
        struct stat st {};
        if (::stat(runtime, &st) == 0 && S_ISDIR(st.st_mode)) return JoinPath(runtime, name);
    }
    const char* tmp = std::getenv("TMPDIR");
    return JoinPath(tmp != nullptr && *tmp ? tmp : "/tmp",
                    std::string(kExeBaseName) + "-" + std::to_string(::getuid()) + ".lock");
}

InstanceLock::~InstanceLock() {
    if (fd_ >= 0) ::close(fd_);
}

bool InstanceLock::acquire() {
    if (fd_ >= 0) return true;
    fd_ = ::open(path_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    // No place for a lock file: better a second copy than no program at all.
    if (fd_ < 0) return true;
    if (::flock(fd_, LOCK_EX | LOCK_NB) == 0) return true;
    ::close(fd_);
    fd_ = -1;
    return false;
}

}  // namespace zx917::ui
