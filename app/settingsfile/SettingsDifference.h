// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

#include <QSet>

namespace Velocor {

/// What differs between two settings documents, as rows to be shown side by side. A plain record.
///
/// It is complete: with the first document, it gives the second. In both, no two sections have the
/// same name, and no two keys of a section, as in everything that was read from a file.
///
///     const auto difference = SettingsDifference::Between(before, after);
///     for (SettingsDifference::Row const& row : difference.rows)
///         show(row.section, row.key, row.before, row.after);
struct SettingsDifference
{
    /// A section or, with a key, an item, in one of the documents or in both.
    struct Row
    {
        QString section;
        QString key;           ///< null for the section itself
        bool isBefore = false; ///< whether the first document has it
        bool isAfter = false;  ///< whether the second one has it
        bool isMoved = false;  ///< in both, but in another order; as few rows as possible
        QString before;        ///< the value in the first document; null for a section
        QString after;

        bool isSection() const { return key.isNull(); }
        bool isSame() const { return hasSameValue() && !isMoved; }

        /// Whether taking over this row changes a value.
        bool hasSameValue() const { return isBefore == isAfter && before == after; }
    };

    QString rootBefore; ///< the names of the root elements
    QString rootAfter;

    /// The sections, each followed by its items, in the order of the second document. What only the
    /// first one has comes after the row that it follows there.
    QVector<Row> rows;

    static SettingsDifference Between(SettingsDocument const& before,
                                      SettingsDocument const& after);

    /// Whether both have the same sections, keys and values in the same order, and the same root
    /// element.
    bool isEmpty() const;

    /// The number of rows that differ.
    int count() const;

    /// The second document, made from the first one and the rows.
    ///
    /// @param before  the first document
    SettingsDocument Apply(SettingsDocument const& before) const;

    /// The first document with some rows as in the second one. What both have stays where it is,
    /// unless it is moved and chosen.
    ///
    /// @param before  the first document
    /// @param chosen  positions in `rows`; that of a section stands for all its rows. An item
    /// brings its section along.
    SettingsDocument TakeOver(SettingsDocument const& before, QSet<int> const& chosen) const;
};

} // namespace Velocor
