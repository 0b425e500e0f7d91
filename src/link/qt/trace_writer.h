// The --trace file: every byte on the line with time, direction and line settings, and every
// time-out, resend, abort and restart, one event a line.
#pragma once

#include <chrono>
#include <fstream>
#include <span>
#include <string>

namespace zx917 {

class Engine;
class QtSerialPort;

class TraceWriter {
public:
    explicit TraceWriter(const std::string& path);
    bool ok() const { return out_.good(); }
    void traffic(bool sent, std::span<const uint8_t> bytes, const std::string& settings);
    void event(const std::string& text);
    void flush();

private:
    void line(const std::string& kind, const std::string& settings, const std::string& text,
              const std::string& at = {});
    std::string stamp() const;
    std::string rxStamp_;

    std::ofstream out_;
    std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
    std::string rx_;  // received bytes until their line ends
    std::string rxSettings_;
};

// Writes every byte of the port, with the settings of the moment, and every event of the
// engine to the trace.
void AttachTrace(TraceWriter& trace, QtSerialPort& port, Engine& engine);

}  // namespace zx917
