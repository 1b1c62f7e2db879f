// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QScopedPointer>
#include <QString>
#include <QStringList>
#include <QVector>

template <class Value>
class TorkOrderedHash;

/// One named section of a configuration file: text values under unique text keys.
///
/// A plain container that knows nothing of files. Names and keys match exactly and
/// case-sensitively. The order in which keys are enumerated is not promised.
/// One thread at a time. It owns its texts and knows nothing of the file that holds it.
///
///     TorkConfigFileSection section("Window");
///     section.AddValue("title", "Bookmarks");
///     QString title;
///     section.FindValue("title", title); // true, "Bookmarks"
class TorkConfigFileSection
{
public:
    /// A value and the key that it is stored under.
    struct Item
    {
        QString key;
        QString value;
    };

    /// Makes an empty section.
    ///
    /// @param name  zero-terminated, decoded as UTF-8 and copied; null names the section
    ///              "UnknownSection". The name never changes afterwards.
    explicit TorkConfigFileSection(char const* name);

    /// Virtual so that the owning file can delete sections of derived classes.
    virtual ~TorkConfigFileSection();

    TorkConfigFileSection(TorkConfigFileSection const&) = delete;
    TorkConfigFileSection& operator=(TorkConfigFileSection const&) = delete;

    /// Whether the section's name equals `name` exactly: no trimming, no case folding.
    bool IsCalled(QString const& name) const;

    /// The section's name.
    QString const& name() const { return m_name; }

    /// Stores copies of `key` and `value`, replacing any earlier value of that key.
    ///
    /// @return always true
    bool AddValue(QString const& key, QString const& value);

    /// Looks a value up.
    ///
    /// @param value  receives the stored text; untouched if the key is missing
    /// @return whether the key is present
    bool FindValue(QString const& key, QString& value);

    /// The keys of the section, each once, in no promised order; empty for an empty section.
    QStringList keyList() const;

    /// All keys with their values, in the order of keyList(): a copy, which no later change of the
    /// section touches.
    QVector<Item> values() const;

    /// Removes all keys and values. The name stays.
    void Clear();

private:
    friend class TorkConfigFile;

    QString m_name;
    QScopedPointer<TorkOrderedHash<QString>> m_values; // never null
};
