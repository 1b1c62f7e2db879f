// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <unordered_set>

class QTableView;

namespace Velocor {

class LogDelegate;

/// Gives the rows of a log table the heights that their messages need when they are wrapped.
///
/// Only rows that are or soon will be in view are measured, because millions of them would take
/// minutes; the others have the usual height. The table scrolls by rows, so the place of a row does
/// not depend on those that were not measured. GUI thread.
class WrappedRows
{
public:
    /// @param table     not owned
    /// @param delegate  not owned
    WrappedRows(QTableView* table, LogDelegate* delegate);

    /// Wraps messages or not. All rows have the usual height until they are measured.
    void SetOn(bool isOn);
    bool isOn() const { return m_isOn; }

    /// All rows are measured again, with the usual height until then: after a change of the font.
    void Restart();

    /// The rows have changed, or their numbers have.
    void Forget() { m_measured.clear(); }

    /// Measures the rows in view, if this one is at the top, a page above and below, and the last
    /// page, which tells how far the table can scroll. Starts again if the table or the column of
    /// the messages has another size than before.
    ///
    /// @return whether a height has changed
    bool Measure(int top);

    /// The first row of those that fit into a height together with a row, which is the last of
    /// them. Measures them.
    int FirstAbove(int row, int height);

    /// The last row of those that fit into a height together with a row, which is the first of
    /// them. Measures them.
    int LastBelow(int row, int height);

    /// The maximum number of lines that a message is wrapped to.
    static constexpr int MaximumLines = 12;

private:
    int measuredHeight(int row);
    int mostLines() const;
    int width() const;

    QTableView* m_table;
    LogDelegate* m_delegate;
    bool m_isOn = false;
    int m_mostLines = 1; // for which rows were measured
    int m_width = 0;     // of the messages, likewise
    bool m_hasChanged = false;
    std::unordered_set<int> m_measured;
};

} // namespace Velocor
