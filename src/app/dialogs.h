// Modal message boxes and the beep, as the operations need them; every box carries kAppTitle.
#pragma once

#include <string>

namespace zx917 {

class Dialogs {
public:
    virtual ~Dialogs() = default;
    virtual void critical(const std::string& text) = 0;
    // OK and Cancel; true when OK was pressed. Closing the box counts as Cancel.
    virtual bool question(const std::string& text) = 0;
    virtual void information(const std::string& text) = 0;
    virtual void beep() = 0;
};

}  // namespace zx917
