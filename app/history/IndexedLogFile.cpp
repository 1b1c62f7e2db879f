// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/IndexedLogFile.h"

#include <QFileInfo>

#include <algorithm>
#include <sys/stat.h>

namespace Velocor {

namespace {

constexpr int SliceSize = 1 << 17; // stays in the processor's cache

} // namespace

bool IndexedLogFile::Open(QString const& path)
{
    if (!m_file.Open(path))
        return false;
    m_wholeSize = m_file.file()->size();
    m_size = m_wholeSize;
    m_modified = QFileInfo(path).lastModified();
    return true;
}

bool IndexedLogFile::Read(LogLineParser const& parser, LogFilter const& filter,
                          std::function<bool()> const& goesOn)
{
    m_index = LogIndex(parser, filter);
    m_lineEnd = parser.fileType().lineEnd();
    m_size -= m_size % m_lineEnd.size(); // the next file begins with a whole character
    QFile& file = *m_file.file();
    QByteArray slice(SliceSize, Qt::Uninitialized);
    bool more = file.seek(m_index.Begin());
    while (more && m_index.nextOffset() < m_size) {
        const qint64 count =
            file.read(slice.data(), std::min<qint64>(slice.size(), m_size - m_index.nextOffset()));
        more = count > 0;
        if (more)
            m_index.Feed(slice.constData(),
                         static_cast<int>(count)); // the first pass knows no line
        if (!goesOn())
            return false;
    }
    m_index.End();
    m_size = m_index.nextOffset();
    MakeRows(filter);
    return true;
}

bool IndexedLogFile::Search(OlderLogFiles const& files, qint64 start, LogFilter const& filter,
                            std::function<bool()> const& goesOn)
{
    m_index.BeginSearch(filter);
    QByteArray lines;
    while (m_index.searchOffset() < m_index.nextOffset()) {
        const qint64 offset = m_index.searchOffset();
        lines.resize(static_cast<int>(m_index.SearchEnd(SliceSize) - offset));
        lines.fill('\0'); // what the file no longer has
        for (int at = 0; at < lines.size();) {
            const qint64 count =
                files.Read(start + offset + at, lines.data() + at, lines.size() - at);
            if (count <= 0)
                break;
            at += static_cast<int>(count);
        }
        m_index.Search(lines, goesOn);
        if (!goesOn())
            return false;
    }
    MakeRows(filter);
    return true;
}

void IndexedLogFile::TakeLines(LineTable const& lines)
{
    m_index.TakeLines(lines);
    m_rows.SetLines(lines, m_rows.newestEnd(), m_rows.complete(), m_rows.end());
}

QByteArray IndexedLogFile::Separator() const
{
    return m_index.completeOffset() < m_index.nextOffset() ? m_lineEnd.bytes() : QByteArray();
}

bool IndexedLogFile::IsUnchanged() const
{
    const QFileInfo info(path());
    return m_file.IsInPlace() && info.size() == m_wholeSize && info.lastModified() == m_modified;
}

quint64 IndexedLogFile::IdentityOf(QString const& path)
{
    struct stat status = {};
    return ::stat(QFile::encodeName(path).constData(), &status) == 0 ? status.st_ino : 0;
}

} // namespace Velocor
