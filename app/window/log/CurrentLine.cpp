// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/CurrentLine.h"

#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/LongText.h"
#include "app/window/widgets/PlainText.h"

#include <QMenu>
#include <QVBoxLayout>

namespace Velocor {

CurrentLine::CurrentLine(QWidget* parent)
    : QWidget(parent), m_note(new ElidedLabel(Qt::ElideRight)), m_text(new LongText)
{
    m_note->setAccessibleName(tr("Note on the current line"));
    m_note->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    m_note->hide();

    m_text->setReadOnly(true);
    m_text->setTabChangesFocus(true);
    m_text->setAccessibleName(tr("Full text of the current line"));
    m_text->setPlaceholderText(tr("Select a line to see its full text here"));
    m_text->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_text->setMinimumHeight(m_text->fontMetrics().lineSpacing() * 2 + 12);
    m_text->setContextMenuPolicy(Qt::CustomContextMenu);
    connect(m_text, &QWidget::customContextMenuRequested, this, &CurrentLine::showMenu);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(4);
    layout->addWidget(m_note);
    layout->addWidget(m_text, 1);
}

void CurrentLine::SetText(QString const& text)
{
    m_text->SetText(text);
}

void CurrentLine::SetNote(QString const& note)
{
    m_note->setText(note.isEmpty() ? QString() : tr("Note: %1").arg(note));
    m_note->setToolTip(PlainToolTip(note));
    m_note->setVisible(!note.isEmpty());
}

void CurrentLine::SetTextFont(QFont const& font)
{
    m_text->setFont(font);
}

int CurrentLine::UsualHeight() const
{
    return m_text->fontMetrics().lineSpacing() * 3 + 12;
}

QWidget* CurrentLine::viewport() const
{
    return m_text->viewport();
}

// For a part of the line, which cannot be selected in the table.
void CurrentLine::showMenu(QPoint const& position)
{
    QMenu* menu = m_text->createStandardContextMenu();
    menu->setAttribute(Qt::WA_DeleteOnClose);
    const QString selected = m_text->SelectedText();
    menu->addSeparator();
    const auto add = [&](QString const& text, void (CurrentLine::*request)(QString const&)) {
        QAction* action =
            menu->addAction(text, this, [this, selected, request] { (this->*request)(selected); });
        action->setEnabled(!selected.isEmpty());
    };
    add(tr("&Filter by This"), &CurrentLine::filterRequested);
    add(tr("&Hide This"), &CurrentLine::hideRequested);
    add(tr("Hi&ghlight This"), &CurrentLine::highlightRequested);
    menu->popup(m_text->mapToGlobal(position));
}

} // namespace Velocor
