// Start-up on disk: the download folder beside the program.
#pragma once

#include <string>

namespace zx917 {

// Creates programFolder/HEX when nothing of that name exists; a folder or a plain file of that
// name is left alone, and a folder that cannot be created lets start-up go on.
void CreateHexFolder(const std::string& programFolder);

}  // namespace zx917
