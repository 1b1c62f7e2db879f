// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLayout.h"

#include <algorithm>

/// The formatting of both XML writers. For the writers' own sources.
///
/// The writers share no base class, so the rules are here once, as templates over the writer. Every
/// piece goes through the writer's virtual operations, one by one, so that a subclass sees each.
namespace TorkXmlFormat {

/// Pending attributes together with one more stay below this many characters, or a line ends.
constexpr int PendingLimit = 81;

// Callers balance the levels; one who does not must not run into undefined behavior.
inline qint32 Raised(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) + static_cast<quint32>(indent));
}

inline qint32 Lowered(qint32 level, int indent)
{
    return static_cast<qint32>(static_cast<quint32>(level) - static_cast<quint32>(indent));
}

// The backslash is one of them, so that paths stand out; the apostrophe is not.
inline bool NeedsCData(QString const& value)
{
    return std::any_of(value.begin(), value.end(), [](QChar character) {
        const ushort unit = character.unicode();
        return unit == '&' || unit == '\\' || unit == '>' || unit == '<' || unit == '"';
    });
}

template <class Writer>
int CurrentIndent(Writer& writer, TorkXmlLayout const& layout)
{
    for (qint32 i = 0; i < layout.level; ++i)
        writer.Write(layout.unit);
    return TorkXmlResult::Success;
}

// A tag that raises the level after it: the start of an element.
template <class Writer>
int RaisingTag(Writer& writer, TorkXmlLayout& layout, QString const& name, QLatin1String end,
               int indent)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    writer.WriteCurrentIndent();
    if (writer.Write(QLatin1Char('<') + name + end) < 0)
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
        layout.pending = QLatin1String("");
        return TorkXmlResult::EmptyName;
    }

    layout.level = Lowered(layout.level, indent);
    layout.pending += end;
    if (writer.Write(layout.pending) < 0)
        return TorkXmlResult::WriteFailed;
    layout.pending = QLatin1String("");
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
    if (writer.Write(QLatin1String("</") + name + QLatin1String(">\n")) < 0)
        return TorkXmlResult::WriteFailed;
    return TorkXmlResult::Success;
}

template <class Writer>
int Element(Writer& writer, QString const& name, QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;
    if (value.isEmpty())
        return TorkXmlResult::Success;

    if (const int result = writer.WriteCurrentIndent())
        return result;
    if (writer.Write(QLatin1Char('<') + name + QLatin1Char('>')) < 0)
        return TorkXmlResult::WriteFailed;
    if (const int result = writer.WriteElementValue(value))
        return result;
    if (writer.Write(QLatin1String("</") + name + QLatin1String(">\n")) < 0)
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

// Filled one after another: a name that holds a placeholder takes the value in its place. For any
// other the result is the same without the search for placeholders.
inline QString FilledAttribute(QString const& name, QString const& value)
{
    if (name.contains(QLatin1Char('%')))
        return QStringLiteral("%1=\"%2\"").arg(name).arg(value); // clazy:exclude=qstring-arg
    return name + QLatin1String("=\"") + value + QLatin1Char('"');
}

template <class Writer>
int CollectAttribute(Writer& writer, TorkXmlLayout& layout, QString const& name,
                     QString const& value)
{
    if (name.isEmpty())
        return TorkXmlResult::EmptyName;

    const QString attribute = FilledAttribute(name, value);
    if (attribute.length() + layout.pending.length() < PendingLimit) {
        layout.pending += QLatin1Char(' ') + attribute;
        return TorkXmlResult::Success;
    }

    // The attribute is then at column 0, without a blank before it.
    layout.pending += QLatin1Char('\n');
    writer.Write(layout.pending);
    layout.pending = attribute;
    return TorkXmlResult::Success;
}

} // namespace TorkXmlFormat
