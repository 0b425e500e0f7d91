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

std::size_t TerminatorItem(std::string_view terminator) {
    for (std::size_t i = 0; i + 1 < kTerminatorItems.size(); ++i) {
        if (kTerminatorItems[i].value == terminator) return i;
    }
    return kTerminatorItems.size() - 1;
}

std::string TerminatorOf(int item) {
    if (item == 0 || item == 1) return std::string(kTerminatorItems[item].value);
    return std::string(kTerminatorItems.back().value);
}

std::optional<SettingsFields> SettingsFieldsOf(std::string_view s) {
    const auto length = static_cast<int>(s.size());
    const int k = s.find('.') != std::string_view::npos ? 2 : 0;
    if (length - 6 - k < 1) return std::nullopt;
    // Positions count from 1, as the fields are laid out from the right.
    auto at = [&](int position) { return std::string(s.substr(position - 1, 1)); };
    return SettingsFields{std::string(s.substr(0, length - 6 - k)), at(length - 4 - k),
                          at(length - 2 - k), std::string(s.substr(length - 1 - k))};
}

namespace {
std::string_view trimmed(std::string_view text) {
    const auto blank = [](char c) { return std::isspace(static_cast<unsigned char>(c)) != 0; };
    while (!text.empty() && blank(text.front())) text.remove_prefix(1);
    while (!text.empty() && blank(text.back())) text.remove_suffix(1);
    return text;
}
}  // namespace

std::string SettingsTextOf(std::string_view speed, std::string_view parity,
                           std::string_view dataBits, std::string_view stopBits) {
    std::string out(trimmed(speed));
    out.append(",").append(parity.substr(0, 1));
    out.append(",").append(trimmed(dataBits));
    out.append(",").append(trimmed(stopBits));
    return out;
}

}  // namespace zx917
