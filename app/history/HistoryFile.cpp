// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryFile.h"

#include "app/logfile/ForeignStamp.h"
#include "app/logfile/LogIndex.h"

#include <QDateTime>
#include <QFileInfo>
#include <QObject>

#include <algorithm>
#include <limits>
#include <sys/stat.h>

namespace Velocor {

namespace {

constexpr int ReadSize = 1 << 17; // stays in the processor's cache

// Of the open file, since its name may belong to another one by now.
QDateTime LastModified(QFile const& file)
{
    struct stat status
    {};
    if (::fstat(file.handle(), &status) != 0)
        return QDateTime();
#ifdef Q_OS_MACOS
    const timespec time = status.st_mtimespec;
#else
    const timespec time = status.st_mtim;
#endif
    return QDateTime::fromMSecsSinceEpoch(qint64(time.tv_sec) * 1000 + time.tv_nsec / 1000000);
}

// What prints a compressed file; null if this is none.
char const* UnpackerOf(LogFileType::Content content)
{
    switch (content) {
    case LogFileType::Gzip:
        return "zcat";
    case LogFileType::Xz:
        return "xzcat";
    case LogFileType::Bzip2:
        return "bzcat";
    case LogFileType::Zstd:
        return "zstdcat";
    case LogFileType::Binary:
    case LogFileType::Text:
        break;
    }
    return nullptr;
}

} // namespace

bool HistoryFile::Open(QString const& path)
{
    m_path = path;
    m_error.clear();
    m_file = std::make_shared<QFile>(path);
    const QFileInfo info(path);
    if (!info.exists())
        m_error = QObject::tr("No such file");
    else if (!info.isFile()) // opening a pipe would block
        m_error = QObject::tr("Not a regular file");
    else if (!m_file->open(QIODevice::ReadOnly | QIODevice::Unbuffered))
        m_error = m_file->errorString();
    return m_error.isEmpty();
}

bool HistoryFile::Read(LogLineParser const& parser, LogFilter const& filter)
{
    const QDateTime modified = LastModified(*m_file);
    m_modified = std::max<qint64>(0, ForeignStamp::KeyOfEpoch(modified.toMSecsSinceEpoch()));
    // What the file gets from now on comes too late, however fast it grows. Some have no size.
    const qint64 size = m_file->size();
    const qint64 end = size > 0 ? size : std::numeric_limits<qint64>::max();

    m_file->seek(0);
    const QByteArray head = m_file->read(std::min<qint64>(LogFileType::HeadSize, end));
    m_parser = parser;
    m_parser.SetFileType(LogFileType::Of(head, parser, parser.chosenEncoding(), modified.date()));
    if (char const* unpacker = UnpackerOf(m_parser.fileType().content)) {
        m_error = QObject::tr("A compressed file. To read it: %1 FILE | velocor-log -")
                      .arg(QLatin1String(unpacker));
        return false;
    }
    LogIndex index(m_parser, filter);
    QByteArray bytes(ReadSize, Qt::Uninitialized);
    qint64 count = m_file->seek(index.Begin()) ? 0 : -1;
    while (count >= 0 && index.nextOffset() < end) {
        count =
            m_file->read(bytes.data(), std::min<qint64>(bytes.size(), end - index.nextOffset()));
        if (count <= 0)
            break;
        index.Feed(bytes.constData(), static_cast<int>(count)); // the first pass knows no line
    }
    index.End();
    m_rows = index.Rows(filter);
    m_runStarts = index.RunStarts();
    m_slowLine = index.slowLine();
    if (count < 0)
        m_error = m_file->errorString();
    return count >= 0;
}

bool HistoryFile::IsInPlace() const
{
    struct stat open = {};
    struct stat named = {};
    return ::fstat(m_file->handle(), &open) == 0 &&
           ::stat(QFile::encodeName(m_path).constData(), &named) == 0 &&
           open.st_dev == named.st_dev && open.st_ino == named.st_ino;
}

} // namespace Velocor
