#include "link/port_defaults.h"

namespace zx917 {

void InitDefaults(AppState& app, SerialPort& port, const std::string& programFolder) {
    InitDefaults(app, programFolder);
    port.setCommPort(1);
    port.setSettings(app.PortSettings);
    port.setHandshaking(0);
}

}  // namespace zx917
