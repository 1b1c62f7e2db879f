// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/ProgramLogs.h"

#include "app/logfile/LogFileList.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QStringList>
#include <QVariant>

namespace Velocor {

namespace {

constexpr QLatin1Char Slash('/');

QString LogFolder()
{
    return QStringLiteral("logs");
}

// The current files, by name.
QStringList CurrentFiles(QDir const& folder)
{
    QStringList files;
    const QStringList names = folder.entryList(QDir::Files | QDir::Hidden, QDir::Name);
    for (QString const& name : names) {
        const QString current = LogFileList::CurrentOf(name);
        if (current.endsWith(QLatin1String(".log")) && !files.contains(current))
            files.append(current);
    }
    return files;
}

} // namespace

QList<ProgramLog> ProgramLogs::In(QString const& folder)
{
    QList<ProgramLog> logs;
    const QDir programs(folder);
    const QStringList names = programs.entryList(QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
    for (QString const& program : names) {
        const QDir logFolder(programs.filePath(program + Slash + LogFolder()));
        const QStringList files = CurrentFiles(logFolder);
        for (QString const& file : files) {
            const QString log = file.left(file.lastIndexOf(QLatin1Char('.')));
            const QString name = files.size() == 1 ? program : program + Slash + log;
            logs.append({name, logFolder.filePath(file)});
        }
    }
    return logs;
}

QString ProgramLogs::FamilyFolder()
{
    const QString data = QCoreApplication::instance()->property("DataPath").toString();
    return QFileInfo(QDir::cleanPath(data)).path();
}

QList<ProgramLog> ProgramLogs::Named(QString const& name, QList<ProgramLog> const& logs)
{
    QList<ProgramLog> found;
    for (ProgramLog const& log : logs) {
        const bool isAll = log.name.compare(name, Qt::CaseInsensitive) == 0;
        if (isAll || log.name.startsWith(name + Slash, Qt::CaseInsensitive))
            found.append(log);
    }
    return found;
}

QString ProgramLogs::NameOf(QString const& path)
{
    const QFileInfo file(path);
    const QDir folder = file.absoluteDir();
    if (folder.dirName() == LogFolder())
        return QFileInfo(folder.absolutePath()).dir().dirName();
    return LogFileList::CurrentOf(file.fileName());
}

} // namespace Velocor
