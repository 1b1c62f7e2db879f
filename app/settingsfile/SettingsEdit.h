// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

namespace Velocor {

/// One change to a settings document, which can be taken back. A plain record.
///
///     const SettingsEdit back = edit.Apply(document);
///     back.Apply(document); // as before
struct SettingsEdit
{
    enum Kind {
        InsertSection,
        RemoveSection,
        MoveSection,
        RenameSection,
        InsertItem,
        RemoveItem,
        MoveItem,
        RenameItem,
        SetValue
    };

    Kind kind = InsertSection;
    int section = 0; ///< position of the section, starting at 0
    int item = 0;    ///< position of the item in the section; only for items and values
    int target = 0;  ///< the position after a move

    QString text;                           ///< the new name or value
    SettingsDocument::Section addedSection; ///< of InsertSection
    SettingsDocument::Item addedItem;       ///< of InsertItem

    /// Whether this is about a section, not an item or its value.
    bool isOfSection() const { return kind <= RenameSection; }

    /// Changes a document. Takes time in proportion to the number of sections or, for an item, of
    /// items in its section.
    ///
    /// @param document  has all positions of this edit, or room for one more at those of an
    /// insertion
    /// @return what takes it back
    SettingsEdit Apply(SettingsDocument& document) const;

private:
    SettingsEdit applyToSections(QVector<SettingsDocument::Section>& sections) const;
    SettingsEdit applyToItems(QVector<SettingsDocument::Item>& items) const;
};

} // namespace Velocor
