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

#include "common/log/TorkLogLock.h"

#include <QDir>
#include <QMap>
#include <QTemporaryFile>
#include <QTextStream>

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

// The files in `directory` that are named `name` and a further extension, in name order.
//
// Compared by hand: the toolkit's name filters are wildcards that split at blanks and semicolons,
// read brackets as character sets and ignore letter case, and would take in files of others.
QStringList NumberedFiles(QString const& directory, QString const& name)
{
    const QString start = name + QLatin1Char('.');
    const QDir::Filters filters = QDir::Files | QDir::Hidden;
    QStringList numbered;
    const QStringList files = QDir(directory).entryList(filters, QDir::Name);
    for (QString const& file : files) {
        if (file.startsWith(start))
            numbered.append(file);
    }
    return numbered;
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

// Makes `to`, which must not exist, whole or not at all. Where the directory takes no new file,
// QFile::copy() would put the text into the system's temporary folder on the way.
void Copy(QString const& from, QString const& to)
{
    QFile source(from);
    QTemporaryFile copy(QFileInfo(to).path() + QLatin1String("/qt_temp.XXXXXX"));
    if (QFile::exists(to) || !source.open(QIODevice::ReadOnly) || !copy.open())
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
    return m_file.isOpen() ? m_file.fileName() : currentFilePath();
}

bool TorkLog::open(QString const& fileName)
{
    TorkLogLock lock(m_mutex);
    return openFile(fileName);
}

bool TorkLog::close()
{
    TorkLogLock lock(m_mutex);
    return closeFile();
}

bool TorkLog::openFile(QString const& fileName)
{
    closeFile();
    m_file.setFileName(fileName);
    // Neither appending nor truncating: entries go over the old content from its start on.
    const bool opened = m_file.open(QIODevice::ReadWrite | QIODevice::Text);
    if (!opened)
        m_errorString = m_file.errorString();
    m_handedOut = false;
    m_direct = opened && mayWriteDirectly();
    m_position = 0;
    return opened;
}

bool TorkLog::closeFile()
{
    if (!m_file.isOpen())
        return false;

    m_file.flush();
    m_file.close();
    return true;
}

bool TorkLog::fits(qint64 size, int length) const
{
    return size < 1 || size + length <= qint64(m_maxLogFileSize);
}

QFileInfo TorkLog::currentFile() const
{
    const QString name = currentFileName();
    const bool isBareName = !name.isEmpty() && !name.contains(QLatin1Char('/'));
    return isBareName ? QFileInfo(QDir(m_path).filePath(name)) : QFileInfo();
}

void TorkLog::makeLogDirectory() const
{
    // The last character goes, whatever it is: as a rule the final slash.
    const QString directory = m_path.length() == 1 ? m_path : m_path.left(m_path.length() - 1);
    QDir().mkpath(directory);
}

QFile* TorkLog::locateLogFile(QString const& text)
{
    QFile* file = locate(text.length());
    m_handedOut = true;
    useFileObject();
    return file;
}

bool TorkLog::mayWriteDirectly() const
{
#ifdef Q_OS_UNIX
    // A file whose status could not be told has no position for the toolkit to go back to.
    return !m_handedOut && !m_file.isSequential();
#else
    return false; // there the toolkit's text mode makes other line ends
#endif
}

// From here on the file object writes, from where the last entry ended.
void TorkLog::useFileObject()
{
    if (m_direct)
        m_file.seek(m_position);
    m_direct = false;
}

// The size of the open file. The position of its end tells as much as its status and is found ten
// times as fast, but must be left where writing goes on.
qint64 TorkLog::openFileSize()
{
#ifdef Q_OS_UNIX
    if (m_direct) {
        const qint64 end = ::lseek(m_file.handle(), 0, SEEK_END);
        if (end == m_position || (end >= 0 && ::lseek(m_file.handle(), m_position, SEEK_SET) >= 0))
            return end;
    }
#endif
    return m_file.size();
}

QFile* TorkLog::locate(int length)
{
    if (m_file.isOpen()) {
        const qint64 size = openFileSize();
        // Behind the last entry there is as a rule nothing to trim.
        if (!fits(size, length) && (m_direct ? m_position : m_file.pos()) != size)
            trimOpenFile(length);
        return &m_file;
    }

    QFileInfo current = currentFile();
    if (!current.isFile()) {
        makeLogDirectory();
        current.refresh();
    }

    if (!current.isFile()) {
        openFile(currentFilePath());
    } else if (fits(current.size(), length)) {
        if (m_logFileName != current.filePath())
            m_logFileName = current.filePath();
        openFile(current.filePath());
    } else {
        deleteOldFiles();
        openFile(currentFilePath());
    }
    return m_file.isOpen() ? &m_file : nullptr;
}

// Looks for old content behind the last entry and, if there is any, cuts it down: without the
// lines that the new text needs room for, and without their line ends. As a rule nothing follows
// and the file grows beyond its limit; it is rotated when it is next opened.
void TorkLog::trimOpenFile(int length)
{
    useFileObject();
    QTextStream stream(&m_file);
    stream.setCodec("ISO 8859-1"); // byte for byte, in any locale
    stream.setAutoDetectUnicode(false);

    QString kept;
    qint64 count = 0;
    bool keep = false;
    while (!stream.atEnd()) {
        const QString line = stream.readLine();
        if (line.isNull()) // a file that cannot be read never comes to its end
            break;
        count += line.length();
        keep = keep || count >= length;
        if (keep)
            kept += line;
        m_file.resize(0);
        stream << kept;
    }
}

void TorkLog::deleteOldFiles()
{
    QString directory = m_path;
    if (EndsInSlash(directory))
        directory.chop(1);
    shiftOldFiles(directory);

    const QString current = currentFilePath();
    Copy(current, current + QLatin1String(".1"));
    QFile::remove(current);
}

void TorkLog::shiftOldFiles(QString const& directory) const
{
    QMap<int, QString> numbered;
    const QStringList files = NumberedFiles(directory, currentFileName());
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

// Removes the older files from `highest` down to the first above the limit, going by the names
// that are there: a stray file with a huge number must not cost a billion attempts.
void TorkLog::pruneOldFiles(QString const& directory, qint64 highest) const
{
    const qint64 lowest = qint64(static_cast<int>(m_maxLogFiles.load())) + 1;
    const QString name = currentFileName();
    const QString path = currentFilePath();

    const QStringList files = NumberedFiles(directory, name);
    for (QString const& file : files) {
        const QString number = file.mid(name.length() + 1);
        const qint64 value = number.toLongLong();
        if (number == QString::number(value) && value >= lowest && value <= highest)
            QFile::remove(path + QLatin1Char('.') + number);
    }
}
