// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view's line parser: any line, in any format, is split into parts within it.

#include "FuzzInput.h"

#include "app/logfile/LogLineParser.h"

#include <vector>

using namespace Velocor;

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
