// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

namespace Velocor {

/// Finds and reads the defaults of a settings file, which its program may install: a settings file
/// itself, called `viewer.defaults.cfg` for `viewer.cfg`. docs/config-file.md says where.
///
///     const SettingsValues defaults = SettingsDefaults::Of(path);
class SettingsDefaults
{
public:
    /// The file with the defaults of a settings file; empty if there is none.
    static QString FileFor(QString const& path);

    /// The defaults of a settings file; empty if there are none, or their file is malformed.
    static SettingsValues Of(QString const& path);
};

} // namespace Velocor
