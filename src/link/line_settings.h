// Serial line settings as a value ("38400,E,8,1" parsed and compared), and the settings page's
// rules: what its lists hold, how a settings text is taken apart to show it, and how the
// choice is put back together.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

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

// An item of a settings list: its caption and the value it stands for.
struct ListItem {
    std::string_view caption;
    std::string_view value;
};
inline constexpr std::array<ListItem, 2> kSpeedItems = {{{"9600", "9600"}, {"19200", "19200"}}};
inline constexpr std::array<ListItem, 2> kDataBitsItems = {{{"7", "7"}, {"8", "8"}}};
inline constexpr std::array<ListItem, 3> kParityItems = {
    {{"Even", "e"}, {"Odd", "o"}, {"None", "n"}}};
inline constexpr std::array<ListItem, 2> kStopBitsItems = {{{"1", "1"}, {"2", "2"}}};
inline constexpr std::array<ListItem, 3> kTerminatorItems = {
    {{"LF", "\n"}, {"CR", "\r"}, {"CR+LF", "\r\n"}}};
// The handshaking code is the item's position.
inline constexpr std::array<ListItem, 2> kHandshakingItems = {{{"None", "0"}, {"Xon/Xoff", "1"}}};

// The terminator's item: LF, CR, else CR+LF.
std::size_t TerminatorItem(std::string_view terminator);
// The terminator of an item; no item (or any other) gives CR LF.
std::string TerminatorOf(int item);

// A settings text taken apart from its right-hand end: the baud rate is what stands before the
// last three fields. A text too short for that gives nothing.
struct SettingsFields {
    std::string speed;
    std::string parity;  // the one character, as written: "e", "o" and "n" name an item
    std::string dataBits;
    std::string stopBits;  // "1.5" when the text holds a point
};
std::optional<SettingsFields> SettingsFieldsOf(std::string_view settings);

// The settings text of a choice: each field without its surrounding blanks, comma-separated.
// The parity letter is the parity item's value (empty without a selection).
std::string SettingsTextOf(std::string_view speed, std::string_view parity,
                           std::string_view dataBits, std::string_view stopBits);

}  // namespace zx917
