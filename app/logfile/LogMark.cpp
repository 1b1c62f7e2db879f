// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogMark.h"

#include "app/logfile/LogLineReader.h"

#include <QCryptographicHash>

#include <algorithm>

namespace Velocor {

namespace {

constexpr qint64 LookBack = 64 << 10; // bytes

// Where the line above starts; -1 if there is none, or if it is very long.
qint64 StartAbove(LogSource const& source, qint64 start, LogLineEnd const& lineEnd)
{
    LogBytes log;
    const qint64 first = source.logs ? start - start % LogSource::LogSize : 0; // of this log
    const qint64 from = std::max(first, start - LookBack);
    if (start <= first || !log.Open(source) || !log.Seek(from))
        return -1;
    const QByteArray bytes = log.Read(start - from - lineEnd.size());
    char const* at = bytes.constBegin();
    while (char const* last =
               lineEnd.Find(at, bytes.constEnd(), from + (at - bytes.constBegin()), '\0'))
        at = last + 1;
    return at == bytes.constBegin() && from > first ? -1 : from + (at - bytes.constBegin());
}

} // namespace

QByteArray LogMark::IdentityOf(QByteArray const& line)
{
    return QByteArray::number(line.size()) + ':' +
           QCryptographicHash::hash(line, QCryptographicHash::Sha1).toHex();
}

LogMark LogMark::Of(LogSource const& source, qint64 start, LogFileType const& type)
{
    LogMark mark;
    mark.start = start;
    mark.isFound = true;
    LogLineReader reader;
    if (!reader.Open(source, type))
        return mark;
    mark.line = IdentityOf(reader.Line(start));
    const qint64 next = reader.nextStart();
    const QByteArray below = reader.Line(next);
    if (reader.nextStart() > next)
        mark.below = IdentityOf(below);
    const qint64 above = StartAbove(source, start, type.lineEnd());
    if (above >= 0)
        mark.above = IdentityOf(reader.Line(above));
    return mark;
}

} // namespace Velocor
