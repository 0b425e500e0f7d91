#include "link/qt/qt_serial_port.h"

#include <linux/serial.h>
#include <sys/ioctl.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "link/line_settings.h"
#include "link/qt/port_list.h"
#include "link/qt/termios_settings.h"

namespace zx917 {

QtSerialPort::QtSerialPort(QObject* parent) : QObject(parent) {
    dsrPoll_.setInterval(kDsrPoll);
    drainCheck_.setSingleShot(true);
    connect(&dsrPoll_, &QTimer::timeout, this, [this] { pollModemLines(); });
    connect(&drainCheck_, &QTimer::timeout, this, [this] { checkDrained(); });
    // Raised from the event loop, not inside QSerialPort's signal, so that a handler that waits
    // for further events (the engine's nested waits) still gets them.
    connect(
        &port_, &QSerialPort::readyRead, this, [this] { queue(kCommEvReceive); },
        Qt::QueuedConnection);
    connect(
        &port_, &QSerialPort::bytesWritten, this, [this] { checkDrained(); }, Qt::QueuedConnection);
    connect(&port_, &QSerialPort::errorOccurred, this, [this](QSerialPort::SerialPortError e) {
        if (e == QSerialPort::ResourceError || e == QSerialPort::WriteError ||
            e == QSerialPort::ReadError) {
            portFailed(port_.errorString());
        }
    });
}

QtSerialPort::~QtSerialPort() {
    closeDevice();
}

void QtSerialPort::closeDevice() {
    if (!port_.isOpen()) return;
    if (flagsBefore_ && !writeSerialFlags(port_.handle(), *flagsBefore_))
        note("the driver did not take its serial flags back");
    flagsBefore_.reset();
    port_.close();
}

void QtSerialPort::note(const std::string& text) {
    if (onNote) onNote(text);
}

void QtSerialPort::askLowLatency() {
    flagsBefore_.reset();
    int flags = 0;
    if (!readSerialFlags(port_.handle(), flags)) {
        note("no low latency: the device has no serial flags");
    } else if ((flags & ASYNC_LOW_LATENCY) != 0) {
        note("low latency already on");
    } else if (writeSerialFlags(port_.handle(), flags | ASYNC_LOW_LATENCY)) {
        flagsBefore_ = flags;
        note("low latency on");
    } else {
        note("no low latency: the driver refused it");
    }
}

bool QtSerialPort::ReadSerialFlags(int fd, int& flags) {
    serial_struct s{};
    if (::ioctl(fd, TIOCGSERIAL, &s) != 0) return false;
    flags = s.flags;
    return true;
}

bool QtSerialPort::WriteSerialFlags(int fd, int flags) {
    serial_struct s{};
    if (::ioctl(fd, TIOCGSERIAL, &s) != 0) return false;
    s.flags = flags;
    return ::ioctl(fd, TIOCSSERIAL, &s) == 0;
}

std::string QtSerialPort::DevicePath(int16_t port) {
    return ComDevice(port).path;
}

bool QtSerialPort::setCommPort(int16_t port) {
    if (port_.isOpen() || port < 1) return false;
    commPort_ = port;
    return true;
}

bool QtSerialPort::apply(const std::string& settings, int16_t handshaking) {
    const auto parsed = ParseLineSettings(settings);
    if (!parsed) {
        error_ = "settings refused: " + settings;
        return false;
    }
    if (!port_.isOpen()) return SpeedConstant(parsed->baud) != 0;
    const std::string why = ApplyLineSettings(port_.handle(), *parsed, handshaking);
    if (!why.empty()) {
        error_ = why;
        return false;
    }
    return true;
}

bool QtSerialPort::setSettings(const std::string& settings) {
    if (!apply(settings, handshaking_)) return false;
    settings_ = settings;
    return true;
}

bool QtSerialPort::setHandshaking(int16_t code) {
    if (code < 0 || code > 3) return false;
    if (!apply(settings_, code)) return false;
    handshaking_ = code;
    return true;
}

bool QtSerialPort::setPortOpen(bool open) {
    if (!open) {
        dsrPoll_.stop();
        drainCheck_.stop();
        sendPending_ = false;
        closeDevice();
        return true;
    }
    if (port_.isOpen()) return true;
    const std::string path = DevicePath(commPort_);
    if (path.empty()) {
        error_ = "no such device: there is no port " + std::to_string(commPort_);
        return false;
    }
    port_.setPortName(QString::fromStdString(path));
    if (!port_.open(QIODevice::ReadWrite)) {
        const auto e = port_.error();
        error_ = e == QSerialPort::DeviceNotFoundError ? "no such device: " + path
                 : e == QSerialPort::PermissionError
                     ? "permission denied or busy: " + path +
                           " (is another program using it? is your user in the dialout group?)"
                     : port_.errorString().toStdString() + ": " + path;
        return false;
    }
    if (!apply(settings_, handshaking_)) {
        port_.close();
        return false;
    }
    askLowLatency();
    dsr_ = false;
    int bits = 0;
    if (readModemLines(port_.handle(), bits)) {
        dsr_ = (bits & TIOCM_DSR) != 0;
        dsrPoll_.start();
    }  // no modem lines (a pseudo-terminal), so no DSR events
    return true;
}

bool QtSerialPort::output(std::span<const uint8_t> bytes) {
    if (!port_.isOpen()) {
        error_ = "the port is not open";
        return false;
    }
    const auto n =
        port_.write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
    if (n != static_cast<qint64>(bytes.size())) {
        error_ = port_.errorString().toStdString();
        return false;
    }
    if (onTraffic) onTraffic(true, bytes);
    sendPending_ = true;
    // Hand the bytes to the kernel now rather than at the next turn of the event loop: every
    // record waits for its answer, and the answer for the record.
    port_.flush();
    return true;
}

std::optional<uint8_t> QtSerialPort::input() {
    char c = 0;
    if (!port_.isOpen() || port_.read(&c, 1) != 1) return std::nullopt;
    const auto b = static_cast<uint8_t>(c);
    if (onTraffic) onTraffic(false, std::span<const uint8_t>(&b, 1));
    return b;
}

int32_t QtSerialPort::inBufferCount() const {
    return port_.isOpen() ? static_cast<int32_t>(port_.bytesAvailable()) : 0;
}

void QtSerialPort::clearInBuffer() {
    if (port_.isOpen()) port_.clear(QSerialPort::Input);
}

int32_t QtSerialPort::outBufferCount() const {
    if (!port_.isOpen()) return 0;
    return static_cast<int32_t>(port_.bytesToWrite()) + KernelOutQueue(port_.handle());
}

void QtSerialPort::clearOutBuffer() {
    if (port_.isOpen()) port_.clear(QSerialPort::Output);
}

// How long the bytes still queued take on the line; rechecking no sooner saves the wakeups of a
// short poll, rechecking no later keeps the send event on time.
std::chrono::milliseconds QtSerialPort::DrainWait(int32_t queued, const std::string& settings) {
    const auto s = ParseLineSettings(settings);
    if (!s || s->baud <= 0) return kDrainRecheck;
    const double bits = 1 + s->dataBits + (s->parity == 'n' ? 0 : 1) + (s->stopBits == "1" ? 1 : 2);
    const auto ms = static_cast<int64_t>(queued * bits * 1000 / s->baud);
    return std::chrono::milliseconds(std::clamp<int64_t>(ms, 1, kDrainWaitLimit.count()));
}

// The send event comes when Qt's buffer and the kernel's queue are both empty.
void QtSerialPort::checkDrained() {
    if (!sendPending_ || !port_.isOpen() || port_.bytesToWrite() > 0) return;
    if (const int32_t queued = KernelOutQueue(port_.handle()); queued > 0) {
        drainCheck_.start(DrainWait(queued, settings_));
        return;
    }
    sendPending_ = false;
    raise(kCommEvSend);
}

bool QtSerialPort::ReadModemLines(int fd, int& bits) {
    return ::ioctl(fd, TIOCMGET, &bits) == 0;  // ENOTTY on a pseudo-terminal
}

void QtSerialPort::pollModemLines() {
    int bits = 0;
    if (!port_.isOpen() || !readModemLines(port_.handle(), bits)) {
        dsrPoll_.stop();
        return;
    }
    const bool dsr = (bits & TIOCM_DSR) != 0;
    if (dsr == dsr_) return;
    dsr_ = dsr;
    raise(kCommEvDsr);
}

void QtSerialPort::portFailed(const QString& why) {
    if (!port_.isOpen()) return;
    error_ = why.toStdString();
    dsrPoll_.stop();
    drainCheck_.stop();
    sendPending_ = false;
    closeDevice();
    queue(kCommEvFailed);
}

void QtSerialPort::queue(int16_t code) {
    QMetaObject::invokeMethod(
        this, [this, code] { raise(code); }, Qt::QueuedConnection);
}

void QtSerialPort::raise(int16_t code) {
    if (code == kCommEvReceive && (!port_.isOpen() || port_.bytesAvailable() == 0)) return;
    const int16_t saved = event_;
    event_ = code;
    raiseOnComm();
    event_ = saved;
}

}  // namespace zx917
