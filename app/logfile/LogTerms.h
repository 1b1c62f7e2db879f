// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPair>
#include <QString>
#include <QStringList>
#include <QStringMatcher>
#include <QVector>

namespace Velocor {

/// Several texts to look for in lines, typed in one field: separated by blanks, or in double quotes
/// if they have blanks or quotes themselves, which are then doubled.
///
///     disk "not found"    two terms: disk, not found
///     "no ""x"" here"     one term: no "x" here
///
/// A plain value; any thread may use its own copy.
class LogTerms
{
public:
    LogTerms() = default;

    /// A quote without a second one ends with the text.
    LogTerms(QString const& typed, bool caseSensitive);

    bool isEmpty() const { return m_matchers.isEmpty(); }

    /// Whether a line contains all terms; true without terms.
    bool AreAllIn(QString const& line) const;

    /// Whether a line contains at least one term; false without terms.
    bool IsAnyIn(QString const& line) const;

    /// Where the terms are in a text: start and length.
    QVector<QPair<int, int>> Ranges(QString const& text) const;

    /// One for each term.
    QVector<QStringMatcher> const& matchers() const { return m_matchers; }

    bool operator==(LogTerms const& other) const;

    /// The terms in what a user has typed.
    static QStringList Split(QString const& typed);

    /// What a user would type for one term that is not empty.
    static QString Quoted(QString const& term);

private:
    QVector<QStringMatcher> m_matchers; // prepared once for many lines
};

} // namespace Velocor
