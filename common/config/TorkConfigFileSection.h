// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QScopedPointer>
#include <QString>
#include <QStringList>
#include <QVector>

template <class Value>
class TorkOrderedHash;

/// One named section of a configuration file: text values under unique text keys.
///
/// A plain container: it owns its texts and knows neither the file that contains it nor the disk.
/// Names and keys match exactly and case-sensitively. The order in which keys are enumerated is
/// not guaranteed. One thread at a time.
///
/// Unlike TorkConfigFile, it removes no spaces from keys: a key that contains one is found here,
/// but not by the readers of TorkConfigFile. Nor does it encode anything: for texts that do not
/// survive saving, see TorkConfigText.
///
///     TorkConfigFileSection section("Window");
///     section.AddValue("title", "Bookmarks");
///     QString title;
///     section.FindValue("title", title); // true, "Bookmarks"
class TORK_EXPORT TorkConfigFileSection
{
public:
    /// A value and the key that it is stored under.
    struct Item
    {
        /// Exactly as it was passed to AddValue(), or as it is in the file.
        QString key;

        /// May be empty. An empty value is lost when the file is loaded: see TorkConfigText.
        QString value;
    };

    /// Creates an empty section in no file; TorkConfigFile::AppendSection() adds it to one.
    ///
    /// @param name  zero-terminated, decoded as UTF-8 and copied; null names the section
    ///              "UnknownSection". The name never changes afterwards.
    explicit TorkConfigFileSection(char const* name);

    /// Virtual, so that the file can delete sections of derived classes. Never delete a section
    /// that is in a file: the file owns it.
    virtual ~TorkConfigFileSection();

    TorkConfigFileSection(TorkConfigFileSection const&) = delete;
    TorkConfigFileSection& operator=(TorkConfigFileSection const&) = delete;

    /// Whether the section's name equals `name` exactly: no trimming, no case folding, no removal
    /// of spaces.
    bool IsCalled(QString const& name) const;

    /// The section's name, as decoded by the constructor. The reference is valid as long as the
    /// section.
    QString const& name() const { return m_name; }

    /// Stores copies of `key` and `value`, replacing any earlier value of that key. Empty and null
    /// texts are stored too; TorkConfigFile::WriteItem() rejects null ones.
    ///
    /// Nothing reaches the disk before TorkConfigFile::Save().
    ///
    /// @param key  used unchanged, spaces included
    /// @return always true
    bool AddValue(QString const& key, QString const& value);

    /// Looks up a value. Not const, for compatibility, but it changes nothing.
    ///
    /// @param key  compared exactly: no trimming, no case folding
    /// @param value  receives the stored text; untouched if the key is missing
    /// @return whether the key is present
    bool FindValue(QString const& key, QString& value);

    /// The keys of the section, each once, in no guaranteed order; empty for an empty section.
    QStringList keyList() const;

    /// All keys with their values, in the order of keyList(). A copy: later changes to the section
    /// do not affect it.
    QVector<Item> values() const;

    /// Removes all keys and values, The name is kept, and so is the section's place in its file.
    void Clear();

private:
    friend class TorkConfigFile; // its typed readers look into the table without copying a value

    // Never changes, so that the file's table of sections stays right.
    QString m_name;

    // Never null. A pointer, so that the table's type is not part of the installed headers.
    QScopedPointer<TorkOrderedHash<QString>> m_values;
};
