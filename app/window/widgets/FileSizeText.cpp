// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/FileSizeText.h"

#include <QLocale>
#include <QObject>

namespace Velocor {

QString FileSizeText(qint64 bytes)
{
    if (bytes == 1)
        return QObject::tr("1 byte");
    if (bytes < 1000)
        return QObject::tr("%1 bytes").arg(bytes);

    double value = static_cast<double>(bytes);
    char const* unit = "";
    for (char const* next : {"kB", "MB", "GB", "TB"}) {
        if (value < 999.5)
            break;
        value /= 1000;
        unit = next;
    }
    const int decimals = value < 9.95 ? 1 : 0;
    return QLocale().toString(value, 'f', decimals) + QLatin1Char(' ') + QLatin1String(unit);
}

} // namespace Velocor
