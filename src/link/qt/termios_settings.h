// Line settings applied to a serial device as one termios change.
#pragma once

#include <termios.h>

#include <cstdint>
#include <string>

#include "link/line_settings.h"

namespace zx917 {

// The termios speed constant of a baud rate; 0 when the rate is not one the kernel names.
speed_t SpeedConstant(int baud);

// Speed, parity, data bits, stop bits and flow control in one tcsetattr, after tcgetattr.
// Returns an empty text on success, else the system's reason.
std::string ApplyLineSettings(int fd, const LineSettings& settings, int16_t handshaking);

// True for the slave side of a pseudo-terminal (a simulator's line, not a real port).
bool IsPseudoTerminal(int fd);

// Bytes the kernel still holds for sending; 0 when it cannot tell.
int32_t KernelOutQueue(int fd);

}  // namespace zx917
