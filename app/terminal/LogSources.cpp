// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/LogSources.h"

#include "app/history/ProgramLogs.h"
#include "app/logfile/LogFileList.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QObject>
#include <QVariant>

#include <algorithm>
#include <unistd.h>

namespace Velocor {

namespace {

QList<ProgramLog> FamilyLogs()
{
    return ProgramLogs::In(LogSources::FamilyFolder());
}

PrintedLog SourceOf(ProgramLog const& log)
{
    PrintedLog source;
    source.name = log.name;
    source.log = log.path;
    return source;
}

// Of the files of one log, the current one is the newest.
void SortOldestFirst(QStringList& files)
{
    const auto absolute = [](QString const& path) {
        return QFileInfo(path).absoluteFilePath();
    };
    const QStringList newestFirst =
        LogFileList::FilesOf(LogFileList::CurrentOf(absolute(files.first())));
    std::stable_sort(files.begin(), files.end(), [&](QString const& a, QString const& b) {
        return newestFirst.indexOf(absolute(a)) > newestFirst.indexOf(absolute(b));
    });
}

} // namespace

QString PrintedLog::CurrentPath() const
{
    return LogFileList::CurrentOf(QFileInfo(path()).absoluteFilePath());
}

LogSources::LogSources(QStringList const& names, bool joinsFiles) : m_joinsFiles(joinsFiles)
{
    if (names.isEmpty()) {
        const QList<ProgramLog> logs = FamilyLogs();
        for (ProgramLog const& log : logs)
            m_sources.append(SourceOf(log));
    }
    for (QString const& name : names)
        add(name);
    for (PrintedLog& source : m_sources) {
        if (source.files.size() > 1)
            SortOldestFirst(source.files);
    }
}

QString LogSources::FamilyFolder()
{
    return ProgramLogs::FamilyFolder();
}

void LogSources::add(QString const& name)
{
    if (name == QLatin1String("-")) {
        addInput();
        return;
    }
    const QFileInfo file(name);
    const bool isPath = name.contains(QLatin1Char('/')) && !file.exists();
    const QList<ProgramLog> logs =
        file.exists() ? QList<ProgramLog>() : ProgramLogs::Named(name, FamilyLogs());
    for (ProgramLog const& log : logs)
        m_sources.append(SourceOf(log));
    if (file.exists() || (isPath && logs.isEmpty()))
        addFile(name);
    else if (logs.isEmpty())
        m_errors.append(name + QLatin1String(": ") + QObject::tr("No such file or program"));
}

void LogSources::addFile(QString const& path)
{
    const auto sameLog = [&path](PrintedLog const& source) {
        return !source.files.isEmpty() && !source.isInput &&
               LogFileList::CurrentOf(QFileInfo(source.files.first()).absoluteFilePath()) ==
                   LogFileList::CurrentOf(QFileInfo(path).absoluteFilePath());
    };
    const auto known = std::find_if(m_sources.begin(), m_sources.end(), sameLog);
    if (m_joinsFiles && known != m_sources.end()) {
        known->files.append(path);
        return;
    }
    PrintedLog source;
    source.name = ProgramLogs::NameOf(path);
    source.files = QStringList(path);
    m_sources.append(source);
}

// A log has to be read twice, so a copy is read.
void LogSources::addInput()
{
    if (m_input)
        return;
    m_input =
        std::make_unique<QTemporaryFile>(QDir::tempPath() + QLatin1String("/velocor-log-XXXXXX"));
    QFile input;
    bool isCopied = m_input->open() && input.open(STDIN_FILENO, QIODevice::ReadOnly);
    while (isCopied) {
        const QByteArray bytes = input.read(1 << 20);
        if (bytes.isEmpty())
            break;
        isCopied = m_input->write(bytes) == bytes.size();
    }
    if (!isCopied || !m_input->flush() || input.error() != QFileDevice::NoError) {
        m_errors.append(QLatin1String("-: ") + QObject::tr("Standard input cannot be read"));
        return;
    }
    PrintedLog source;
    source.name = QLatin1String("-");
    source.files = QStringList(m_input->fileName());
    source.isInput = true;
    m_sources.append(source);
}

} // namespace Velocor
