// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

class LogModel;

/// How much time passed between the rows of a log: from the entry above each, or from one that the
/// user has chosen; and where the gaps are.
///
/// It reads the times of the rows that it is asked about, so only rows in view cost anything. A row
/// without a time has neither. Times without a date count as if they were less than half a day
/// apart, and one with a date has no interval to one without. GUI thread.
class RowSpans
{
public:
    /// @param model  not owned; must exist as long as this object
    explicit RowSpans(LogModel const& model) : m_model(model) {}

    /// Measures from the entry that a row belongs to, wherever that is later, or even if it is not
    /// shown any more.
    ///
    /// @return false, with nothing changed, if the entry has no time
    bool MeasureFrom(int row);

    /// Measures from the entry above each row again, as at the start.
    void MeasureFromAbove() { m_base = Time(); }

    /// The time stamp of the chosen entry; empty if there is none.
    QString const& base() const { return m_base.text; }

    /// The time since that entry or, if none was chosen, since the entry above. Negative if the row
    /// is older. Empty if it is not known.
    QString Since(int row) const;

    /// Sets from which time on there is a gap between two entries, in milliseconds; 0 for none.
    void SetLeastGap(qint64 span) { m_leastGap = span; }
    qint64 leastGap() const { return m_leastGap; }

    /// The gap before a row, in words; empty if there is none.
    QString Gap(int row) const;

    /// How many rows above are looked at for one with a time.
    static constexpr int MostAbove = 10000;

private:
    struct Time
    {
        qint64 key = -1; // as LogLineParser::Parts::timeKey
        bool hasDate = false;
        QString text;
    };

    // Whether there is an interval, and its length in milliseconds.
    struct Span
    {
        bool isKnown = false;
        qint64 length = 0;
    };

    Time timeOf(int row) const;
    Span spanAbove(int row) const;
    static Span between(Time const& from, Time const& to);

    LogModel const& m_model;
    Time m_base;
    qint64 m_leastGap = 0;
};

} // namespace Velocor
