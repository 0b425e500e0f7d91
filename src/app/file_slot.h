// The program's single binary file slot: the download file, open for a check or a transfer.
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace zx917 {

class FileSlot {
public:
    FileSlot() = default;
    FileSlot(const FileSlot&) = delete;
    FileSlot& operator=(const FileSlot&) = delete;
    ~FileSlot() { close(); }

    // Opens a plain file for binary reading; a folder or a missing file fails.
    bool open(const std::string& path);
    void close();
    bool isOpen() const { return file_ != nullptr; }

    int64_t length() const { return length_; }
    // 1-based position of the next byte to read.
    int64_t nextPosition() const { return pos_ + 1; }
    // Bytes from the start of the file up to the last byte read.
    int64_t bytesRead() const { return pos_; }
    bool atEnd() const { return pos_ >= length_; }
    // Moves so that the next read takes the byte at 1-based position pos1.
    bool seek(int64_t pos1);

    bool readByte(uint8_t& b);
    // Reads exactly n bytes into out (appended); false when the file ends first.
    bool readBytes(std::size_t n, std::vector<uint8_t>& out);
    // A line runs to the next CR; an LF right after it is consumed. False at the end of the file.
    bool readLine(std::string& line);
    // A delimited text field: it ends at a comma or at the end of its line, and a field that
    // begins with a double quote runs to the closing quote. False at the end of the file.
    bool readField(std::string& field);

private:
    int next();  // next byte or -1
    int peek();

    std::FILE* file_ = nullptr;
    int64_t length_ = 0;
    int64_t pos_ = 0;
};

}  // namespace zx917
