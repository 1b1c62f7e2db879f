// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/ScreenlessPlatform.h"

#include <QGuiApplication>

bool IsScreenlessPlatform()
{
    // Qt keeps the name as the user wrote it and ignores its case.
    const QString platform = QGuiApplication::platformName();
    return platform.compare(QLatin1String("offscreen"), Qt::CaseInsensitive) == 0 ||
           platform.compare(QLatin1String("minimal"), Qt::CaseInsensitive) == 0;
}
