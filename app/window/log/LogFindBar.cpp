// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogFindBar.h"

#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/WrappedLabel.h"

#include <QCheckBox>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QToolButton>

namespace Velocor {

namespace {

constexpr int FindPause = 150; // milliseconds

QToolButton* NewButton(QString const& text, QString const& name, QString const& toolTip)
{
    auto* button = new QToolButton;
    button->setText(text);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    button->setFocusPolicy(Qt::TabFocus);
    return button;
}

} // namespace

LogFindBar::LogFindBar(QWidget* parent)
    : QWidget(parent), m_text(new QLineEdit), m_count(NewPlainLabel()), m_error(new WrappedLabel)
{
    setAccessibleName(tr("Find"));
    m_text->setPlaceholderText(tr("Find"));
    m_text->setClearButtonEnabled(true);
    m_text->setAccessibleName(tr("Find text"));
    m_text->setAcceptDrops(false); // leave dropped files to the window
    m_text->setToolTip(PlainToolTip(tr("Go to lines that contain this text, among the others "
                                       "(Ctrl+F)")));
    m_text->installEventFilter(this);
    m_count->setAccessibleName(tr("Lines found"));
    m_error->setAccessibleName(tr("Find error"));
    m_error->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_error->hide();

    m_case = makeOption(tr("Aa"), tr("Match case when finding"));
    m_expression = makeOption(LeftToRight(tr(".*")), tr("Find a regular expression"));
    QToolButton* next = NewButton(tr("Next"), tr("Find next"), tr("Next line found (F3)"));
    QToolButton* previous =
        NewButton(tr("Previous"), tr("Find previous"), tr("Previous line found (Shift+F3)"));
    QToolButton* close = NewButton(QString(QChar(0xd7)), tr("Close find bar"), tr("Close (Esc)"));
    close->setAutoRaise(true);

    auto* row = new FlowLayout(6);
    for (QWidget* widget : {static_cast<QWidget*>(m_text), static_cast<QWidget*>(m_count),
                            static_cast<QWidget*>(m_case), static_cast<QWidget*>(m_expression),
                            static_cast<QWidget*>(next), static_cast<QWidget*>(previous),
                            static_cast<QWidget*>(close)})
        row->addWidget(widget);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(4);
    layout->addLayout(row);
    layout->addWidget(m_error);
    hide();

    m_typing.setSingleShot(true);
    m_typing.setInterval(FindPause);
    connect(&m_typing, &QTimer::timeout, this, &LogFindBar::Apply);
    connect(m_text, &QLineEdit::textChanged, this, [this] { m_typing.start(); });
    connect(next, &QToolButton::clicked, this, [this] { Q_EMIT stepRequested(1); });
    connect(previous, &QToolButton::clicked, this, [this] { Q_EMIT stepRequested(-1); });
    connect(close, &QToolButton::clicked, this, &LogFindBar::Close);
}

QCheckBox* LogFindBar::makeOption(QString const& text, QString const& name)
{
    auto* option = new QCheckBox(text);
    option->setAccessibleName(name);
    option->setToolTip(PlainToolTip(name));
    connect(option, &QCheckBox::toggled, this, &LogFindBar::Apply);
    return option;
}

bool LogFindBar::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::KeyPress) {
        auto const* key = static_cast<QKeyEvent*>(event);
        if (key->key() == Qt::Key_Return || key->key() == Qt::Key_Enter) {
            const bool isBackward = key->modifiers() & Qt::ShiftModifier;
            Q_EMIT stepRequested(isBackward ? -1 : 1);
            return true;
        }
    }
    return QWidget::eventFilter(watched, event);
}

bool LogFindBar::hasText() const
{
    return !m_text->text().isEmpty();
}

LogFilter LogFindBar::text() const
{
    LogFilter filter;
    if (!isHidden())
        filter.SetText(m_text->text(), m_expression->isChecked(), m_case->isChecked());
    return filter;
}

void LogFindBar::Open()
{
    const bool wasHidden = isHidden();
    show();
    m_text->setFocus(Qt::ShortcutFocusReason);
    m_text->selectAll();
    if (wasHidden)
        Apply();
}

void LogFindBar::Close()
{
    if (isHidden())
        return;
    m_typing.stop();
    hide();
    Q_EMIT closed();
    Q_EMIT textChanged();
}

void LogFindBar::Apply()
{
    m_typing.stop();
    m_slowLine = 0;
    const QString error =
        m_expression->isChecked() ? LogFilter::ErrorOf(m_text->text()) : QString();
    showError(error.isEmpty() ? QString() : tr("Invalid regular expression: %1").arg(error));
    Q_EMIT textChanged();
}

void LogFindBar::ShowCount(QString const& count)
{
    m_count->setText(count);
}

void LogFindBar::ShowSlowLine(qint64 line)
{
    if (line == m_slowLine)
        return;
    m_slowLine = line;
    showError(line == 0 ? QString()
                        : tr("The regular expression takes too long at line %L1.").arg(line));
}

void LogFindBar::showError(QString const& error)
{
    m_error->setText(error);
    m_error->setVisible(!error.isEmpty());
}

} // namespace Velocor
