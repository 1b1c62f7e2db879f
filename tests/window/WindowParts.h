// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "WindowTest.h"

#include "app/window/FileTabs.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogView.h"

#include <QAction>
#include <QCheckBox>
#include <QLineEdit>
#include <QStatusBar>
#include <QTreeWidget>

/// The parts of a window, found the way assistive technology finds them.
namespace WindowParts {

constexpr int Patience = WindowTest::Patience;

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

/// A check box reacts to clicks on the box, not on the whole area of the widget.
inline void ClickBox(QCheckBox* box)
{
    QTest::mouseClick(box, Qt::LeftButton, Qt::NoModifier, QPoint(8, box->height() / 2));
}

/// How many pixels of a widget have a color.
inline int Pixels(QWidget* widget, QColor const& color)
{
    const QImage image = widget->grab().toImage();
    int count = 0;
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x)
            count += image.pixelColor(x, y) == color ? 1 : 0;
    }
    return count;
}

/// The message in the status bar.
inline QString Status(Velocor::MainWindow const& window)
{
    return window.statusBar()->currentMessage();
}

/// Types a text over that of a cell, without ending the editing.
inline void TypeInto(QTreeWidget* tree, QTreeWidgetItem* item, int column, QString const& text)
{
    tree->setFocus();
    tree->setCurrentItem(item, column);
    QTest::keyClick(tree, Qt::Key_F2);
    QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), text);
}

/// Ends the editing of a cell with the Enter key.
inline void Enter(QTreeWidget* tree)
{
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
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
