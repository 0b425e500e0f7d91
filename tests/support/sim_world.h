// Simulated time for the engine: a virtual clock, timers on it, a serial port wired to the
// in-process instrument, and a pump that jumps the clock to the next due event.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "app/app_state.h"
#include "app/file_slot.h"
#include "instrument/instrument.h"
#include "link/command_script.h"
#include "link/engine.h"
#include "link/event_pump.h"
#include "link/serial_port.h"
#include "link/timer.h"

namespace zx917::test {

using Bytes = std::vector<uint8_t>;

class Scheduler {
public:
    int64_t now() const { return now_; }
    void at(int64_t t, std::function<void()> fn) {
        items_.emplace(std::make_pair(t, seq_++), std::move(fn));
    }
    bool runNext() {
        if (items_.empty()) return false;
        auto it = items_.begin();
        now_ = std::max(now_, it->first.first);
        auto fn = std::move(it->second);
        items_.erase(it);
        fn();
        return true;
    }
    std::size_t pending() const { return items_.size(); }
    int64_t nextAt() const { return items_.empty() ? INT64_MAX : items_.begin()->first.first; }

private:
    int64_t now_ = 0;
    uint64_t seq_ = 0;
    std::map<std::pair<int64_t, uint64_t>, std::function<void()>> items_;
};

class SimPump : public EventPump {
public:
    explicit SimPump(Scheduler& s) : s_(s) {}
    void processNextEvent() override {
        ++turns;
        if (!s_.runNext())
            throw std::runtime_error("the program waits for an event that never comes");
        if (s_.now() > limitMs)
            throw std::runtime_error("simulated time ran past the test's limit");
    }
    int64_t limitMs = 4LL * 3600 * 1000;
    int64_t turns = 0;

private:
    Scheduler& s_;
};

class SimTimer : public Timer {
public:
    SimTimer(Scheduler& s, int intervalMs) : s_(s), interval_(intervalMs) {}
    void setEnabled(bool on) override {
        if (on == on_) return;
        on_ = on;
        ++gen_;
        if (on) schedule();
    }
    bool enabled() const override { return on_; }
    int64_t ticks = 0;

private:
    void schedule() {
        const uint64_t g = gen_;
        s_.at(s_.now() + interval_, [this, g] {
            if (g != gen_ || !on_) return;
            schedule();
            ++ticks;
            tick();
        });
    }
    Scheduler& s_;
    int interval_;
    bool on_ = false;
    uint64_t gen_ = 0;
};

// What went on the line, and how.
struct Sent {
    int64_t atMs;
    std::string settings;
    int16_t handshaking;
    Bytes bytes;
    std::string text() const { return std::string(bytes.begin(), bytes.end()); }
};

class SimSerialPort : public SerialPort {
public:
    SimSerialPort(Scheduler& s, Instrument* instrument) : s_(s), instrument_(instrument) {}

    bool setCommPort(int16_t port) override {
        if (open_) return false;
        port_ = port;
        return true;
    }
    int16_t commPort() const override { return port_; }
    bool setSettings(const std::string& settings) override;
    std::string settings() const override { return settings_; }
    bool setHandshaking(int16_t code) override {
        if (code < 0 || code > 3) return false;
        handshaking_ = code;
        return true;
    }
    int16_t handshaking() const override { return handshaking_; }
    bool setPortOpen(bool open) override;
    bool portOpen() const override { return open_; }
    bool output(std::span<const uint8_t> bytes) override;
    std::optional<uint8_t> input() override {
        if (in_.empty()) return std::nullopt;
        const uint8_t b = in_.front();
        in_.pop_front();
        return b;
    }
    int32_t inBufferCount() const override { return static_cast<int32_t>(in_.size()); }
    void clearInBuffer() override { in_.clear(); }
    int32_t outBufferCount() const override { return outPending_; }
    void clearOutBuffer() override {
        ++outGen_;
        outPending_ = 0;
    }
    int16_t commEvent() const override { return event_; }
    bool dsrHolding() const override { return dsr_; }
    std::string errorText() const override { return error_; }

    // Bytes from the instrument side arriving at time t (now when omitted).
    void inject(const std::string& text, int64_t delayMs = 0);
    void raiseDsr(int64_t delayMs = 0);
    void vanish(int64_t delayMs = 0);

    std::vector<Sent> sent;
    std::vector<std::string> settingsHistory;  // every accepted settings change while open
    bool present = true;
    std::set<int16_t> absent;      // port numbers that cannot be opened (missing or held elsewhere)
    bool anySettingsText = false;  // keeps any settings text, as a port that never checks
    bool failWrites = false;
    std::string failWritesOf;  // refuse the writes whose text starts with this
    // The peer holds the line stopped (XOFF or CTS low): bytes not yet gone stay queued.
    bool lineHeld = false;
    std::function<void(const Sent&)> onSent;  // after every accepted write
    int opens = 0;

private:
    void raise(int16_t code);
    void deliverEmissions();
    int64_t charTimeUs(const std::string& settings) const;

    Scheduler& s_;
    Instrument* instrument_;
    int16_t port_ = 1;
    std::string settings_ = "9600,n,8,1";
    int16_t handshaking_ = 0;
    bool open_ = false;
    bool dsr_ = false;
    bool vanished_ = false;
    int16_t event_ = kCommEvNone;
    std::deque<uint8_t> in_;
    int32_t outPending_ = 0;
    uint64_t outGen_ = 0;
    int64_t lineFreeAtUs_ = 0;
    int64_t rxFreeAtUs_ = 0;
    std::string error_;
};

// One program world: shared state, script, file slot, engine and the simulated platform.
struct SimWorld {
    explicit SimWorld(InstrumentOptions options = {}, bool withInstrument = true);

    // The bytes of every send whose text starts with prefix.
    std::vector<Sent> sendsOf(const std::string& prefix) const;

    AppState app;
    CommandScript script;
    FileSlot file;
    Scheduler clock;
    SimPump pump{clock};
    SimTimer retry{clock, kRetryIntervalMs};
    SimTimer rsRetry{clock, kRsRetryIntervalMs};
    SimTimer timer1{clock, kTimer1IntervalMs};
    std::unique_ptr<Instrument> instrument;
    SimSerialPort port;
    Engine engine;
};

}  // namespace zx917::test
