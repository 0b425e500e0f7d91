// The file chooser's rules for names: what the name and type boxes take, and which names of a
// folder are listed and how they are shown.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace zx917 {

// A name of more bytes is never listed; the type box takes no more.
inline constexpr int kNameLimitBytes = 12;

// Upper case as the chooser shows names: ASCII and Latin-1 letters; other characters unchanged.
char32_t UpperCaseChar(char32_t c);
std::u32string UpperCase(std::u32string_view text);

// A key typed into the name box: its upper-case form, or nothing when it is refused.
std::optional<char32_t> FileNameKey(char32_t key);
// A key typed into the type box, with the box's text before the key.
std::optional<char32_t> RetFileKey(std::u32string_view before, char32_t key);

// Text that reaches a box by any way (keys, paste, drop, input method, a list item) becomes
// what typing it character by character would give, in place of the part of the previous text
// that it replaces. A change that only brings refused characters changes nothing.
std::u32string FileNameText(std::u32string_view previous, std::u32string_view proposed);
std::u32string RetFileText(std::u32string_view previous, std::u32string_view proposed);

struct ListedName {
    std::string name;   // the real name, the file system's bytes
    std::string shown;  // the name in upper case, UTF-8
};

// The names of a folder's plain files (in the file system's order) that the file list shows:
// those whose upper-case form matches the pattern as a whole and that take at most 12 bytes,
// each upper-case form once, opening the name written as shown when there is one, else the
// first in the folder's order.
std::vector<ListedName> ListedFileNames(const std::vector<std::string>& names,
                                        std::string_view pattern);

// The first of the names (real names, in the file system's order) that a name typed or shown
// in upper case (UTF-8) stands for without regard to case; nothing when none does.
std::optional<std::string> SameNameRegardlessOfCase(const std::vector<std::string>& names,
                                                    std::string_view typed);

}  // namespace zx917
