// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// Replaces each `escape`, "u" and four hexadecimal digits by their UTF-16 code unit, and leaves
/// everything else unchanged. Pure; any thread.
///
/// For TorkConfigText, which also rejects what it has not encoded itself, and for values that
/// earlier versions of the program have escaped differently.
QString TorkUnescaped(QLatin1Char escape, QString const& text);
