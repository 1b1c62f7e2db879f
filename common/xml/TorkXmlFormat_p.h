// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLayout.h"

#include <algorithm>
#include <cstddef>
#include <utility>

/// The formatting of both XML writers. For the writers' own sources.
///
/// The writers share no base class, so the rules are here once, as templates on the writer. Each
/// piece goes through the writer's virtual operations, so that a subclass sees it.
///
/// Fast paths are NeedsCData(), AppendAll(), the buffer in WriteTag() and the branch without
/// placeholders in CollectAttribute(). They are for the goal "document, against the floor" in
/// docs/performance.md, and tests/plain/tst_PlainWriters.cpp compares them with plain strings.
namespace TorkXmlFormat {

/// If the pending attributes and the next one reach this many characters, a new line starts.
constexpr int PendingLimit = 81;

// Callers balance the levels; one who does not must not cause undefined behavior.
inline qint32 Raised(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) + static_cast<quint32>(indent));
}

inline qint32 Lowered(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) - static_cast<quint32>(indent));
}

// The backslash is included, so that paths are easy to see; the apostrophe is not. No early return,
// so that compilers can vectorize the loop.
inline bool NeedsCData(QString const& value)
{
    ushort found = 0;
    for (QChar character : value) {
        const ushort unit = character.unicode();
        const int matches =
            (unit == '&') + (unit == '\\') + (unit == '>') + (unit == '<') + (unit == '"');
        found |= static_cast<ushort>(matches);
    }
    return found != 0;
}

template <std::size_t Size>
int Length(char const (&)[Size])
{
    return static_cast<int>(Size) - 1;
}

inline int Length(QString const& text)
{
    return text.length();
}

template <std::size_t Size>
QChar* Copy(char const (&text)[Size], QChar* to)
{
    for (std::size_t i = 0; i + 1 < Size; ++i)
        *to++ = QLatin1Char(text[i]);
    return to;
}

inline QChar* Copy(QString const& text, QChar* to)
{
    return std::copy_n(text.constData(), text.length(), to);
}

// Appends literals and texts after reserving space once. None of them is `text`.
template <class... Pieces>
void AppendAll(QString& text, Pieces const&... pieces)
{
    const int end = text.length();
    text.resize((end + ... + Length(pieces)));
    QChar* to = text.data() + end;
    ((to = Copy(pieces, to)), ...);
}

// Joins the tag in a buffer that is kept from tag to tag, so that nothing is allocated per tag. It
// is moved out during the call, as an overridden Write() may re-enter the writer.
template <class Writer, std::size_t StartSize, std::size_t EndSize>
int WriteTag(Writer& writer, TorkXmlLayout& layout, char const (&start)[StartSize],
             QString const& name, char const (&end)[EndSize])
{
    QString tag = std::move(layout.tag);
    tag.resize(0);
    AppendAll(tag, start, name, end);
    const int written = writer.Write(tag);
    layout.tag = std::move(tag);
    return written;
}

// Writes a copy, as an overridden Write() may re-enter the writer and change what is pending.
template <class Writer>
int WritePending(Writer& writer, TorkXmlLayout const& layout)
{
    const QString text = layout.pending;
    return writer.Write(text);
}

template <class Writer>
int CurrentIndent(Writer& writer, TorkXmlLayout const& layout)
{
    for (qint32 i = 0; i < layout.level; ++i)
        writer.Write(layout.unit);
    return TorkXmlResult::Success;
}

// A tag that raises the level: the start of an element.
template <class Writer, std::size_t EndSize>
int RaisingTag(Writer& writer, TorkXmlLayout& layout, QString const& name,
               char const (&end)[EndSize], int indent)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    writer.WriteCurrentIndent();
    if (WriteTag(writer, layout, "<", name, end) < 0)
        return TorkXmlResult::WriteFailed;
    layout.level = Raised(layout.level, indent);
    return TorkXmlResult::Success;
}

template <class Writer>
int ElementOpen(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return RaisingTag(writer, layout, name, " ", indent);
}

template <class Writer>
int ElementStart(Writer& writer, TorkXmlLayout& layout, QString const& name, int indent)
{
    return RaisingTag(writer, layout, name, ">\n", indent);
}

// The end of a start tag, preceded by the collected attributes.
template <class Writer>
int EndOfTag(Writer& writer, TorkXmlLayout& layout, QString const& name, QLatin1String end,
             int indent)
{
    if (name.isEmpty()) {
        layout.pending.resize(0);
        return TorkXmlResult::EmptyName;
    }

    layout.level = Lowered(layout.level, indent);
    layout.pending += end;
    if (WritePending(writer, layout) < 0)
        return TorkXmlResult::WriteFailed;
    layout.pending.resize(0);
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
    writer.WriteCurrentIndent();
    if (WriteTag(writer, layout, "</", name, ">\n") < 0)
        return TorkXmlResult::WriteFailed;
    return TorkXmlResult::Success;
}

template <class Writer>
int Element(Writer& writer, TorkXmlLayout& layout, QString const& name, QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;
    if (value.isEmpty())
        return TorkXmlResult::Success;

    if (const int result = writer.WriteCurrentIndent())
        return result;
    if (WriteTag(writer, layout, "<", name, ">") < 0)
        return TorkXmlResult::WriteFailed;
    if (const int result = writer.WriteElementValue(value))
        return result;
    if (WriteTag(writer, layout, "</", name, ">\n") < 0)
        return TorkXmlResult::WriteFailed;
    return TorkXmlResult::Success;
}

template <class Writer>
int ElementValue(Writer& writer, QString const& value)
{
    if (value.isEmpty())
        return TorkXmlResult::Success;

    if (NeedsCData(value))
        writer.Write(QLatin1String("<![CDATA[") + value + QLatin1String("]]>"));
    else
        writer.Write(value);
    return TorkXmlResult::Success;
}

// Appends an attribute to the pending ones, or starts a new line with it.
template <class Writer, class... Pieces>
void Collect(Writer& writer, TorkXmlLayout& layout, Pieces const&... pieces)
{
    if ((layout.pending.length() + ... + Length(pieces)) < PendingLimit) {
        AppendAll(layout.pending, " ", pieces...);
        return;
    }

    // The attribute is then at column 0, without a space before it.
    layout.pending += QLatin1Char('\n');
    WritePending(writer, layout);
    layout.pending.resize(0);
    AppendAll(layout.pending, pieces...);
}

// Arguments are substituted one at a time, for compatibility: a name that contains a placeholder
// gets the value in its place. Any other name needs no placeholders.
template <class Writer>
int CollectAttribute(Writer& writer, TorkXmlLayout& layout, QString const& name,
                     QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    if (std::find(name.begin(), name.end(), QLatin1Char('%')) == name.end())
        Collect(writer, layout, name, "=\"", value, "\"");
    else
        Collect(writer, layout,
                QStringLiteral("%1=\"%2\"").arg(name).arg(value)); // clazy:exclude=qstring-arg
    return TorkXmlResult::Success;
}

} // namespace TorkXmlFormat
