// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryLines.h"

#include "app/logfile/LogIndex.h"

#include <algorithm>

namespace Velocor {

HistoryLines::HistoryLines(HistoryFile const& file)
    : m_file(&file), m_lines(&file.rows().lines()), m_starts(file.rows().lines()),
      m_bytes(file.file()), m_lineEnd(file.parser().fileType().lineEnd())
{}

qint64 HistoryLines::start(size_t line)
{
    return line < m_lines->size() ? m_starts.start(line) : m_file->rows().end();
}

QByteArray HistoryLines::Bytes(size_t line)
{
    const qint64 begin = start(line);
    const qint64 length = start(line + 1) - begin;
    return m_bytes.At(begin, static_cast<int>(std::min<qint64>(length, LogIndex::LineLimit)));
}

QByteArray HistoryLines::Content(size_t line, QByteArray const& bytes)
{
    const qint64 begin = start(line);
    const bool isWhole =
        begin < m_file->rows().complete() && begin + bytes.size() == start(line + 1);
    const int length = std::max(0, bytes.size() - (isWhole ? m_lineEnd.size() : 0));
    LogEncoding const& encoding = m_file->parser().fileType().encoding;
    return QByteArray::fromRawData(bytes.constData(),
                                   encoding.WithoutReturn(bytes.constData(), length));
}

bool HistoryLines::IsSame(size_t line, QByteArray const& content) const
{
    return LogRows::CheckOf(content.constData(), content.size()) == m_lines->check(line);
}

LogLineParser::Parts HistoryLines::Parts(QByteArray const& content)
{
    char const* text = content.constData();
    int length = content.size();
    QByteArray narrow;
    m_file->parser().fileType().encoding.Narrow(text, length, narrow);
    return m_file->parser().Find(text, std::min(length, LogIndex::PartsLimit), m_beginnings);
}

} // namespace Velocor
