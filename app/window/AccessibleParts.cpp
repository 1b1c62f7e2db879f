// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/AccessibleParts.h"

#include <QAccessibleWidget>
#include <QEvent>
#include <QLabel>
#include <QPixmap>
#include <QSplitter>
#include <QSplitterHandle>

namespace Velocor {

namespace {

// A label has no signal for its text, and none is needed before the text is painted.
class LabelWatcher : public QObject
{
public:
    explicit LabelWatcher(QLabel* label) : QObject(label), m_label(label), m_said(label->text())
    {
        label->installEventFilter(this);
    }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if (event->type() == QEvent::Paint && m_label->text() != m_said) {
            m_said = m_label->text();
            QAccessibleEvent said(m_label, QAccessible::DescriptionChanged);
            QAccessible::updateAccessibility(&said);
        }
        return QObject::eventFilter(watched, event);
    }

private:
    QLabel* m_label;
    QString m_said;
};

// Qt says either the name or the text of a label. The text is the news.
class NamedLabel : public QAccessibleWidget
{
public:
    explicit NamedLabel(QLabel* label)
        : QAccessibleWidget(label, QAccessible::StaticText), m_label(label)
    {
        new LabelWatcher(label);
    }

    QAccessible::Role role() const override
    {
        const bool isPicture = !m_label->property("pixmap").value<QPixmap>().isNull();
        return isPicture ? QAccessible::Graphic : QAccessible::StaticText;
    }

    QString text(QAccessible::Text which) const override
    {
        const QString text = QAccessibleWidget::text(which);
        const bool isNews = which == QAccessible::Description &&
                            m_label->accessibleDescription().isEmpty() &&
                            m_label->text() != m_label->accessibleName();
        return isNews ? m_label->text() : text;
    }

private:
    QLabel* m_label;
};

QAccessibleInterface* CreatePart(QString const& className, QObject* object)
{
    if (className == QLatin1String("QLabel")) {
        auto* label = qobject_cast<QLabel*>(object);
        return label && !label->accessibleName().isEmpty() ? new NamedLabel(label) : nullptr;
    }
    if (className == QLatin1String("Velocor::Announcer"))
        return new QAccessibleWidget(qobject_cast<QWidget*>(object), QAccessible::Notification);
    if (className == QLatin1String("QSplitterHandle")) {
        auto* handle = qobject_cast<QSplitterHandle*>(object);
        return handle ? new QAccessibleWidget(handle, QAccessible::Separator,
                                              handle->splitter()->accessibleName())
                      : nullptr;
    }
    return nullptr;
}

} // namespace

void InstallAccessibleParts()
{
    QAccessible::installFactory(CreatePart);
}

} // namespace Velocor
