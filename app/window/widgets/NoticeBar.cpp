// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/NoticeBar.h"

#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"
#include "app/window/widgets/WrappedLabel.h"

#include <QEvent>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QStyle>

namespace Velocor {

namespace {

constexpr qreal Tint = 0.18;

} // namespace

NoticeBar::NoticeBar(QString const& name, QWidget* parent)
    : QFrame(parent), m_icon(NewPlainLabel()), m_label(new WrappedLabel)
{
    setFrameShape(StyledPanel);
    setAutoFillBackground(true);
    m_label->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_label->setAccessibleName(name);
    m_icon->setAccessibleName(tr("%1 icon").arg(name));

    auto* dismiss = new QPushButton(tr("Dismiss"));
    dismiss->setAutoDefault(false);
    dismiss->setAccessibleName(tr("Dismiss %1").arg(name.toLower()));
    connect(dismiss, &QPushButton::clicked, this, &NoticeBar::Dismiss);

    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(10, 6, 6, 6);
    layout->setSpacing(10);
    layout->addWidget(m_icon);
    layout->addWidget(m_label, 1);
    layout->addWidget(dismiss, 0, Qt::AlignTop);
    updateColors();
    hide();
}

void NoticeBar::updateColors()
{
    QPalette const& outer = parentWidget() ? parentWidget()->palette() : QGuiApplication::palette();
    const QColor warning = SeverityIcons::Color(LogEntry::Warning, outer);
    QPalette colors; // sets only this role, so the others still follow the window's palette
    colors.setColor(QPalette::Window, Blended(outer.color(QPalette::Base), warning, Tint));
    if (palette().color(QPalette::Window) != colors.color(QPalette::Window))
        setPalette(colors);
    m_icon->setPixmap(SeverityIcons::Icon(LogEntry::Warning, outer)
                          .pixmap(style()->pixelMetric(QStyle::PM_SmallIconSize, nullptr, this)));
}

void NoticeBar::changeEvent(QEvent* event)
{
    QFrame::changeEvent(event);
    if (event->type() == QEvent::PaletteChange || event->type() == QEvent::ParentChange ||
        event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange)
        updateColors();
}

void NoticeBar::SetState(QString const& state)
{
    if (state == m_state)
        return;
    m_state = state;
    m_label->setText(state);
    setVisible(!state.isEmpty());
}

void NoticeBar::ShowMessage(QString const& text)
{
    m_label->setText(isHidden() ? text : m_label->text() + QLatin1Char('\n') + text);
    show();
}

QPushButton* NoticeBar::AddButton(QString const& text)
{
    auto* button = new QPushButton(text);
    button->setAutoDefault(false);
    auto* row = static_cast<QHBoxLayout*>(layout());
    row->insertWidget(row->count() - 1, button, 0, Qt::AlignTop);
    return button;
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
