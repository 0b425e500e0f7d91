#include "app/startup.h"

#include <filesystem>
#include <system_error>

#include "app/identity.h"

namespace zx917 {

void CreateHexFolder(const std::string& programFolder) {
    const std::filesystem::path path = JoinPath(programFolder, kHexFolderName);
    std::error_code ec;
    if (std::filesystem::symlink_status(path, ec).type() != std::filesystem::file_type::not_found)
        return;
    // A read-only program folder: the chooser's recovery meets the missing folder later.
    std::filesystem::create_directory(path, ec);
}

}  // namespace zx917
