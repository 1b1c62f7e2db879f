// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFilter.h"

#include <QObject>

namespace Velocor {

namespace {

constexpr unsigned AllSeverities = (1U << LogEntry::None) - 1;

} // namespace

LogFilter::LogFilter() : m_severities(AllSeverities) {}

void LogFilter::SetSeverity(LogEntry::Severity severity, bool shown)
{
    if (severity == LogEntry::None)
        return;
    const unsigned bit = 1U << severity;
    m_severities = shown ? m_severities | bit : m_severities & ~bit;
}

bool LogFilter::Shows(LogEntry::Severity severity) const
{
    if (severity == LogEntry::None)
        return m_severities == AllSeverities;
    return m_severities & (1U << severity);
}

bool LogFilter::SetText(QString const& text, bool isExpression, bool caseSensitive)
{
    if (isExpression && !ErrorOf(text).isEmpty())
        return false;

    m_isExpression = isExpression;
    m_matcher = QStringMatcher(text, caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive);
    m_expression = QRegularExpression(isExpression ? text : QRegularExpression::escape(text),
                                      caseSensitive ? QRegularExpression::NoPatternOption
                                                    : QRegularExpression::CaseInsensitiveOption);
    return true;
}

bool LogFilter::Matches(QString const& line) const
{
    if (!hasText())
        return true;
    return m_isExpression ? m_expression.match(line).hasMatch() : m_matcher.indexIn(line) >= 0;
}

QVector<QPair<int, int>> LogFilter::Ranges(QString const& text) const
{
    QVector<QPair<int, int>> ranges;
    if (!hasText())
        return ranges;
    QRegularExpressionMatchIterator matches = m_expression.globalMatch(text);
    while (matches.hasNext()) {
        const QRegularExpressionMatch match = matches.next();
        if (match.capturedLength() > 0)
            ranges.append(qMakePair(match.capturedStart(), match.capturedLength()));
    }
    return ranges;
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
    return m_expression == other.m_expression && m_isExpression == other.m_isExpression;
}

} // namespace Velocor
