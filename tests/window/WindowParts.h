// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "WindowTest.h"

#include "app/window/FileTabs.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogView.h"

#include <QAction>

/// The parts of a window, found the way assistive technology finds them.
namespace WindowParts {

constexpr int Patience = 20000; // milliseconds

QByteArray const Settings("<VelocorSettings>\n<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n"
                          "</Editor>\n</VelocorSettings>\n");

template <class Widget>
inline Widget* Child(QWidget* parent, QString const& accessibleName)
{
    const QList<Widget*> all = parent->findChildren<Widget*>();
    for (Widget* widget : all) {
        if (widget->accessibleName() == accessibleName)
            return widget;
    }
    qWarning("no %s", qPrintable(accessibleName));
    return nullptr;
}

inline Velocor::LogPanel* Panel(Velocor::MainWindow& window)
{
    return window.findChild<Velocor::FileTabs*>()->currentLog();
}

inline Velocor::LogView* View(Velocor::MainWindow& window)
{
    return Panel(window)->view();
}

inline int Rows(Velocor::MainWindow& window)
{
    return Panel(window)->model()->rowCount();
}

inline void Click(QWidget* widget)
{
    QTest::mouseClick(widget, Qt::LeftButton, Qt::NoModifier, widget->rect().center());
}

inline QString ActionText(QAction const* action)
{
    return QString(action->text()).remove('&');
}

inline QAction* Action(Velocor::MainWindow& window, QString const& text)
{
    const QList<QAction*> all = window.findChildren<QAction*>();
    for (QAction* action : all) {
        if (ActionText(action) == text)
            return action;
    }
    return nullptr;
}

} // namespace WindowParts
