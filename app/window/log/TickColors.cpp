// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/TickColors.h"

#include "app/window/widgets/SeverityIcons.h"

namespace Velocor {

QColor TickColors::Found(QPalette const& palette)
{
    return QColor(SeverityIcons::IsDark(palette) ? 0xff5fd9e8 : 0xff007a8c);
}

QColor TickColors::Marked(QPalette const& palette)
{
    return QColor(SeverityIcons::IsDark(palette) ? 0xffd6a2ff : 0xff8a2be2);
}

} // namespace Velocor
