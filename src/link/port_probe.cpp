#include "link/port_probe.h"

namespace zx917 {

PortProbe ProbePorts(SerialPort& port, int16_t count) {
    PortProbe probe;
    const int16_t previous = port.commPort();
    for (int16_t n = 1; n <= count; ++n) {
        port.setCommPort(n);
        port.setPortOpen(true);
        if (!port.portOpen() || port.commPort() != n) continue;
        if (!probe.selected || n == previous) probe.selected = probe.present.size();
        probe.present.push_back(n);
        port.setPortOpen(false);
    }
    if (probe.selected) port.setCommPort(probe.present[*probe.selected]);
    return probe;
}

}  // namespace zx917
