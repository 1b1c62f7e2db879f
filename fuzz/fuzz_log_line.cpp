// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view's line parser: any line, in any format, is split into parts within it.

#include "FuzzInput.h"

#include "app/logfile/LogLineParser.h"

#include <QDateTime>

#include <algorithm>
#include <random>
#include <vector>

extern "C" size_t LLVMFuzzerMutate(uint8_t* data, size_t size, size_t maximum);

using namespace Velocor;

// Puts a line of the log's own into half of the inputs: bytes alone never make a time that fits the
// format.
extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    std::mt19937 random(seed);
    if (random() % 2 == 0)
        return LLVMFuzzerMutate(data, size, maximum);

    FuzzInput input(data, size);
    const QString format = input.text();
    const QString prefix = input.text();
    const QByteArray before(reinterpret_cast<char const*>(data), int(size) - input.rest().size());
    const QDateTime time =
        QDateTime::fromMSecsSinceEpoch(qint64(random()) * 1000 + random() % 1000);
    const QStringList severities = {"Trace", "Notification", "Warning", "Error", "Fatal", ""};
    QString line = time.toString(format) + ' ' + severities.at(int(random() % 6)) + ' ';
    if (random() % 2 == 0)
        line += prefix + '[' + QString::number(int(random() % 2000) - 1000) + "] ";
    const QByteArray bytes = before + (line + "text").toLatin1();
    const size_t length = qMin(size_t(bytes.size()), maximum);
    std::copy_n(bytes.begin(), length, data);
    return random() % 2 == 0 ? length : LLVMFuzzerMutate(data, length, maximum);
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    const QStringList formats(input.text());
    const QStringList prefixes(input.text());
    const LogLineParser parser(formats, prefixes);
    const QByteArray line = input.rest();

    // As in a memory-mapped file: the line is not NUL-terminated.
    const std::vector<char> bytes(line.begin(), line.end());
    const int length = line.size();
    const LogLineParser::Parts parts = parser.Find(bytes.data(), length);
    Require(parts.timeLength >= 0 && parts.timeLength <= length);
    Require(parts.message >= parts.timeLength && parts.message <= length);
    Require(parts.elapsedLength >= 0 && parts.elapsed >= 0);
    Require(parts.elapsed + parts.elapsedLength <= parts.message);
    Require(parts.isEntry || (parts.message == 0 && parts.severity == LogEntry::None));

    const LogEntry entry = parser.Parse(line);
    Require(entry.isEntry == parts.isEntry && entry.severity == parts.severity);
    Require(entry.message.size() == length - parts.message);
    return 0;
}
