// Serial line settings as a value: "38400,E,8,1" parsed and compared.
#pragma once

#include <optional>
#include <string>

namespace zx917 {

struct LineSettings {
    int baud = 9600;
    char parity = 'n';  // n, e, o, m, s (lower case)
    int dataBits = 8;
    std::string stopBits = "1";  // "1", "1.5", "2"

    bool operator==(const LineSettings&) const = default;
    std::string str() const;
};

// Parses "baud,parity,data,stop"; parity in either case. Nothing when a field is off.
std::optional<LineSettings> ParseLineSettings(const std::string& text);

}  // namespace zx917
