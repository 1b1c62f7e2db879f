// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogFilterBar.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QCheckBox>
#include <QComboBox>
#include <QEvent>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QSignalBlocker>
#include <QToolButton>

namespace Velocor {

namespace {

constexpr int TypingPause = 150; // milliseconds
constexpr int MaximumShown = 80; // characters of an earlier filter

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

    m_text->installEventFilter(this);
    m_earlier = new QToolButton;
    m_earlier->setArrowType(Qt::DownArrow);
    m_earlier->setAutoRaise(true);
    m_earlier->setFocusPolicy(Qt::NoFocus); // the Down key in the text does the same
    m_earlier->setAccessibleName(tr("Earlier filters"));
    m_earlier->setToolTip(PlainToolTip(tr("Earlier filters (Down)")));
    connect(m_earlier, &QToolButton::clicked, this, &LogFilterBar::showHistory);

    auto* row = new QHBoxLayout;
    row->setSpacing(6);
    row->addWidget(m_text, 1);
    row->addWidget(m_earlier);
    row->addWidget(m_case);
    row->addWidget(m_expression);
    row->addSpacing(8);
    addSeverities();
    for (QToolButton* button : qAsConst(m_severities))
        row->addWidget(button);

    m_more = new QToolButton;
    m_more->setText(tr("More"));
    m_more->setCheckable(true);
    m_more->setFocusPolicy(Qt::TabFocus);
    m_more->setAccessibleName(tr("More filters"));
    m_more->setToolTip(PlainToolTip(tr("More terms, terms to hide, least severity, context")));
    row->addWidget(m_more);
    QWidget* secondRow = makeSecondRow();
    connect(m_more, &QToolButton::toggled, secondRow, &QWidget::setVisible);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(4);
    layout->addLayout(row);
    layout->addWidget(secondRow);
    layout->addWidget(m_error);

    m_typing.setSingleShot(true);
    m_typing.setInterval(TypingPause);
    connect(&m_typing, &QTimer::timeout, this, &LogFilterBar::apply);
    connect(m_text, &QLineEdit::textChanged, this, [this] { m_typing.start(); });
    connect(m_text, &QLineEdit::returnPressed, this, &LogFilterBar::apply);
    connect(m_text, &QLineEdit::editingFinished, this, &LogFilterBar::keepText);
}

QLineEdit* LogFilterBar::makeTerms(QString const& name, QString const& toolTip)
{
    auto* field = new QLineEdit;
    field->setPlaceholderText(tr("Terms"));
    field->setClearButtonEnabled(true);
    field->setAccessibleName(name);
    field->setAcceptDrops(false); // leave dropped files to the window
    field->setToolTip(PlainToolTip(toolTip));
    connect(field, &QLineEdit::textChanged, this, [this] { m_typing.start(); });
    connect(field, &QLineEdit::returnPressed, this, &LogFilterBar::apply);
    return field;
}

QWidget* LogFilterBar::makeSecondRow()
{
    m_required = makeTerms(tr("Terms that lines also contain"),
                           tr("Show only lines that contain all of these terms, too. "
                              "Blanks separate terms; \"two words\" are one."));
    m_hidden = makeTerms(tr("Terms of lines to hide"),
                         tr("Hide lines that contain any of these terms. "
                            "Blanks separate terms; \"two words\" are one."));
    m_least = new QComboBox;
    m_least->setAccessibleName(tr("Least severity"));
    m_least->addItem(tr("All severities"));
    for (int i = 1; i < LogEntry::Fatal; ++i)
        m_least->addItem(
            tr("At least %1").arg(LogSeverities::Name(static_cast<LogEntry::Severity>(i))));
    m_least->addItem(tr("Only %1").arg(LogSeverities::Name(LogEntry::Fatal)));
    m_least->addItem(tr("Some severities")); // as the buttons say
    connect(m_least, QOverload<int>::of(&QComboBox::activated), this,
            &LogFilterBar::setLeastSeverity);
    m_context = new QComboBox;
    m_context->setAccessibleName(tr("Lines of context"));
    m_context->setToolTip(PlainToolTip(tr("Lines to show before and after each one that matches")));
    for (int lines : {0, 1, 2, 5, 10}) {
        const QString text = lines == 0 ? tr("No context") : tr("%1 around").arg(lines);
        m_context->addItem(text, lines);
    }
    connect(m_context, QOverload<int>::of(&QComboBox::currentIndexChanged), this,
            &LogFilterBar::apply);

    auto* second = new QWidget;
    auto* row = new QHBoxLayout(second);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(6);
    row->addWidget(NewPlainLabel(tr("Also:")));
    row->addWidget(m_required, 1);
    row->addWidget(NewPlainLabel(tr("Hide:")));
    row->addWidget(m_hidden, 1);
    row->addWidget(m_least);
    row->addWidget(m_context);
    second->hide();
    return second;
}

void LogFilterBar::setLeastSeverity(int least)
{
    if (least >= LogEntry::None)
        return;
    for (int i = 0; i < m_severities.size(); ++i) {
        const QSignalBlocker blocker(m_severities.at(i));
        m_severities.at(i)->setChecked(i >= least);
    }
    apply();
}

// What the five buttons amount to.
void LogFilterBar::showLeastSeverity()
{
    int least = 0;
    while (least < LogEntry::None && !m_severities.at(least)->isChecked())
        ++least;
    bool isRange = least < LogEntry::None;
    for (int i = least; i < m_severities.size(); ++i)
        isRange = isRange && m_severities.at(i)->isChecked();
    m_least->setCurrentIndex(isRange ? least : LogEntry::None);
}

// What the second row does is told while it is hidden, too.
void LogFilterBar::showMore()
{
    const int count = (m_required->text().isEmpty() ? 0 : 1) +
                      (m_hidden->text().isEmpty() ? 0 : 1) +
                      (m_context->currentIndex() > 0 ? 1 : 0);
    m_more->setText(count > 0 ? tr("More (%1)").arg(count) : tr("More"));
}

void LogFilterBar::FilterBy(QString const& text)
{
    const QSignalBlocker blocker(m_expression);
    m_expression->setChecked(false);
    m_text->setText(text);
    keepText();
    apply();
}

void LogFilterBar::Hide(QString const& text)
{
    const QString term = LogTerms::Quoted(text);
    const QString before = m_hidden->text().trimmed();
    m_hidden->setText(before.isEmpty() ? term : before + QLatin1Char(' ') + term);
    m_more->setChecked(true);
    apply();
}

void LogFilterBar::FilterBy(LogEntry::Severity severity)
{
    if (severity >= m_severities.size())
        return; // it has no button
    for (int i = 0; i < m_severities.size(); ++i) {
        const QSignalBlocker blocker(m_severities.at(i));
        m_severities.at(i)->setChecked(i == severity);
    }
    apply();
}

void LogFilterBar::Hide(LogEntry::Severity severity)
{
    if (severity < m_severities.size())
        m_severities.at(severity)->setChecked(false);
}

void LogFilterBar::keepText()
{
    const QString text = m_text->text();
    if (text.trimmed().isEmpty())
        return;
    m_history->removeAll(text);
    m_history->prepend(text);
    while (m_history->size() > MaximumHistory)
        m_history->removeLast();
}

void LogFilterBar::showHistory()
{
    auto* menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    for (QString const& text : qAsConst(*m_history)) {
        QString shown = Shortened(text, MaximumShown);
        shown.replace(QLatin1Char('&'), QLatin1String("&&"));
        menu->addAction(shown, this, [this, text] {
            m_text->setText(text);
            apply();
        });
    }
    if (m_history->isEmpty())
        menu->addAction(tr("No earlier filters"))->setEnabled(false);
    menu->popup(m_text->mapToGlobal(QPoint(0, m_text->height())));
}

bool LogFilterBar::eventFilter(QObject* watched, QEvent* event)
{
    if (watched == m_text && event->type() == QEvent::KeyPress &&
        static_cast<QKeyEvent*>(event)->key() == Qt::Key_Down) {
        showHistory();
        return true;
    }
    return QWidget::eventFilter(watched, event);
}

// Otherwise the way from the text to the lines would lead through all other controls.
void LogFilterBar::keyPressEvent(QKeyEvent* event)
{
    if (event->key() == Qt::Key_Escape && parentWidget())
        parentWidget()->setFocus(); // passed on to the table
    else
        QWidget::keyPressEvent(event);
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
    m_required->clear();
    m_hidden->clear();
    m_context->setCurrentIndex(0);
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
    if (m_severities.size() <= LogEntry::None || !m_context)
        return; // controls are not complete yet
    m_typing.stop();
    for (int i = 0; i < m_severities.size(); ++i)
        m_filter.SetSeverity(static_cast<LogEntry::Severity>(i), m_severities.at(i)->isChecked());
    showLeastSeverity();
    m_filter.SetTerms(LogTerms(m_required->text(), m_case->isChecked()),
                      LogTerms(m_hidden->text(), m_case->isChecked()));
    m_filter.SetContext(m_context->currentData().toInt());
    showMore();

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
