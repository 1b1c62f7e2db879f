// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

namespace Velocor {

/// A language that the window's texts have been translated to.
///
/// The texts of the framework are in no catalog, among them the names of severities in a log and
/// its messages about settings: logs of all languages read alike.
struct Language
{
    QString code; ///< of its catalog, such as "de"
    QString name; ///< in that language

    /// Those with a catalog, ordered by code.
    static QList<Language> All();

    /// The code of the language that is in use; empty before Use().
    static QString Used();

    /// Makes the application use a language: its texts, and Qt's own if Qt's catalog is installed.
    /// What no catalog has stays English; a language without a catalog of ours, all of it. It
    /// replaces the language that was used before; texts that were translated by then stay as they
    /// are. Numbers and dates are always those of the system. To be called from the GUI thread.
    ///
    /// @param code  a code of All(); anything else selects the system's language
    static void Use(QString const& code);
};

} // namespace Velocor
