// Whole-text wildcard match for answers, section markers, the end marker and file-name filters.
#pragma once

#include <string_view>

namespace zx917 {

// "*" any run of characters (also none), "?" one character, "#" one digit, "[list]" one
// character of the list (ranges such as A-Z; "[!list]" one character not in it). "[[]" is a
// literal opening bracket. Case-sensitive; an unclosed "[" stands for itself.
bool WildcardMatch(std::string_view text, std::string_view pattern);
// The same over code points, for names: "?" stands for one character, not one byte.
bool WildcardMatch(std::u32string_view text, std::u32string_view pattern);

}  // namespace zx917
