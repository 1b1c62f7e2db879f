// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsFindBar.h"

#include "app/window/settings/SettingsTree.h"
#include "app/window/widgets/PlainText.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QToolButton>

namespace Velocor {

SettingsFindBar::SettingsFindBar(SettingsTree* tree, QWidget* parent)
    : QWidget(parent), m_tree(tree), m_text(new QLineEdit), m_result(NewPlainLabel())
{
    m_text->setPlaceholderText(tr("Find in names and values"));
    m_text->setAccessibleName(tr("Find in names and values"));
    m_text->setClearButtonEnabled(true);
    m_text->setAcceptDrops(false); // leave dropped files to the window
    m_result->setAccessibleName(tr("Result of the search"));
    QToolButton* previous = makeButton(QString(QChar(0x2191)), tr("Find previous"),
                                       tr("Go to the previous match (Shift+F3)"));
    QToolButton* next =
        makeButton(QString(QChar(0x2193)), tr("Find next"), tr("Go to the next match (F3)"));
    QToolButton* close =
        makeButton(QString(QChar(0xd7)), tr("Close the find bar"), tr("Close (Esc)"));
    connect(previous, &QToolButton::clicked, this, [this] { FindNext(-1); });
    connect(next, &QToolButton::clicked, this, [this] { FindNext(1); });
    connect(close, &QToolButton::clicked, this, &SettingsFindBar::Close);
    connect(m_text, &QLineEdit::textChanged, this, [this] { find(1, true); });

    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_text, 1);
    layout->addWidget(m_result);
    layout->addWidget(previous);
    layout->addWidget(next);
    layout->addWidget(close);
    hide();
}

QToolButton* SettingsFindBar::makeButton(QString const& text, QString const& name,
                                         QString const& toolTip)
{
    auto* button = new QToolButton;
    button->setText(text);
    button->setAutoRaise(true);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    return button;
}

void SettingsFindBar::Open()
{
    show();
    m_text->setFocus();
    m_text->selectAll();
}

void SettingsFindBar::Close()
{
    hide();
    m_tree->setFocus();
}

void SettingsFindBar::FindNext(int step)
{
    if (m_text->text().isEmpty())
        Open();
    else
        find(step, false);
}

void SettingsFindBar::find(int step, bool fromCurrent)
{
    const QString text = m_text->text();
    const bool isFound = text.isEmpty() || m_tree->Find(text, step, fromCurrent);
    m_result->setText(isFound ? QString() : tr("No match"));
}

void SettingsFindBar::keyPressEvent(QKeyEvent* event)
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
