// A folder's plain files and folders as the chooser shows them: names in upper case for the
// eye, the real names (the file system's bytes) for opening.
#pragma once

#include <QString>
#include <optional>
#include <string>
#include <vector>

namespace zx917::ui {

struct FolderEntry {
    std::string name;  // the real name, as the file system holds it
    QString shown;     // decoded for the screen (names that are not valid text still show)
};

// The names of a folder's visible plain files in the order the file system gives them (names
// beginning with "." are hidden files and left out). Nothing when the folder cannot be listed.
std::optional<std::vector<std::string>> PlainFiles(const std::string& folder);
// The visible subfolders, by name.
std::optional<std::vector<FolderEntry>> Subfolders(const std::string& folder);

// The real name of the file that a name typed or picked in upper case stands for: the exact
// name when it exists, else the first name in the folder's order that equals it without regard
// to case; the name unchanged when nothing matches.
std::string ResolveFileName(const std::string& folder, const QString& shownName);

// True when the path is a folder, readable or not.
bool IsFolder(const std::string& path);

// True when the path is a folder that can be listed.
bool IsReadableFolder(const std::string& path);

}  // namespace zx917::ui
