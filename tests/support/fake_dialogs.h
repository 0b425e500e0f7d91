// Dialogs that record what was shown and answer questions from a script.
#pragma once

#include <deque>
#include <ostream>
#include <string>
#include <vector>

#include "app/dialogs.h"

namespace zx917::test {

class FakeDialogs : public Dialogs {
public:
    struct Shown {
        std::string kind;  // "critical", "question", "information", "beep"
        std::string text;
        bool operator==(const Shown&) const = default;
        friend void PrintTo(const Shown& s, std::ostream* os) {
            *os << s.kind << " \"" << s.text << "\"";
        }
    };

    void critical(const std::string& text) override { shown.push_back({"critical", text}); }
    bool question(const std::string& text) override {
        shown.push_back({"question", text});
        if (answers.empty()) return false;
        const bool a = answers.front();
        answers.pop_front();
        return a;
    }
    void information(const std::string& text) override { shown.push_back({"information", text}); }
    void beep() override { shown.push_back({"beep", ""}); }

    std::vector<Shown> shown;
    std::deque<bool> answers;  // OK = true; when empty, Cancel
};

}  // namespace zx917::test
