// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QObject>
#include <QString>
#include <QVector>

namespace Velocor {

/// Which lines of a log get a color: those with a text, or that match an expression.
struct HighlightRule
{
    QString text; ///< at most MaximumText characters; empty: no lines
    bool isExpression = false;
    bool isCaseSensitive = false;
    bool isOn = true;
    int color = 0; ///< see HighlightColors

    static constexpr int MaximumText = 1000;
};

/// The user's rules that highlight lines, shared by all logs. Of several rules for a line, the
/// first one determines its color. GUI thread.
///
///     HighlightRules rules;
///     rules.Add("timeout");
///     const int color = rules.ColorOf(line);
class HighlightRules : public QObject
{
    Q_OBJECT

public:
    explicit HighlightRules(QObject* parent = nullptr);

    QVector<HighlightRule> const& rules() const { return m_rules; }

    /// Replaces the rules; those after MaximumRules are dropped. A rule with an invalid expression
    /// is kept, but highlights nothing.
    void SetRules(QVector<HighlightRule> const& rules);

    /// Adds a rule for a text, with a color that is used least, or switches on the one that there
    /// is.
    ///
    /// @return what the user should know
    QString Add(QString const& text);

    /// The color that the fewest rules have; the first one of several.
    static int UnusedColor(QVector<HighlightRule> const& rules);

    /// The rules as a text, one a line, and back. What is no rule is ignored.
    QString ToText() const;
    void SetFromText(QString const& text);

    /// Whether no line is highlighted.
    bool isIdle() const { return m_active.isEmpty(); }

    /// The color of a line; -1 without one. An expression that takes too long at a line is not
    /// asked again until the rules change.
    int ColorOf(QString const& line);

    static constexpr int MaximumRules = 50;

Q_SIGNALS:
    /// Some lines may have other colors.
    void changed();

    /// An expression took too long; a message for the user.
    void stopped(QString const& message);

private:
    struct Active
    {
        LogFilter text;
        int rule = 0;
    };

    void stop(int position);

    QVector<HighlightRule> m_rules;
    QVector<Active> m_active; // those that are asked
};

} // namespace Velocor
