#include "ui/chooser/box_validators.h"

#include <algorithm>

namespace zx917::ui {

QValidator::State BoxValidator::validate(QString& input, int& pos) const {
    const std::u32string proposed = input.toStdU32String();
    // The text after the cursor stays after it.
    const auto after = static_cast<std::size_t>(
        input.mid(std::clamp<int>(pos, 0, input.size())).toStdU32String().size());
    const std::u32string taken = rule_(previous_, proposed);
    previous_ = taken;
    if (taken != proposed) {
        const std::size_t cursor = taken.size() >= after ? taken.size() - after : 0;
        input = QString::fromStdU32String(taken);
        pos = static_cast<int>(QString::fromStdU32String(taken.substr(0, cursor)).size());
    }
    return Acceptable;
}

}  // namespace zx917::ui
