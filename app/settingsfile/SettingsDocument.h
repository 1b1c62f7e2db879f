// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QHash>
#include <QPair>
#include <QString>
#include <QStringList>
#include <QVector>

namespace Velocor {

/// Values by section and key.
using SettingsValues = QHash<QPair<QString, QString>, QString>;

/// What a configuration-store file holds, in its own order, and what the store makes of it.
/// A plain record.
struct SettingsDocument
{
    struct Item
    {
        QString key;
        QString value;
    };

    struct Section
    {
        QString name;
        QVector<Item> items;
    };

    QString rootName;
    QVector<Section> sections;

    bool isReadable = false; ///< whether the file could be read from the disk
    bool isParsed = false;
    QString error; ///< the system's or the reader's message; empty if all is well
    int line = 0;  ///< place of the error, from 1 on; 0 if it has none
    int column = 0;

    /// What the file holds that the store does not keep, one text each, with its line.
    QStringList losses;
    int lossCount = 0; ///< of all of them; only the first are worded

    /// The value under a section and a key; `byDefault` if there is none.
    QString Value(QString const& section, QString const& key,
                  QString const& byDefault = QString()) const;

    /// All values, for looking up many of them.
    SettingsValues AllValues() const;

    /// Stores a value, making the section if need be.
    void SetValue(QString const& section, QString const& key, QString const& value);

    /// Whether both hold the same sections, keys and values in the same order.
    bool HasSameValues(SettingsDocument const& other) const;
};

} // namespace Velocor
