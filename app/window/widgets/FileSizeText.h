// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// A number of bytes for people, in decimal units: "812 bytes", "1.2 MB".
QString FileSizeText(qint64 bytes);

} // namespace Velocor
