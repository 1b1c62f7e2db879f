// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

namespace Velocor {

/// Which keys of a settings document to show. A plain record; as it is, all of them.
struct SettingsFilter
{
    QString text; ///< is in the section's name, the key or the value, in any letter case
    bool onlyChanged = false;   ///< only values that the file does not have
    bool onlyDiffering = false; ///< only values that have a default, and are not that

    /// Whether all keys are shown.
    bool isEmpty() const { return text.isEmpty() && !onlyChanged && !onlyDiffering; }

    /// What is shown of a document, by number, each in ascending order.
    struct Shown
    {
        std::vector<int> sections;
        std::vector<std::vector<int>> items; ///< of each section of the document
    };

    /// Applies the filter. A section is shown if one of its keys is, or if only its name and not a
    /// value is asked for.
    ///
    /// @param saved  the values in the file; only used for `onlyChanged`
    /// @param defaults  only used for `onlyDiffering`
    Shown Of(SettingsDocument const& document, SettingsValues const& saved,
             SettingsValues const& defaults) const;
};

} // namespace Velocor
