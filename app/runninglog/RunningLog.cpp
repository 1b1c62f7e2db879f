// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/RunningLog.h"

#include "common/log/TorkLog.h"

#include <QDir>
#include <QFileInfo>

namespace Velocor {

QString RunningLog::FileName()
{
    TorkLog* log = TorkLog::logger();
    if (!log)
        return QString();
    const QString name = log->newLogFileName();
    if (QFileInfo::exists(name))
        return name;

    const QDir folder = QFileInfo(name).dir();
    const QFileInfoList others =
        folder.entryInfoList({QStringLiteral("*.log")}, QDir::Files, QDir::Time);
    return others.isEmpty() ? name : folder.path() + QLatin1Char('/') + others.first().fileName();
}

} // namespace Velocor
