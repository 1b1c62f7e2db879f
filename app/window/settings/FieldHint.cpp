// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/FieldHint.h"

#include "app/window/widgets/Announcer.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/PlainText.h"

#include <QEvent>
#include <QGuiApplication>
#include <QLabel>
#include <QLineEdit>

#include <algorithm>

namespace Velocor {

namespace {

constexpr qreal ErrorTint = 0.25;
constexpr int Margin = 4; // pixels

} // namespace

FieldHint::FieldHint(QLineEdit* field) : QObject(field), m_field(field), m_label(NewPlainLabel())
{
    m_label->setParent(field->parentWidget());
    m_label->setAccessibleName(tr("Problem with what is typed"));
    m_label->setForegroundRole(QPalette::ToolTipText);
    m_label->setBackgroundRole(QPalette::ToolTipBase);
    m_label->setAutoFillBackground(true);
    m_label->setFrameShape(QFrame::Box);
    m_label->setMargin(Margin);
    m_label->setWordWrap(true);
    m_label->hide();
    field->installEventFilter(this);
    connect(field, &QObject::destroyed, m_label, &QObject::deleteLater);
}

void FieldHint::Show(QString const& problem)
{
    m_field->setAccessibleDescription(problem);
    if (problem != m_label->text())
        Announcer::Say(m_field, problem);
    m_label->setText(problem);
    QPalette colors = QGuiApplication::palette();
    if (!problem.isEmpty())
        colors.setColor(QPalette::Base, Blended(colors.color(QPalette::Base), Qt::red, ErrorTint));
    m_field->setPalette(colors);
    m_label->setVisible(!problem.isEmpty());
    place();
}

// Below the field or, if there is no room, above it.
void FieldHint::place()
{
    QWidget const* parent = m_field->parentWidget();
    const int width = std::min(m_label->fontMetrics().averageCharWidth() * 60, parent->width());
    m_label->setFixedWidth(width);
    m_label->adjustSize();
    QPoint corner(m_field->x(), m_field->geometry().bottom() + 1);
    if (corner.y() + m_label->height() > parent->height())
        corner.setY(std::max(0, m_field->y() - m_label->height()));
    corner.setX(std::max(0, std::min(corner.x(), parent->width() - width)));
    m_label->move(corner);
    m_label->raise();
}

bool FieldHint::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() == QEvent::Move || event->type() == QEvent::Resize)
        place();
    else if (event->type() == QEvent::Hide)
        m_label->hide();
    return QObject::eventFilter(object, event);
}

} // namespace Velocor
