// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QCoreApplication>
#include <QString>
#include <QVariant>

namespace Velocor {

/// A string property of the application object, set at startup: a directory such as "DataPath",
/// ending in "/", or the "caption". Empty if it is not set. GUI thread.
inline QString ApplicationProperty(char const* name)
{
    return QCoreApplication::instance()->property(name).toString();
}

} // namespace Velocor
