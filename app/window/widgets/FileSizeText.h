// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// Formats a number of bytes for users, in decimal units: "812 bytes", "1.2 MB".
QString FileSizeText(qint64 bytes);

} // namespace Velocor
