// The program's icon, drawn in code: no file to lose. The window, the desktop entry and the
// icon theme all show this one drawing.
#pragma once

#include <QIcon>

namespace zx917::ui {

QIcon ProgramIcon();

}  // namespace zx917::ui
