// Revision texts: their numeric value, the display form; the byte length of names and UTF-8.
#pragma once

#include <string>
#include <string_view>

#include "app/rev7.h"

namespace zx917 {

inline constexpr const char* kUnknownRevision = "?.??.??";
inline constexpr const char* kPlaceholderRevision = "X.XX.XX";

// The decimal number that the text from its third character on begins with (1.02 for A.01.02).
double RevisionNumber(std::string_view revision);
inline double RevisionNumber(const Rev7& revision) {
    return RevisionNumber(revision.str());
}

// The text without its NUL, space and underscore characters.
std::string StripFillers(std::string_view text);

// Bytes the text takes in the single-byte code page (Latin-1): U+0010..U+00FF count 1,
// every other character 2.
int AnsiByteLength(std::u32string_view text);
// The same for UTF-8 text such as a file name; a byte that is not valid UTF-8 counts 2.
int AnsiByteLengthUtf8(std::string_view utf8);

// UTF-8 and code points; a byte that is not valid UTF-8 becomes U+FFFD.
inline constexpr char32_t kReplacementChar = 0xFFFD;
std::u32string DecodeUtf8(std::string_view utf8);
std::string EncodeUtf8(std::u32string_view text);

// The warning before a download: the instrument's revision is newer than or equal to the file's.
bool CurrentIsNewerOrEqual(const Rev7& current, const Rev7& selected);
// Two revisions need different hardware when their first characters differ.
bool NeedsHardwareChange(const Rev7& current, const Rev7& fileRevision);

}  // namespace zx917
