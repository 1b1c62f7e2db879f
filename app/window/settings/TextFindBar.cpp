// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/TextFindBar.h"

#include "app/window/widgets/PlainText.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QTextBlock>
#include <QToolButton>

#include <algorithm>

namespace Velocor {

TextFindBar::TextFindBar(QPlainTextEdit* text, QWidget* parent)
    : QWidget(parent), m_text(text), m_wanted(new QLineEdit), m_result(NewPlainLabel())
{
    m_wanted->setPlaceholderText(tr("Find in the text"));
    m_wanted->setAccessibleName(tr("Find in the text"));
    m_wanted->setClearButtonEnabled(true);
    m_wanted->setAcceptDrops(false); // leave dropped files to the window
    m_result->setAccessibleName(tr("Result of the search in the text"));
    QToolButton* previous = makeButton(QChar(0x2191), tr("Find previous in the text"),
                                       tr("Go to the previous match (Shift+F3)"));
    QToolButton* next =
        makeButton(QChar(0x2193), tr("Find next in the text"), tr("Go to the next match (F3)"));
    QToolButton* close =
        makeButton(QChar(0xd7), tr("Close the find bar of the text"), tr("Close (Esc)"));
    connect(previous, &QToolButton::clicked, this, [this] { FindNext(-1); });
    connect(next, &QToolButton::clicked, this, [this] { FindNext(1); });
    connect(close, &QToolButton::clicked, this, &TextFindBar::Close);
    connect(m_wanted, &QLineEdit::textChanged, this, [this] {
        m_isStale = true;
        find(1, true);
    });
    m_soon.setSingleShot(true);
    m_soon.setInterval(0);
    connect(&m_soon, &QTimer::timeout, this, &TextFindBar::showResult);
    connect(m_text, &QPlainTextEdit::textChanged, this, &TextFindBar::noteChange);
    connect(m_text, &QPlainTextEdit::selectionChanged, &m_soon, QOverload<>::of(&QTimer::start));
    connect(m_text, &QPlainTextEdit::cursorPositionChanged, &m_soon,
            QOverload<>::of(&QTimer::start));

    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_wanted, 1);
    layout->addWidget(m_result);
    layout->addWidget(previous);
    layout->addWidget(next);
    layout->addWidget(close);
    hide();
}

QToolButton* TextFindBar::makeButton(QChar sign, QString const& name, QString const& toolTip)
{
    auto* button = new QToolButton;
    button->setText(QString(sign));
    button->setAutoRaise(true);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    return button;
}

void TextFindBar::Open()
{
    show();
    showResult();
    m_wanted->setFocus();
    m_wanted->selectAll();
}

void TextFindBar::Close()
{
    hide();
    m_text->setFocus();
}

void TextFindBar::FindNext(int step)
{
    if (m_wanted->text().isEmpty())
        Open();
    else
        find(step, false);
}

// While one types, the match may grow where it is.
void TextFindBar::find(int step, bool fromSelection)
{
    QVector<int> const& all = matches();
    m_wrap = 0;
    if (!all.isEmpty()) {
        const QTextCursor selected = m_text->textCursor();
        const int length = m_wanted->text().size();
        const int start = fromSelection ? selected.selectionStart() : selected.selectionEnd();
        auto match = std::lower_bound(all.begin(), all.end(), start);
        if (step < 0)
            match = std::upper_bound(all.begin(), all.end(), selected.selectionStart() - length);
        if (match == (step < 0 ? all.begin() : all.end())) {
            m_wrap = step;
            match = step < 0 ? all.end() : all.begin();
        }
        QTextCursor found(m_text->document());
        found.setPosition(step < 0 ? *(match - 1) : *match);
        m_wrappedTo = found.position();
        found.setPosition(m_wrappedTo + length, QTextCursor::KeepAnchor);
        m_text->setTextCursor(found);
    }
    showResult();
}

// None without a text to find. A non-breaking space looks like a space, so it is one here.
QVector<int> const& TextFindBar::matches()
{
    if (!m_isStale)
        return m_matches;
    m_isStale = false;
    m_matches.clear();
    const QString wanted = m_wanted->text().replace(QChar::Nbsp, QLatin1Char(' '));
    QTextBlock block = m_text->document()->begin();
    for (; block.isValid() && !wanted.isEmpty(); block = block.next()) {
        const QString line = block.text().replace(QChar::Nbsp, QLatin1Char(' '));
        int at = line.indexOf(wanted, 0, Qt::CaseInsensitive);
        for (; at >= 0; at = line.indexOf(wanted, at + wanted.size(), Qt::CaseInsensitive))
            m_matches.append(block.position() + at);
    }
    return m_matches;
}

void TextFindBar::noteChange()
{
    m_isStale = true;
    m_soon.start();
}

void TextFindBar::showResult()
{
    if (isHidden())
        return;
    const QString wanted = m_wanted->text();
    QVector<int> const& all = matches();
    const QTextCursor selected = m_text->textCursor();
    const int start = selected.selectionStart();
    const auto match = std::lower_bound(all.begin(), all.end(), start);
    const bool isSelected =
        match != all.end() && *match == start && selected.selectionEnd() == start + wanted.size();
    const int number = isSelected ? static_cast<int>(match - all.begin()) + 1 : 0;
    const int wrap = start == m_wrappedTo ? m_wrap : 0;
    m_result->setText(wanted.isEmpty() ? QString() : resultText(number, all.size(), wrap));
}

// The number of the match that is selected is 0 if none is.
QString TextFindBar::resultText(int number, int count, int wrap)
{
    if (count == 0)
        return tr("No match");
    if (number == 0)
        return tr("%Ln match(es)", nullptr, count);
    const QString place = wrap == 0  ? tr("%L1 of %L2")
                          : wrap < 0 ? tr("%L1 of %L2, continued from the bottom")
                                     : tr("%L1 of %L2, continued from the top");
    return place.arg(number).arg(count);
}

void TextFindBar::keyPressEvent(QKeyEvent* event)
{
    const bool isShifted = event->modifiers().testFlag(Qt::ShiftModifier);
    const int key = event->key();
    if (key == Qt::Key_Escape)
        Close();
    else if (key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_F3)
        FindNext(isShifted ? -1 : 1);
    else if (event->matches(QKeySequence::Find))
        Open();
    else
        QWidget::keyPressEvent(event);
}

} // namespace Velocor
