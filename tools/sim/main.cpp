// zx917-sim: the ZX917 on a pseudo-terminal, for the demo, the tests and the benchmarks.
#include <fcntl.h>
#include <poll.h>
#include <termios.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <deque>
#include <fstream>
#include <iostream>
#include <string>
#include <thread>

#include "app/identity.h"
#include "instrument/instrument.h"
#include "sim/expect.h"

namespace {

using Clock = std::chrono::steady_clock;
volatile std::sig_atomic_t gStop = 0;

constexpr const char* kUsage = R"(usage: zx917-sim [OPTIONS]
The ZX917 instrument on a pseudo-terminal.
  --link PATH            put a symlink to the terminal at PATH (the program opens PATH)
  --revision REV         current firmware revision (A.01.02)
  --identity TEXT        the identity answer's first 39 characters, the revision follows
                         (Quorvex,ZX917,SN0001234567,FW)
  --settings S           the instrument's own serial settings (9600,n,8,1)
  --terminator crlf|cr|lf  line end of its queries (crlf)
  --amps-flag C          flag in its REV answers; 0 leaves the AMPS section out (1)
  --program-delay MS     time to program an area after its last record (100)
  --open-delay MS        time to answer OPEN (20)
  --answer-delay MS      time to answer any other command or record (2)
  --idn-only             answer "*IDN?" and nothing else
  --no-download-mode     ignore "MAINTENANCE:DOWNLOAD"
  --wrong-revc           confirm another revision on "REVC"
  --quiet-after-revc     send nothing between "REVC" and "REBOOT" (the program then waits
                         its full 40 s); by default an empty line follows after 500 ms
  --noise                noise lines and control characters before every answer
  --fault ACTION:CMD[:FROM[:TIMES]]
                         silent|abort|garble|refuse|hangup at a command (*IDN?, OPEN, SP2,
                         DL for any record, DLE for a last record, EP, CLOSE, REVC, REBOOT...)
                         from its FROM-th time on, TIMES times at most (0: always);
                         restart:P2:R:K asks K times to restart area P2 at its R-th record
  --line-rate            take the line time of every byte, both ways, at the line's rate
  --expect FILE          compare every record received with this download file
  --report PATH          write the JSON report there at the end (else stdout)
  --once                 end after "REBOOT" has been answered or the line hung up
  --help                 show this text
  --version              show the version
)";

struct Pending {
    Clock::time_point due;
    zx917::Emission e;
};

int64_t msSince(Clock::time_point start) {
    return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - start).count();
}

std::string baudText(speed_t s) {
    switch (s) {
        case B1200:
            return "1200";
        case B2400:
            return "2400";
        case B4800:
            return "4800";
        case B9600:
            return "9600";
        case B19200:
            return "19200";
        case B38400:
            return "38400";
        case B57600:
            return "57600";
        case B115200:
            return "115200";
        default:
            return "?";
    }
}

// The terminal's settings as a pseudo-terminal shows them: speed and stop bits are kept;
// parity and character size are not, so they read as "*".
std::string ptySettings(int slave, int& baud, bool& twoStop) {
    termios t{};
    if (::tcgetattr(slave, &t) != 0) return "?";
    const std::string b = baudText(::cfgetospeed(&t));
    baud = b == "?" ? 0 : std::stoi(b);
    twoStop = (t.c_cflag & CSTOPB) != 0;
    return b + ",*,*," + (twoStop ? "2" : "1");
}

}  // namespace

int main(int argc, char** argv) {
    zx917::InstrumentOptions opt;
    opt.readyAfterRevcMs = 500;
    std::string link, expectFile, reportPath;
    bool lineRate = false, once = false;
    for (int i = 1; i < argc; ++i) {
        const std::string a = argv[i];
        auto next = [&]() -> std::string {
            if (i + 1 >= argc) {
                std::cerr << "zx917-sim: " << a << " needs a value\n";
                std::exit(2);
            }
            return argv[++i];
        };
        if (a == "--link")
            link = next();
        else if (a == "--revision")
            opt.revision = next();
        else if (a == "--identity")
            opt.identity = next();
        else if (a == "--settings") {
            auto s = zx917::ParseLineSettings(next());
            if (!s) {
                std::cerr << "zx917-sim: bad --settings\n";
                return 2;
            }
            opt.userLine = *s;
        } else if (a == "--terminator") {
            const std::string t = next();
            opt.terminator = t == "cr" ? "\r" : t == "lf" ? "\n" : "\r\n";
        } else if (a == "--amps-flag")
            opt.ampsFlag = next()[0];
        else if (a == "--program-delay")
            opt.programDelayMs = std::atoi(next().c_str());
        else if (a == "--open-delay")
            opt.openDelayMs = std::atoi(next().c_str());
        else if (a == "--answer-delay")
            opt.answerDelayMs = std::atoi(next().c_str());
        else if (a == "--idn-only")
            opt.idnOnly = true;
        else if (a == "--no-download-mode")
            opt.noDownloadMode = true;
        else if (a == "--wrong-revc")
            opt.wrongRevc = true;
        else if (a == "--noise")
            opt.noise = true;
        else if (a == "--quiet-after-revc")
            opt.readyAfterRevcMs = -1;
        else if (a == "--fault") {
            zx917::Fault f;
            if (!zx917::ParseFault(next(), f)) {
                std::cerr << "zx917-sim: bad --fault\n";
                return 2;
            }
            opt.faults.push_back(f);
        } else if (a == "--line-rate")
            lineRate = true;
        else if (a == "--expect")
            expectFile = next();
        else if (a == "--report")
            reportPath = next();
        else if (a == "--once")
            once = true;
        else if (a == "--help" || a == "-h") {
            std::cout << kUsage;
            return 0;
        } else if (a == "--version") {
            std::cout << "zx917-sim " << zx917::kVersion << "\n";
            return 0;
        } else {
            std::cerr << "zx917-sim: unknown option " << a << "\n" << kUsage;
            return 2;
        }
    }

    const int master = ::posix_openpt(O_RDWR | O_NOCTTY);
    if (master < 0 || ::grantpt(master) != 0 || ::unlockpt(master) != 0) {
        std::perror("zx917-sim: pseudo-terminal");
        return 1;
    }
    const std::string slavePath = ::ptsname(master);
    // Held open so that the program's close and reopen never hang the line up, and to read the
    // terminal's settings.
    const int slave = ::open(slavePath.c_str(), O_RDWR | O_NOCTTY);
    termios raw{};
    ::tcgetattr(slave, &raw);
    ::cfmakeraw(&raw);
    ::cfsetspeed(&raw, B9600);
    ::tcsetattr(slave, TCSANOW, &raw);
    if (!link.empty()) {
        ::unlink(link.c_str());
        if (::symlink(slavePath.c_str(), link.c_str()) != 0) {
            std::perror("zx917-sim: --link");
            return 1;
        }
    }
    std::signal(SIGTERM, [](int) { gStop = 1; });
    std::signal(SIGINT, [](int) { gStop = 1; });
    std::signal(SIGPIPE, SIG_IGN);
    std::cerr << "zx917-sim: instrument on " << slavePath << (link.empty() ? "" : " (" + link + ")")
              << std::endl;

    zx917::Instrument inst(opt);
    const auto start = Clock::now();
    std::deque<Pending> out;
    // Bytes on their way in: due time, bytes, the settings they were written at.
    struct Incoming {
        Clock::time_point due;
        std::vector<uint8_t> bytes;
        std::string settings;
        bool ok;
    };
    std::deque<Incoming> in;
    Clock::time_point rxFree = start, txFree = start;
    std::string prevSettings;
    bool hungUp = false;
    Clock::time_point endAt = Clock::time_point::max();
    auto charTime = [&] {
        const auto& l = inst.line();
        const double bits = 1 + l.dataBits + (l.parity == 'n' ? 0 : 1) + std::stod(l.stopBits);
        return std::chrono::nanoseconds(static_cast<int64_t>(bits * 1e9 / l.baud));
    };
    // Settings as ptySettings writes them: only speed and stop bits can be compared.
    auto matches = [&](const std::string& s) {
        const auto comma = s.find(',');
        if (comma == std::string::npos || s[0] == '?') return false;
        return std::stoi(s.substr(0, comma)) == inst.line().baud &&
               s.substr(s.rfind(',') + 1) == (inst.line().stopBits == "1" ? "1" : "2");
    };
    auto current = [&] {
        int baud = 0;
        bool two = false;
        return ptySettings(slave, baud, two);
    };
    while (!gStop && Clock::now() < endAt) {
        auto next = Clock::now() + std::chrono::milliseconds(200);
        if (!out.empty()) next = std::min(next, out.front().due);
        if (!in.empty()) next = std::min(next, in.front().due);
        const auto waitMs = std::max<int64_t>(
            0, std::chrono::duration_cast<std::chrono::milliseconds>(next - Clock::now()).count());
        pollfd p{master, POLLIN, 0};
        const int r = hungUp ? ::poll(nullptr, 0, static_cast<int>(waitMs))
                             : ::poll(&p, 1, static_cast<int>(waitMs));
        if (r > 0 && (p.revents & POLLIN)) {
            uint8_t buf[4096];
            const ssize_t n = ::read(master, buf, sizeof buf);
            if (n > 0) {
                auto due = Clock::now();
                if (lineRate) {
                    due = std::max(due, rxFree) + charTime() * n;
                    rxFree = due;
                }
                // Judged at the settings they were written at; bytes written just before a
                // speed change still count as sent at the old settings.
                const std::string now = current();
                const bool early = !matches(now) && now != prevSettings && matches(prevSettings);
                const std::string at = early ? prevSettings : now;
                in.push_back({due, std::vector<uint8_t>(buf, buf + n), at, matches(at)});
            }
        }
        // Bytes that have fully arrived go to the instrument at the settings of the moment;
        // bytes written just before a speed change still count as sent at the old settings.
        while (!in.empty() && in.front().due <= Clock::now()) {
            inst.receive(in.front().bytes, in.front().ok, in.front().settings, msSince(start));
            in.pop_front();
            for (auto& e : inst.takeEmissions()) {
                out.push_back({start + std::chrono::milliseconds(e.atMs), std::move(e)});
            }
        }
        if (!hungUp) prevSettings = current();
        while (!out.empty() && out.front().due <= Clock::now()) {
            Pending pe = std::move(out.front());
            out.pop_front();
            if (pe.e.kind == zx917::Emission::Hangup) {
                std::cerr << "zx917-sim: hanging up" << std::endl;
                ::close(master);
                ::close(slave);
                if (!link.empty()) ::unlink(link.c_str());
                hungUp = true;
                endAt = Clock::now() + std::chrono::milliseconds(once ? 100 : 0);
                if (!once) endAt = Clock::time_point::max();
                continue;
            }
            if (pe.e.kind == zx917::Emission::DsrRise) continue;  // a pty has no DSR line
            if (hungUp) continue;
            // The answer goes out only once the program listens at the instrument's speed;
            // give it a moment to switch, then it is lost as it would be on a real line.
            const auto deadline = Clock::now() + std::chrono::milliseconds(300);
            while (!matches(current()) && Clock::now() < deadline) ::usleep(2000);
            if (!matches(current())) {
                std::cerr << "zx917-sim: answer lost, the line is not at " << inst.line().str()
                          << std::endl;
                continue;
            }
            if (lineRate) {
                const auto start2 = std::max(Clock::now(), txFree);
                txFree = start2 + charTime() * static_cast<int64_t>(pe.e.bytes.size());
                std::this_thread::sleep_until(txFree);
            }
            (void)!::write(master, pe.e.bytes.data(), pe.e.bytes.size());
        }
        if (once && inst.rebooted() && out.empty() && endAt == Clock::time_point::max()) {
            endAt = Clock::now() + std::chrono::milliseconds(300);
        }
    }

    std::string report = inst.reportJson();
    if (!expectFile.empty()) report = zx917::AddExpectation(report, inst, expectFile);
    if (reportPath.empty()) {
        std::cout << report;
    } else {
        std::ofstream(reportPath) << report;
    }
    if (!link.empty() && !hungUp) ::unlink(link.c_str());
    return 0;
}
