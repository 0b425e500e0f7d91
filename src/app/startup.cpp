#include "app/startup.h"

#include <unistd.h>

#include <filesystem>
#include <system_error>

#include "app/identity.h"

namespace zx917 {

namespace fs = std::filesystem;

std::string CreateHexFolder(const std::string& programFolder, const std::string& userDataFolder) {
    const std::string beside = JoinPath(programFolder, kHexFolderName);
    std::error_code ec;
    if (fs::symlink_status(beside, ec).type() != fs::file_type::not_found) return beside;
    if (::access(programFolder.c_str(), W_OK | X_OK) == 0 && fs::create_directory(beside, ec))
        return beside;
    if (!userDataFolder.empty()) {
        const std::string own = JoinPath(userDataFolder, kHexFolderName);
        fs::create_directories(own, ec);
        if (fs::is_directory(own, ec)) return own;
    }
    return beside;
}

}  // namespace zx917
