// Start-up on disk: the download folder, beside the program where it can be, else in the
// user's own data folder.
#pragma once

#include <string>

namespace zx917 {

// The "HEX" folder beside the program when something of that name is there already (a folder,
// or a plain file the chooser meets later) or when it can be created there. An installed
// program's folder belongs to root: then userDataFolder + "/HEX", created with its parents.
// Returns the folder chosen; the one beside the program when none could be created anywhere,
// so that start-up goes on and the chooser recovers.
std::string CreateHexFolder(const std::string& programFolder, const std::string& userDataFolder);

}  // namespace zx917
