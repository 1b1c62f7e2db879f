// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// A text as a row shows it: tabs reach to the next column that is a multiple of 8, terminals'
/// color sequences are left out, and each other control character is a blank. Any thread.
QString ShownText(QString const& text);

} // namespace Velocor
