// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Window fitting: no numbers overflow, and on sane desktops the window ends up inside them.

#include "FuzzInput.h"

#include "common/config/TorkScreenFit_p.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    const int x = input.number();
    const int y = input.number();
    const int width = input.number();
    const int height = input.number();
    const QSize desktop(input.number(), input.number());

    const TorkWindowRect fitted = TorkFitToDesktop(x, y, width, height, desktop);

    const bool isSane = desktop.width() > 640 && desktop.height() > 480 &&
                        desktop.width() < 65536 && desktop.height() < 65536 &&
                        qAbs(qint64(x)) < 65536 && qAbs(qint64(y)) < 65536 &&
                        qAbs(qint64(width)) < 65536 && qAbs(qint64(height)) < 65536;
    if (isSane) {
        Require(fitted.position.x() >= 0 && fitted.position.y() >= 0);
        Require(fitted.position.x() + fitted.size.width() < desktop.width());
        Require(fitted.position.y() + fitted.size.height() < desktop.height());
    }
    return 0;
}
