// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/ActionIcons.h"

#include <QToolBar>
#include <QVector>

namespace Velocor {

/// The tool bar: buttons for items of the menus.
class MainToolBar : public QToolBar
{
    Q_OBJECT

public:
    explicit MainToolBar(QWidget* parent = nullptr);

    /// Adds a button for an action of a menu, with a tool tip that names its keys.
    void AddTool(QAction* action, ActionIcons::Name icon);

    /// Further buttons are at the right.
    void AddSpace();

protected:
    void changeEvent(QEvent* event) override;

private:
    void updateIconSize();

    struct Tool
    {
        QAction* action;
        ActionIcons::Name icon;
    };
    QVector<Tool> m_tools;
};

} // namespace Velocor
