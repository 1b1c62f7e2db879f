// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The files of the log: names, opening, trimming and rotation.
//
// Rotation of app.log with a limit of 3 older files:
//
//     before                   after
//     app.log     too full     app.log      opened anew
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

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

namespace {

// As the names have always been formed: an empty path counts as ending in a slash.
bool EndsInSlash(QString const& path)
{
    return path.lastIndexOf(QLatin1Char('/')) == path.length() - 1;
}

QString BeforeLastDot(QString const& fileName)
{
    return fileName.left(fileName.lastIndexOf(QLatin1Char('.')));
}

// The number of an older file: what follows the last dot; -1 if that is no number.
int logFileNumber(QString const& fileName)
{
    const int dot = fileName.lastIndexOf(QLatin1Char('.'));
    if (dot == -1)
        return -1;

    bool converted = false;
    const int number = fileName.midRef(dot + 1).toInt(&converted);
    return converted ? number : -1;
}

// What lies in `directory` and is named `name` and a further extension, in name order.
//
// Compared by hand: Qt's name filters are wildcards that split at blanks and semicolons, read
// brackets as character sets and ignore letter case, and would take in files of others.
QStringList NamedLike(QString const& directory, QString const& name, QDir::Filters filters)
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

bool HasReachedTheDisk(QFileDevice& file)
{
    if (!file.flush())
        return false;
#ifdef Q_OS_UNIX
    ::fsync(file.handle()); // some file systems cannot; the copy is good all the same
#endif
    return true;
}

// A copy has no name before it is whole, or, where the file system knows no such files, one that
// tells whose it is: app.log.1.aBcDeF.part, which no number can be mistaken for.
QString PartName(QString const& to)
{
    return to + QLatin1String(".XXXXXX.part");
}

// Makes `to`, which must not exist, whole or not at all. Where the directory takes no new file,
// QFile::copy() would put the text into the system's temporary folder on the way.
void Copy(QString const& from, QString const& to)
{
    QFile source(from);
    QTemporaryFile copy(PartName(to));
    const bool isFile = QFileInfo(from).isFile(); // opening a pipe would wait for a writer
    if (!isFile || QFile::exists(to) || !source.open(QIODevice::ReadOnly) || !copy.open())
        return;

    constexpr qint64 blockSize = 1 << 16;
    QByteArray block = source.read(blockSize);
    for (; !block.isEmpty(); block = source.read(blockSize)) {
        if (copy.write(block) != block.size())
            return;
    }
    const bool isWhole = source.error() == QFileDevice::NoError && HasReachedTheDisk(copy);
    copy.setPermissions(source.permissions());
    if (isWhole && copy.rename(to))
        copy.setAutoRemove(false);
}

// Removes what Copy() to number 1 of the log `name` leaves behind when the program is killed.
void RemoveUnfinishedCopies(QString const& directory, QString const& name)
{
    const QString start = name + QLatin1String(".1");
    const int length = PartName(start).length();
    const QStringList files =
        NamedLike(directory, start, QDir::Files | QDir::Hidden | QDir::NoSymLinks);
    for (QString const& file : files) {
        const QStringRef random = file.midRef(start.length() + 1, 6);
        const bool isRandom = std::all_of(random.begin(), random.end(), [](QChar letter) {
            return (letter >= QLatin1Char('a') && letter <= QLatin1Char('z')) ||
                   (letter >= QLatin1Char('A') && letter <= QLatin1Char('Z'));
        });
        if (file.length() == length && file.endsWith(QLatin1String(".part")) && isRandom)
            QFile::remove(QDir(directory).filePath(file));
    }
}

} // namespace

QString TorkLog::currentFileName() const
{
    return m_fileExtension.isEmpty() ? m_filePrefix
                                     : m_filePrefix + QLatin1Char('.') + m_fileExtension;
}

QString TorkLog::currentFilePath() const
{
    const QString separator = EndsInSlash(m_path) ? QString() : QStringLiteral("/");
    return m_path + separator + currentFileName();
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
    // Left alone where a reader of the buffer would see no change.
    // cppcheck-suppress duplicateConditionalAssign ; an assignment would take the buffer away
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
    const QString reason = m_writer->open(fileName);
    if (!reason.isNull())
        m_errorString = reason;
    return reason.isNull();
}

// Empty for a hidden file: QDir::Files does not list one, so the log never looks at its size.
QFileInfo TorkLog::currentFile() const
{
    const QString name = currentFileName();
    const bool isListed =
        !name.isEmpty() && !name.startsWith(QLatin1Char('.')) && !name.contains(QLatin1Char('/'));
    return isListed ? QFileInfo(QDir(m_path).filePath(name)) : QFileInfo();
}

void TorkLog::makeLogDirectory(QString const& path)
{
    // The last character goes, whatever it is: usually the final slash.
    const QString directory = path.length() == 1 ? path : path.left(path.length() - 1);
    QDir().mkpath(directory);
}

QFile* TorkLog::locateLogFile(QString const& text)
{
    QFile* file = m_writer->handOut();
    return locate(text.length()) ? file : nullptr;
}

// Whether the file that `length` more characters go to is open. It may have been trimmed for them,
// or have been opened for them.
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
    QString directory = m_path;
    if (EndsInSlash(directory))
        directory.chop(1);
    shiftOldFiles(directory);

    const QString current = currentFilePath();
    RemoveUnfinishedCopies(directory, currentFileName());
    Copy(current, current + QLatin1String(".1"));
    QFile::remove(current);
}

void TorkLog::shiftOldFiles(QString const& directory) const
{
    QMap<int, QString> numbered;
    const QStringList files = NamedLike(directory, currentFileName(), QDir::Files);
    for (QString const& file : files) {
        const int number = logFileNumber(file);
        if (number != -1)
            numbered.insert(number, file);
    }
    if (numbered.isEmpty() || numbered.lastKey() < 0)
        return;

    // From the highest down, so that each new name is free. Directory and name are joined as they
    // are: a directory without its final slash runs into the name.
    const QList<int> numbers = numbered.keys();
    for (auto number = numbers.crbegin(); number != numbers.crend() && *number >= 1; ++number) {
        QString const& file = numbered[*number];
        const QString next = QString::number(qint64(*number) + 1);
        QFile::rename(m_path + file, m_path + BeforeLastDot(file) + QLatin1Char('.') + next);
    }

    if (numbered.lastKey() >= static_cast<int>(m_maxLogFiles.load()))
        pruneOldFiles(directory, qint64(numbered.lastKey()) + 1);
}

// Removes everything that has the name of an older file, from `highest` down to the first above the
// limit, be it a pipe or a link to nothing. Goes by the names that are there: a stray file with a
// huge number must not cost a billion attempts.
void TorkLog::pruneOldFiles(QString const& directory, qint64 highest) const
{
    const qint64 lowest = qint64(static_cast<int>(m_maxLogFiles.load())) + 1;
    const QString name = currentFileName();
    const QString path = currentFilePath();

    const QDir::Filters all = QDir::AllEntries | QDir::System | QDir::NoDotAndDotDot;
    const QStringList files = NamedLike(directory, name, all);
    for (QString const& file : files) {
        const QString number = file.mid(name.length() + 1);
        const qint64 value = number.toLongLong();
        if (number == QString::number(value) && value >= lowest && value <= highest)
            QFile::remove(path + QLatin1Char('.') + number);
    }
}
