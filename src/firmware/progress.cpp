#include "firmware/progress.h"

#include <cmath>
#include <limits>

namespace zx917 {

int32_t RoundHalfEven(double value) {
    const double r = std::nearbyint(value);  // the default rounding mode is to nearest even
    if (r >= std::numeric_limits<int32_t>::max()) return std::numeric_limits<int32_t>::max();
    if (r <= std::numeric_limits<int32_t>::min()) return std::numeric_limits<int32_t>::min();
    return static_cast<int32_t>(r);
}

int32_t EstimateSeconds(int32_t fileLength) {
    return RoundHalfEven(fileLength / kTransferBytesPerSecond + kFixedAllowanceSeconds);
}

std::string FormatRemainingTime(int32_t estimatedSeconds, int32_t bytes) {
    int32_t s = RoundHalfEven(estimatedSeconds - bytes / kTransferBytesPerSecond);
    if (s < 0) s = 0;  // a late transfer shows no time left, not a negative one
    const int32_t m = s / 60;
    const int32_t c = s - 60 * m;
    auto two = [](int32_t v) {
        std::string t = std::to_string(v);
        return t.size() == 1 ? "0" + t : t;
    };
    return two(m) + ":" + two(c);
}

std::string ByteLabel(int32_t bytes) {
    return std::to_string(bytes) + "Byte";
}

}  // namespace zx917
