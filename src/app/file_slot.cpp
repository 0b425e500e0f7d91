#include "app/file_slot.h"

#include <sys/stat.h>

namespace zx917 {

namespace {
// Fields are only ever examined at their start; a runaway field keeps just this much.
constexpr std::size_t kFieldKeep = 256;
constexpr int kCR = 13;
constexpr int kLF = 10;
}  // namespace

bool FileSlot::open(const std::string& path) {
    close();
    struct stat st {};
    if (::stat(path.c_str(), &st) != 0 || !S_ISREG(st.st_mode)) return false;
    file_ = std::fopen(path.c_str(), "rb");
    if (file_ == nullptr) return false;
    std::setvbuf(file_, nullptr, _IOFBF, 1 << 16);
    if (std::fseek(file_, 0, SEEK_END) != 0) {
        close();
        return false;
    }
    length_ = std::ftell(file_);
    if (length_ < 0 || std::fseek(file_, 0, SEEK_SET) != 0) {
        close();
        return false;
    }
    pos_ = 0;
    return true;
}

void FileSlot::close() {
    if (file_ != nullptr) std::fclose(file_);
    file_ = nullptr;
    length_ = 0;
    pos_ = 0;
}

bool FileSlot::seek(int64_t pos1) {
    if (file_ == nullptr || pos1 < 1) return false;
    if (std::fseek(file_, static_cast<long>(pos1 - 1), SEEK_SET) != 0) return false;
    pos_ = pos1 - 1;
    return true;
}

int FileSlot::next() {
    if (file_ == nullptr) return -1;
    const int c = std::getc(file_);
    if (c != EOF) ++pos_;
    return c == EOF ? -1 : c;
}

int FileSlot::peek() {
    if (file_ == nullptr) return -1;
    const int c = std::getc(file_);
    if (c == EOF) return -1;
    std::ungetc(c, file_);
    return c;
}

bool FileSlot::readByte(uint8_t& b) {
    const int c = next();
    if (c < 0) return false;
    b = static_cast<uint8_t>(c);
    return true;
}

bool FileSlot::readBytes(std::size_t n, std::vector<uint8_t>& out) {
    if (file_ == nullptr) return false;
    const std::size_t start = out.size();
    out.resize(start + n);
    const std::size_t got = std::fread(out.data() + start, 1, n, file_);
    pos_ += static_cast<int64_t>(got);
    if (got != n) {
        out.resize(start + got);
        return false;
    }
    return true;
}

bool FileSlot::readLine(std::string& line) {
    line.clear();
    int c = next();
    if (c < 0) return false;
    while (c >= 0 && c != kCR) {
        line.push_back(static_cast<char>(c));
        c = next();
    }
    if (c == kCR && peek() == kLF) next();
    return true;
}

bool FileSlot::readField(std::string& field) {
    field.clear();
    int c = next();
    while (c == ' ' || c == '\t') c = next();
    if (c < 0) return false;
    auto keep = [&field](int ch) {
        if (field.size() < kFieldKeep) field.push_back(static_cast<char>(ch));
    };
    if (c == '"') {
        for (c = next(); c >= 0 && c != '"'; c = next()) keep(c);
        if (c == '"') c = next();
        while (c >= 0 && c != ',' && c != kCR && c != kLF) c = next();
    } else {
        for (; c >= 0 && c != ',' && c != kCR && c != kLF; c = next()) keep(c);
        while (!field.empty() && (field.back() == ' ' || field.back() == '\t')) field.pop_back();
    }
    if (c == kCR && peek() == kLF) next();
    return true;
}

}  // namespace zx917
