// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/ActionIcons.h"

#include "app/window/widgets/SeverityIcons.h"

#include <QPainter>
#include <QPainterPath>
#include <QPalette>
#include <QPixmap>

namespace Velocor {

namespace {

constexpr qreal IconBox = 16; // size of the square that shapes are drawn in
constexpr int IconSizes[] = {16, 24, 32, 48};

QPolygonF Lines(std::initializer_list<QPointF> points)
{
    return QPolygonF(QVector<QPointF>(points));
}

void DrawFolder(QPainter& painter)
{
    painter.drawPolygon(Lines({{1.5, 13}, {1.5, 3}, {6, 3}, {7.6, 5}, {14.5, 5}, {14.5, 13}}));
}

void DrawReload(QPainter& painter)
{
    painter.drawArc(QRectF(2.8, 2.8, 10.4, 10.4), 20 * 16, 290 * 16);
    painter.drawPolyline(Lines({{13.6, 2.2}, {12.9, 6.2}, {8.9, 5.5}}));
}

void DrawPause(QPainter& painter)
{
    painter.setBrush(painter.pen().color());
    painter.drawRect(QRectF(4.3, 3.2, 1.8, 9.6));
    painter.drawRect(QRectF(9.9, 3.2, 1.8, 9.6));
}

void DrawFollow(QPainter& painter)
{
    painter.drawLine(QPointF(8, 2), QPointF(8, 10));
    painter.drawPolyline(Lines({{4.6, 6.8}, {8, 10.2}, {11.4, 6.8}}));
    painter.drawLine(QPointF(3, 13.5), QPointF(13, 13.5));
}

// A warning, and an arrow below or above it.
void DrawProblem(QPainter& painter, bool next, QPalette const& palette)
{
    const qreal top = next ? 1 : 6;
    const qreal arrow = next ? 12 : 4;
    const qreal tip = next ? 14.6 : 1.4;
    painter.drawPolyline(Lines({{4.6, arrow}, {8, tip}, {11.4, arrow}}));
    const QColor warning = SeverityIcons::Color(LogEntry::Warning, palette);
    painter.setPen(QPen(warning, 1.2, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.setBrush(warning);
    painter.drawPolygon(Lines({{8, top}, {13.2, top + 8.6}, {2.8, top + 8.6}}));
}

void DrawFind(QPainter& painter)
{
    painter.drawEllipse(QPointF(6.8, 6.8), 4.4, 4.4);
    painter.drawLine(QPointF(10.2, 10.2), QPointF(14, 14));
}

void DrawFilter(QPainter& painter)
{
    painter.drawPolygon(
        Lines({{1.8, 2.8}, {14.2, 2.8}, {9.4, 8.4}, {9.4, 12}, {6.6, 13.8}, {6.6, 8.4}}));
}

void DrawPlaces(QPainter& painter)
{
    painter.drawPolyline(Lines({{1.6, 8}, {8, 2.2}, {14.4, 8}}));
    painter.drawPolyline(Lines({{3.6, 7}, {3.6, 13.5}, {12.4, 13.5}, {12.4, 7}}));
}

void Draw(QPainter& painter, ActionIcons::Name name, QPalette const& palette)
{
    switch (name) {
    case ActionIcons::Open:
        DrawFolder(painter);
        break;
    case ActionIcons::Reload:
        DrawReload(painter);
        break;
    case ActionIcons::Pause:
        DrawPause(painter);
        break;
    case ActionIcons::Follow:
        DrawFollow(painter);
        break;
    case ActionIcons::PreviousProblem:
        DrawProblem(painter, false, palette);
        break;
    case ActionIcons::NextProblem:
        DrawProblem(painter, true, palette);
        break;
    case ActionIcons::Find:
        DrawFind(painter);
        break;
    case ActionIcons::Filter:
        DrawFilter(painter);
        break;
    case ActionIcons::Places:
        DrawPlaces(painter);
        break;
    }
}

} // namespace

QIcon ActionIcons::Icon(Name name, QPalette const& palette)
{
    QIcon icon;
    for (int size : IconSizes) {
        QPixmap pixmap(size, size);
        pixmap.fill(Qt::transparent);
        QPainter painter(&pixmap);
        painter.setRenderHint(QPainter::Antialiasing);
        painter.scale(size / IconBox, size / IconBox);
        QColor const& color = palette.color(QPalette::Active, QPalette::ButtonText);
        painter.setPen(QPen(color, 1.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
        Draw(painter, name, palette);
        icon.addPixmap(pixmap);
    }
    return icon;
}

} // namespace Velocor
