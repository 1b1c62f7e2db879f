// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLayout.h"

#include <cstring>
#include <typeinfo>
#include <utility>

/// The formatting of both XML writers. For the writers' own sources.
///
/// The writers share no base class, so the rules stand here once, as templates over the writer.
/// Every piece goes through the writer's virtual operations, so that a subclass which overrides
/// Write() redirects all output. Where no subclass can see it, a line goes out as a whole.
namespace TorkXmlFormat {

/// Pending attributes together with one more stay below this many characters, or a line ends.
constexpr int PendingLimit = 81;

// Callers balance the levels; one who does not must not run into undefined behaviour.
inline qint32 Raised(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) + static_cast<quint32>(indent));
}

inline qint32 Lowered(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) - static_cast<quint32>(indent));
}

// The backslash is one of them, so that paths stand out; the apostrophe is not. Looks at all
// characters without stopping, several at once: a third of the time.
inline bool NeedsCData(QString const& value)
{
    bool found = false;
    for (QChar character : value) {
        const ushort unit = character.unicode();
        // cppcheck-suppress bitwiseOnBoolean ; without a jump
        found |= (unit == '&') | (unit == '\\') | (unit == '>') | (unit == '<') | (unit == '"');
    }
    return found;
}

// Empties a text but keeps its memory: allocating one for every tag took a third of the time.
inline void Empty(QString& text)
{
    text.resize(0);
}

inline int Length(QLatin1String text)
{
    return text.size();
}

inline int Length(QString const& text)
{
    return text.length();
}

inline QChar* Copy(QChar* to, QLatin1String text)
{
    for (char character : text)
        *to++ = QLatin1Char(character);
    return to;
}

inline QChar* Copy(QChar* to, QString const& text)
{
    std::memcpy(to, text.constData(), size_t(text.length()) * sizeof(QChar));
    return to + text.length();
}

// Appends all pieces after making room once: half the time of one after another.
template <class... Pieces>
void AppendAll(QString& text, Pieces const&... pieces)
{
    const int end = text.length();
    text.resize((end + ... + Length(pieces)));
    QChar* to = text.data() + end;
    ((to = Copy(to, pieces)), ...);
}

// Whether a line may go out as a whole, which takes a third of the time of its pieces: no subclass
// looks at the pieces, and the stream neither pads each nor complains about each.
template <class Writer>
bool GoesOutAsWhole(Writer& writer, TorkXmlLayout const& layout)
{
    const bool isSubclass = typeid(writer) != typeid(Writer);
    return !isSubclass && writer.device() && writer.fieldWidth() == 0 && layout.level < 1000;
}

template <class Writer, class... Pieces>
void WriteWhole(Writer& writer, TorkXmlLayout& layout, Pieces const&... pieces)
{
    QString line = std::move(layout.piece);
    Empty(line);
    for (qint32 i = 0; i < layout.level; ++i)
        line += layout.unit;
    AppendAll(line, pieces...);
    writer.Write(line);
    layout.piece = std::move(line);
}

// Joins up to three pieces and writes them as one. The text is made in memory that is kept from tag
// to tag; it is taken away meanwhile, as an overridden Write() may come back here.
template <class Writer>
int WriteJoined(Writer& writer, TorkXmlLayout& layout, QLatin1String start, QString const& middle,
                QLatin1String end)
{
    QString piece = std::move(layout.piece);
    Empty(piece);
    AppendAll(piece, start, middle, end);
    const int written = writer.Write(piece);
    layout.piece = std::move(piece);
    return written;
}

// Names are so short that the toolkit's search takes longer to begin than to end.
inline bool HoldsPlaceholder(QString const& name)
{
    for (QChar character : name) {
        if (character == QLatin1Char('%'))
            return true;
    }
    return false;
}

// Filled one after another: a name that holds a placeholder takes the value in its place.
inline QString FilledAttribute(QString const& name, QString const& value)
{
    return QStringLiteral("%1=\"%2\"").arg(name).arg(value); // clazy:exclude=qstring-arg
}

inline int AttributeLength(QString const& name, QString const& value)
{
    return name.length() + value.length() + 3;
}

template <class Writer>
int CurrentIndent(Writer& writer, TorkXmlLayout const& layout)
{
    for (qint32 i = 0; i < layout.level; ++i)
        writer.Write(layout.unit);
    return TorkXmlResult::Success;
}

// A tag on a line of its own. Returns what Write() says of the tag.
template <class Writer>
int WriteTag(Writer& writer, TorkXmlLayout& layout, QLatin1String start, QString const& name,
             QLatin1String end)
{
    if (GoesOutAsWhole(writer, layout)) {
        WriteWhole(writer, layout, start, name, end);
        return 0;
    }
    writer.WriteCurrentIndent();
    return WriteJoined(writer, layout, start, name, end);
}

// A tag that raises the level behind it: the start of an element.
template <class Writer>
int RaisingTag(Writer& writer, TorkXmlLayout& layout, QString const& name, QLatin1String end,
               int indent)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    if (WriteTag(writer, layout, QLatin1String("<"), name, end) < 0)
        return TorkXmlResult::WriteFailed;
    layout.level = Raised(layout.level, indent);
    return TorkXmlResult::Success;
}

template <class Writer>
int ElementOpen(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return RaisingTag(writer, layout, name, QLatin1String(" "), indent);
}

template <class Writer>
int ElementStart(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return RaisingTag(writer, layout, name, QLatin1String(">\n"), indent);
}

// The end of a start tag, with the attributes collected so far before it.
template <class Writer>
int EndOfTag(Writer& writer, TorkXmlLayout& layout, QString const& name, QLatin1String end,
             int indent)
{
    if (name.isEmpty()) {
        Empty(layout.pending);
        return TorkXmlResult::EmptyName;
    }

    layout.level = Lowered(layout.level, indent);
    layout.pending += end;
    if (writer.Write(layout.pending) < 0)
        return TorkXmlResult::WriteFailed;
    Empty(layout.pending);
    return TorkXmlResult::Success;
}

template <class Writer>
int ElementClose(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return EndOfTag(writer, layout, name, QLatin1String(">\n"), indent);
}

template <class Writer>
int ElementCloseAndEnd(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return EndOfTag(writer, layout, name, QLatin1String("/>\n"), indent);
}

template <class Writer>
int ElementEnd(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    layout.level = Lowered(layout.level, indent);
    if (WriteTag(writer, layout, QLatin1String("</"), name, QLatin1String(">\n")) < 0)
        return TorkXmlResult::WriteFailed;
    return TorkXmlResult::Success;
}

template <class Writer>
void WriteWholeElement(Writer& writer, TorkXmlLayout& layout, QString const& name,
                       QString const& value)
{
    const QLatin1String start("<");
    const QLatin1String end(">\n");
    if (NeedsCData(value))
        WriteWhole(writer, layout, start, name, QLatin1String("><![CDATA["), value,
                   QLatin1String("]]></"), name, end);
    else
        WriteWhole(writer, layout, start, name, QLatin1String(">"), value, QLatin1String("</"),
                   name, end);
}

template <class Writer>
int Element(Writer& writer, TorkXmlLayout& layout, QString const& name, QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;
    if (value.isEmpty())
        return TorkXmlResult::Success;
    if (GoesOutAsWhole(writer, layout)) {
        WriteWholeElement(writer, layout, name, value);
        return TorkXmlResult::Success;
    }

    if (const int result = writer.WriteCurrentIndent())
        return result;
    if (WriteJoined(writer, layout, QLatin1String("<"), name, QLatin1String(">")) < 0)
        return TorkXmlResult::WriteFailed;
    if (const int result = writer.WriteElementValue(value))
        return result;
    if (WriteJoined(writer, layout, QLatin1String("</"), name, QLatin1String(">\n")) < 0)
        return TorkXmlResult::WriteFailed;
    return TorkXmlResult::Success;
}

template <class Writer>
int ElementValue(Writer& writer, TorkXmlLayout& layout, QString const& value)
{
    if (value.isEmpty())
        return TorkXmlResult::Success;

    if (NeedsCData(value))
        WriteJoined(writer, layout, QLatin1String("<![CDATA["), value, QLatin1String("]]>"));
    else
        writer.Write(value);
    return TorkXmlResult::Success;
}

// What follows stands at column 0, without a blank before it.
template <class Writer>
void EndPendingLine(Writer& writer, TorkXmlLayout& layout)
{
    layout.pending += QLatin1Char('\n');
    writer.Write(layout.pending);
    Empty(layout.pending);
}

template <class Writer>
int CollectAttribute(Writer& writer, TorkXmlLayout& layout, QString const& name,
                     QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    const bool needsFilling = HoldsPlaceholder(name);
    const QString filled = needsFilling ? FilledAttribute(name, value) : QString();
    const int length = needsFilling ? filled.length() : AttributeLength(name, value);

    const bool fits = length + layout.pending.length() < PendingLimit;
    if (!fits)
        EndPendingLine(writer, layout);

    const QLatin1String blank(fits ? " " : "");
    if (needsFilling)
        AppendAll(layout.pending, blank, filled);
    else
        AppendAll(layout.pending, blank, name, QLatin1String("=\""), value, QLatin1String("\""));
    return TorkXmlResult::Success;
}

} // namespace TorkXmlFormat
