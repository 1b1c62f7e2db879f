// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogFilterBar.h"

#include "app/history/HistoryTime.h"
#include "app/logfile/LogSeverities.h"
#include "app/window/log/SeveritySwitches.h"
#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/WrappedLabel.h"

#include <QCheckBox>
#include <QComboBox>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QSignalBlocker>
#include <QToolButton>

namespace Velocor {

namespace {

constexpr int TypingPause = 150; // milliseconds
constexpr int Gap = 6;           // pixels
constexpr int MaximumShown = 80; // characters of an earlier filter

} // namespace

LogFilterBar::LogFilterBar(QWidget* parent)
    : QWidget(parent), m_text(new QLineEdit), m_severities(new SeveritySwitches),
      m_error(new WrappedLabel)
{
    m_text->setPlaceholderText(tr("Filter"));
    m_text->setClearButtonEnabled(true);
    m_text->setAccessibleName(tr("Filter by text"));
    m_text->setAcceptDrops(false); // leave dropped files to the window
    m_text->setToolTip(PlainToolTip(tr("Show only lines that contain this text (Ctrl+L)")));
    m_text->installEventFilter(this);
    m_error->setAccessibleName(tr("Filter error"));
    m_error->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_error->hide();

    QLayout* firstRow = makeFirstRow();
    QWidget* secondRow = makeSecondRow();
    connect(m_more, &QToolButton::toggled, secondRow, &QWidget::setVisible);
    connect(m_severities, &SeveritySwitches::toggled, this, &LogFilterBar::apply);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(4);
    layout->addLayout(firstRow);
    layout->addWidget(secondRow);
    layout->addWidget(makeSpanRow());
    layout->addWidget(m_error);

    m_typing.setSingleShot(true);
    m_typing.setInterval(TypingPause);
    connect(&m_typing, &QTimer::timeout, this, &LogFilterBar::apply);
    connect(m_text, &QLineEdit::textChanged, this, [this] { m_typing.start(); });
    connect(m_text, &QLineEdit::returnPressed, this, &LogFilterBar::apply);
    connect(m_text, &QLineEdit::editingFinished, this, &LogFilterBar::keepText);
}

QLayout* LogFilterBar::makeFirstRow()
{
    auto* earlier = new QToolButton;
    earlier->setArrowType(Qt::DownArrow);
    earlier->setAutoRaise(true);
    earlier->setFocusPolicy(Qt::NoFocus); // the Down key in the text does the same
    earlier->setAccessibleName(tr("Earlier filters"));
    earlier->setToolTip(PlainToolTip(tr("Earlier filters (Down)")));
    connect(earlier, &QToolButton::clicked, this, &LogFilterBar::showHistory);

    m_case = makeOption(tr("Aa"), tr("Match case"), tr("Match case"));
    m_expression = makeOption(LeftToRight(tr(".*")), tr("Regular expression"),
                              tr("Search each line with a regular expression"));
    m_more = new QToolButton;
    m_more->setText(tr("More"));
    m_more->setCheckable(true);
    m_more->setFocusPolicy(Qt::TabFocus);
    m_more->setAccessibleName(tr("More filters"));
    m_more->setToolTip(
        PlainToolTip(tr("More terms, terms to hide, times, least severity, context")));

    auto* row = new FlowLayout(Gap);
    for (QWidget* widget : {static_cast<QWidget*>(m_text), static_cast<QWidget*>(earlier),
                            static_cast<QWidget*>(m_case), static_cast<QWidget*>(m_expression),
                            static_cast<QWidget*>(m_severities), static_cast<QWidget*>(m_more)})
        row->addWidget(widget);
    return row;
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

QLineEdit* LogFilterBar::makeTime(QString const& name, QString const& toolTip)
{
    QLineEdit* field =
        makeTerms(name, toolTip + QLatin1Char(' ') +
                            tr("A date, a time or both (2026-11-20, 14:03, 2026-11-20 14:03), or "
                               "an interval until now such as -2h, -30m or -1d."));
    field->setPlaceholderText(name);
    connect(field, &QLineEdit::textChanged, this, &LogFilterBar::readSpan);
    return field;
}

// "-2h" is two hours before it was typed: the times stay when something else is changed.
void LogFilterBar::readSpan()
{
    m_filter.SetSpan({readTime(m_since), readTime(m_until)});
}

qint64 LogFilterBar::readTime(QLineEdit const* field)
{
    return HistoryTime::OfUser(field->text(), HistoryTime::Now());
}

void LogFilterBar::SetSpan(LogSpan const& span)
{
    const auto textOf = [](qint64 time) {
        return QString::fromLatin1(time < 0 ? QByteArray() : HistoryTime::Text(time))
            .replace(QLatin1Char('T'), QLatin1Char(' '));
    };
    m_since->setText(textOf(span.since));
    m_until->setText(textOf(span.until));
    m_since->setCursorPosition(0); // the date matters more than the milliseconds
    m_until->setCursorPosition(0);
    apply();
}

QWidget* LogFilterBar::makeSpanRow()
{
    m_span = NewPlainLabel();
    m_span->setAccessibleName(tr("Times shown"));
    m_span->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* remove = new QToolButton;
    remove->setText(QStringLiteral("\u00d7"));
    remove->setAutoRaise(true);
    remove->setFocusPolicy(Qt::TabFocus);
    remove->setAccessibleName(tr("Show all times"));
    remove->setToolTip(PlainToolTip(tr("Show all times")));
    connect(remove, &QToolButton::clicked, this, [this] {
        SetSpan(LogSpan());
        if (parentWidget())
            parentWidget()->setFocus(); // passed on to the table
    });
    auto* times = new QWidget;
    auto* row = new QHBoxLayout(times);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(6);
    row->addWidget(m_span);
    row->addWidget(remove);
    row->addStretch(1);
    times->hide();
    return times;
}

void LogFilterBar::showSpan()
{
    const LogSpan span = m_filter.span();
    const auto textOf = [](qint64 time) {
        const bool isWhole = time % 1000 == 0;
        return HistoryTime::DateTime(time).toString(
            isWhole ? QStringLiteral("yyyy-MM-dd HH:mm:ss")
                    : QStringLiteral("yyyy-MM-dd HH:mm:ss.zzz"));
    };
    QString text;
    if (span.since >= 0 && span.until >= 0)
        text = tr("Only from %1 to %2").arg(textOf(span.since), textOf(span.until));
    else if (span.since >= 0)
        text = tr("Only from %1 on").arg(textOf(span.since));
    else if (span.until >= 0)
        text = tr("Only until %1").arg(textOf(span.until));
    m_span->setText(text);
    m_span->parentWidget()->setVisible(span.isLimited());
}

QWidget* LogFilterBar::makeSecondRow()
{
    m_since = makeTime(tr("From"), tr("Show only entries from this time on."));
    m_until = makeTime(tr("Until"), tr("Show only entries up to this time."));

    m_required = makeTerms(tr("Terms that lines also contain"),
                           tr("Show only lines that contain all of these terms, too. "
                              "Blanks separate terms; \"two words\" are one."));
    m_hidden = makeTerms(tr("Terms of lines to hide"),
                         tr("Hide lines that contain any of these terms. "
                            "Blanks separate terms; \"two words\" are one."));
    m_least = makeLeastSeverity();
    m_context = makeContext();

    auto* second = new QWidget;
    auto* row = new FlowLayout(Gap, second);
    row->addWidget(NewPlainLabel(tr("Also:")));
    row->addWidget(m_required);
    row->addWidget(NewPlainLabel(tr("Hide:")));
    row->addWidget(m_hidden);
    row->addWidget(m_since);
    row->addWidget(m_until);
    row->addWidget(m_least);
    row->addWidget(m_context);
    second->hide();
    return second;
}

QComboBox* LogFilterBar::makeLeastSeverity()
{
    auto* box = new QComboBox;
    box->setAccessibleName(tr("Least severity"));
    box->addItem(tr("All severities"));
    for (int i = 1; i < LogEntry::Fatal; ++i)
        box->addItem(
            tr("At least %1").arg(LogSeverities::Name(static_cast<LogEntry::Severity>(i))));
    box->addItem(tr("Only %1").arg(LogSeverities::Name(LogEntry::Fatal)));
    box->addItem(tr("Some severities")); // as the buttons say
    connect(box, QOverload<int>::of(&QComboBox::activated), this, [this](int least) {
        if (least < LogEntry::None)
            m_severities->SetLeast(least);
    });
    return box;
}

QComboBox* LogFilterBar::makeContext()
{
    auto* box = new QComboBox;
    box->setAccessibleName(tr("Lines of context"));
    box->setToolTip(PlainToolTip(tr("Lines to show before and after each one that matches")));
    for (int lines : {0, 1, 2, 5, 10}) {
        const QString text = lines == 0 ? tr("No context") : tr("%1 around").arg(lines);
        box->addItem(text, lines);
    }
    connect(box, QOverload<int>::of(&QComboBox::currentIndexChanged), this, &LogFilterBar::apply);
    return box;
}

// What the second row does is told while it is hidden, too.
void LogFilterBar::showMore()
{
    const int count = (m_required->text().isEmpty() ? 0 : 1) +
                      (m_hidden->text().isEmpty() ? 0 : 1) + (m_filter.span().isLimited() ? 1 : 0) +
                      (m_context->currentIndex() > 0 ? 1 : 0);
    m_more->setText(count > 0 ? tr("More (%1)").arg(count) : tr("More"));
}

void LogFilterBar::FilterBy(QString const& text)
{
    filterBy(text, false);
}

void LogFilterBar::FilterByExpression(QString const& expression)
{
    filterBy(expression, true);
}

void LogFilterBar::filterBy(QString const& text, bool isExpression)
{
    const QSignalBlocker blocker(m_expression);
    m_expression->setChecked(isExpression);
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
    m_severities->ShowOnly(severity);
}

void LogFilterBar::Hide(LogEntry::Severity severity)
{
    m_severities->SetShown(severity, false);
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

void LogFilterBar::FocusText()
{
    m_text->setFocus(Qt::ShortcutFocusReason);
    m_text->selectAll();
}

void LogFilterBar::focusTerms(QLineEdit* field)
{
    m_more->setChecked(true);
    field->setFocus(Qt::ShortcutFocusReason);
    field->selectAll();
}

void LogFilterBar::Clear()
{
    m_text->clear();
    m_required->clear();
    m_hidden->clear();
    m_since->clear();
    m_until->clear();
    m_context->setCurrentIndex(0);
    m_severities->ShowAll(); // applies everything
}

void LogFilterBar::SetEarlierRuns(bool shown)
{
    m_filter.SetEarlierRuns(shown);
    Q_EMIT filterChanged();
}

void LogFilterBar::apply()
{
    if (!m_context)
        return; // controls are not complete yet
    m_typing.stop();
    for (int i = 0; i <= LogEntry::None; ++i) {
        const auto severity = static_cast<LogEntry::Severity>(i);
        m_filter.SetSeverity(severity, m_severities->Shows(severity));
    }
    m_least->setCurrentIndex(m_severities->least());
    m_filter.SetTerms(LogTerms(m_required->text(), m_case->isChecked()),
                      LogTerms(m_hidden->text(), m_case->isChecked()));
    m_filter.SetContext(m_context->currentData().toInt());
    showMore();
    showSpan();

    const bool isExpression = m_expression->isChecked();
    const QString error = isExpression ? LogFilter::ErrorOf(m_text->text()) : QString();
    showError(error.isEmpty()
                  ? timeError()
                  : tr("Invalid regular expression, nothing is filtered: %1").arg(error));
    m_filter.SetText(error.isEmpty() ? m_text->text() : QString(), isExpression,
                     m_case->isChecked());
    Q_EMIT filterChanged();
}

// While a time is being typed, it may be none yet.
QString LogFilterBar::timeError() const
{
    for (QLineEdit const* field : {m_since, m_until}) {
        if (!field->text().trimmed().isEmpty() && HistoryTime::OfUser(field->text(), 0) < 0)
            return tr("Not a time, which is not filtered: %1").arg(field->text());
    }
    return QString();
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
        showError(timeError());
}

void LogFilterBar::ShowCounts(LogCounts const& counts)
{
    m_severities->SetCounts(counts);
}

} // namespace Velocor
