#include "link/wildcard.h"

#include <cstddef>

namespace zx917 {

namespace {

// Matches one pattern element at p against c; sets len to the element's length in the pattern.
bool matchOne(std::string_view pat, std::size_t p, unsigned char c, std::size_t& len) {
    const char pc = pat[p];
    len = 1;
    if (pc == '?') return true;
    if (pc == '#') return c >= '0' && c <= '9';
    if (pc != '[') return static_cast<unsigned char>(pc) == c;
    std::size_t close = pat.find(']', p + 1);
    // "[]" and an unclosed bracket are plain characters.
    if (close == std::string_view::npos || close == p + 1)
        return static_cast<unsigned char>(pc) == c;
    len = close - p + 1;
    std::size_t i = p + 1;
    bool negate = false;
    if (pat[i] == '!' && i + 1 < close) {
        negate = true;
        ++i;
    }
    bool found = false;
    for (; i < close; ++i) {
        auto lo = static_cast<unsigned char>(pat[i]);
        auto hi = lo;
        if (i + 2 < close && pat[i + 1] == '-') {
            hi = static_cast<unsigned char>(pat[i + 2]);
            i += 2;
        }
        if (c >= lo && c <= hi) found = true;
    }
    return found != negate;
}

}  // namespace

bool WildcardMatch(std::string_view text, std::string_view pat) {
    std::size_t t = 0;
    std::size_t p = 0;
    std::size_t starP = std::string_view::npos;  // pattern position after the last '*'
    std::size_t starT = 0;                       // text position that '*' was tried up to
    while (t < text.size()) {
        std::size_t len = 1;
        if (p < pat.size() && pat[p] == '*') {
            starP = ++p;
            starT = t;
            continue;
        }
        if (p < pat.size() && matchOne(pat, p, static_cast<unsigned char>(text[t]), len)) {
            p += len;
            ++t;
            continue;
        }
        if (starP == std::string_view::npos) return false;
        p = starP;
        t = ++starT;
    }
    while (p < pat.size() && pat[p] == '*') ++p;
    return p == pat.size();
}

}  // namespace zx917
