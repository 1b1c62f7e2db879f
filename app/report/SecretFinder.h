// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/SecretKind.h"

#include <QRegularExpression>
#include <QString>

#include <vector>

namespace Velocor {

/// Finds what looks like a secret: addresses, home folders of anybody, tokens, keys and passwords.
///
/// It goes by the form of the text and by the words before it, so it takes some other text for a
/// secret, too. Pure; any thread.
class SecretFinder
{
public:
    /// A part of a text.
    struct Place
    {
        int start = 0;
        int length = 0;
        SecretKind kind = SecretKind::Token;
    };

    /// Appends the places of all secrets, which may overlap, in no particular order.
    static void Find(QString const& text, std::vector<Place>& places);

    /// Appends the places where an expression matches and the filter, if any, agrees.
    ///
    /// Where the expression takes too long, the rest of the line counts as a match.
    static void FindMatches(QString const& text, QRegularExpression const& expression,
                            SecretKind kind, bool (*filter)(QString const&),
                            std::vector<Place>& places);

    /// Whether a value with this name, as in a settings file, is likely to be a secret.
    static bool IsSecretName(QString const& name);
};

} // namespace Velocor
