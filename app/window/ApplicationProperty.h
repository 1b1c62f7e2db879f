// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QCoreApplication>
#include <QString>
#include <QVariant>

namespace Velocor {

/// A text that the start has published on the application object: a directory such as "DataPath",
/// ending in "/", or the "caption". Empty if there is none. GUI thread.
inline QString ApplicationProperty(char const* name)
{
    return QCoreApplication::instance()->property(name).toString();
}

} // namespace Velocor
