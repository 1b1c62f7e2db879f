// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/TypedText.h"

#include <QIcon>

class QPalette;

namespace Velocor {

/// What a kind of value is called, for the user.
QString ValueKindName(ValueKind kind);

/// The icon of a kind, drawn in the text color of a palette; that of a color shows the color.
/// GUI thread.
///
/// @param text  the value
QIcon ValueIcon(ValueKind kind, QString const& text, QPalette const& palette);

} // namespace Velocor
