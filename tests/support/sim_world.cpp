#include "support/sim_world.h"

#include "link/line_settings.h"

namespace zx917::test {

int64_t SimSerialPort::charTimeUs(const std::string& settings) const {
    const auto s = ParseLineSettings(settings).value_or(LineSettings{});
    const double bits = 1 + s.dataBits + (s.parity == 'n' ? 0 : 1) + std::stod(s.stopBits);
    return static_cast<int64_t>(bits * 1e6 / s.baud);
}

bool SimSerialPort::setSettings(const std::string& settings) {
    if (!anySettingsText && !ParseLineSettings(settings)) return false;
    settings_ = settings;
    if (open_) settingsHistory.push_back(settings);
    return true;
}

bool SimSerialPort::setPortOpen(bool open) {
    if (!open) {
        open_ = false;
        in_.clear();
        clearOutBuffer();
        return true;
    }
    if (open_) return true;
    if (!present || vanished_ || absent.count(port_) > 0) {
        error_ = "No such file or directory";
        return false;
    }
    open_ = true;
    ++opens;
    settingsHistory.push_back(settings_);
    return true;
}

bool SimSerialPort::output(std::span<const uint8_t> bytes) {
    const bool refused =
        !failWritesOf.empty() && std::string(bytes.begin(), bytes.end()).starts_with(failWritesOf);
    if (!open_ || failWrites || refused || vanished_) {
        error_ = "Input/output error";
        return false;
    }
    sent.push_back({s_.now(), settings_, handshaking_, Bytes(bytes.begin(), bytes.end())});
    const int64_t startUs = std::max(s_.now() * 1000, lineFreeAtUs_);
    const int64_t endUs = startUs + charTimeUs(settings_) * static_cast<int64_t>(bytes.size());
    lineFreeAtUs_ = endUs;
    outPending_ += static_cast<int32_t>(bytes.size());
    const uint64_t gen = outGen_;
    const std::string settings = settings_;
    const Bytes data(bytes.begin(), bytes.end());
    s_.at((endUs + 999) / 1000, [this, gen, settings, data] {
        if (gen != outGen_ || lineHeld) return;  // discarded, or held, before it left
        outPending_ -= static_cast<int32_t>(data.size());
        if (instrument_ != nullptr) {
            const auto ours = ParseLineSettings(settings);
            instrument_->receive(data, ours && *ours == instrument_->line(), settings, s_.now());
            deliverEmissions();
        }
        if (open_ && outPending_ == 0) raise(kCommEvSend);
    });
    if (onSent) onSent(sent.back());
    return true;
}

void SimSerialPort::deliverEmissions() {
    for (Emission& e : instrument_->takeEmissions()) {
        switch (e.kind) {
            case Emission::DsrRise:
                s_.at(e.atMs, [this] {
                    dsr_ = true;
                    if (open_) raise(kCommEvDsr);
                });
                break;
            case Emission::Hangup:
                vanish(e.atMs - s_.now());
                break;
            case Emission::Data: {
                // The answer takes its line time at the instrument's settings.
                const std::string line = instrument_->line().str();
                const int64_t startUs = std::max(e.atMs * 1000, rxFreeAtUs_);
                const int64_t endUs =
                    startUs + charTimeUs(line) * static_cast<int64_t>(e.bytes.size());
                rxFreeAtUs_ = endUs;
                s_.at((endUs + 999) / 1000, [this, line, bytes = std::move(e.bytes)] {
                    const auto ours = ParseLineSettings(settings_);
                    if (!open_ || !ours || *ours != *ParseLineSettings(line)) return;  // lost
                    in_.insert(in_.end(), bytes.begin(), bytes.end());
                    raise(kCommEvReceive);
                });
                break;
            }
        }
    }
}

void SimSerialPort::inject(const std::string& text, int64_t delayMs) {
    s_.at(s_.now() + delayMs, [this, text] {
        if (!open_) return;
        in_.insert(in_.end(), text.begin(), text.end());
        raise(kCommEvReceive);
    });
}

void SimSerialPort::raiseDsr(int64_t delayMs) {
    s_.at(s_.now() + delayMs, [this] {
        dsr_ = true;
        if (open_) raise(kCommEvDsr);
    });
}

void SimSerialPort::vanish(int64_t delayMs) {
    s_.at(s_.now() + delayMs, [this] {
        vanished_ = true;
        error_ = "No such device";
        if (open_) {
            open_ = false;
            raise(kCommEvFailed);
        }
    });
}

void SimSerialPort::raise(int16_t code) {
    const int16_t saved = event_;
    event_ = code;
    raiseOnComm();
    event_ = saved;
}

SimWorld::SimWorld(InstrumentOptions options, bool withInstrument)
    : instrument(withInstrument ? std::make_unique<Instrument>(std::move(options)) : nullptr),
      port(clock, instrument.get()),
      engine(EngineParts{.app = app,
                         .script = script,
                         .port = port,
                         .retry = retry,
                         .rsRetry = rsRetry,
                         .timer1 = timer1,
                         .pump = pump,
                         .file = file}) {
    InitDefaults(app, "/opt/zx917");
    InitCommandScript(script);
    port.setSettings(app.PortSettings);
    port.setPortOpen(true);
}

std::vector<Sent> SimWorld::sendsOf(const std::string& prefix) const {
    std::vector<Sent> out;
    for (const Sent& s : port.sent) {
        if (s.text().starts_with(prefix)) out.push_back(s);
    }
    return out;
}

}  // namespace zx917::test
