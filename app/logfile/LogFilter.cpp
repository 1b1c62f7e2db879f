// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFilter.h"

#include <QObject>

namespace Velocor {

namespace {

constexpr unsigned AllSeverities = (2U << LogEntry::None) - 1;

// How many ways to match one text are tried. Some expressions have more ways than anybody can wait
// for, and Qt knows no time limit.
constexpr int MaximumTries = 1000000;
constexpr int MaximumTriesWhilePainting = 20000;

// The limit is written into the expression, as only the library below Qt knows it.
QRegularExpression Limited(QString const& pattern, int tries, bool caseSensitive)
{
    return QRegularExpression(QStringLiteral("(*LIMIT_MATCH=%1)").arg(tries) + pattern,
                              caseSensitive ? QRegularExpression::NoPatternOption
                                            : QRegularExpression::CaseInsensitiveOption);
}

} // namespace

LogFilter::LogFilter() : m_severities(AllSeverities) {}

void LogFilter::SetSeverity(LogEntry::Severity severity, bool shown)
{
    const unsigned bit = 1U << severity;
    m_severities = shown ? m_severities | bit : m_severities & ~bit;
}

bool LogFilter::Shows(LogEntry::Severity severity) const
{
    return m_severities & (1U << severity);
}

bool LogFilter::SetText(QString const& text, bool isExpression, bool caseSensitive)
{
    if (isExpression && !ErrorOf(text).isEmpty())
        return false;

    m_isExpression = isExpression;
    m_text = text;
    m_matcher = QStringMatcher(text, caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive);
    const QString pattern = isExpression ? text : QRegularExpression::escape(text);
    m_expression = Limited(pattern, MaximumTries, caseSensitive);
    m_marking = Limited(pattern, MaximumTriesWhilePainting, caseSensitive);
    return true;
}

void LogFilter::SetTerms(LogTerms const& required, LogTerms const& hidden)
{
    m_required = required;
    m_hidden = hidden;
}

LogFilter::Match LogFilter::Find(QString const& line) const
{
    if (m_hidden.IsAnyIn(line))
        return Hidden;
    if (!m_required.AreAllIn(line))
        return No;
    if (m_text.isEmpty())
        return Yes;
    if (!m_isExpression)
        return m_matcher.indexIn(line) >= 0 ? Yes : No;
    const QRegularExpressionMatch match = m_expression.match(line);
    if (!match.isValid())
        return TooLong;
    return match.hasMatch() ? Yes : No;
}

LogFilter::Match LogFilter::FindQuickly(QString const& line) const
{
    if (!m_isExpression)
        return m_matcher.indexIn(line) >= 0 ? Yes : No;
    const QRegularExpressionMatch match = m_marking.match(line);
    if (!match.isValid())
        return TooLong;
    return match.hasMatch() ? Yes : No;
}

QVector<QPair<int, int>> LogFilter::Ranges(QString const& text) const
{
    QVector<QPair<int, int>> ranges;
    if (m_text.isEmpty())
        return m_required.Ranges(text);
    QRegularExpressionMatchIterator matches = m_marking.globalMatch(text);
    while (matches.hasNext()) {
        const QRegularExpressionMatch match = matches.next();
        if (match.capturedLength() > 0)
            ranges.append(qMakePair(match.capturedStart(), match.capturedLength()));
    }
    return ranges + m_required.Ranges(text);
}

QString LogFilter::ErrorOf(QString const& expression)
{
    const QRegularExpression compiled(expression);
    if (compiled.isValid())
        return QString();
    return QObject::tr("%1 at character %2")
        .arg(compiled.errorString())
        .arg(compiled.patternErrorOffset() + 1);
}

bool LogFilter::HasSameText(LogFilter const& other) const
{
    return m_expression == other.m_expression && m_isExpression == other.m_isExpression &&
           m_required == other.m_required && m_hidden == other.m_hidden;
}

} // namespace Velocor
