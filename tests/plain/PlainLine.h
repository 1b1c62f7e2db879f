// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

/// The plain version of what is written to a settings file.
namespace PlainLine {

/// A value as it appears in the file.
inline QString filtered(QString const& value)
{
    for (char const* markup : {"&", "'", "<", ">", "\""}) {
        if (value.contains(QLatin1String(markup)))
            return QStringLiteral("<![CDATA[%1]]>").arg(value);
    }
    return value;
}

/// The line of a root element or section: `line` is "<%1>\n" or "</%1>\n".
inline QByteArray tag(char const* line, QString const& name)
{
    return QString(QLatin1String(line)).arg(name).toLatin1();
}

/// The line of a key and its value.
inline QByteArray item(QString const& key, QString const& value)
{
    return QStringLiteral("<%1>%2</%3>\n") // clazy:exclude=qstring-arg
        .arg(key)
        .arg(filtered(value))
        .arg(key)
        .toLatin1();
}

} // namespace PlainLine
