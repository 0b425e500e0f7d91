// The program's icon, one drawing for the window, the desktop entry and the icon theme: an
// instrument's face with a down arrow, firmware going in. Drawn on a 16-unit grid.
#pragma once

#include <string_view>

namespace zx917 {

inline constexpr std::string_view kProgramIconSvg =
    R"(<svg xmlns="http://www.w3.org/2000/svg" width="16" height="16" viewBox="0 0 16 16">
  <rect x="1" y="3" width="14" height="11" rx="2" ry="2" fill="#3c6eaa" stroke="#1e283c" stroke-width="1"/>
  <rect x="3" y="5" width="6" height="4" fill="#c8e6ff" stroke="#1e283c" stroke-width="1"/>
  <polygon points="11,5 14,5 14,8 15.5,8 12.5,12 9.5,8 11,8" fill="#fac828"/>
</svg>
)";

}  // namespace zx917
