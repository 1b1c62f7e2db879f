// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/UniformTable.h"

#include <unordered_map>

namespace Velocor {

class LogDelegate;

/// A table of a log whose messages may be wrapped, so that rows differ in height.
///
/// It still scrolls by rows. Only rows near those in view, and the last ones, which tell how far
/// the table can scroll, are measured: millions of them would take minutes. GUI thread.
class WrappingTable : public UniformTable
{
    Q_OBJECT

public:
    /// @param delegate  draws the cells; owned by the table
    explicit WrappingTable(LogDelegate* delegate, QWidget* parent = nullptr);

    bool isWrapped() const { return m_isWrapped; }

    /// How many rows have been measured since the rows, their width or their font have changed.
    int measuredRows() const { return static_cast<int>(m_heights.size()); }

    /// The maximum number of lines that a message is wrapped to.
    static constexpr int MaximumLines = 12;

protected:
    int heightOf(int row) const override;
    int topOf(int row) const override;
    int rowPast(int y) const override;
    int rowsThatFit(int height) const override;
    int topFor(int row, ScrollHint hint) const override;
    int pageFrom(int row, int step) const override;

    /// Wraps messages or not; the first row in view stays.
    void setWrapped(bool isWrapped);

    /// The rows, their numbers or their font have changed.
    void forgetHeights() { m_heights.clear(); }

private:
    int mostLines() const;
    void adapt() const;
    int firstAbove(int row, int height) const;
    int lastBelow(int row, int height) const;

    LogDelegate* m_delegate;
    bool m_isWrapped = false;
    mutable std::unordered_map<int, int> m_heights; // of measured rows
    mutable int m_width = 0;                        // for which they were measured
    mutable int m_mostLines = 1;                    // likewise
};

} // namespace Velocor
