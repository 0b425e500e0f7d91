// The program's icon for the window, rendered from its drawing.
#pragma once

#include <QIcon>
#include <QImage>

namespace zx917::ui {

// The drawing at side x side pixels.
QImage ProgramIconImage(int side);
QIcon ProgramIcon();

}  // namespace zx917::ui
