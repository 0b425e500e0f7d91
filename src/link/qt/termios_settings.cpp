#include "link/qt/termios_settings.h"

#include <sys/ioctl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

#include <cerrno>
#include <cstring>

namespace zx917 {

speed_t SpeedConstant(int baud) {
    switch (baud) {
        case 50:
            return B50;
        case 75:
            return B75;
        case 110:
            return B110;
        case 134:
            return B134;
        case 150:
            return B150;
        case 200:
            return B200;
        case 300:
            return B300;
        case 600:
            return B600;
        case 1200:
            return B1200;
        case 1800:
            return B1800;
        case 2400:
            return B2400;
        case 4800:
            return B4800;
        case 9600:
            return B9600;
        case 19200:
            return B19200;
        case 38400:
            return B38400;
        case 57600:
            return B57600;
        case 115200:
            return B115200;
        case 230400:
            return B230400;
        case 460800:
            return B460800;
        case 921600:
            return B921600;
        default:
            return 0;
    }
}

std::string ApplyLineSettings(int fd, const LineSettings& s, int16_t handshaking) {
    const speed_t speed = SpeedConstant(s.baud);
    if (speed == 0) return "baud rate " + std::to_string(s.baud) + " is not supported";
    termios tio{};
    if (::tcgetattr(fd, &tio) != 0) return std::strerror(errno);
    ::cfsetispeed(&tio, speed);
    ::cfsetospeed(&tio, speed);
    tio.c_cflag &= ~static_cast<tcflag_t>(CSIZE | PARENB | PARODD | CMSPAR | CSTOPB | CRTSCTS);
    tio.c_cflag |= CREAD | CLOCAL;
    switch (s.dataBits) {
        case 5:
            tio.c_cflag |= CS5;
            break;
        case 6:
            tio.c_cflag |= CS6;
            break;
        case 7:
            tio.c_cflag |= CS7;
            break;
        default:
            tio.c_cflag |= CS8;
            break;
    }
    switch (s.parity) {
        case 'e':
            tio.c_cflag |= PARENB;
            break;
        case 'o':
            tio.c_cflag |= PARENB | PARODD;
            break;
        case 'm':
            tio.c_cflag |= PARENB | CMSPAR | PARODD;
            break;
        case 's':
            tio.c_cflag |= PARENB | CMSPAR;
            break;
        default:
            break;
    }
    if (s.stopBits != "1") tio.c_cflag |= CSTOPB;  // Linux has no 1.5: two stop bits
    tio.c_iflag &= ~static_cast<tcflag_t>(IXON | IXOFF | IXANY | INPCK | ISTRIP);
    if (handshaking == 1 || handshaking == 3) tio.c_iflag |= IXON | IXOFF;
    if (handshaking == 2 || handshaking == 3) tio.c_cflag |= CRTSCTS;
    if (::tcsetattr(fd, TCSANOW, &tio) != 0) {
        // glibc reports EINVAL when the kernel dropped the parity or size bits; a pseudo-
        // terminal always does (it has no line to carry them), a real port means it.
        if (errno == EINVAL && IsPseudoTerminal(fd)) return {};
        return std::strerror(errno);
    }
    return {};
}

bool IsPseudoTerminal(int fd) {
    struct stat st {};
    if (::fstat(fd, &st) != 0 || !S_ISCHR(st.st_mode)) return false;
    const unsigned m = major(st.st_rdev);
    return m >= 136 && m <= 143;  // UNIX98 pty slaves
}

int32_t KernelOutQueue(int fd) {
    int n = 0;
    if (::ioctl(fd, TIOCOUTQ, &n) != 0) return 0;
    return n;
}

}  // namespace zx917
