// The settings page's probe of the serial ports: which of ports 1 to n can be opened, and which
// of them the page selects.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "link/serial_port.h"

namespace zx917 {

struct PortProbe {
    std::vector<int16_t> present;         // the ports that could be opened, in ascending order
    std::optional<std::size_t> selected;  // the previous port when present, else the lowest
};

// Opens and closes each port from 1 to count, ignoring the port's refusals. When one is present
// the port is left set to the selected one, closed; otherwise at the last number tried.
PortProbe ProbePorts(SerialPort& port, int16_t count);

}  // namespace zx917
