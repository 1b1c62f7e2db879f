// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/SeveritySwitches.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QEvent>
#include <QHBoxLayout>
#include <QLocale>
#include <QSignalBlocker>
#include <QToolButton>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int Margin = 5;     // pixels
constexpr int IconGap = 4;    // of Qt, between icon and text, in pixels
constexpr int LeastIcon = 16; // pixels; larger ones would need room that small screens lack

// Qt replaces the shortcut of a button along with its text.
void SetText(QToolButton* button, QString const& text)
{
    const QKeySequence shortcut = button->shortcut();
    button->setText(text);
    button->setShortcut(shortcut);
}

} // namespace

SeveritySwitches::SeveritySwitches(QWidget* parent) : QWidget(parent)
{
    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(3);
    for (int i = 0; i <= LogEntry::None; ++i) {
        m_buttons.append(makeButton(static_cast<LogEntry::Severity>(i)));
        layout->addWidget(m_buttons.last());
        showCount(i);
    }
    updateIcons();
    updateWidths();
}

QToolButton* SeveritySwitches::makeButton(LogEntry::Severity severity)
{
    const QString name = severity == LogEntry::None ? tr("Other") : LogSeverities::Name(severity);
    auto* button = new QToolButton;
    button->setCheckable(true);
    button->setChecked(true);
    button->setFocusPolicy(Qt::TabFocus);
    button->setAccessibleName(tr("Show %1").arg(name));
    button->setShortcut(QKeySequence(Qt::CTRL | (Qt::Key_1 + severity)));
    button->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    connect(button, &QToolButton::toggled, this, &SeveritySwitches::toggled);
    return button;
}

void SeveritySwitches::updateIcons()
{
    for (int i = 0; i < m_buttons.size(); ++i)
        m_buttons.at(i)->setIcon(
            SeverityIcons::SwitchIcon(static_cast<LogEntry::Severity>(i), palette()));
}

// As wide as the longest number needs, so that the bar does not jump while a log grows. The style
// would leave more room, which the text of the filter needs on small screens.
void SeveritySwitches::updateWidths()
{
    for (QToolButton* button : qAsConst(m_buttons)) {
        const int icon = std::max(LeastIcon, button->fontMetrics().ascent() * 3 / 4);
        button->setIconSize(QSize(icon, icon));
        const int number = button->fontMetrics().boundingRect(QStringLiteral("888M")).width();
        button->setFixedWidth(Margin + icon + IconGap + number + Margin);
    }
}

void SeveritySwitches::changeEvent(QEvent* event)
{
    QWidget::changeEvent(event);
    if (event->type() == QEvent::PaletteChange)
        updateIcons();
    else if (event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange)
        updateWidths();
}

bool SeveritySwitches::Shows(LogEntry::Severity severity) const
{
    return m_buttons.at(severity)->isChecked();
}

void SeveritySwitches::SetShown(LogEntry::Severity severity, bool shown)
{
    m_buttons.at(severity)->setChecked(shown);
}

void SeveritySwitches::setAll(std::function<bool(int)> const& isShown)
{
    for (int i = 0; i < m_buttons.size(); ++i) {
        const QSignalBlocker blocker(m_buttons.at(i));
        m_buttons.at(i)->setChecked(isShown(i));
    }
    Q_EMIT toggled();
}

void SeveritySwitches::ShowOnly(LogEntry::Severity severity)
{
    setAll([severity](int i) { return i == severity; });
}

void SeveritySwitches::SetLeast(int severity)
{
    setAll([severity](int i) { return i >= severity; });
}

void SeveritySwitches::ShowAll()
{
    setAll([](int) { return true; });
}

int SeveritySwitches::least() const
{
    const auto isOn = [](QToolButton const* button) {
        return button->isChecked();
    };
    const auto first = std::find_if(m_buttons.begin(), m_buttons.end(), isOn);
    const bool isRange = std::all_of(first, m_buttons.end(), isOn);
    const auto position = static_cast<int>(first - m_buttons.begin());
    return isRange ? std::min<int>(position, LogEntry::None) : static_cast<int>(LogEntry::None);
}

void SeveritySwitches::SetCounts(LogCounts const& counts)
{
    for (int i = 0; i < m_buttons.size(); ++i) {
        const auto at = static_cast<size_t>(i);
        if (m_counts[at] == counts[at])
            continue;
        m_counts[at] = counts[at];
        showCount(i);
    }
}

void SeveritySwitches::showCount(int severity)
{
    const size_t count = m_counts[static_cast<size_t>(severity)];
    const QString what =
        severity == LogEntry::None
            ? tr("lines without a severity")
            : tr("%1 entries").arg(LogSeverities::Name(static_cast<LogEntry::Severity>(severity)));
    const QString number =
        tr("%1 in this file").arg(QLocale().toString(static_cast<qulonglong>(count)));
    QToolButton* button = m_buttons.at(severity);
    SetText(button, ShortCount(count));
    button->setAccessibleDescription(number);
    button->setToolTip(
        PlainToolTip(tr("Show or hide %1 (Ctrl+%2): %3").arg(what).arg(severity + 1).arg(number)));
}

QString SeveritySwitches::ShortCount(size_t count)
{
    if (count < 1000)
        return QString::number(count);
    size_t unit = 1000;
    QString letters = QStringLiteral("kMGT");
    while (letters.size() > 1 && count / unit >= 1000) {
        unit *= 1000;
        letters.remove(0, 1);
    }
    const size_t whole = count / unit;
    const QString fraction =
        whole < 10 ? QLocale().decimalPoint() + QString::number(count % unit * 10 / unit)
                   : QString();
    return QString::number(whole) + fraction + letters.at(0);
}

} // namespace Velocor
