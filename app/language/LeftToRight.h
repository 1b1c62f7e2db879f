// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// A path, a name or a value as part of a text that is shown. In a language that is written from
/// right to left, it is enclosed in the characters that keep it left to right: its slashes, dots
/// and numbers would change places. In other languages, it is returned as it is.
QString LeftToRight(QString const& text);

} // namespace Velocor
