// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The files of the log: names, opening, trimming and rotation.
//
// Rotation of app.log with a limit of 3 older files:
//
//     before                   after
//     app.log     too full     app.log      new
//     app.log.1                app.log.1    was app.log
//     app.log.2                app.log.2    was app.log.1
//     app.log.3                app.log.3    was app.log.2
//                              (app.log.4, was app.log.3, is removed)

#include "common/log/TorkLog.h"

#include "common/log/TorkLogLock_p.h"
#include "common/log/TorkLogWriter_p.h"

#include <QDir>
#include <QMap>
#include <QTemporaryFile>

#include <algorithm>
#include <utility>

#ifdef Q_OS_UNIX
#include <fcntl.h>
#include <unistd.h>
#endif

namespace {

// An empty path counts as ending in a slash, for compatibility with existing file names.
bool EndsInSlash(QString const& path)
{
    return path.lastIndexOf(QLatin1Char('/')) == path.length() - 1;
}

QString BeforeLastDot(QString const& fileName)
{
    return fileName.left(fileName.lastIndexOf(QLatin1Char('.')));
}

// The number of an older file: what follows the last dot; -1 if that is not a number.
int LogFileNumber(QString const& fileName)
{
    bool converted = false;
    const int dot = fileName.lastIndexOf(QLatin1Char('.'));
    const int number = fileName.mid(dot + 1).toInt(&converted);
    return converted ? number : -1;
}

// The entries of `directory` that are named `name` plus another extension, sorted by name.
//
// Compared by hand: Qt's name filters are wildcards that split at spaces and semicolons, treat
// brackets as character sets and ignore case, and would match unrelated files.
QStringList EntriesWithExtension(QString const& directory, QString const& name,
                                 QDir::Filters filters)
{
    const QString start = name + QLatin1Char('.');
    QStringList found;
    const QStringList files = QDir(directory).entryList(filters, QDir::Name);
    for (QString const& file : files) {
        if (file.startsWith(start))
            found.append(file);
    }
    return found;
}

bool SyncToDisk(QFileDevice& file)
{
    if (!file.flush())
        return false;
#ifdef Q_OS_UNIX
    ::fsync(file.handle()); // not every file system can; the copy is good anyway
#endif
    return true;
}

// The names of the files in it: a disk may otherwise remove the current file before its copy has a
// name, if the power fails.
void SyncToDisk(QString const& directory)
{
#ifdef Q_OS_UNIX
    const int folder =
        ::open(QFile::encodeName(directory).constData(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (folder == -1)
        return;
    ::fsync(folder);
    ::close(folder);
#else
    Q_UNUSED(directory)
#endif
}

// A link without a target is in the way although it does not count as existing: Qt would create the
// target instead of the older file, or not copy the current one, which would then be lost.
void RemoveDeadLink(QString const& path)
{
    const QFileInfo info(path);
    if (info.isSymLink() && !info.exists())
        QFile::remove(path);
}

// Until it is complete, a copy has no name or, if the file system does not support unnamed files,
// one that says what it belongs to and does not end in a number: app.log.1.aBcDeF.part.
QString PartName(QString const& to)
{
    return to + QLatin1String(".XXXXXX.part");
}

// Creates `to`, which must not exist, completely or not at all. If the directory is not writable,
// QFile::copy() would leave the text in the system's temporary folder for a while.
void Copy(QString const& from, QString const& to)
{
    QFile source(from);
    QTemporaryFile copy(PartName(to));
    const bool isFile =
        QFileInfo(from).isFile(); // opening a pipe would block until it has a writer
    if (!isFile || QFile::exists(to) || !source.open(QIODevice::ReadOnly) || !copy.open())
        return;

    constexpr qint64 blockSize = 1 << 16;
    QByteArray block = source.read(blockSize);
    for (; !block.isEmpty(); block = source.read(blockSize)) {
        if (copy.write(block) != block.size())
            return;
    }
    const bool isWhole = source.error() == QFileDevice::NoError && SyncToDisk(copy);
    copy.setPermissions(source.permissions());
    if (isWhole)
        RemoveDeadLink(to);
    if (isWhole && copy.rename(to)) {
        copy.setAutoRemove(false);
        SyncToDisk(QFileInfo(to).path());
    }
}

// Removes what Copy() to number 1 of the log leaves when the program is killed.
void RemoveUnfinishedCopies(QFileInfo const& log)
{
    const QString start = log.fileName() + QLatin1String(".1");
    const int length = PartName(start).length();
    const QStringList files =
        EntriesWithExtension(log.path(), start, QDir::Files | QDir::Hidden | QDir::NoSymLinks);
    for (QString const& file : files) {
        const QString random = file.mid(start.length() + 1, 6);
        const bool isRandom = std::all_of(random.begin(), random.end(), [](QChar letter) {
            return (letter >= QLatin1Char('a') && letter <= QLatin1Char('z')) ||
                   (letter >= QLatin1Char('A') && letter <= QLatin1Char('Z'));
        });
        if (file.length() == length && file.endsWith(QLatin1String(".part")) && isRandom)
            QFile::remove(log.dir().filePath(file));
    }
}

} // namespace

QString TorkLog::currentFileName() const
{
    return m_fileExtension.isEmpty() ? m_filePrefix
                                     : m_filePrefix + QLatin1Char('.') + m_fileExtension;
}

QString TorkLog::inLogDirectory(QString const& name) const
{
    const QString separator = EndsInSlash(m_path) ? QString() : QStringLiteral("/");
    return m_path + separator + name;
}

QString TorkLog::currentFilePath() const
{
    return inLogDirectory(currentFileName());
}

QString& TorkLog::fileSpec(bool all)
{
    TorkLogLock lock(m_mutex);
    m_fileSpec = currentFileName();
    if (all)
        m_fileSpec += QLatin1String(".*");
    return m_fileSpec;
}

QString& TorkLog::newLogFileName()
{
    TorkLogLock lock(m_mutex);
    const QString name = currentFilePath();
    // Not assigned if equal: a caller may still be reading the buffer.
    // cppcheck-suppress duplicateConditionalAssign ; an assignment would replace the buffer
    if (m_logFileName != name)
        m_logFileName = name;
    return m_logFileName;
}

QString TorkLog::currentLogFile() const
{
    TorkLogLock lock(m_mutex);
    return m_writer->isOpen() ? m_writer->fileName() : currentFilePath();
}

bool TorkLog::open(QString const& fileName)
{
    TorkLogLock lock(m_mutex);
    return openFile(fileName);
}

bool TorkLog::close()
{
    TorkLogLock lock(m_mutex);
    return m_writer->close();
}

bool TorkLog::openFile(QString const& fileName)
{
    QString reason = m_writer->open(fileName);
    if (reason.isNull())
        return true;
    m_errorString = std::move(reason); // ThreadSanitizer sees the old text freed
    return false;
}

// Empty for a hidden file: QDir::Files does not list those, so the log never checks their size.
QFileInfo TorkLog::currentFile() const
{
    const QString name = currentFileName();
    const bool isListed =
        !name.isEmpty() && !name.startsWith(QLatin1Char('.')) && !name.contains(QLatin1Char('/'));
    return isListed ? QFileInfo(QDir(m_path).filePath(name)) : QFileInfo();
}

void TorkLog::makeLogDirectory(QString const& path)
{
    // The last character is dropped, whatever it is: usually the final slash.
    const QString directory = path.length() == 1 ? path : path.left(path.length() - 1);
    QDir().mkpath(directory);
}

QFile* TorkLog::locateLogFile(QString const& text)
{
    QFile* file = m_writer->handOut();
    return locate(text.length()) ? file : nullptr;
}

// Opens or trims the file to make room for `length` more characters.
//
// @return whether a file is open
bool TorkLog::locate(int length)
{
    if (m_writer->isOpen()) {
        m_writer->trim(length, m_maxLogFileSize);
        return true;
    }

    QFileInfo current = currentFile();
    if (!current.isFile()) {
        makeLogDirectory(m_path);
        current.refresh();
    }

    if (!current.isFile()) {
        openFile(currentFilePath());
    } else if (TorkLogWriter::fits(current.size(), length, m_maxLogFileSize)) {
        if (m_logFileName != current.filePath())
            m_logFileName = current.filePath();
        openFile(current.filePath());
    } else {
        deleteOldFiles();
        openFile(currentFilePath());
    }
    return m_writer->isOpen();
}

void TorkLog::deleteOldFiles()
{
    // Of "/" nothing is left, which lists the working directory instead: the names found there
    // decide what is shifted, and up to which number files are removed. Kept for compatibility.
    QString directory = m_path;
    if (EndsInSlash(directory))
        directory.chop(1);
    shiftOldFiles(directory);

    const QString current = currentFilePath();
    RemoveUnfinishedCopies(QFileInfo(current));
    Copy(current, current + QLatin1String(".1"));
    QFile::remove(current);
}

void TorkLog::shiftOldFiles(QString const& directory) const
{
    QMap<int, QString> numbered;
    const QStringList files = EntriesWithExtension(directory, currentFileName(), QDir::Files);
    for (QString const& file : files) {
        const int number = LogFileNumber(file);
        if (number != -1)
            numbered.insert(number, file);
    }
    // A folder that cannot be listed, for lack of memory or descriptors, is not one without older
    // files: number 1 would be in the way of the current file, which would then be lost.
    const QString start = currentFileName() + QLatin1Char('.');
    const auto name = [&start](int number) -> QString {
        return start + QString::number(number);
    };
    const bool isListed = !start.startsWith(QLatin1Char('.')) && !start.contains(QLatin1Char('/'));
    if (files.isEmpty() && isListed) {
        const QDir listed(directory);
        for (int number = 1; QFileInfo(listed.filePath(name(number))).isFile(); ++number)
            numbered.insert(number, name(number));
    }
    if (numbered.isEmpty() || numbered.lastKey() < 0)
        return;

    // From the highest down, so that each new name is free. Directory and name are joined without a
    // slash: a directory that lacks the final one runs into the name.
    const QList<int> numbers = numbered.keys();
    for (auto number = numbers.crbegin(); number != numbers.crend() && *number >= 1; ++number) {
        QString const& file = numbered[*number];
        const QString next = QString::number(qint64(*number) + 1);
        const QString to = m_path + BeforeLastDot(file) + QLatin1Char('.') + next;
        RemoveDeadLink(to);
        QFile::rename(m_path + file, to);
    }

    if (numbered.lastKey() >= static_cast<int>(m_maxLogFiles.load()))
        pruneOldFiles(qint64(numbered.lastKey()) + 1);
}

// Removes everything named like an older file, from `highest` down to the first above the limit,
// even a pipe or a dangling link. Iterates over existing names: a stray file with a huge number
// must not cost a billion attempts.
void TorkLog::pruneOldFiles(qint64 highest) const
{
    const qint64 lowest = qint64(static_cast<int>(m_maxLogFiles.load())) + 1;
    const QFileInfo current(currentFilePath());

    const QDir::Filters all = QDir::AllEntries | QDir::System | QDir::NoDotAndDotDot;
    const QStringList files = EntriesWithExtension(current.path(), current.fileName(), all);
    for (QString const& file : files) {
        const QString number = file.mid(current.fileName().length() + 1);
        const qint64 value = number.toLongLong();
        if (number == QString::number(value) && value >= lowest && value <= highest)
            QFile::remove(current.filePath() + QLatin1Char('.') + number);
    }
    // Not listed again; each rotation adds only one.
    if (files.isEmpty())
        QFile::remove(current.filePath() + QLatin1Char('.') + QString::number(highest));
}
