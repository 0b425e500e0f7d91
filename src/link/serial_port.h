// The serial port as the program uses it; the platform adapter and the test fake implement it.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>

namespace zx917 {

// Codes of CommEvent.
enum CommEventCode : int16_t {
    kCommEvNone = 0,
    kCommEvSend = 1,       // the written bytes have left the port
    kCommEvReceive = 2,    // bytes have arrived
    kCommEvDsr = 4,        // the DSR line changed
    kCommEvFailed = 1000,  // the port failed (device gone, write error); see errorText()
};

class SerialPort {
public:
    virtual ~SerialPort() = default;

    // Each write returns false when the port refuses it; the port then keeps its state.
    virtual bool setCommPort(int16_t port) = 0;  // fails while the port is open
    virtual int16_t commPort() const = 0;
    // "baud,parity,data,stop", for example "38400,E,8,1".
    virtual bool setSettings(const std::string& settings) = 0;
    virtual std::string settings() const = 0;
    // 0 none, 1 XON/XOFF, 2 RTS/CTS, 3 RTS/CTS and XON/XOFF.
    virtual bool setHandshaking(int16_t code) = 0;
    virtual int16_t handshaking() const = 0;
    virtual bool setPortOpen(bool open) = 0;
    virtual bool portOpen() const = 0;

    // Text goes out as its single-byte characters, a byte array byte for byte.
    virtual bool output(std::span<const uint8_t> bytes) = 0;
    bool output(const std::string& text) {
        return output(std::span(reinterpret_cast<const uint8_t*>(text.data()), text.size()));
    }
    // At most one received byte per read; nothing when the buffer is empty.
    virtual std::optional<uint8_t> input() = 0;
    virtual int32_t inBufferCount() const = 0;
    virtual void clearInBuffer() = 0;
    virtual int32_t outBufferCount() const = 0;
    virtual void clearOutBuffer() = 0;

    virtual int16_t commEvent() const = 0;
    virtual bool dsrHolding() const = 0;
    // The system's reason for the last failure, for a person to read.
    virtual std::string errorText() const { return {}; }

    // OnComm: raised for every real event with commEvent() telling which.
    void setOnComm(std::function<void()> handler) { onComm_ = std::move(handler); }

protected:
    void raiseOnComm() {
        if (onComm_) onComm_();
    }

private:
    std::function<void()> onComm_;
};

}  // namespace zx917
