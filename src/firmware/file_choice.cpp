#include "firmware/file_choice.h"

#include <algorithm>
#include <map>

#include "firmware/revision.h"
#include "link/wildcard.h"

namespace zx917 {

namespace {

constexpr char32_t kEnter = 13;
constexpr char32_t kBackspace = 8;

bool isFiller(char32_t c) {
    return c == 0 || c == ' ' || c == '_';
}

// Bytes of the text without its fillers, as the type box's limit counts them.
int strippedBytes(std::u32string_view text) {
    std::u32string kept;
    std::copy_if(text.begin(), text.end(), std::back_inserter(kept),
                 [](char32_t c) { return !isFiller(c); });
    return AnsiByteLength(kept);
}

// Characters no key gives: they never arrive by paste either.
bool typeable(char32_t c) {
    return c >= 0x20 && c != 0x7F;
}

}  // namespace

char32_t UpperCaseChar(char32_t c) {
    if (c >= 'a' && c <= 'z') return c - 0x20;
    if (c >= 0xE0 && c <= 0xFE && c != 0xF7) return c - 0x20;
    if (c == 0xFF) return 0x178;
    return c;
}

std::u32string UpperCase(std::u32string_view text) {
    std::u32string out(text);
    std::transform(out.begin(), out.end(), out.begin(), UpperCaseChar);
    return out;
}

std::optional<char32_t> FileNameKey(char32_t key) {
    key = UpperCaseChar(key);
    if (key == '*' || key == ' ' || key == '/' || key == ':' || key == '\\') return std::nullopt;
    return key;
}

std::optional<char32_t> RetFileKey(std::u32string_view before, char32_t key) {
    key = UpperCaseChar(key);
    if (key == ' ' || key == '/' || key == ':' || key == '\\') return std::nullopt;
    if (key != kBackspace && key != kEnter && strippedBytes(before) >= kNameLimitBytes)
        return std::nullopt;
    return key;
}

namespace {

// The change from the previous text is one replacement: what lies between the common start and
// the common end. The old characters go, as under a key typed over a selection, and the new ones
// are typed one by one where they stood, each through the box's key rule.
template <typename KeyRule>
std::u32string typeInto(std::u32string_view previous, std::u32string_view proposed, KeyRule key) {
    std::size_t head = 0;
    const std::size_t shorter = std::min(previous.size(), proposed.size());
    while (head < shorter && previous[head] == proposed[head]) ++head;
    std::size_t tail = 0;
    while (tail < shorter - head &&
           previous[previous.size() - 1 - tail] == proposed[proposed.size() - 1 - tail])
        ++tail;
    const std::u32string_view inserted = proposed.substr(head, proposed.size() - head - tail);
    std::u32string text(previous);
    text.erase(head, previous.size() - head - tail);
    std::size_t at = head;
    for (const char32_t c : inserted) {
        if (!typeable(c)) continue;
        if (const auto k = key(text, c)) text.insert(at++, 1, *k);
    }
    // Only refused characters: the key changes nothing, not even the selection it was typed over.
    if (!inserted.empty() && at == head) return std::u32string(previous);
    return text;
}

}  // namespace

std::u32string FileNameText(std::u32string_view previous, std::u32string_view proposed) {
    return typeInto(previous, proposed,
                    [](std::u32string_view, char32_t c) { return FileNameKey(c); });
}

std::u32string RetFileText(std::u32string_view previous, std::u32string_view proposed) {
    return typeInto(previous, proposed, RetFileKey);
}

std::vector<ListedName> ListedFileNames(const std::vector<std::string>& names,
                                        std::string_view pattern) {
    const std::u32string pat = DecodeUtf8(pattern);
    std::vector<ListedName> out;
    std::map<std::u32string, std::size_t> listed;  // names that differ only in case: one entry
    for (const std::string& name : names) {
        const std::u32string shown = UpperCase(DecodeUtf8(name));
        if (const auto at = listed.find(shown); at != listed.end()) {
            // The entry opens the name written as shown, when there is one.
            if (name == out[at->second].shown) out[at->second].name = name;
            continue;
        }
        if (!WildcardMatch(shown, pat) || AnsiByteLengthUtf8(name) > kNameLimitBytes) continue;
        listed.emplace(shown, out.size());
        out.push_back({name, EncodeUtf8(shown)});
    }
    return out;
}

std::optional<std::string> SameNameRegardlessOfCase(const std::vector<std::string>& names,
                                                    std::string_view typed) {
    const std::u32string wanted = UpperCase(DecodeUtf8(typed));
    for (const std::string& name : names) {
        if (UpperCase(DecodeUtf8(name)) == wanted) return name;
    }
    return std::nullopt;
}

}  // namespace zx917
