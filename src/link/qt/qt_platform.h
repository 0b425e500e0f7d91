// The timers and the event pump on Qt's event loop.
#pragma once

#include <QCoreApplication>
#include <QTimer>

#include "link/event_pump.h"
#include "link/timer.h"

namespace zx917 {

class QtTimer : public Timer {
public:
    explicit QtTimer(int intervalMs);
    void setEnabled(bool on) override;
    bool enabled() const override { return timer_.isActive(); }

private:
    QTimer timer_;
};

// One turn: blocks until at least one event has come, then processes what is pending.
class QtEventPump : public EventPump {
public:
    void processNextEvent() override {
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
};

}  // namespace zx917
