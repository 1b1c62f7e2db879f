// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ReachableStyle.h"

#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/Contrast.h"
#include "app/window/widgets/UsualTextHeight.h"

#include <QAbstractScrollArea>
#include <QApplication>
#include <QEvent>
#include <QMetaEnum>
#include <QPainter>
#include <QPalette>
#include <QStyleOption>
#include <QWidget>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int FrameShade = 140; // of Fusion's frames, in percent

QColor FocusColor(QPalette const& palette, QColor const& ground, qreal least = PartContrast)
{
    return WithContrast(palette.color(QPalette::Highlight), ground, least);
}

// Of what would not be recognized without it.
QColor BoundaryColor(QPalette const& palette)
{
    QColor const& window = palette.color(QPalette::Window);
    const QColor frame = WithContrast(window, window, PartContrast);
    return WithContrast(frame, palette.color(QPalette::Base), PartContrast);
}

void DrawFrame(QPainter* painter, QRect const& place, QColor const& color)
{
    painter->save();
    painter->setRenderHint(QPainter::Antialiasing, false);
    painter->setPen(QPen(color, 1));
    painter->setBrush(Qt::NoBrush);
    painter->drawRect(QRectF(place).adjusted(0.5, 0.5, -0.5, -0.5));
    painter->restore();
}

bool IsSeparator(QStyle::ContentsType type, QStyleOption const* option)
{
    auto const* entry = qstyleoption_cast<QStyleOptionMenuItem const*>(option);
    return type == QStyle::CT_MenuItem && entry &&
           entry->menuItemType == QStyleOptionMenuItem::Separator;
}

} // namespace

void ReachableStyle::polish(QWidget* widget)
{
    QProxyStyle::polish(widget);
    if (qobject_cast<QAbstractScrollArea*>(widget))
        widget->installEventFilter(this);
    if (!widget->accessibleName().isEmpty())
        return;
    if (widget->inherits("QLineEditIconButton"))
        widget->setAccessibleName(tr("Clear"));
    else if (widget->objectName() == QLatin1String("qt_toolbar_ext_button"))
        widget->setAccessibleName(tr("More tools"));
}

void ReachableStyle::unpolish(QWidget* widget)
{
    widget->removeEventFilter(this);
    QProxyStyle::unpolish(widget);
}

// Qt paints their contents again, but not the frame.
bool ReachableStyle::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::FocusIn || event->type() == QEvent::FocusOut)
        static_cast<QWidget*>(watched)->update();
    return QProxyStyle::eventFilter(watched, event);
}

void ReachableStyle::polish(QPalette& palette)
{
    QProxyStyle::polish(palette);
    // Older versions of Qt have no such role.
    const auto roles = QMetaEnum::fromType<QPalette::ColorRole>();
    const int placeholders = roles.keyToValue("PlaceholderText");
    for (const QPalette::ColorGroup group : {QPalette::Active, QPalette::Inactive}) {
        const QColor selected = palette.color(group, QPalette::HighlightedText);
        const QColor highlight = palette.color(group, QPalette::Highlight);
        palette.setColor(group, QPalette::Highlight,
                         WithContrast(highlight, selected, TextContrast));
        if (placeholders < 0)
            continue;
        const auto role = static_cast<QPalette::ColorRole>(placeholders);
        const QColor base = palette.color(group, QPalette::Base);
        const QColor placeholder = palette.color(group, role);
        const QColor seen = Blended(base, placeholder, placeholder.alphaF());
        palette.setColor(group, role, WithContrast(seen, base, TextContrast));
    }
}

QSize ReachableStyle::sizeFromContents(ContentsType type, QStyleOption const* option,
                                       QSize const& size, QWidget const* widget) const
{
    const QSize usual = QProxyStyle::sizeFromContents(type, option, size, widget);
    switch (type) {
    case CT_CheckBox:
    case CT_ComboBox:
    case CT_LineEdit:
    case CT_MenuBarItem:
    case CT_MenuItem:
    case CT_PushButton:
    case CT_RadioButton:
    case CT_SpinBox:
    case CT_TabBarTab:
    case CT_ToolButton:
        return IsSeparator(type, option) ? usual
                                         : usual.expandedTo(QSize(LeastTarget, LeastTarget));
    default:
        return usual;
    }
}

// The field in a spin box has no frame of its own.
void ReachableStyle::drawComplexControl(ComplexControl control, QStyleOptionComplex const* option,
                                        QPainter* painter, QWidget const* widget) const
{
    QProxyStyle::drawComplexControl(control, option, painter, widget);
    if (control == CC_SpinBox && !(option->state & State_HasFocus))
        DrawFrame(painter, option->rect, BoundaryColor(option->palette));
}

void ReachableStyle::drawPrimitive(PrimitiveElement element, QStyleOption const* option,
                                   QPainter* painter, QWidget const* widget) const
{
    if (element == PE_FrameLineEdit || element == PE_IndicatorCheckBox) {
        QProxyStyle::drawPrimitive(element, option, painter, widget);
        const bool isFocused = element == PE_FrameLineEdit && (option->state & State_HasFocus);
        if (!isFocused)
            DrawFrame(painter, option->rect, BoundaryColor(option->palette));
        return;
    }
    auto const* focus = qstyleoption_cast<QStyleOptionFocusRect const*>(option);
    if (element != PE_FrameFocusRect || !focus)
        QProxyStyle::drawPrimitive(element, option, painter, widget);
    else if (option->state & State_KeyboardFocusChange)
        DrawFrame(painter, option->rect,
                  FocusColor(option->palette, focus->backgroundColor.isValid()
                                                  ? focus->backgroundColor
                                                  : option->palette.color(QPalette::Window)));
}

// Of lists and other parts that scroll.
void ReachableStyle::drawControl(ControlElement element, QStyleOption const* option,
                                 QPainter* painter, QWidget const* widget) const
{
    QProxyStyle::drawControl(element, option, painter, widget);
    auto const* frame = qstyleoption_cast<QStyleOptionFrame const*>(option);
    if (element == CE_ShapedFrame && frame && frame->frameShape != QFrame::NoFrame &&
        (option->state & State_HasFocus) && qobject_cast<QAbstractScrollArea const*>(widget))
        DrawFrame(painter, option->rect,
                  FocusColor(option->palette,
                             option->palette.color(QPalette::Window).darker(FrameShade),
                             TextContrast)); // a thin line
}

int ReachableStyle::pixelMetric(PixelMetric metric, QStyleOption const* option,
                                QWidget const* widget) const
{
    const int usual = QProxyStyle::pixelMetric(metric, option, widget);
    switch (metric) {
    case PM_ButtonIconSize:
    case PM_ExclusiveIndicatorHeight:
    case PM_ExclusiveIndicatorWidth:
    case PM_IndicatorHeight:
    case PM_IndicatorWidth:
    case PM_ListViewIconSize:
    case PM_SmallIconSize:
    case PM_TabBarIconSize:
    case PM_TabCloseIndicatorHeight:
    case PM_TabCloseIndicatorWidth:
    case PM_ToolBarIconSize: {
        const QFontMetrics text =
            widget ? widget->fontMetrics() : QFontMetrics(QApplication::font());
        return usual * std::max(UsualTextHeight, text.height()) / UsualTextHeight;
    }
    default:
        return usual;
    }
}

// Those of Fusion can hardly be seen on dark colors.
int ReachableStyle::styleHint(StyleHint hint, QStyleOption const* option, QWidget const* widget,
                              QStyleHintReturn* returned) const
{
    if (hint == SH_DialogButtonBox_ButtonsHaveIcons)
        return 0;
    return QProxyStyle::styleHint(hint, option, widget, returned);
}

// A click above or below the text of a check box is meant for it, too.
QRect ReachableStyle::subElementRect(SubElement element, QStyleOption const* option,
                                     QWidget const* widget) const
{
    QRect place = QProxyStyle::subElementRect(element, option, widget);
    if (element == SE_CheckBoxClickRect || element == SE_RadioButtonClickRect) {
        place.setTop(option->rect.top());
        place.setBottom(option->rect.bottom());
    }
    return place;
}

} // namespace Velocor
