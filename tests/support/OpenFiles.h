// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDir>

/// How many files this process has open, for a comparison with the number at another time. 0 where
/// the system does not list them.
inline int openFileCount()
{
    return QDir("/proc/self/fd").entryList(QDir::AllEntries | QDir::System).size();
}
