// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// One option that the launch data file can set. A plain record.
///
///     auto* product = new LaunchOption("product", "product", "p", 1, "The product name");
struct LaunchOption
{
    /// Initializes the fields in order; the value is not set.
    LaunchOption(QString const& optionName, QString const& longForm, QString const& shortForm,
                 qint32 arguments, QString const& text);

    QString name;        ///< the key by which the option is found; compared exactly
    QString longName;    ///< long form of the name; unused
    QString shortName;   ///< one letter; unused
    qint32 argCount;     ///< number of values that follow; unused
    QString description; ///< for users
    QString value;       ///< the value; empty until set
    bool isSet = false;  ///< whether a value was read, even an empty one
};
