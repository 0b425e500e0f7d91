#include "link/wildcard.h"

#include <cstddef>

namespace zx917 {

namespace {

// Characters compare by value: bytes as unsigned, code points as they are.
inline char32_t value(char c) {
    return static_cast<unsigned char>(c);
}
inline char32_t value(char32_t c) {
    return c;
}

// Matches one pattern element at p against c; sets len to the element's length in the pattern.
template <typename View>
bool matchOne(View pat, std::size_t p, char32_t c, std::size_t& len) {
    const char32_t pc = value(pat[p]);
    len = 1;
    if (pc == '?') return true;
    if (pc == '#') return c >= '0' && c <= '9';
    if (pc != '[') return pc == c;
    std::size_t close = pat.find(']', p + 1);
    // "[]" and an unclosed bracket are plain characters.
    if (close == View::npos || close == p + 1) return pc == c;
    len = close - p + 1;
    std::size_t i = p + 1;
    bool negate = false;
    if (pat[i] == '!' && i + 1 < close) {
        negate = true;
        ++i;
    }
    bool found = false;
    for (; i < close; ++i) {
        const char32_t lo = value(pat[i]);
        char32_t hi = lo;
        if (i + 2 < close && pat[i + 1] == '-') {
            hi = value(pat[i + 2]);
            i += 2;
        }
        if (c >= lo && c <= hi) found = true;
    }
    return found != negate;
}

template <typename View>
bool match(View text, View pat) {
    std::size_t t = 0;
    std::size_t p = 0;
    std::size_t starP = View::npos;  // pattern position after the last '*'
    std::size_t starT = 0;           // text position that '*' was tried up to
    while (t < text.size()) {
        std::size_t len = 1;
        if (p < pat.size() && pat[p] == '*') {
            starP = ++p;
            starT = t;
            continue;
        }
        if (p < pat.size() && matchOne(pat, p, value(text[t]), len)) {
            p += len;
            ++t;
            continue;
        }
        if (starP == View::npos) return false;
        p = starP;
        t = ++starT;
    }
    while (p < pat.size() && pat[p] == '*') ++p;
    return p == pat.size();
}

}  // namespace

bool WildcardMatch(std::string_view text, std::string_view pattern) {
    return match(text, pattern);
}

bool WildcardMatch(std::u32string_view text, std::u32string_view pattern) {
    return match(text, pattern);
}

}  // namespace zx917
