// Progress and time: the download-time estimate, the remaining-time text and the byte label.
#pragma once

#include <cstdint>
#include <string>

namespace zx917 {

inline constexpr double kTransferBytesPerSecond = 2000.0;
inline constexpr double kFixedAllowanceSeconds = 160.0;

// Nearest whole number, halves to the even neighbour.
int32_t RoundHalfEven(double value);

// Seconds a download of a file of this length is estimated to take.
int32_t EstimateSeconds(int32_t fileLength);

// Remaining time after `bytes` bytes as minutes and seconds, "12:34"; never below "00:00".
std::string FormatRemainingTime(int32_t estimatedSeconds, int32_t bytes);

// The transferred-bytes label: "12345Byte".
std::string ByteLabel(int32_t bytes);

}  // namespace zx917
