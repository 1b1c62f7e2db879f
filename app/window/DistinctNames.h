// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QStringList>

namespace Velocor {

/// The names of files, as short as they are distinct: "a.log"; for files of the same name with as
/// much of their folders as it takes, "a.log – web" and "a.log – db".
///
/// @param paths  absolute and distinct
/// @return one name for each path, in the same order
QStringList DistinctNames(QStringList const& paths);

} // namespace Velocor
