// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QByteArray>
#include <QString>

/// A small configuration before and after a program changes it.
namespace SampleConfiguration {

inline const QByteArray oldBytes = "<VelocorSettings>\n<a>\n<b>1</b>\n</a>\n</VelocorSettings>\n";
inline const QByteArray newBytes =
    "<VelocorSettings>\n<a>\n<b>2</b>\n<c><![CDATA[x & y]]></c>\n</a>\n</VelocorSettings>\n";

/// Writes the values of `newBytes`.
inline void fill(TorkConfigFile& configuration)
{
    configuration.WriteItem("a", "b", "2");
    configuration.WriteItem("a", "c", "x & y");
}

/// A value of section "a"; empty if there is none.
inline QString value(TorkConfigFile& configuration, QString const& key)
{
    QString none;
    QString found;
    configuration.ReadItem("a", key, none, found);
    return found;
}

} // namespace SampleConfiguration
