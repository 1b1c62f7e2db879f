// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogFilterBar.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QCheckBox>
#include <QEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QToolButton>

namespace Velocor {

namespace {

constexpr int TypingPause = 150; // milliseconds

} // namespace

LogFilterBar::LogFilterBar(QWidget* parent)
    : QWidget(parent), m_text(new QLineEdit), m_error(NewPlainLabel())
{
    m_text->setPlaceholderText(tr("Filter"));
    m_text->setClearButtonEnabled(true);
    m_text->setAccessibleName(tr("Filter by text"));
    m_text->setAcceptDrops(false); // leave dropped files to the window
    m_text->setToolTip(PlainToolTip(tr("Show only lines that contain this text (Ctrl+L)")));
    m_error->setAccessibleName(tr("Filter error"));
    m_error->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_error->setWordWrap(true);
    m_error->hide();

    m_case = makeOption(tr("Aa"), tr("Match case"), tr("Match case"));
    m_expression = makeOption(tr(".*"), tr("Regular expression"),
                              tr("Search each line with a regular expression"));

    auto* row = new QHBoxLayout;
    row->setSpacing(6);
    row->addWidget(m_text, 1);
    row->addWidget(m_case);
    row->addWidget(m_expression);
    row->addSpacing(8);
    addSeverities();
    for (QToolButton* button : qAsConst(m_severities))
        row->addWidget(button);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(4);
    layout->addLayout(row);
    layout->addWidget(m_error);

    m_typing.setSingleShot(true);
    m_typing.setInterval(TypingPause);
    connect(&m_typing, &QTimer::timeout, this, &LogFilterBar::apply);
    connect(m_text, &QLineEdit::textChanged, this, [this] { m_typing.start(); });
    connect(m_text, &QLineEdit::returnPressed, this, &LogFilterBar::apply);
}

QCheckBox* LogFilterBar::makeOption(QString const& text, QString const& name,
                                    QString const& toolTip)
{
    auto* option = new QCheckBox(text);
    option->setAccessibleName(name);
    option->setToolTip(PlainToolTip(toolTip));
    connect(option, &QCheckBox::toggled, this, &LogFilterBar::apply);
    return option;
}

void LogFilterBar::addSeverities()
{
    for (int i = 0; i <= LogEntry::None; ++i) {
        const bool isNone = i == LogEntry::None;
        const QString name = isNone ? tr("Other") : LogSeverities::Name(LogEntry::Severity(i));
        auto* button = new QToolButton;
        button->setCheckable(true);
        button->setChecked(true);
        button->setFocusPolicy(Qt::TabFocus);
        button->setText(name);
        button->setAccessibleName(tr("Show %1").arg(name));
        const QString what = isNone ? tr("lines without a severity") : tr("%1 entries").arg(name);
        button->setToolTip(PlainToolTip(tr("Show or hide %1 (Ctrl+%2)").arg(what).arg(i + 1)));
        button->setShortcut(QKeySequence(Qt::CTRL | (Qt::Key_1 + i)));
        button->setToolButtonStyle(Qt::ToolButtonIconOnly);
        connect(button, &QToolButton::toggled, this, &LogFilterBar::apply);
        m_severities.append(button);
    }
    updateIcons();
}

void LogFilterBar::updateIcons()
{
    for (int i = 0; i < m_severities.size(); ++i)
        m_severities.at(i)->setIcon(
            SeverityIcons::SwitchIcon(static_cast<LogEntry::Severity>(i), palette()));
}

void LogFilterBar::changeEvent(QEvent* event)
{
    QWidget::changeEvent(event);
    if (event->type() == QEvent::PaletteChange)
        updateIcons();
}

void LogFilterBar::FocusText()
{
    m_text->setFocus(Qt::ShortcutFocusReason);
    m_text->selectAll();
}

void LogFilterBar::Clear()
{
    m_text->clear();
    for (QToolButton* button : qAsConst(m_severities))
        button->setChecked(true);
    apply();
}

void LogFilterBar::SetEarlierRuns(bool shown)
{
    m_filter.SetEarlierRuns(shown);
    Q_EMIT filterChanged();
}

void LogFilterBar::apply()
{
    if (m_severities.size() <= LogEntry::None)
        return; // controls are not complete yet
    m_typing.stop();
    for (int i = 0; i < m_severities.size(); ++i)
        m_filter.SetSeverity(static_cast<LogEntry::Severity>(i), m_severities.at(i)->isChecked());

    const bool isExpression = m_expression->isChecked();
    const QString error = isExpression ? LogFilter::ErrorOf(m_text->text()) : QString();
    showError(error.isEmpty()
                  ? QString()
                  : tr("Invalid regular expression, nothing is filtered: %1").arg(error));
    m_filter.SetText(error.isEmpty() ? m_text->text() : QString(), isExpression,
                     m_case->isChecked());
    Q_EMIT filterChanged();
}

void LogFilterBar::showError(QString const& error)
{
    m_error->setText(error);
    m_error->setVisible(!error.isEmpty());
}

void LogFilterBar::ShowSlowLine(size_t line)
{
    if (line > 0)
        showError(tr("The regular expression takes too long at line %L1, nothing is filtered.")
                      .arg(static_cast<qulonglong>(line)));
    else if (m_filter.hasText())
        showError(QString());
}

} // namespace Velocor
