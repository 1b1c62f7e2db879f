// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>

class QWidget;

namespace Velocor {

/// Gives the keyboard focus to the next (step 1) or previous (step -1) of these panes, after that
/// with the focus; to the first or last one if none has it. Hidden panes are skipped. GUI thread.
///
/// @param panes  in their order on the screen; null ones are skipped
void GoToPane(QList<QWidget*> const& panes, int step);

} // namespace Velocor
