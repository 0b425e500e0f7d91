#include "firmware/revision.h"

namespace zx917 {

double RevisionNumber(std::string_view revision) {
    if (revision.size() <= 2) return 0.0;
    double value = 0.0;
    double scale = 0.0;  // 0 before the decimal point, then 0.1, 0.01, ...
    for (const char c : revision.substr(2)) {
        if (c == ' ' || c == '\t' || c == '\n') continue;
        if (c == '.' && scale == 0.0) {
            scale = 0.1;
            continue;
        }
        if (c < '0' || c > '9') break;
        const int digit = c - '0';
        if (scale == 0.0) {
            value = value * 10 + digit;
        } else {
            value += digit * scale;
            scale /= 10;
        }
    }
    return value;
}

std::string StripFillers(std::string_view text) {
    std::string out;
    for (const char c : text) {
        if (c != '\0' && c != ' ' && c != '_') out.push_back(c);
    }
    return out;
}

int AnsiByteLength(std::u32string_view text) {
    int n = 0;
    for (const char32_t c : text) n += (c >= 0x10 && c <= 0xFF) ? 1 : 2;
    return n;
}

std::u32string DecodeUtf8(std::string_view s) {
    std::u32string out;
    std::size_t i = 0;
    while (i < s.size()) {
        const auto b = static_cast<unsigned char>(s[i]);
        const std::size_t len = b < 0x80         ? 1
                                : (b >> 5) == 6  ? 2
                                : (b >> 4) == 14 ? 3
                                : (b >> 3) == 30 ? 4
                                                 : 0;
        char32_t cp = len <= 1 ? b : (b & (0x7F >> len));
        bool valid = len != 0 && i + len <= s.size();
        for (std::size_t k = 1; valid && k < len; ++k) {
            const auto cont = static_cast<unsigned char>(s[i + k]);
            valid = (cont & 0xC0) == 0x80;
            cp = (cp << 6) | (cont & 0x3F);
        }
        if (!valid) {
            out.push_back(kReplacementChar);
            ++i;
            continue;
        }
        out.push_back(cp);
        i += len;
    }
    return out;
}

std::string EncodeUtf8(std::u32string_view text) {
    std::string out;
    for (char32_t c : text) {
        if (c > 0x10FFFF || (c >= 0xD800 && c <= 0xDFFF)) c = kReplacementChar;
        if (c < 0x80) {
            out.push_back(static_cast<char>(c));
        } else if (c < 0x800) {
            out.push_back(static_cast<char>(0xC0 | (c >> 6)));
            out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
        } else if (c < 0x10000) {
            out.push_back(static_cast<char>(0xE0 | (c >> 12)));
            out.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
            out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
        } else {
            out.push_back(static_cast<char>(0xF0 | (c >> 18)));
            out.push_back(static_cast<char>(0x80 | ((c >> 12) & 0x3F)));
            out.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
            out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
        }
    }
    return out;
}

int AnsiByteLengthUtf8(std::string_view s) {
    return AnsiByteLength(DecodeUtf8(s));
}

bool CurrentIsNewerOrEqual(const Rev7& current, const Rev7& selected) {
    return RevisionNumber(current) >= RevisionNumber(selected);
}

bool NeedsHardwareChange(const Rev7& current, const Rev7& fileRevision) {
    return !(current == kUnknownRevision) && current[0] != fileRevision[0];
}

}  // namespace zx917
