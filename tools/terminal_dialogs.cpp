#include "terminal_dialogs.h"

#include <unistd.h>

#include <cstdio>
#include <iostream>

namespace zx917 {

std::string Latin1ToUtf8(const std::string& latin1) {
    std::string out;
    for (const char ch : latin1) {
        const auto c = static_cast<unsigned char>(ch);
        if (c < 0x80) {
            out.push_back(static_cast<char>(c));
        } else {
            out.push_back(static_cast<char>(0xC0 | (c >> 6)));
            out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
        }
    }
    return out;
}

std::string TerminalLines(const std::string& text) {
    std::string out;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\r' && i + 1 < text.size() && text[i + 1] == '\n') continue;
        out.push_back(text[i]);
    }
    return out;
}

void TerminalDialogs::critical(const std::string& text) {
    ++criticals_;
    last_ = text;
    std::cerr << TerminalLines(text) << std::endl;
}

bool TerminalDialogs::question(const std::string& text) {
    last_ = text;
    const bool ok = ask(text);
    declined_ = declined_ || !ok;
    return ok;
}

bool TerminalDialogs::ask(const std::string& text) {
    std::cerr << TerminalLines(text);
    if (assumeYes_) {
        std::cerr << " [OK]" << std::endl;
        return true;
    }
    if (!::isatty(STDIN_FILENO)) {
        std::cerr << " [Cancel: no terminal to answer on]" << std::endl;
        return false;
    }
    std::cerr << " [OK/Cancel] " << std::flush;
    std::string answer;
    if (!std::getline(std::cin, answer)) return false;
    return answer == "OK" || answer == "ok" || answer == "y" || answer == "yes" || answer == "Y";
}

void TerminalDialogs::information(const std::string& text) {
    last_ = text;
    std::cerr << TerminalLines(text) << std::endl;
}

void TerminalDialogs::beep() {
    if (::isatty(STDERR_FILENO)) std::cerr << '\a' << std::flush;
}

}  // namespace zx917
