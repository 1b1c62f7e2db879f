// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/TextFindBar.h"

#include "app/window/widgets/PlainText.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QToolButton>

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
    connect(m_wanted, &QLineEdit::textChanged, this, [this] { find(1, true); });

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
    m_result->clear();
    const QString wanted = m_wanted->text();
    if (wanted.isEmpty())
        return;
    QTextCursor from = m_text->textCursor();
    if (fromSelection)
        from.setPosition(from.selectionStart());
    const QTextDocument::FindFlags flags =
        step < 0 ? QTextDocument::FindBackward : QTextDocument::FindFlags();
    QTextCursor match = m_text->document()->find(wanted, from, flags);
    if (match.isNull()) {
        from.movePosition(step < 0 ? QTextCursor::End : QTextCursor::Start);
        match = m_text->document()->find(wanted, from, flags);
        m_result->setText(match.isNull() ? tr("No match")
                          : step < 0     ? tr("Continued from the bottom")
                                         : tr("Continued from the top"));
    }
    if (!match.isNull())
        m_text->setTextCursor(match);
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
