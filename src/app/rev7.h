// A fixed 7-character text field, as the revision fields of the shared state hold them.
#pragma once

#include <array>
#include <string>
#include <string_view>

namespace zx917 {

class Rev7 {
public:
    static constexpr std::size_t kWidth = 7;

    Rev7() = default;                              // seven characters of code 0
    Rev7(std::string_view text) { assign(text); }  // NOLINT: assignment from text is the point

    Rev7& operator=(std::string_view text) {
        assign(text);
        return *this;
    }

    // Shorter texts are padded with spaces, longer ones cut to 7 characters.
    void assign(std::string_view text) {
        for (std::size_t i = 0; i < kWidth; ++i) chars_[i] = i < text.size() ? text[i] : ' ';
    }

    std::string str() const { return std::string(chars_.data(), kWidth); }
    char operator[](std::size_t i) const { return chars_[i]; }
    bool operator==(const Rev7&) const = default;
    bool operator==(std::string_view text) const { return str() == text; }

private:
    std::array<char, kWidth> chars_{};
};

}  // namespace zx917
