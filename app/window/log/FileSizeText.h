// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// A number of bytes for people, in decimal units: "812 bytes", "1.2 MB".
QString FileSizeText(qint64 bytes);
