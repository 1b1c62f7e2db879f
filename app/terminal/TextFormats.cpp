// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/TextFormats.h"

#include "app/history/HistoryTime.h"

#include <QStringList>

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

constexpr QLatin1Char Quote('"');

// Those with a short name in JSON, and their names.
constexpr char const* JsonEscaped = "\"\\\b\f\n\r\t";
constexpr char const* JsonNames = "\"\\bfnrt";

// What turns the rest of a line around, or ends it, without being seen.
bool ReordersLine(ushort code)
{
    return (code >= 0x202a && code <= 0x202e) || (code >= 0x2066 && code <= 0x2069) ||
           code == 0x2028 || code == 0x2029;
}

} // namespace

QByteArray TextFormats::CsvRecord(QVector<QString> const& fields)
{
    QStringList quoted;
    for (QString field : fields)
        quoted.append(Quote + field.replace(Quote, QLatin1String("\"\"")) + Quote);
    return quoted.join(QLatin1Char(',')).toUtf8() + "\r\n";
}

QString TextFormats::JsonText(QString const& text)
{
    QString json(Quote);
    for (QChar c : text) {
        char const* const named =
            c.unicode() < 0x80 && !c.isNull() ? std::strchr(JsonEscaped, c.toLatin1()) : nullptr;
        if (named)
            json += QLatin1Char('\\') + QLatin1Char(JsonNames[named - JsonEscaped]);
        else if (c.unicode() < 0x20)
            json += QStringLiteral("\\u%1").arg(c.unicode(), 4, 16, QLatin1Char('0'));
        else
            json += c;
    }
    return json + Quote;
}

QByteArray TextFormats::JsonLine(QVector<QPair<char const*, QString>> const& members)
{
    QStringList texts;
    for (QPair<char const*, QString> const& member : members)
        texts.append(JsonText(QString::fromLatin1(member.first)) + QLatin1Char(':') +
                     member.second);
    return '{' + texts.join(QLatin1Char(',')).toUtf8() + "}\n";
}

QByteArray TextFormats::MarkdownBlock(QByteArray const& lines)
{
    int longest = 0;
    int length = 0;
    for (char c : lines) {
        length = c == '`' ? length + 1 : 0;
        longest = std::max(longest, length);
    }
    const QByteArray fence(std::max(3, longest + 1), '`');
    return fence + '\n' + lines + fence + '\n';
}

QString TextFormats::Harmless(QString text)
{
    for (QChar& c : text) {
        const ushort code = c.unicode();
        if (code < 0x20 && code != '\t')
            c = QChar(0x2400 + code);
        else if (code == 0x7f)
            c = QChar(0x2421);
        else if ((code >= 0x80 && code < 0xa0) || ReordersLine(code))
            c = QChar(QChar::ReplacementCharacter);
    }
    return text;
}

QString TextFormats::Time(qint64 time)
{
    // Other programs read it, so the digits must not be those of the locale.
    return HistoryTime::DateTime(time).isValid() ? QString::fromLatin1(HistoryTime::Text(time))
                                                 : QString();
}

} // namespace Velocor
