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

    /// Makes a redactor replace the full name of a user, and its parts, as the system describes the
    /// account: "Ada Lovelace,Room 5". Parts of fewer than three letters stay, and in another case
    /// only the whole name is replaced. Any thread.
    static void AddFullName(Redactor& redactor, QString const& description);

    /// Whether many users or computers have this name, so that it gives nobody away.
    static bool IsCommon(QString const& name);
};

} // namespace Velocor
