// The windows are designed in twips: 15 to a pixel at 96 dpi. Qt's high-DPI scaling maps these
// pixels to the screen, so the design units stay the one truth about geometry.
#pragma once

#include <QRect>

namespace zx917::ui {

inline constexpr int kTwipsPerPixel = 15;

constexpr int px(int twips) {
    return (twips + kTwipsPerPixel / 2) / kTwipsPerPixel;
}

inline QRect twips(int left, int top, int width, int height) {
    return QRect(px(left), px(top), px(width), px(height));
}

}  // namespace zx917::ui
