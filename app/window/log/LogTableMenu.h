// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMenu>
#include <QModelIndex>

namespace Velocor {

class LineCopier;
class LogFilterBar;
class MarkControl;

/// The menu of the table: what can be done with a cell and with the current line. Deletes itself
/// when it closes. GUI thread.
class LogTableMenu : public QMenu
{
    Q_OBJECT

public:
    /// @param cell    what was clicked on; may be invalid
    /// @param copier  not owned
    /// @param filter  not owned
    /// @param marks   not owned
    LogTableMenu(QModelIndex const& cell, LineCopier* copier, LogFilterBar* filter,
                 MarkControl* marks, QWidget* parent);

Q_SIGNALS:
    /// Lines with a text shall be highlighted.
    void highlightRequested(QString const& text);

    /// The time since the current entry shall be shown (true), or since the entry above each.
    void measureRequested(bool isFromCurrent);

private:
    void filterBy(bool isHiding);
    QString text() const;

    QPersistentModelIndex m_cell;
    LogFilterBar* m_filter;
};

} // namespace Velocor
