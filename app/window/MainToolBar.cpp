// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainToolBar.h"

#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QEvent>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int UsualIconSize = 20; // pixels

} // namespace

MainToolBar::MainToolBar(QWidget* parent) : QToolBar(parent)
{
    setAccessibleName(tr("Tools"));
    setMovable(false);
    setContextMenuPolicy(Qt::PreventContextMenu); // the window's would hide it behind the menu item
    updateIconSize();
}

void MainToolBar::updateIconSize()
{
    const int size = std::max(UsualIconSize, fontMetrics().height());
    setIconSize(QSize(size, size));
}

void MainToolBar::AddTool(QAction* action, ActionIcons::Name icon)
{
    m_tools.append({action, icon});
    action->setIcon(ActionIcons::Icon(icon, palette()));
    action->setIconVisibleInMenu(false);
    action->setToolTip(PlainToolTip(tr("%1 (%2)").arg(
        action->statusTip(), action->shortcut().toString(QKeySequence::NativeText))));
    addAction(action);
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
    if (event->type() == QEvent::FontChange)
        updateIconSize();
    if (event->type() != QEvent::PaletteChange)
        return;
    for (Tool const& tool : qAsConst(m_tools))
        tool.action->setIcon(ActionIcons::Icon(tool.icon, palette()));
}

} // namespace Velocor
