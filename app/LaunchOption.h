// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// One option that the launch data file can set. A plain record.
///
///     auto* product = new LaunchOption("product", "product", "p", 1, "The product name");
struct LaunchOption
{
    /// Sets the fields in their order; no value is set.
    LaunchOption(QString const& optionName, QString const& longForm, QString const& shortForm,
                 qint32 arguments, QString const& text);

    QString name;        ///< the key by which the option is found; compared exactly
    QString longName;    ///< a second form of the name; not consulted
    QString shortName;   ///< one letter; not consulted
    qint32 argCount;     ///< how many values follow; not interpreted
    QString description; ///< for people
    QString value;       ///< the value read; empty until set
    bool isSet = false;  ///< whether a value was read, be it an empty one
};
