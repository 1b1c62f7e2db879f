// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ProgramColors.h"

#include "app/window/widgets/SeverityIcons.h"

#include <QHash>
#include <QPainter>
#include <QPalette>
#include <QPixmap>

namespace Velocor {

namespace {

struct ProgramColor
{
    QRgb onLight;
    QRgb onDark;
};

// Neighbors differ in lightness, too.
constexpr ProgramColor LogColors[ProgramColors::Count] = {
    {0xff1f5fbf, 0xff6ea8ff}, {0xffb35900, 0xffffb347}, {0xff1b6b3a, 0xff57c785},
    {0xff9b3fb5, 0xffd99cf0}, {0xff0f5c66, 0xff4fd0e0}, {0xffc2364f, 0xffff8fa3},
    {0xff5a4a00, 0xffd9c74a}, {0xff5f6670, 0xffb4bcc8},
};

constexpr int SwatchSizes[] = {16, 24, 32, 48};

QPixmap Swatch(int size, QColor const& color)
{
    QPixmap pixmap(size, size);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(color);
    const qreal margin = size / 5.0;
    painter.drawRoundedRect(QRectF(margin, margin, size - 2 * margin, size - 2 * margin),
                            size / 10.0, size / 10.0);
    return pixmap;
}

} // namespace

QColor ProgramColors::Color(int log, QPalette const& palette)
{
    ProgramColor const& color = LogColors[log % Count];
    return QColor(SeverityIcons::IsDark(palette) ? color.onDark : color.onLight);
}

QIcon ProgramColors::Icon(int log, QPalette const& palette)
{
    // Never deleted, because pixmaps must not be destroyed after the application object.
    static auto* const icons = new QHash<int, QIcon>;
    const int key = log % Count * 2 + (SeverityIcons::IsDark(palette) ? 1 : 0);
    QIcon& icon = (*icons)[key];
    if (icon.isNull()) {
        for (int size : SwatchSizes) {
            icon.addPixmap(Swatch(size, Color(log, palette)));
            icon.addPixmap(Swatch(size, palette.color(QPalette::HighlightedText)), QIcon::Selected);
        }
    }
    return icon;
}

} // namespace Velocor
