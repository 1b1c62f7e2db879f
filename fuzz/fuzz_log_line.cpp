// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log view's line parser: any line, in any format, gives parts that lie within it.

#include "FuzzInput.h"

#include "app/window/LogLineParser.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    const QStringList formats(input.text());
    const QStringList prefixes(input.text());
    const LogLineParser parser(formats, prefixes);
    const QByteArray line = input.rest();

    const LogLineParser::Parts parts = parser.Find(line.constData(), line.size());
    Require(parts.timeLength >= 0 && parts.timeLength <= line.size());
    Require(parts.message >= 0 && parts.message <= line.size());
    Require(parts.elapsedLength >= 0 && parts.elapsed + parts.elapsedLength <= line.size());

    const LogEntry entry = parser.Parse(line);
    Require(entry.isEntry == parts.isEntry);
    return 0;
}
