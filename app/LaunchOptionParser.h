// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/LaunchOption.h"

#include <QList>
#include <QString>

/// Reads a launch data file into a list of options.
///
/// The file is a sequence of top-level `arg` elements whose first attribute, `key`, names the
/// option and whose text is its value. File format: docs/launch-data.md. One thread at a time.
///
///     LaunchOptionParser parser;
///     parser.AddOption(new LaunchOption("product", "product", "p", 1, "The product name"));
///     if (parser.ReadDataFile(path) && parser.FindOption("product")->isSet)
///         name = parser.FindOption("product")->value;
class LaunchOptionParser
{
public:
    /// A parser without options; add them before reading.
    LaunchOptionParser();

    /// Deletes the options, in the order they were added.
    ~LaunchOptionParser();

    LaunchOptionParser(LaunchOptionParser const&) = delete;
    LaunchOptionParser& operator=(LaunchOptionParser const&) = delete;

    /// Appends an option and takes ownership of it.
    void AddOption(LaunchOption* option);

    /// The first option called exactly `key`, still owned by the parser; null if there is none.
    LaunchOption* FindOption(QString const& key) const;

    /// Reads a launch data file, in the locale's encoding, and sets the options it names.
    ///
    /// Only regular files and links to them are read: reading a pipe or device could block or never
    /// end.
    ///
    /// @return false if the file is missing, is not a regular file, cannot be opened, has more than
    ///         268435456 characters (256 Mi), or if ParseOptions() fails; an empty file sets
    ///         nothing and succeeds
    bool ReadDataFile(QString const& path);

    /// Sets the options named in an XML text.
    ///
    /// An unknown key fails the whole text, with a message in errorText, but what follows is still
    /// read. Text that is not well-formed, or nested deeper than TorkXmlMaximumDepth, fails
    /// without a message and sets nothing.
    bool ParseOptions(QString& text);

    QList<LaunchOption*> options; ///< owned, in the order they were added
    QString errorText;            ///< all messages, concatenated without a separator
};
