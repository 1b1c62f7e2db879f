// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLineParser.h"

#include "app/logfile/AsciiCharacters.h"
#include "app/logfile/ForeignLine.h"
#include "app/logfile/LogFields.h"
#include "app/logfile/LogSeverities.h"

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

// No stamp is longer; a severity name further on is part of a message.
constexpr int MaximumStampLength = 80;

QStringList WithDefault(QStringList texts, QString const& byDefault)
{
    texts.append(byDefault);
    texts.removeAll(QString());
    texts.removeDuplicates();
    return texts;
}

// In a format that is not known. Not "make: *** [Makefile:12: all] Error 1".
bool MayBeStamp(char const* text, int length)
{
    char const* const end = text + length;
    return std::any_of(text, end, IsAsciiDigit) && std::find(text, end, '*') == end;
}

// The length of a number such as "[-12] ", up to its "]"; 0 if there is none.
int NumberInBrackets(char const* text, int length)
{
    int at = 1;
    if (at < length && text[at] == '-')
        ++at;
    const int firstDigit = at;
    while (at < length && IsAsciiDigit(text[at]))
        ++at;
    const bool complete = at > firstDigit && at < length && text[at] == ']';
    return length > 0 && text[0] == '[' && complete ? at + 1 : 0;
}

} // namespace

LogLineParser::LogLineParser() : LogLineParser(QStringList(), QStringList()) {}

LogLineParser::LogLineParser(QStringList const& dateFormats, QStringList const& elapsedPrefixes)
{
    const QStringList formats = WithDefault(dateFormats, QStringLiteral("yyyy-MM-dd hh:mm:ss.z"));
    for (QString const& format : formats)
        m_readers.emplace_back(format);
    const QStringList prefixes = WithDefault(elapsedPrefixes, QStringLiteral("dT:"));
    for (QString const& prefix : prefixes)
        m_elapsedPrefixes.push_back(prefix.toLatin1());

    // A program may translate the names in its log, so a file may hold both kinds.
    for (int i = 0; i < LogEntry::None; ++i) {
        const auto severity = static_cast<LogEntry::Severity>(i);
        const QByteArray name = LogSeverities::LoggedName(severity);
        const QByteArray translated = LogSeverities::NameInLog(severity).toLatin1();
        m_names.emplace_back(name, severity);
        if (translated != name && !translated.isEmpty())
            m_names.emplace_back(translated, severity);
    }
    m_firstNames.fill(static_cast<quint8>(m_names.size()));
    for (size_t i = m_names.size(); i > 0; --i)
        m_firstNames[static_cast<uchar>(m_names[i - 1].text.at(0))] = static_cast<quint8>(i - 1);
}

LogLineParser::Name::Name(QByteArray const& name, LogEntry::Severity ofSeverity)
    : text(name), severity(ofSeverity)
{
    const QByteArray bytes = text + ' ';
    const QByteArray mask(bytes.size(), '\xFF');
    if (static_cast<size_t>(bytes.size()) <= sizeof m_bytes) {
        std::memcpy(m_bytes.data(), bytes.constData(), static_cast<size_t>(bytes.size()));
        std::memcpy(m_mask.data(), mask.constData(), static_cast<size_t>(mask.size()));
    }
}

// Which name there is differs from line to line, so that a processor cannot foresee where a
// comparison ends: all bytes are compared at once. For the goal "opening" in docs/performance.md;
// tst_PlainLineParser.
bool LogLineParser::Name::IsAt(char const* at, int length) const
{
    Words words;
    if (m_mask[0] != 0 && static_cast<size_t>(length) >= sizeof words) {
        std::memcpy(words.data(), at, sizeof words);
        return (((words[0] ^ m_bytes[0]) & m_mask[0]) | ((words[1] ^ m_bytes[1]) & m_mask[1])) == 0;
    }
    const int size = text.size();
    return length >= size && std::memcmp(at, text.constData(), static_cast<size_t>(size)) == 0 &&
           (length == size || at[size] == ' ');
}

LogLineParser::Name const* LogLineParser::nameAt(char const* text, int length) const
{
    if (length <= 0)
        return nullptr;
    Name const* const end = m_names.data() + m_names.size();
    Name const* name = m_names.data() + m_firstNames[static_cast<uchar>(*text)];
    while (name != end && !name->IsAt(text, length))
        ++name;
    return name != end ? name : nullptr;
}

bool LogLineParser::findByFormat(char const* line, int length, Beginnings* last, Parts& parts) const
{
    LogTimeReader::Beginning* beginning = last ? last->data() : nullptr;
    for (LogTimeReader const& reader : m_readers) {
        const LogTimeReader::Stamp stamp =
            beginning ? reader.Read(line, length, *beginning++) : reader.Read(line, length);
        const int blank = stamp.length;
        if (blank < 0 || blank >= length || line[blank] != ' ')
            continue;

        Name const* name = nameAt(line + blank + 1, length - blank - 1);
        const bool nameless = blank + 1 < length && line[blank + 1] == ' ';
        if (!name && !nameless)
            continue;
        parts.isEntry = true;
        parts.timeLength = blank;
        parts.timeKey = stamp.key;
        parts.hasDate = reader.hasDate();
        parts.resolution = reader.resolution();
        parts.severity = name ? name->severity : LogEntry::None;
        parts.message = std::min<int>(length, blank + 2 + (name ? name->text.size() : 0));
        return true;
    }
    return false;
}

bool LogLineParser::findByName(char const* line, int length, Parts& parts) const
{
    const int limit = std::min(length, MaximumStampLength);
    for (int blank = 0; blank < limit; ++blank) {
        if (line[blank] != ' ')
            continue;
        Name const* name = nameAt(line + blank + 1, length - blank - 1);
        if (!name)
            continue;
        if (blank > 0 && !MayBeStamp(line, blank))
            return false;
        parts.isEntry = true;
        parts.timeLength = blank;
        parts.severity = name->severity;
        parts.message = std::min<int>(length, blank + 2 + name->text.size());
        return true;
    }
    return false;
}

bool LogLineParser::mayBeElapsed(char first) const
{
    return std::any_of(m_elapsedPrefixes.begin(), m_elapsedPrefixes.end(),
                       [first](QByteArray const& prefix) { return prefix.at(0) == first; });
}

void LogLineParser::findElapsed(char const* line, int length, Parts& parts) const
{
    char const* const rest = line + parts.message;
    const int restLength = length - parts.message;
    for (QByteArray const& prefix : m_elapsedPrefixes) {
        const int size = prefix.size();
        if (restLength < size ||
            std::memcmp(rest, prefix.constData(), static_cast<size_t>(size)) != 0)
            continue;
        const int number = NumberInBrackets(rest + size, restLength - size);
        const int after = size + number;
        if (number == 0 || (after < restLength && rest[after] != ' '))
            continue;
        parts.elapsed = parts.message + size + 1;
        parts.elapsedLength = number - 2;
        parts.message = std::min<int>(length, parts.message + after + 1);
        return;
    }
}

void LogLineParser::findOwn(char const* line, int length, Beginnings* last, Parts& parts) const
{
    length = std::min(length, SearchLimit);
    const bool isFound = findByFormat(line, length, last, parts) || findByName(line, length, parts);
    if (isFound && parts.message < length && mayBeElapsed(line[parts.message]))
        findElapsed(line, length, parts);
}

LogLineParser::Parts LogLineParser::FindOwn(char const* line, int length) const
{
    Parts parts;
    findOwn(line, length, nullptr, parts);
    return parts;
}

LogLineParser::Parts LogLineParser::Find(char const* line, int length) const
{
    return find(line, length, nullptr);
}

LogLineParser::Parts LogLineParser::Find(char const* line, int length, Beginnings& last) const
{
    if (last.empty())
        last.resize(m_readers.size());
    return find(line, length, &last);
}

bool LogLineParser::findForeign(char const* line, int length, Parts& parts) const
{
    const ForeignLine foreign = ForeignLine::Read(line, length, m_type.latest);
    if (!foreign.isEntry)
        return false;
    parts.isEntry = true;
    parts.severity = foreign.severity;
    parts.timeLength = foreign.time.length;
    parts.timeKey = foreign.timeKey;
    parts.hasDate = foreign.hasDate;
    parts.resolution = foreign.resolution;
    parts.message = foreign.message.start;
    return true;
}

LogLineParser::Parts LogLineParser::find(char const* line, int length, Beginnings* last) const
{
    Parts parts;
    if (!m_type.isForeign || !findForeign(line, length, parts))
        findOwn(line, length, last, parts);
    return parts;
}

QString LogLineParser::Text(QByteArray const& line) const
{
    return m_type.encoding.Decode(line.constData(), line.size());
}

bool LogLineParser::parseForeign(char const* line, int length, LogEntry& entry) const
{
    if (!m_type.isForeign)
        return false;
    const ForeignLine foreign = ForeignLine::Read(line, length, m_type.latest);
    if (!foreign.isEntry)
        return false;
    const LogEncoding encoding = m_type.encoding.narrowed();
    char const* const time = line + foreign.time.start;
    entry.isEntry = true;
    entry.severity = foreign.severity;
    entry.timeKey = foreign.timeKey;
    entry.hasDate = foreign.hasDate;
    entry.time = foreign.isEpoch ? ForeignLine::EpochText(time, foreign.time.length)
                                 : QString::fromLatin1(time, foreign.time.length);
    entry.message = encoding.Decode(line + foreign.message.start, foreign.message.length);
    if (foreign.isEscaped)
        entry.message = LogField::Unescaped(entry.message);
    entry.program = encoding.Decode(line + foreign.program.start, foreign.program.length);
    return true;
}

LogEntry LogLineParser::Parse(QByteArray const& line) const
{
    QByteArray buffer;
    char const* text = line.constData();
    int length = line.size();
    m_type.encoding.Narrow(text, length, buffer);

    LogEntry entry;
    if (parseForeign(text, length, entry))
        return entry;
    const Parts parts = FindOwn(text, length);
    const LogEncoding encoding = m_type.encoding.narrowed();
    entry.isEntry = parts.isEntry;
    entry.severity = parts.severity;
    entry.timeKey = parts.timeKey;
    entry.hasDate = parts.hasDate;
    entry.time = encoding.Decode(text, parts.timeLength);
    entry.elapsed = QString::fromLatin1(text + parts.elapsed, parts.elapsedLength);
    entry.message = encoding.Decode(text + parts.message, length - parts.message);
    return entry;
}

} // namespace Velocor
