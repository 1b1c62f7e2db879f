// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"
#include "app/logfile/LogSpan.h"
#include "app/logfile/LogTerms.h"

#include <QPair>
#include <QRegularExpression>
#include <QString>
#include <QStringMatcher>
#include <QVector>

namespace Velocor {

/// Which lines of a log are shown: by severity, by text, by time, by run.
///
/// A plain value; any thread may use its own copy.
///
///     LogFilter filter;
///     filter.SetText("disk (full|gone)", true, false);
///     if (filter.Matches(line))
///         ranges = filter.Ranges(line);
class LogFilter
{
public:
    /// Shows everything.
    LogFilter();

    /// Shows or hides one severity; None stands for lines without one.
    void SetSeverity(LogEntry::Severity severity, bool shown);
    bool Shows(LogEntry::Severity severity) const;

    /// Sets the text that lines have to contain, or the regular expression they have to match.
    ///
    /// @param text  empty: every line matches
    /// @return false, with the filter unchanged, if the expression is not valid
    bool SetText(QString const& text, bool isExpression, bool caseSensitive);

    /// Sets the terms that lines have to contain besides the text, and those that hide a line.
    void SetTerms(LogTerms const& required, LogTerms const& hidden);

    /// Sets how many lines before and after each line that matches are shown as well.
    void SetContext(int lines) { m_context = lines; }
    int context() const { return m_context; }

    /// Whether entries of runs before the newest are shown.
    void SetEarlierRuns(bool shown) { m_earlierRuns = shown; }
    bool earlierRuns() const { return m_earlierRuns; }

    /// Sets from when to when entries are shown. A line of another file tells no date, so this is
    /// decided by whoever knows the times of the whole log; a LogIndex does not look at it.
    void SetSpan(LogSpan const& span) { m_span = span; }
    LogSpan const& span() const { return m_span; }

    /// Whether there is any text or term.
    bool hasText() const
    {
        return !m_text.isEmpty() || !m_required.isEmpty() || !m_hidden.isEmpty();
    }
    bool isExpression() const { return m_isExpression; }
    QString const& text() const { return m_text; }
    Qt::CaseSensitivity caseSensitivity() const { return m_matcher.caseSensitivity(); }
    LogTerms const& required() const { return m_required; }
    LogTerms const& hidden() const { return m_hidden; }

    enum Match {
        Yes,
        No,
        Hidden, ///< has a term that hides its entry
        TooLong ///< unknown: the expression tried too many ways to match this line
    };

    /// Whether a line, as stored in the file, contains the text and the right terms.
    Match Find(QString const& line) const;
    bool Matches(QString const& line) const { return Find(line) == Yes; }

    /// Whether a line contains the text, while it is painted: gives up much earlier than Find().
    /// Terms are not looked at.
    Match FindQuickly(QString const& line) const;

    /// The matches in a text: start and length, in order, followed by those of required terms. An
    /// expression that takes too long to find
    /// them has none.
    QVector<QPair<int, int>> Ranges(QString const& text) const;

    /// The error in an expression, for users; empty if it is valid.
    static QString ErrorOf(QString const& expression);

    /// Whether both let the same lines through the text filter.
    bool HasSameText(LogFilter const& other) const;

private:
    unsigned m_severities;
    bool m_earlierRuns = true;
    bool m_isExpression = false;
    QString m_text;
    LogTerms m_required;
    LogTerms m_hidden;
    int m_context = 0;
    LogSpan m_span;
    QStringMatcher m_matcher;        // prepared once for many lines
    QRegularExpression m_expression; // to find lines
    QRegularExpression m_marking;    // to mark matches while painting, which must be quick
};

} // namespace Velocor
