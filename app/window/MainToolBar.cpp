// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainToolBar.h"

#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QEvent>
#include <QToolButton>

namespace Velocor {

MainToolBar::MainToolBar(QWidget* parent) : QToolBar(parent)
{
    setAccessibleName(tr("Tools"));
    setMovable(false);
    setContextMenuPolicy(Qt::PreventContextMenu); // the window's would hide it behind the menu item
    setIconSize(QSize(20, 20));
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

void MainToolBar::changeEvent(QEvent* event)
{
    QToolBar::changeEvent(event);
    if (event->type() != QEvent::PaletteChange)
        return;
    for (Tool const& tool : qAsConst(m_tools))
        tool.action->setIcon(ActionIcons::Icon(tool.icon, palette()));
}

} // namespace Velocor
