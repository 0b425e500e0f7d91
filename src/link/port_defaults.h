// The serial defaults of every start: port 1, "9600,n,8,1", no handshaking, the port closed.
#pragma once

#include <string>

#include "app/app_state.h"
#include "link/serial_port.h"

namespace zx917 {

// Every failure is ignored: a machine without port 1 still starts.
void InitDefaults(AppState& app, SerialPort& port, const std::string& programFolder);

}  // namespace zx917
