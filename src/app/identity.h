// The program's names: title, version, executable base name and the files beside it.
#pragma once

#include <string>

namespace zx917 {

inline constexpr const char* kAppTitle = "Quorvex ZX917 Download Program";
inline constexpr const char* kWindowTitle = "Quorvex ZX917 Download Program Ver.02.01";
inline constexpr const char* kVersion = ZX917_VERSION;  // the project's version
inline constexpr const char* kVersionText = "2.01";
inline constexpr const char* kExeBaseName = "ZX917A";
inline constexpr const char* kHexFolderName = "HEX";
inline constexpr const char* kHelpFileSuffix = ".HLP";
inline constexpr const char* kClipFileName = "Filemove.avi";
// One application id for the desktop entry, the AppStream component and the icon.
inline constexpr const char* kAppId = "com.quorvex.zx917a";

// The folder that holds the running executable (no trailing separator but at the root).
std::string ProgramFolder();

// Joins a folder and a name with one separator; a folder that is a root keeps its own.
inline std::string JoinPath(const std::string& folder, const std::string& name) {
    if (folder.empty()) return name;
    if (folder.back() == '/') return folder + name;
    return folder + "/" + name;
}

}  // namespace zx917
