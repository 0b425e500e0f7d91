// Which device "Com1", "Com2", ... stand for: $ZX917_COM<n> when set, else the system's serial
// ports with USB and ACM adapters (the cables engineers plug in) first, each group by name.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace zx917 {

struct SystemPort {
    std::string name;         // ttyUSB0
    std::string path;         // /dev/ttyUSB0
    std::string description;  // as the system reports it, e.g. "FT232R USB UART"
    bool adapter = false;     // a USB or ACM adapter
};

// The ports in the order Com1, Com2, ... take them.
std::vector<SystemPort> OrderPorts(std::vector<SystemPort> ports);

// The ports the system lists now, ordered.
std::vector<SystemPort> SystemPorts();

// The device of port n; an empty path when there is none. Quick when a variable names it.
SystemPort ComDevice(int16_t port);
// The same with the system's description of the device, also when a variable names it.
SystemPort DescribedComDevice(int16_t port);
// "/dev/ttyUSB0 - FT232R USB UART", the device and description of port n; empty when none.
std::string DescribeComPort(int16_t port);

}  // namespace zx917
