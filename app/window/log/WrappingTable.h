// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/WrappedRows.h"

#include <QTableView>

namespace Velocor {

/// A table that scrolls by rows, whose messages may be wrapped. GUI thread.
class WrappingTable : public QTableView
{
    Q_OBJECT

public:
    /// @param delegate  draws the cells; must be destroyed with or after the table
    explicit WrappingTable(LogDelegate* delegate, QWidget* parent = nullptr);

    bool isWrapped() const { return m_wrapped.isOn(); }

    void scrollTo(QModelIndex const& index, ScrollHint hint = EnsureVisible) override;

protected:
    QModelIndex moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers) override;
    void resizeEvent(QResizeEvent* event) override;

    /// Wraps messages or not; the first row in view stays.
    void setWrapped(bool isWrapped);

    /// Gives the rows in view their heights.
    void measureRows();

    /// The rows, or their numbers, have changed.
    void measureChangedRows();

    /// Gives all rows their heights again, after a change of the font.
    void restartWrapping();

    /// Updates range and position of the scroll bar to the heights of the rows.
    void updateScrollBars();

    /// Whether it is not the user who scrolls.
    bool m_scrollingItself = false;

private:
    WrappedRows m_wrapped;
};

} // namespace Velocor
