// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainToolBar.h"

#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QEvent>
#include <QStyle>
#include <QToolButton>

namespace Velocor {

MainToolBar::MainToolBar(QWidget* parent) : QToolBar(parent)
{
    setAccessibleName(tr("Tools"));
    setMovable(false);
    setContextMenuPolicy(Qt::PreventContextMenu); // the window's would hide it behind the menu item
    updateIconSize();
}

void MainToolBar::AddTool(QAction* action, ActionIcons::Name icon)
{
    m_tools.append({action, icon});
    action->setIcon(ActionIcons::Icon(icon, palette()));
    action->setIconVisibleInMenu(false);
    action->setToolTip(PlainToolTip(tr("%1 (%2)").arg(
        action->statusTip(), action->shortcut().toString(QKeySequence::NativeText))));
    addAction(action);
    // Assistive technology toggles the button without a click, and Qt does not tell the action.
    auto const* button = qobject_cast<QToolButton*>(widgetForAction(action));
    connect(button, &QToolButton::toggled, action, [action](bool checked) {
        if (action->isChecked() != checked)
            action->trigger();
    });
}

void MainToolBar::AddSpace()
{
    auto* space = new QWidget;
    space->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Preferred);
    addWidget(space);
}

// Between those of menus and the large ones of tool bars that have nothing else.
void MainToolBar::updateIconSize()
{
    const int size = style()->pixelMetric(QStyle::PM_SmallIconSize, nullptr, this) * 5 / 4;
    setIconSize(QSize(size, size));
}

void MainToolBar::changeEvent(QEvent* event)
{
    QToolBar::changeEvent(event);
    if (event->type() == QEvent::FontChange || event->type() == QEvent::StyleChange)
        updateIconSize();
    if (event->type() != QEvent::PaletteChange)
        return;
    for (Tool const& tool : qAsConst(m_tools))
        tool.action->setIcon(ActionIcons::Icon(tool.icon, palette()));
}

} // namespace Velocor
