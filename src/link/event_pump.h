// One turn of the event loop: wait for the next event and process it. Every wait is a loop
// around it, so a wait costs no CPU and handlers run nested inside the waiting code.
#pragma once

namespace zx917 {

class EventPump {
public:
    virtual ~EventPump() = default;
    virtual void processNextEvent() = 0;
};

}  // namespace zx917
