// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QCoreApplication>
#include <QString>
#include <QVariant>

namespace Velocor {

/// A text that the program set as a property of the application object: "caption", "RootPath",
/// "DataPath", or "DocPath". Empty if it is not set. There must be an application object. GUI
/// thread.
inline QString ProgramProperty(char const* name)
{
    return QCoreApplication::instance()->property(name).toString();
}

} // namespace Velocor
