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

QByteArray const& HistoryLines::Content(size_t line)
{
    const qint64 begin = start(line);
    const qint64 end = start(line + 1);
    const auto size = static_cast<int>(std::min<qint64>(end - begin, LogIndex::LineLimit));
    QByteArray const& read = m_bytes.At(begin, size);
    m_line.setRawData(read.constData(), static_cast<uint>(read.size()));
    const bool isWhole = begin < m_file->rows().complete() && begin + m_line.size() == end;
    const int length = std::max<int>(0, m_line.size() - (isWhole ? m_lineEnd.size() : 0));
    LogEncoding const& encoding = m_file->parser().fileType().encoding;
    m_content.setRawData(m_line.constData(),
                         static_cast<uint>(encoding.WithoutReturn(m_line.constData(), length)));
    return m_content;
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
