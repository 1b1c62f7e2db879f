// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFileType.h"

#include "app/logfile/ForeignLine.h"
#include "app/logfile/LogLineParser.h"

namespace Velocor {

namespace {

constexpr int LeastTextPerControl = 20; // characters

// Whose format lines are in.
class Owner
{
public:
    Owner(LogLineParser const& parser, QDate const& modified)
        : m_parser(parser), m_modified(modified)
    {}

    void Ask(char const* line, int length)
    {
        const LogLineParser::Parts own = m_parser.FindOwn(line, length);
        const ForeignLine foreign = ForeignLine::Read(line, length, m_modified);
        isOwn = own.timeKey >= 0 && own.severity != LogEntry::None;
        // In an unknown date format, the log's own entries may look like others'.
        const bool isEither =
            own.severity != LogEntry::None &&
            (foreign.severity == LogEntry::None || foreign.severity == own.severity);
        m_isForeign = m_isForeign || (foreign.isSure && !isEither);
        m_mayBeOwn = m_mayBeOwn || own.isEntry;
        m_mayBeForeign = m_mayBeForeign || (foreign.isEntry && !own.isEntry);
    }

    // After all lines.
    bool isForeign() const { return !isOwn && (m_isForeign || (m_mayBeForeign && !m_mayBeOwn)); }
    bool mayBeOwn() const { return isOwn || (m_mayBeOwn && !m_isForeign); }

    bool isOwn = false; // no doubt

private:
    LogLineParser const& m_parser;
    QDate m_modified;
    bool m_isForeign = false;
    bool m_mayBeOwn = false;
    bool m_mayBeForeign = false;
};

// More than text has with the colors and the overwritten progress bars of terminals. A run of zeros
// counts once: after a power failure, a log may have a long one.
bool HasManyControls(QByteArray const& head)
{
    int controls = 0;
    char before = '\1';
    for (const char c : head) {
        const bool isText =
            static_cast<uchar>(c) >= 0x20 || (c >= '\a' && c <= '\r') || c == '\x1B';
        if (!isText && (c != '\0' || before != '\0'))
            ++controls;
        before = c;
    }
    return controls * LeastTextPerControl > head.size();
}

} // namespace

LogLineEnd LogFileType::lineEnd() const
{
    if (encoding.kind() == LogEncoding::Utf16Le)
        return LogLineEnd('\n', '\0', 2);
    if (encoding.kind() == LogEncoding::Utf16Be)
        return LogLineEnd('\0', '\n', 2);
    return isJournal ? LogLineEnd('\n', '\n', 1) : LogLineEnd();
}

bool LogFileType::IsLike(LogFileType const& other) const
{
    return encoding == other.encoding && isForeign == other.isForeign &&
           isJournal == other.isJournal;
}

LogFileType::Content LogFileType::ContentOf(QByteArray const& head, LogEncoding encoding)
{
    if (head.startsWith("\x1F\x8B\x08"))
        return Gzip;
    if (head.startsWith(QByteArray("\xFD"
                                   "7zXZ\0",
                                   6)))
        return Xz;
    if (head.startsWith("BZh") && head.mid(4, 6) == "1AY&SY")
        return Bzip2;
    if (head.startsWith("\x28\xB5\x2F\xFD"))
        return Zstd;
    return !encoding.isWide() && HasManyControls(head) ? Binary : Text;
}

LogFileType LogFileType::Of(QByteArray const& head, LogLineParser const& parser, LogEncoding chosen,
                            QDate const& modified)
{
    LogFileType type;
    type.latest = modified;
    const bool isChosen = chosen != LogEncoding::Automatic;
    if (parser.isOwn()) {
        type.isOwn = true;
        type.encoding = isChosen ? chosen : LogEncoding(LogEncoding::Latin1);
        return type;
    }
    const LogEncoding declared = isChosen ? chosen : LogEncoding::Declared(head);
    QByteArray buffer;
    char const* text = head.constData();
    int length = head.size();
    declared.Narrow(text, length, buffer);

    Owner owner(parser, modified);
    char const* const end = text + length;
    for (char const* at = text; at != end && !owner.isOwn;) {
        char const* const lineEnd = LogLineEnd().Find(at, end, 0, '\0');
        if (!lineEnd && head.size() < HeadSize)
            break; // it may become anything
        auto size = static_cast<int>((lineEnd ? lineEnd : end) - at);
        if (size > 0 && at[size - 1] == '\r')
            --size;
        owner.Ask(at, size);
        at = lineEnd ? lineEnd + 1 : end;
    }

    type.isOwn = owner.isOwn;
    type.isForeign = owner.isForeign();
    type.isJournal =
        type.isForeign && !declared.isWide() && ForeignLine::IsJournalExport(text, length);
    type.encoding = declared;
    if (declared == LogEncoding::Automatic)
        type.encoding =
            owner.mayBeOwn() ? LogEncoding(LogEncoding::Latin1) : LogEncoding::Detect(head);
    type.content = type.isOwn ? Text : ContentOf(head, type.encoding);
    return type;
}

} // namespace Velocor
