// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/HighlightRules.h"

#include "app/window/log/HighlightColors.h"
#include "app/window/widgets/PlainText.h"

#include <QStringList>
#include <QTimer>

#include <algorithm>
#include <array>

namespace Velocor {

namespace {

constexpr int LongestRule = 60; // characters of a rule in a message
constexpr int FieldCount = 4;   // before the text

QString LineOf(HighlightRule const& rule)
{
    return QStringList({rule.isOn ? QStringLiteral("on") : QStringLiteral("off"),
                        HighlightColors::Key(rule.color),
                        rule.isExpression ? QStringLiteral("expression") : QStringLiteral("text"),
                        rule.isCaseSensitive ? QStringLiteral("case") : QStringLiteral("any"),
                        rule.text})
        .join(QLatin1Char(' '));
}

bool ReadRule(QString const& line, HighlightRule& rule)
{
    int at = 0;
    QString fields[FieldCount];
    for (QString& field : fields) {
        const int end = line.indexOf(QLatin1Char(' '), at);
        if (end < 0)
            return false;
        field = line.mid(at, end - at);
        at = end + 1;
    }
    rule.isOn = fields[0] == QLatin1String("on");
    rule.color = HighlightColors::FromKey(fields[1]);
    rule.isExpression = fields[2] == QLatin1String("expression");
    rule.isCaseSensitive = fields[3] == QLatin1String("case");
    rule.text = line.mid(at, HighlightRule::MaximumText);
    return rule.color >= 0;
}

} // namespace

HighlightRules::HighlightRules(QObject* parent) : QObject(parent) {}

void HighlightRules::SetRules(QVector<HighlightRule> const& rules)
{
    m_rules = rules.mid(0, MaximumRules);
    m_active.clear();
    for (int i = 0; i < m_rules.size(); ++i) {
        HighlightRule const& rule = m_rules.at(i);
        Active active{LogFilter(), i};
        if (rule.isOn && !rule.text.isEmpty() &&
            active.text.SetText(rule.text, rule.isExpression, rule.isCaseSensitive))
            m_active.append(active);
    }
    Q_EMIT changed();
}

QString HighlightRules::Add(QString const& text)
{
    QVector<HighlightRule> rules = m_rules;
    HighlightRule added;
    added.text = text.left(HighlightRule::MaximumText);
    const auto known = std::find_if(rules.begin(), rules.end(), [&](HighlightRule const& rule) {
        return !rule.isExpression && rule.text.compare(added.text, Qt::CaseInsensitive) == 0;
    });
    if (known != rules.end()) {
        known->isOn = true;
    } else if (rules.size() >= MaximumRules) {
        return tr("There are %1 highlight rules already").arg(rules.size());
    } else {
        added.color = UnusedColor(rules);
        rules.append(added);
    }
    SetRules(rules);
    return tr("Highlighted; Ctrl+Shift+H changes the rules");
}

int HighlightRules::UnusedColor(QVector<HighlightRule> const& rules)
{
    std::array<int, HighlightColors::Count> uses{};
    for (HighlightRule const& rule : rules)
        ++uses[static_cast<size_t>(rule.color)];
    return static_cast<int>(std::min_element(uses.begin(), uses.end()) - uses.begin());
}

QString HighlightRules::ToText() const
{
    QStringList lines;
    for (HighlightRule const& rule : m_rules)
        lines.append(LineOf(rule));
    return lines.join(QLatin1Char('\n'));
}

void HighlightRules::SetFromText(QString const& text)
{
    QVector<HighlightRule> rules;
    int at = 0;
    while (at < text.size() && rules.size() < MaximumRules) {
        int end = text.indexOf(QLatin1Char('\n'), at);
        if (end < 0)
            end = text.size();
        HighlightRule rule;
        if (ReadRule(text.mid(at, end - at), rule))
            rules.append(rule);
        at = end + 1;
    }
    SetRules(rules);
}

int HighlightRules::ColorOf(QString const& line)
{
    for (int i = 0; i < m_active.size(); ++i) {
        const LogFilter::Match match = m_active.at(i).text.FindQuickly(line);
        if (match == LogFilter::Yes)
            return m_rules.at(m_active.at(i).rule).color;
        if (match == LogFilter::TooLong)
            stop(i--);
    }
    return -1;
}

// Told later, because views ask while they paint.
void HighlightRules::stop(int position)
{
    const QString text = m_rules.at(m_active.at(position).rule).text;
    m_active.removeAt(position);
    const QString message = tr("The highlight rule \"%1\" takes too long and is not applied")
                                .arg(Shortened(text, LongestRule));
    QTimer::singleShot(0, this, [this, message] {
        Q_EMIT stopped(message);
        Q_EMIT changed();
    });
}

} // namespace Velocor
