#include "link/qt/trace_writer.h"

#include <cstdio>

#include "link/engine.h"
#include "link/qt/qt_serial_port.h"

namespace zx917 {

namespace {
std::string printable(const std::string& bytes) {
    std::string out;
    for (const char ch : bytes) {
        const auto c = static_cast<unsigned char>(ch);
        if (c == '\r')
            out += "\\r";
        else if (c == '\n')
            out += "\\n";
        else if (c == '\\')
            out += "\\\\";
        else if (c >= 0x20 && c < 0x7F)
            out += ch;
        else {
            char buf[8];
            std::snprintf(buf, sizeof buf, "\\x%02X", c);
            out += buf;
        }
    }
    return out;
}
}  // namespace

TraceWriter::TraceWriter(const std::string& path) : out_(path) {
    out_ << "# time(s) kind [line settings] data; bytes shown as text with \\r \\n \\xHH\n";
}

std::string TraceWriter::stamp() const {
    const auto ms = std::chrono::duration_cast<std::chrono::milliseconds>(
                        std::chrono::steady_clock::now() - start_)
                        .count();
    char buf[32];
    std::snprintf(buf, sizeof buf, "%8lld.%03lld", static_cast<long long>(ms / 1000),
                  static_cast<long long>(ms % 1000));
    return buf;
}

void TraceWriter::line(const std::string& kind, const std::string& settings,
                       const std::string& text, const std::string& at) {
    out_ << (at.empty() ? stamp() : at) << ' ' << kind
         << (settings.empty() ? "" : " [" + settings + "]") << ' ' << text << '\n';
}

void TraceWriter::traffic(bool sent, std::span<const uint8_t> bytes, const std::string& settings) {
    const std::string data(bytes.begin(), bytes.end());
    if (sent) {
        flush();
        line("TX", settings, printable(data));
        out_.flush();
        return;
    }
    if (rx_.empty()) {
        rxSettings_ = settings;
        rxStamp_ = stamp();  // a received line is stamped with the time of its first byte
    }
    rx_ += data;
    if (!data.empty() && data.back() == '\n') flush();
}

void TraceWriter::event(const std::string& text) {
    flush();
    line("--", "", text);
    out_.flush();
}

void TraceWriter::flush() {
    if (rx_.empty()) return;
    line("RX", rxSettings_, printable(rx_), rxStamp_);
    rx_.clear();
    out_.flush();
}

void AttachTrace(TraceWriter& trace, QtSerialPort& port, Engine& engine) {
    port.onTraffic = [&trace, &port](bool sent, std::span<const uint8_t> bytes) {
        const int16_t hs = port.handshaking();
        trace.traffic(sent, bytes, port.settings() + (hs ? " hs" + std::to_string(hs) : ""));
    };
    engine.setTrace([&trace](const std::string& e) { trace.event(e); });
    port.onNote = [&trace](const std::string& e) { trace.event("port: " + e); };
}

}  // namespace zx917
