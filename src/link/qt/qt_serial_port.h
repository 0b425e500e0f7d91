// The serial port on QSerialPort: line settings through termios, events raised from the event
// loop, the send event only once the kernel has sent every byte.
#pragma once

#include <QObject>
#include <QSerialPort>
#include <QTimer>
#include <chrono>
#include <optional>
#include <string>

#include "link/serial_port.h"

namespace zx917 {

class QtSerialPort : public QObject, public SerialPort {
    Q_OBJECT
public:
    explicit QtSerialPort(QObject* parent = nullptr);
    ~QtSerialPort() override;

    // The device of port n: $ZX917_COM<n>, else the n-th port the system lists (port_list.h).
    static std::string DevicePath(int16_t port);

    bool setCommPort(int16_t port) override;
    int16_t commPort() const override { return commPort_; }
    bool setSettings(const std::string& settings) override;
    std::string settings() const override { return settings_; }
    bool setHandshaking(int16_t code) override;
    int16_t handshaking() const override { return handshaking_; }
    bool setPortOpen(bool open) override;
    bool portOpen() const override { return port_.isOpen(); }
    bool output(std::span<const uint8_t> bytes) override;
    std::optional<uint8_t> input() override;
    int32_t inBufferCount() const override;
    void clearInBuffer() override;
    int32_t outBufferCount() const override;
    void clearOutBuffer() override;
    int16_t commEvent() const override { return event_; }
    bool dsrHolding() const override { return dsr_; }
    std::string errorText() const override { return error_; }

    // Every byte written and read, for a trace; settings are those of the moment.
    std::function<void(bool sent, std::span<const uint8_t> bytes)> onTraffic;

    // Reads the modem lines (TIOCM_* bits) of the open device; false when it has none, as a
    // pseudo-terminal. A test replaces it to raise and drop DSR through the real poll.
    using ModemLineReader = std::function<bool(int fd, int& bits)>;
    static bool ReadModemLines(int fd, int& bits);
    ModemLineReader readModemLines = ReadModemLines;

    // The driver's serial flags (TIOCGSERIAL, TIOCSSERIAL); false when it has none or refuses,
    // as a pseudo-terminal does. On open the port asks for low latency: stop-and-wait pays the
    // adapter's receive latency (16 ms on FTDI adapters) once a record. A test replaces them.
    using SerialFlagsReader = std::function<bool(int fd, int& flags)>;
    using SerialFlagsWriter = std::function<bool(int fd, int flags)>;
    static bool ReadSerialFlags(int fd, int& flags);
    static bool WriteSerialFlags(int fd, int flags);
    SerialFlagsReader readSerialFlags = ReadSerialFlags;
    SerialFlagsWriter writeSerialFlags = WriteSerialFlags;

    // What the adapter did that a support trace should show (low latency asked, refused).
    std::function<void(const std::string&)> onNote;

private:
    void raise(int16_t code);
    void queue(int16_t code);
    void checkDrained();
    void pollModemLines();
    void portFailed(const QString& why);
    bool apply(const std::string& settings, int16_t handshaking);
    void askLowLatency();
    // Closes the device, with the driver's flags as they were before it was opened.
    void closeDevice();
    void note(const std::string& text);

    static constexpr std::chrono::milliseconds kDsrPoll{100};
    static constexpr std::chrono::milliseconds kDrainRecheck{2};
    static constexpr std::chrono::milliseconds kDrainWaitLimit{50};

public:
    // The time to wait before looking at the kernel's output queue again.
    static std::chrono::milliseconds DrainWait(int32_t queued, const std::string& settings);

private:
    QSerialPort port_;
    QTimer dsrPoll_;
    QTimer drainCheck_;
    int16_t commPort_ = 1;
    std::string settings_ = "9600,n,8,1";
    int16_t handshaking_ = 0;
    int16_t event_ = kCommEvNone;
    bool dsr_ = false;
    bool sendPending_ = false;
    std::optional<int> flagsBefore_;  // the driver's flags to put back on close
    std::string error_;
};

}  // namespace zx917
