// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsDefaults.h"

#include "app/settingsfile/SettingsFileReader.h"

#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>

namespace Velocor {

namespace {

// Where the defaults of a file may be: beside it and, if it is in a data directory of the user, at
// the same place in those of the system.
QStringList FoldersFor(QFileInfo const& file)
{
    QStringList folders{file.absolutePath()};
    const QStringList dataFolders =
        QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation);
    const QString users = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    const QString place = QDir(users).relativeFilePath(file.absolutePath());
    if (place.startsWith(QLatin1String("..")) || QDir::isAbsolutePath(place))
        return folders;
    for (QString const& folder : dataFolders) {
        if (folder != users)
            folders.append(folder + QLatin1Char('/') + place);
    }
    return folders;
}

} // namespace

QString SettingsDefaults::FileFor(QString const& path)
{
    const QFileInfo file(path);
    const QString ending = file.suffix().isEmpty() ? QString() : QLatin1Char('.') + file.suffix();
    const QString name = file.completeBaseName() + QLatin1String(".defaults") + ending;
    const QStringList folders = FoldersFor(file);
    for (QString const& folder : folders) {
        const QFileInfo candidate(folder + QLatin1Char('/') + name);
        if (candidate.isFile())
            return candidate.filePath();
    }
    return QString();
}

SettingsValues SettingsDefaults::Of(QString const& path)
{
    const QString file = FileFor(path);
    const SettingsDocument document =
        file.isEmpty() ? SettingsDocument() : SettingsFileReader::ReadShown(file);
    return document.isParsed ? document.AllValues() : SettingsValues();
}

} // namespace Velocor
