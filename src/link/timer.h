// A fixed-interval timer of the main window; the platform calls its tick handler.
#pragma once

#include <functional>

namespace zx917 {

class Timer {
public:
    virtual ~Timer() = default;
    // Switching on a running timer leaves its phase alone.
    virtual void setEnabled(bool on) = 0;
    virtual bool enabled() const = 0;
    void setOnTick(std::function<void()> handler) { onTick_ = std::move(handler); }

protected:
    void tick() {
        if (onTick_) onTick_();
    }

private:
    std::function<void()> onTick_;
};

inline constexpr int kRetryIntervalMs = 1000;
inline constexpr int kRsRetryIntervalMs = 1000;
inline constexpr int kTimer1IntervalMs = 100;

}  // namespace zx917
