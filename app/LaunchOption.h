// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// One option that the launch data file can set. A plain record: nothing in it is checked.
///
/// Owned by the LaunchOptionParser that it is added to. LaunchOptionParser::ReadDataFile() fills in
/// value and isSet; the other fields never change. To give an option a default, set its value
/// before reading and leave isSet false. One thread at a time.
///
///     auto* product = new LaunchOption("product", "product", "p", 1, "The product name");
struct LaunchOption
{
    /// Sets the first five fields in their order; the value is empty and not set.
    ///
    /// @param optionName  the key of the `arg` element that sets the option
    /// @param longForm, shortForm, arguments  for the caller's own use
    /// @param text  description for people
    LaunchOption(QString const& optionName, QString const& longForm, QString const& shortForm,
                 qint32 arguments, QString const& text);

    /// The key by which the option is found; compared exactly, letter case included.
    QString name;

    /// A second form of the name; not used.
    QString longName;

    /// One letter; not used.
    QString shortName;

    /// How many values follow; not interpreted, as a launch data file gives one value per option.
    qint32 argCount;

    /// A description for people; not used.
    QString description;

    /// The value that was read; empty until then. If the file sets the option more than once, the
    /// last value counts.
    QString value;

    /// Whether a value was read, even an empty one.
    bool isSet = false;
};
