// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/SeverityIcons.h"

#include <QHash>
#include <QPainter>
#include <QPainterPath>
#include <QPalette>
#include <QPixmap>

namespace Velocor {

namespace {

constexpr qreal Box = 16; // size of the square that shapes are drawn in
constexpr int Sizes[] = {16, 24, 32, 48};

// Chosen for a contrast of more than 4.5:1 against the background.
QColor ForBackground(QPalette const& palette, QRgb onLight, QRgb onDark)
{
    return QColor(SeverityIcons::IsDark(palette) ? onDark : onLight);
}

QPolygonF Triangle()
{
    return QPolygonF() << QPointF(8, 1.5) << QPointF(15.2, 14) << QPointF(0.8, 14);
}

QPolygonF Octagon()
{
    return QPolygonF() << QPointF(5, 1) << QPointF(11, 1) << QPointF(15, 5) << QPointF(15, 11)
                       << QPointF(11, 15) << QPointF(5, 15) << QPointF(1, 11) << QPointF(1, 5);
}

void DrawMark(QPainter& painter, QColor const& color, qreal top, qreal bottom)
{
    painter.setPen(QPen(color, 1.9, Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(8, top), QPointF(8, bottom));
    painter.setPen(Qt::NoPen);
    painter.setBrush(color);
    painter.drawEllipse(QPointF(8, bottom + 3), 1.1, 1.1);
}

void DrawCross(QPainter& painter, QColor const& color)
{
    painter.setPen(QPen(color, 2, Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(5.4, 5.4), QPointF(10.6, 10.6));
    painter.drawLine(QPointF(10.6, 5.4), QPointF(5.4, 10.6));
}

void DrawInformation(QPainter& painter, QColor const& mark)
{
    painter.drawEllipse(QPointF(8, 8), 7, 7);
    painter.setPen(QPen(mark, 1.9, Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(8, 7.6), QPointF(8, 11.6));
    painter.setPen(Qt::NoPen);
    painter.setBrush(mark);
    painter.drawEllipse(QPointF(8, 4.6), 1.15, 1.15);
}

void Draw(QPainter& painter, LogEntry::Severity severity, QColor const& color, QColor const& mark)
{
    painter.setPen(Qt::NoPen);
    painter.setBrush(color);
    switch (severity) {
    case LogEntry::Trace:
        painter.drawEllipse(QPointF(8, 8), 2.4, 2.4);
        break;
    case LogEntry::Notification:
        DrawInformation(painter, mark);
        break;
    case LogEntry::Warning:
        painter.drawPolygon(Triangle());
        DrawMark(painter, mark, 6, 9.2);
        break;
    case LogEntry::Error:
        painter.drawEllipse(QPointF(8, 8), 7, 7);
        DrawCross(painter, mark);
        break;
    case LogEntry::Fatal:
        painter.drawPolygon(Octagon());
        DrawMark(painter, mark, 4, 8.6);
        break;
    case LogEntry::None:
        painter.setPen(QPen(color, 1.6, Qt::DotLine));
        painter.setBrush(Qt::NoBrush);
        painter.drawEllipse(QPointF(8, 8), 5.5, 5.5);
        break;
    }
}

QPixmap Pixmap(int size, LogEntry::Severity severity, QColor const& color, QColor const& mark)
{
    QPixmap pixmap(size, size);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.scale(size / Box, size / Box);
    Draw(painter, severity, color, mark);
    return pixmap;
}

QPixmap StruckThrough(QPixmap const& pixmap, QColor const& color)
{
    QPixmap result(pixmap.size());
    result.fill(Qt::transparent);
    QPainter painter(&result);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setOpacity(0.3);
    painter.drawPixmap(0, 0, pixmap);
    painter.setOpacity(1);
    painter.scale(pixmap.width() / Box, pixmap.height() / Box);
    painter.setPen(QPen(color, 1.4, Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(2, 14), QPointF(14, 2));
    return result;
}

// The trace dot is faded, to be less prominent than the others.
QColor IconColor(LogEntry::Severity severity, QPalette const& palette)
{
    QColor color = SeverityIcons::Color(severity, palette);
    if (severity == LogEntry::Trace)
        color.setAlphaF(0.55);
    return color;
}

} // namespace

bool SeverityIcons::IsDark(QPalette const& palette)
{
    return palette.color(QPalette::Base).lightness() < 128;
}

QColor SeverityIcons::Color(LogEntry::Severity severity, QPalette const& palette)
{
    switch (severity) {
    case LogEntry::Notification:
        return ForBackground(palette, 0xff1a5fb4, 0xff78aeed);
    case LogEntry::Warning:
        return ForBackground(palette, 0xff8f5200, 0xfff5c211);
    case LogEntry::Error:
        return ForBackground(palette, 0xffc01c28, 0xffff7b7b);
    case LogEntry::Fatal:
        return ForBackground(palette, 0xff9c1482, 0xffff8ee6);
    case LogEntry::Trace:
    case LogEntry::None:
        break;
    }
    return palette.color(QPalette::Text);
}

QIcon SeverityIcons::Icon(LogEntry::Severity severity, QPalette const& palette)
{
    if (severity == LogEntry::None)
        return QIcon();

    // Never deleted, because pixmaps must not be destroyed after the application object.
    static auto* const icons = new QHash<QPair<quint64, quint64>, QIcon>;
    const auto pair = [&palette](QPalette::ColorRole first, QPalette::ColorRole second) {
        return quint64(palette.color(first).rgb()) << 32 | palette.color(second).rgb();
    };
    QIcon& icon = (*icons)[qMakePair(pair(QPalette::Text, QPalette::Base) ^ quint64(severity) << 24,
                                     pair(QPalette::Highlight, QPalette::HighlightedText))];
    if (icon.isNull()) {
        const QColor color = IconColor(severity, palette);
        QColor const& selected = palette.color(QPalette::HighlightedText);
        for (int size : Sizes) {
            icon.addPixmap(Pixmap(size, severity, color, palette.color(QPalette::Base)));
            icon.addPixmap(Pixmap(size, severity, selected, palette.color(QPalette::Highlight)),
                           QIcon::Selected);
        }
    }
    return icon;
}

QIcon SeverityIcons::SwitchIcon(LogEntry::Severity severity, QPalette const& palette)
{
    QIcon icon;
    const QColor color = IconColor(severity, palette);
    for (int size : Sizes) {
        const QPixmap on = Pixmap(size, severity, color, palette.color(QPalette::Base));
        icon.addPixmap(on, QIcon::Normal, QIcon::On);
        icon.addPixmap(StruckThrough(on, palette.color(QPalette::ButtonText)), QIcon::Normal,
                       QIcon::Off);
    }
    return icon;
}

} // namespace Velocor
