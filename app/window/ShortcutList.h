// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

class QMainWindow;

namespace Velocor {

/// All keyboard shortcuts of a window: those of its menus, menu by menu, of its tabs, and of its
/// buttons, one per line with what they do.
QString ShortcutList(QMainWindow const* window);

} // namespace Velocor
