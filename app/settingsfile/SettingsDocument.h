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

/// The content of a configuration file, in file order, and what the store would not keep.
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

    /// Something that saving does not keep.
    struct Loss
    {
        QString section; ///< where it is; empty outside any section
        QString key;     ///< empty outside any item
        QString text;    ///< for the user; of a file that was read, starting with its line
    };

    QString rootName;
    QVector<Section> sections;

    bool isReadable = false; ///< whether the file could be read from disk
    bool isParsed = false;
    bool isTooLarge = false; ///< why it is not parsed: it has the first keys, or none
    QString error;           ///< message of the system or the parser; empty on success
    int line = 0;            ///< position of the error, starting at 1; 0 if unknown
    int column = 0;

    QVector<Loss> losses; ///< what the store does not keep of a file
    int lossCount = 0;    ///< the number of all losses; `losses` has only the first ones

    /// What was read of a malformed file, as a document that can be saved: its error is one more
    /// loss. A document that was parsed stays the same.
    SettingsDocument WithErrorAsLoss() const;

    /// The texts of losses.
    static QStringList TextsOf(QVector<Loss> const& losses);

    /// The value under a section and a key; `byDefault` if there is none.
    QString Value(QString const& section, QString const& key,
                  QString const& byDefault = QString()) const;

    /// All values, for looking up many of them.
    SettingsValues AllValues() const;

    /// Stores a value, creating the section if necessary.
    void SetValue(QString const& section, QString const& key, QString const& value);

    /// Whether both hold the same sections, keys and values in the same order.
    bool HasSameValues(SettingsDocument const& other) const;
};

} // namespace Velocor
