// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFileList.h"

#include <QDir>
#include <QFileInfo>
#include <QMap>

namespace Velocor {

namespace {

// The number after the last dot; -1 if there is none.
int NumberOf(QString const& name)
{
    bool converted = false;
    const int number = name.mid(name.lastIndexOf(QLatin1Char('.')) + 1).toInt(&converted);
    return converted && name.contains(QLatin1Char('.')) ? number : -1;
}

} // namespace

QString LogFileList::CurrentOf(QString const& path)
{
    if (NumberOf(QFileInfo(path).fileName()) < 0)
        return path;
    return path.left(path.lastIndexOf(QLatin1Char('.')));
}

QStringList LogFileList::FilesOf(QString const& path)
{
    const QString current = CurrentOf(path);
    const QFileInfo file(current);
    const QString start = file.fileName() + QLatin1Char('.');

    QMap<int, QString> older;
    const QStringList names = file.dir().entryList(QDir::Files | QDir::Hidden);
    for (QString const& name : names) {
        if (name.startsWith(start) && NumberOf(name) >= 0 &&
            name == start + QString::number(NumberOf(name)))
            older.insert(NumberOf(name), file.path() + QLatin1Char('/') + name);
    }

    QStringList files = older.values();
    if (path == current || QFileInfo::exists(current))
        files.prepend(current);
    if (!files.contains(path))
        files.prepend(path);
    return files;
}

} // namespace Velocor
