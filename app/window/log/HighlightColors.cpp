// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/HighlightColors.h"

#include "app/window/widgets/SeverityIcons.h"

#include <QCoreApplication>
#include <QPalette>

namespace Velocor {

namespace {

struct HighlightColor
{
    char const* name;
    QRgb onLight;
    QRgb onDark;
};

constexpr HighlightColor Colors[HighlightColors::Count] = {
    {QT_TRANSLATE_NOOP("HighlightColors", "Green"), 0xffb5e3be, 0xff1d5230},
    {QT_TRANSLATE_NOOP("HighlightColors", "Blue"), 0xffc0d4ff, 0xff23457f},
    {QT_TRANSLATE_NOOP("HighlightColors", "Orange"), 0xffffd2a6, 0xff6b3d0f},
    {QT_TRANSLATE_NOOP("HighlightColors", "Purple"), 0xffdcc7fa, 0xff512f7d},
    {QT_TRANSLATE_NOOP("HighlightColors", "Red"), 0xffffc2c7, 0xff6f222c},
    {QT_TRANSLATE_NOOP("HighlightColors", "Pink"), 0xfffbc4e6, 0xff6d2657},
    {QT_TRANSLATE_NOOP("HighlightColors", "Gray"), 0xffcfd2d7, 0xff4a4f57},
};

} // namespace

QString HighlightColors::Name(int color)
{
    return QCoreApplication::translate("HighlightColors", Colors[color].name);
}

QString HighlightColors::Key(int color)
{
    return QString::fromLatin1(Colors[color].name).toLower();
}

int HighlightColors::FromKey(QString const& key)
{
    for (int color = 0; color < Count; ++color) {
        if (Key(color) == key)
            return color;
    }
    return -1;
}

QColor HighlightColors::Background(int color, QPalette const& palette)
{
    return QColor(SeverityIcons::IsDark(palette) ? Colors[color].onDark : Colors[color].onLight);
}

QColor HighlightColors::Text(QPalette const& palette)
{
    return QColor(SeverityIcons::IsDark(palette) ? 0xfff5f5f5 : 0xff1a1a1a);
}

} // namespace Velocor
