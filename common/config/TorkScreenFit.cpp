// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkScreenFit_p.h"

#include <algorithm>

namespace {

constexpr int MinimumWidth = 320;
constexpr int MinimumHeight = 200;

// A damaged file may contain any number, so sums and differences wrap instead of overflowing.
int Sum(int a, int b)
{
    return static_cast<int>(static_cast<unsigned int>(a) + static_cast<unsigned int>(b));
}

int Difference(int a, int b)
{
    return static_cast<int>(static_cast<unsigned int>(a) - static_cast<unsigned int>(b));
}

} // namespace

TorkWindowRect TorkFitToDesktop(int x, int y, int width, int height, QSize const& desktop)
{
    int right = Sum(x, width);
    int bottom = Sum(y, height);

    if (width < 0)
        width = MinimumWidth;
    if (height < 0)
        height = MinimumHeight;

    if (width > desktop.width())
        width = Difference(desktop.width(), 1);
    if (height > desktop.height())
        height = Difference(desktop.height(), 1);

    // The far edges change only here: if x and y are on the desktop, the stored edges are used even
    // if width or height was replaced above. The format's rule.
    if (x < 0) {
        x = 0;
        right = width;
    }
    if (y < 0) {
        y = 0;
        bottom = height;
    }

    if (width < MinimumWidth)
        right = Sum(x, MinimumWidth);
    if (height < MinimumHeight) {
        bottom = Sum(y, MinimumHeight);
        height = MinimumHeight;
    }

    if (right >= desktop.width()) {
        right = Difference(desktop.width(), 1);
        x = std::max(0, Difference(right, std::max(width, MinimumWidth)));
    }
    if (bottom >= desktop.height()) {
        bottom = Difference(desktop.height(), 1);
        y = std::max(0, Difference(bottom, height));
    }

    return {QPoint(x, y), QSize(Difference(right, x), Difference(bottom, y))};
}
