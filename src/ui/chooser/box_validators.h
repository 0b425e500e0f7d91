// The name and type boxes take text through the chooser's name rules, so that paste, drop and
// input methods obey them as typed keys do.
#pragma once

#include <QValidator>
#include <string>
#include <string_view>

namespace zx917::ui {

class BoxValidator : public QValidator {
public:
    // The text a box takes, from the text it had and the text proposed.
    using Rule = std::u32string (*)(std::u32string_view previous, std::u32string_view proposed);

    BoxValidator(Rule rule, QObject* parent) : QValidator(parent), rule_(rule) {}

    // Always Acceptable: the proposed text is replaced by what the rule makes of it.
    State validate(QString& input, int& pos) const override;

private:
    Rule rule_;
    // The text the box holds: every text validated is taken, as the rule made it.
    mutable std::u32string previous_;
};

}  // namespace zx917::ui
