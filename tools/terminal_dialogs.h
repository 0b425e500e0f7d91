// Message boxes on a terminal: messages on stderr, questions answered on the terminal.
#pragma once

#include <string>

#include "app/dialogs.h"

namespace zx917 {

class TerminalDialogs : public Dialogs {
public:
    // assumeYes answers every question with OK; without it and without a terminal, Cancel.
    explicit TerminalDialogs(bool assumeYes = false) : assumeYes_(assumeYes) {}
    void critical(const std::string& text) override;
    bool question(const std::string& text) override;
    void information(const std::string& text) override;
    void beep() override;

    int criticalCount() const { return criticals_; }
    // A question was answered with Cancel: the engineer stopped.
    bool declined() const { return declined_; }
    const std::string& lastMessage() const { return last_; }

private:
    bool ask(const std::string& text);

    bool assumeYes_;
    int criticals_ = 0;
    bool declined_ = false;
    std::string last_;
};

// Text from the instrument or a download file is Latin-1; the terminal wants UTF-8.
std::string Latin1ToUtf8(const std::string& latin1);
// Message texts use CR LF between lines; a terminal wants LF.
std::string TerminalLines(const std::string& text);

}  // namespace zx917
