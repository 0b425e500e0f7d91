#include "download/cli_view.h"

#include <unistd.h>

#include <cstdio>
#include <iostream>

namespace zx917 {

namespace {
constexpr auto kTtyRedraw = std::chrono::milliseconds(100);
constexpr auto kPlainEvery = std::chrono::seconds(10);
}  // namespace

CliView::CliView() : tty_(::isatty(STDERR_FILENO) != 0) {}

void CliView::setProgressRange(int32_t minimum, int32_t maximum) {
    min_ = minimum;
    max_ = maximum;
}

void CliView::setProgressValue(int32_t value) {
    value_ = value;
    draw();
}

void CliView::setByteLabel(const std::string& text) {
    bytes_ = text;
    draw();
}

void CliView::setRemainingTime(int page, const std::string& text) {
    if (page == 2) {
        estimate = text;
        return;
    }
    remaining_ = text;
    draw();
}

void CliView::setAnimationPlaying(bool playing) {
    if (playing) {
        active_ = true;
        draw(true);
    } else if (active_) {
        draw(true);
        active_ = false;
        if (tty_) std::cerr << std::endl;
    }
}

void CliView::draw(bool force) {
    if (!active_) return;
    const auto now = std::chrono::steady_clock::now();
    const int span = max_ - min_;
    const int percent = span > 0 ? static_cast<int>(100.0 * (value_ - min_) / span) : 0;
    if (!force) {
        if (tty_ && now - lastDraw_ < kTtyRedraw) return;
        if (!tty_ && percent / 10 == lastPercent_ / 10 && now - lastDraw_ < kPlainEvery) return;
    }
    lastDraw_ = now;
    lastPercent_ = percent;
    char buf[128];
    std::snprintf(buf, sizeof buf, "%3d%%  %s  remaining %s", percent, bytes_.c_str(),
                  remaining_.empty() ? "--:--" : remaining_.c_str());
    if (tty_) {
        std::cerr << "\r\x1b[K" << buf << std::flush;
    } else {
        std::cerr << buf << std::endl;
    }
}

}  // namespace zx917
