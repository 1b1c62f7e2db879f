// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/LogFileBox.h"
#include "app/window/widgets/ElidedLabel.h"

#include <QAbstractButton>
#include <QAbstractItemView>
#include <QComboBox>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QScreen>
#include <QScrollArea>
#include <QStyle>
#include <QStyleOptionComboBox>
#include <QToolButton>
#include <QWindow>

/// Whether the texts of a window fit into it, as measured on its visible widgets.
namespace ShownTexts {

inline bool isPart(QWidget const* widget)
{
    return qobject_cast<QAbstractButton const*>(widget) || qobject_cast<QLabel const*>(widget) ||
           qobject_cast<QLineEdit const*>(widget) || qobject_cast<QComboBox const*>(widget) ||
           qobject_cast<QAbstractItemView const*>(widget) ||
           qobject_cast<QPlainTextEdit const*>(widget);
}

/// The visible controls of a window, without those that are parts of another one.
inline QList<QWidget*> parts(QWidget const* window)
{
    QList<QWidget*> found;
    const QList<QWidget*> all = window->findChildren<QWidget*>();
    for (QWidget* widget : all) {
        bool isInner = !isPart(widget) || !widget->isVisible() || widget->window() != window;
        for (QWidget const* outer = widget->parentWidget(); outer && outer != window;
             outer = outer->parentWidget())
            isInner = isInner || isPart(outer);
        if (!isInner)
            found.append(widget);
    }
    return found;
}

/// What a control says, for people who read the report of a test.
inline QString textOf(QWidget const* widget)
{
    if (auto const* button = qobject_cast<QAbstractButton const*>(widget))
        return button->text();
    if (auto const* label = qobject_cast<QLabel const*>(widget))
        return label->text();
    if (auto const* line = qobject_cast<QLineEdit const*>(widget))
        return line->text().isEmpty() ? line->placeholderText() : line->text();
    if (auto const* box = qobject_cast<QComboBox const*>(widget))
        return box->currentText();
    return widget->accessibleName();
}

inline int widthOf(QWidget const* widget, QString text)
{
    return widget->fontMetrics().boundingRect(text.remove('&')).width();
}

/// Those that elide what they show on purpose have it in a tool tip.
inline bool fits(QWidget const* widget)
{
    const QString text = textOf(widget);
    if (dynamic_cast<Velocor::ElidedLabel const*>(widget) || text.isEmpty() ||
        dynamic_cast<Velocor::LogFileBox const*>(widget))
        return true;
    if (auto const* box = qobject_cast<QComboBox const*>(widget)) {
        QStyleOptionComboBox option;
        option.initFrom(box);
        const QRect field = box->style()->subControlRect(QStyle::CC_ComboBox, &option,
                                                         QStyle::SC_ComboBoxEditField, box);
        const int icon = box->itemIcon(box->currentIndex()).isNull() ? 0 : box->iconSize().width();
        return widthOf(box, text) + icon <= field.width();
    }
    if (auto const* line = qobject_cast<QLineEdit const*>(widget))
        return !line->text().isEmpty() || widthOf(line, text) <= line->contentsRect().width() - 4;
    auto const* label = qobject_cast<QLabel const*>(widget);
    if (label && label->wordWrap())
        return label->height() >= label->heightForWidth(label->width());
    auto const* tool = qobject_cast<QToolButton const*>(widget);
    if (tool && !tool->icon().isNull() && tool->toolButtonStyle() == Qt::ToolButtonTextBesideIcon)
        return tool->iconSize().width() + widthOf(tool, text) <= tool->width() - 6 &&
               tool->fontMetrics().height() <= tool->height();
    if (!label && !qobject_cast<QAbstractButton const*>(widget))
        return true; // scrolls
    return widget->width() >= widget->minimumSizeHint().width() &&
           widget->height() >= widget->minimumSizeHint().height();
}

/// Whether a control is whole in the window; in one that scrolls, only from side to side.
inline bool isWhole(QWidget const* widget)
{
    for (QWidget const* outer = widget->parentWidget(); outer; outer = outer->parentWidget()) {
        const QRect place(widget->mapTo(outer, QPoint()), widget->size());
        const bool scrolls = qobject_cast<QScrollArea const*>(outer->parentWidget()) != nullptr;
        if (place.left() < 0 || place.right() > outer->rect().right() ||
            (!scrolls && !outer->rect().contains(place)))
            return false;
        if (scrolls || outer->isWindow())
            return true;
    }
    return true;
}

/// The texts that are cut off, and the window itself if the screen is too small for it.
inline QStringList cutOff(QWidget* window)
{
    QStringList found;
    const QList<QWidget*> all = parts(window);
    for (QWidget const* widget : all) {
        if (!fits(widget) || !isWhole(widget))
            found.append(widget->metaObject()->className() + (": " + textOf(widget)));
    }
    const QList<QHeaderView*> headers = window->findChildren<QHeaderView*>();
    for (QHeaderView const* header : headers) {
        for (int i = 0;
             header->isVisible() && header->orientation() == Qt::Horizontal && i < header->count();
             ++i) {
            // The last one has what is left; the table scrolls.
            const bool isRest = header->stretchLastSection() && i + 1 == header->count();
            if (!isRest && !header->isSectionHidden(i) &&
                header->sectionSize(i) < header->sectionSizeHint(i))
                found.append("column: " +
                             header->model()->headerData(i, Qt::Horizontal).toString());
        }
    }
    const QSize screen = window->windowHandle()->screen()->size();
    if (window->width() > screen.width() || window->height() > screen.height())
        found.append(QString("a window of %1 x %2").arg(window->width()).arg(window->height()));
    return found;
}

/// Controls that are drawn over each other.
inline QStringList overlapping(QWidget* window)
{
    QStringList found;
    const QList<QWidget*> all = parts(window);
    const auto placeOf = [window](QWidget const* widget) {
        QRect place = widget->rect();
        for (QWidget const* inner = widget; inner != window; inner = inner->parentWidget())
            place = place.translated(inner->pos()) & inner->parentWidget()->rect();
        return place;
    };
    for (int i = 0; i < all.size(); ++i) {
        for (int j = i + 1; j < all.size(); ++j) {
            if (placeOf(all.at(i)).intersects(placeOf(all.at(j))))
                found.append(textOf(all.at(i)) + " and " + textOf(all.at(j)));
        }
    }
    return found;
}

} // namespace ShownTexts
