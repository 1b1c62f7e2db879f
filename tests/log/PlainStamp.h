// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkQt_p.h"

#include <QByteArray>
#include <QDateTime>
#include <QLocale>
#include <QString>

/// The plain version of an entry's stamp: Qt's result for the format; in the C locale where Latin-1
/// lacks a character of that.
inline QByteArray plainStamp(QDateTime const& time, QString const& format)
{
    const QString stamp = TorkQt::DateText(time, format);
    if (QString::fromLatin1(stamp.toLatin1()) == stamp)
        return stamp.toLatin1();
    return QLocale::c().toString(time, format).toLatin1();
}
