// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/ValueIcons.h"

#include <QCoreApplication>
#include <QPainter>
#include <QPalette>
#include <QPixmap>

namespace Velocor {

namespace {

constexpr int DrawnSize = 16; // of the square that icons are drawn in, in pixels
constexpr int IconScales[] = {1, 2, 3};

void DrawLetters(QPainter& painter, QString const& letters, bool isSerif)
{
    QFont font(isSerif ? QStringLiteral("Serif") : QStringLiteral("Sans"));
    font.setPixelSize(letters.size() > 1 ? 9 : 14);
    font.setBold(true);
    painter.setFont(font);
    painter.drawText(QRect(0, 0, DrawnSize, DrawnSize), Qt::AlignCenter, letters);
}

void DrawSize(QPainter& painter)
{
    painter.drawRect(QRectF(1.5, 3.5, 13, 9));
    painter.drawLine(QPointF(4, 10.5), QPointF(12, 5.5));
    painter.drawPolyline(QPolygonF({QPointF(8.6, 5.5), QPointF(12, 5.5), QPointF(12, 8)}));
    painter.drawPolyline(QPolygonF({QPointF(4, 8), QPointF(4, 10.5), QPointF(7.4, 10.5)}));
}

void DrawWindow(QPainter& painter)
{
    painter.drawRect(QRectF(1.5, 2.5, 13, 11));
    painter.fillRect(QRectF(1.5, 2.5, 13, 3), painter.pen().color());
}

void DrawList(QPainter& painter)
{
    for (int y : {4, 8, 12}) {
        painter.drawPoint(QPointF(2.5, y));
        painter.drawLine(QPointF(5.5, y), QPointF(14, y));
    }
}

void DrawKind(QPainter& painter, ValueKind kind, QString const& text)
{
    switch (kind) {
    case ValueKind::Number:
        DrawLetters(painter, QStringLiteral("12"), false);
        break;
    case ValueKind::Color: {
        QColor color(Qt::transparent);
        TypedText::ToColor(text, color);
        painter.setBrush(color);
        painter.drawRect(QRectF(1.5, 1.5, 13, 13));
        break;
    }
    case ValueKind::Size:
        DrawSize(painter);
        break;
    case ValueKind::Font:
        DrawLetters(painter, QStringLiteral("F"), true);
        break;
    case ValueKind::WindowPlace:
        DrawWindow(painter);
        break;
    case ValueKind::FileList:
        DrawList(painter);
        break;
    default:
        DrawLetters(painter, QStringLiteral("ab"), false);
        break;
    }
}

} // namespace

QString ValueKindName(ValueKind kind)
{
    switch (kind) {
    case ValueKind::YesNo:
        return QCoreApplication::translate("ValueKind", "Yes or no");
    case ValueKind::Number:
        return QCoreApplication::translate("ValueKind", "Number");
    case ValueKind::Color:
        return QCoreApplication::translate("ValueKind", "Color");
    case ValueKind::Size:
        return QCoreApplication::translate("ValueKind", "Size");
    case ValueKind::Font:
        return QCoreApplication::translate("ValueKind", "Font");
    case ValueKind::WindowPlace:
        return QCoreApplication::translate("ValueKind", "Window place");
    case ValueKind::FileList:
        return QCoreApplication::translate("ValueKind", "File list");
    default:
        return QCoreApplication::translate("ValueKind", "Text");
    }
}

QIcon ValueIcon(ValueKind kind, QString const& text, QPalette const& palette)
{
    QIcon icon;
    for (int scale : IconScales) {
        QPixmap pixmap(DrawnSize * scale, DrawnSize * scale);
        pixmap.fill(Qt::transparent);
        QPainter painter(&pixmap);
        painter.setRenderHint(QPainter::Antialiasing);
        painter.scale(scale, scale);
        painter.setPen(QPen(palette.color(QPalette::Text), 1.2));
        DrawKind(painter, kind, text);
        icon.addPixmap(pixmap);
    }
    return icon;
}

} // namespace Velocor
