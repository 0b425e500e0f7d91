#include "link/line_settings.h"

#include <cctype>
#include <sstream>
#include <vector>

namespace zx917 {

std::string LineSettings::str() const {
    return std::to_string(baud) + "," + parity + "," + std::to_string(dataBits) + "," + stopBits;
}

std::optional<LineSettings> ParseLineSettings(const std::string& text) {
    std::vector<std::string> f;
    std::stringstream ss(text);
    for (std::string part; std::getline(ss, part, ',');) f.push_back(part);
    if (f.size() != 4 || f[0].empty() || f[0].size() > 7 || f[1].size() != 1) return std::nullopt;
    LineSettings s;
    for (const char c : f[0]) {
        if (!std::isdigit(static_cast<unsigned char>(c))) return std::nullopt;
    }
    s.baud = std::stoi(f[0]);
    s.parity = static_cast<char>(std::tolower(static_cast<unsigned char>(f[1][0])));
    if (std::string("neoms").find(s.parity) == std::string::npos) return std::nullopt;
    if (f[2].size() != 1 || f[2][0] < '5' || f[2][0] > '8') return std::nullopt;
    s.dataBits = f[2][0] - '0';
    if (f[3] != "1" && f[3] != "1.5" && f[3] != "2") return std::nullopt;
    s.stopBits = f[3];
    if (s.baud <= 0) return std::nullopt;
    return s;
}

}  // namespace zx917
