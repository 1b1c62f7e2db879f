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
#include <QTreeView>

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

/// A cell of a section in a settings file, or of an item in it.
inline QModelIndex Cell(QTreeView const* tree, int section, int column = 0)
{
    return tree->model()->index(section, column);
}

inline QModelIndex ItemCell(QTreeView const* tree, int section, int item, int column)
{
    return tree->model()->index(item, column, Cell(tree, section));
}

/// The text that a cell shows.
inline QString CellText(QTreeView const* tree, int section, int item, int column)
{
    return ItemCell(tree, section, item, column).data().toString();
}

/// Makes a cell current and its row the only one that is selected, even if the last key of a test
/// had a modifier.
inline void GoTo(QTreeView* tree, QModelIndex const& cell)
{
    tree->selectionModel()->setCurrentIndex(cell, QItemSelectionModel::ClearAndSelect |
                                                      QItemSelectionModel::Rows);
}

/// Starts editing a cell with the keyboard.
inline QLineEdit* StartEditing(QTreeView* tree, QModelIndex const& cell)
{
    tree->setFocus();
    GoTo(tree, cell);
    QTest::keyClick(tree, Qt::Key_F2, cell.column() == 0 ? Qt::ShiftModifier : Qt::NoModifier);
    [&] {
        QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    }();
    return tree->findChild<QLineEdit*>();
}

/// Types a text over that of a cell, without ending the editing.
inline void TypeInto(QTreeView* tree, QModelIndex const& cell, QString const& text)
{
    QTest::keyClicks(StartEditing(tree, cell), text);
}

/// Ends the editing of a cell with the Enter key.
inline void Enter(QTreeView* tree)
{
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
}

/// Gives a value of the first section another text, however long.
inline void SetValue(QTreeView* tree, int item, QString const& text)
{
    StartEditing(tree, ItemCell(tree, 0, item, 1))->insert(text);
    Enter(tree);
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
