// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

class Redactor;

/// The names of this user and this computer.
class OwnNames
{
public:
    /// Makes a redactor replace them: the user's login and full name, the home folder, and the name
    /// of the computer. Not those that many have, such as "root" and "localhost". Any thread.
    static void AddTo(Redactor& redactor);

    /// Whether many users or computers have this name, so that it gives nobody away.
    static bool IsCommon(QString const& name);
};

} // namespace Velocor
