// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// The empty text that is not null. For the framework's own sources.
///
/// TorkConfigFile::WriteItem() refuses a null text, so a null one would leave the old value in a
/// settings file. Callers store what the framework hands out: where it has no text it is this one.
constexpr QLatin1String TorkEmptyText("", 0);
