// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view with any file in any encoding: every byte is in one of the lines, whatever the
// pieces it is read in, and what the index finds in a line is what the table shows.

#include "FuzzInput.h"

#include "app/logfile/ForeignLine.h"
#include "app/logfile/LogIndex.h"

#include <vector>

using namespace Velocor;

namespace {

LogRows RowsOf(LogLineParser const& parser, QByteArray const& file, int piece)
{
    LogIndex index(parser);
    index.Begin();
    for (int at = 0; at < file.size(); at += piece)
        Require(index.Feed(file.constData() + at, qMin(piece, file.size() - at)));
    index.End();
    LogFilter filter;
    filter.SetEarlierRuns(false);
    return index.Rows(parser.fileType().isForeign ? LogFilter() : filter);
}

void CheckParts(QByteArray const& line)
{
    const std::vector<char> bytes(line.begin(), line.end()); // no zero byte follows
    const ForeignLine found = ForeignLine::Read(bytes.data(), line.size(), QDate(2026, 11, 22));
    const auto isWithin = [&](ForeignLine::Span span) {
        return span.start >= 0 && span.length >= 0 && span.start + span.length <= line.size();
    };
    Require(isWithin(found.time) && isWithin(found.message));
    Require(found.isEntry || (found.severity == LogEntry::None && found.time.length == 0));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    const int piece = input.byte() % 8 + 1;
    const auto chosen = static_cast<LogEncoding::Kind>(input.byte() % (LogEncoding::Utf16Be + 1));
    const QByteArray file = input.rest();

    LogLineParser parser;
    const LogFileType type = LogFileType::Of(file, parser, chosen, QDate(2026, 11, 22));
    Require(type.encoding != LogEncoding::Automatic);
    Require(!type.isForeign || !type.isOwn);
    parser.SetFileType(type);
    const LogRows rows = RowsOf(parser, file, piece);
    const LogRows whole = RowsOf(parser, file, file.size() + 1);
    Require(rows.size() == whole.size());
    for (size_t row = 0; row < rows.size(); ++row)
        Require(rows.start(row) == whole.start(row) && rows.mark(row) == whole.mark(row));
    Require(!type.isForeign || rows.earlier() == 0);
    Require(file.isEmpty() == (whole.size() == 0));
    Require(whole.size() == 0 || whole.start(0) == 0);

    for (size_t row = 0; type.isForeign && row < rows.size(); ++row) {
        const int start = static_cast<int>(rows.start(row));
        const bool isLast = row + 1 == rows.size();
        const int next = isLast ? file.size() : static_cast<int>(rows.start(row + 1));
        Require(next > start);
        QByteArray line = file.mid(start, next - start);
        char const* const lineEnd =
            type.lineEnd().Find(line.constBegin(), line.constEnd(), 0, '\0');
        Require(isLast || lineEnd == line.constEnd() - 1);
        if (lineEnd)
            line.chop(type.lineEnd().size());
        line.truncate(type.encoding.WithoutReturn(line.constData(), line.size()));
        CheckParts(line);
        const LogEntry entry = parser.Parse(line);
        const quint8 mark = rows.mark(row);
        Require(entry.isEntry || entry.severity == LogEntry::None);
        Require(entry.isEntry ? (mark & LogRows::SeverityMask) == entry.severity
                              : row == 0 || (mark & LogRows::Continued));
    }
    return 0;
}
