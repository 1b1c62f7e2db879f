// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QIcon>

class QPalette;

namespace Velocor {

/// Icons for tool buttons, drawn in the colors of a palette. GUI thread.
class ActionIcons
{
public:
    enum Name { Open, Reload, Pause, Follow, PreviousProblem, NextProblem, Find, Filter, Places };

    static QIcon Icon(Name name, QPalette const& palette);
};

} // namespace Velocor
