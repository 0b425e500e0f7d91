// SHA-256 of a file or of bytes, as sha256sum prints it: 64 lower-case hex digits.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>

namespace zx917 {

std::string Sha256Hex(std::span<const uint8_t> bytes);
// Nothing when the file cannot be read to its end.
std::optional<std::string> Sha256OfFile(const std::string& path);

}  // namespace zx917
