// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkOrderedHash.h"

#include <QString>
#include <QStringList>

/// One named section of a configuration file: text values under unique text keys.
///
/// A plain container that knows nothing of files. Names and keys match exactly and
/// case-sensitively. The order in which keys are enumerated is not promised.
/// One thread at a time.
///
///     TorkConfigFileSection section("Window");
///     section.AddValue("title", "Bookmarks");
///     QString title;
///     section.FindValue("title", title); // true, "Bookmarks"
class TorkConfigFileSection
{
public:
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

    /// Stores `value` under `key`, replacing any earlier value of that key.
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

    /// The entries, for walking through all of them; valid until the next AddValue() or Clear().
    TorkOrderedHash<QString> const& values() const { return m_values; }

    /// Removes all keys and values. The name stays.
    void Clear();

private:
    QString m_name;
    TorkOrderedHash<QString> m_values;
};
