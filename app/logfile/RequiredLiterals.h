// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QStringList>

namespace Velocor {

/// Texts that every match of a regular expression contains, apart from upper and lower case, which
/// is up to the caller.
///
///     RequiredLiterals("disk \\w+ (full|gone)$")    "disk ", " "
///
/// Texts in groups are left out. Wherever there is doubt, such as with options within the
/// expression, there are none. Pure; any thread.
///
/// @param expression  valid, for QRegularExpression with no other option than CaseInsensitiveOption
/// @return in the order of the expression, none of them empty
QStringList RequiredLiterals(QString const& expression);

} // namespace Velocor
