// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/NoticeBar.h"

#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>

namespace Velocor {

NoticeBar::NoticeBar(QWidget* parent)
    : QFrame(parent), m_icon(NewPlainLabel()), m_label(NewPlainLabel())
{
    setFrameShape(StyledPanel);
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::Base);
    m_label->setWordWrap(true);
    m_label->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_label->setAccessibleName(tr("Notice"));
    m_icon->setAccessibleName(tr("Notice icon"));

    auto* dismiss = new QPushButton(tr("Dismiss"));
    dismiss->setAutoDefault(false);
    dismiss->setAccessibleName(tr("Dismiss notice"));
    connect(dismiss, &QPushButton::clicked, this, &NoticeBar::Dismiss);

    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(10, 6, 6, 6);
    layout->setSpacing(10);
    layout->addWidget(m_icon);
    layout->addWidget(m_label, 1);
    layout->addWidget(dismiss, 0, Qt::AlignTop);
    hide();
}

void NoticeBar::ShowMessage(QString const& text)
{
    m_icon->setPixmap(SeverityIcons::Icon(LogEntry::Warning, palette()).pixmap(16));
    m_label->setText(isHidden() ? text : m_label->text() + QLatin1Char('\n') + text);
    show();
}

void NoticeBar::Dismiss()
{
    hide();
    m_label->clear();
}

QString NoticeBar::text() const
{
    return m_label->text();
}

} // namespace Velocor
