// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogTerms.h"

#include <algorithm>

namespace Velocor {

LogTerms::LogTerms(QString const& typed, bool caseSensitive)
{
    const QStringList terms = Split(typed);
    for (QString const& term : terms)
        m_matchers.append(
            QStringMatcher(term, caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive));
}

QStringList LogTerms::Split(QString const& typed)
{
    QStringList terms;
    QString term;
    bool isQuoted = false;
    const auto end = [&] {
        if (!term.isEmpty())
            terms.append(term);
        term.clear();
    };
    for (int i = 0; i < typed.size(); ++i) {
        const QChar c = typed.at(i);
        const bool isQuote = c == QLatin1Char('"');
        if (isQuote && isQuoted && i + 1 < typed.size() && typed.at(i + 1) == c) {
            term += c;
            ++i;
        } else if (isQuote) {
            end();
            isQuoted = !isQuoted;
        } else if (c.isSpace() && !isQuoted) {
            end();
        } else {
            term += c;
        }
    }
    end();
    return terms;
}

QString LogTerms::Quoted(QString const& term)
{
    QString text = term;
    text.replace(QLatin1Char('"'), QLatin1String("\"\""));
    const bool isPlain = std::none_of(term.begin(), term.end(),
                                      [](QChar c) { return c.isSpace() || c == QLatin1Char('"'); });
    return isPlain ? text : QLatin1Char('"') + text + QLatin1Char('"');
}

bool LogTerms::AreAllIn(QString const& line) const
{
    return std::all_of(m_matchers.begin(), m_matchers.end(),
                       [&](QStringMatcher const& term) { return term.indexIn(line) >= 0; });
}

bool LogTerms::IsAnyIn(QString const& line) const
{
    return std::any_of(m_matchers.begin(), m_matchers.end(),
                       [&](QStringMatcher const& term) { return term.indexIn(line) >= 0; });
}

QVector<QPair<int, int>> LogTerms::Ranges(QString const& text) const
{
    QVector<QPair<int, int>> ranges;
    for (QStringMatcher const& term : m_matchers) {
        const int length = term.pattern().size();
        for (int at = term.indexIn(text); at >= 0; at = term.indexIn(text, at + length))
            ranges.append(qMakePair(at, length));
    }
    return ranges;
}

bool LogTerms::operator==(LogTerms const& other) const
{
    return std::equal(m_matchers.begin(), m_matchers.end(), other.m_matchers.begin(),
                      other.m_matchers.end(), [](QStringMatcher const& a, QStringMatcher const& b) {
                          return a.pattern() == b.pattern() &&
                                 a.caseSensitivity() == b.caseSensitivity();
                      });
}

} // namespace Velocor
