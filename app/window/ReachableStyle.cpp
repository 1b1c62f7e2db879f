// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ReachableStyle.h"

#include <QStyleOption>
#include <QWidget>

namespace Velocor {

namespace {

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
    if (!widget->accessibleName().isEmpty())
        return;
    if (widget->inherits("QLineEditIconButton"))
        widget->setAccessibleName(tr("Clear"));
    else if (widget->objectName() == QLatin1String("qt_toolbar_ext_button"))
        widget->setAccessibleName(tr("More tools"));
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
