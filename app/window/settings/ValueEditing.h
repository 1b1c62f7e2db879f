// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/TypedText.h"

class QWidget;

namespace Velocor {

/// Whether values of a kind are edited in a dialog instead of a cell.
bool HasValueDialog(ValueKind kind);

/// Lets the user edit a value in the dialog of its kind; for kinds without one, as a text in a
/// large field. GUI thread.
///
/// @param name  the name of the value, for the heading
/// @return the new text, as the store writes the value; null if the user has not changed it
QString EditedValue(ValueKind kind, QString const& name, QString const& text, QWidget* parent);

} // namespace Velocor
