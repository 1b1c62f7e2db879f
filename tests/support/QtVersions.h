// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What tests call differently in Qt 5 and Qt 6.

#pragma once

#include <QTextStream>
#include <QtGlobal>

namespace QtVersions {

inline void useUtf8(QTextStream& stream)
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    stream.setCodec("UTF-8");
#else
    stream.setEncoding(QStringConverter::Utf8);
#endif
}

} // namespace QtVersions
