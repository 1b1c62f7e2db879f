// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigText.h"

#include "common/config/TorkConfigEscapes_p.h"
#include "common/log/TorkEmptyText_p.h"

namespace {

constexpr QLatin1Char ValueEscape('\\');
constexpr QLatin1Char NameEscape('_');
constexpr int HexDigits = 4;

bool IsDigit(QChar character)
{
    return character >= QLatin1Char('0') && character <= QLatin1Char('9');
}

bool IsLetter(QChar character)
{
    return (character >= QLatin1Char('a') && character <= QLatin1Char('z')) ||
           (character >= QLatin1Char('A') && character <= QLatin1Char('Z'));
}

// "]" could end a CDATA section, "%" could be a placeholder, and the others are markup.
bool StaysInValue(QChar character)
{
    return character >= QLatin1Char(' ') && character <= QLatin1Char('~') &&
           !QStringLiteral("%&'<>\"]\\").contains(character);
}

// A colon would end a namespace prefix.
bool StaysInName(QChar character, bool isFirst)
{
    if (isFirst || IsLetter(character))
        return IsLetter(character);

    return IsDigit(character) || character == QLatin1Char('.') || character == QLatin1Char('-');
}

// Whether saving would substitute something at this "%": a line has the placeholders %1 to %3, and
// placeholder numbers have up to two digits.
bool IsPlaceholder(QString const& text, int percent)
{
    int i = percent + 1;
    if (i < text.length() && text.at(i) == QLatin1Char('L'))
        ++i;
    int number = 0;
    const int first = i;
    for (; i < text.length() && i < first + 2 && IsDigit(text.at(i)); ++i)
        number = 10 * number + text.at(i).digitValue();
    return i > first && number <= 3;
}

QString Escaped(QLatin1Char escape, QChar character)
{
    return escape + QStringLiteral("u%1").arg(character.unicode(), HexDigits, 16, QLatin1Char('0'));
}

using Encoder = QString (*)(QString const&);

// Each text has exactly one encoding; anything else that looks like one was not encoded here.
QString Decoded(Encoder encode, QLatin1Char escape, QString const& encoded, bool* ok)
{
    // The escape character alone is the empty text.
    const QString text = encoded == escape ? TorkEmptyText() : TorkUnescaped(escape, encoded);
    const bool isEncoding = encode(text) == encoded;
    if (ok)
        *ok = isEncoding;
    return isEncoding ? text : encoded;
}

} // namespace

bool TorkConfigText::IsPlainValue(QString const& text)
{
    for (int i = 0; i < text.length(); ++i) {
        const QChar character = text.at(i);
        if (character > QChar(0x7f) || (character == QLatin1Char('%') && IsPlaceholder(text, i)))
            return false;
    }
    return !text.isEmpty() && !text.contains(QLatin1String("]]>"));
}

bool TorkConfigText::IsPlainName(QString const& text)
{
    for (int i = 0; i < text.length(); ++i) {
        if (text.at(i) != NameEscape && !StaysInName(text.at(i), i == 0))
            return false;
    }
    return !text.isEmpty();
}

QString TorkConfigText::EncodeValue(QString const& text)
{
    if (text.isEmpty())
        return QString(ValueEscape);

    QString encoded;
    for (QChar character : text) {
        if (StaysInValue(character))
            encoded += character;
        else
            encoded += Escaped(ValueEscape, character);
    }
    return encoded;
}

QString TorkConfigText::DecodeValue(QString const& encoded, bool* ok)
{
    return Decoded(EncodeValue, ValueEscape, encoded, ok);
}

QString TorkConfigText::EncodeName(QString const& text)
{
    if (text.isEmpty())
        return QString(NameEscape);

    const bool isRoot = text == QLatin1String("VelocorSettings");
    QString encoded;
    for (QChar character : text) {
        const bool isFirst = encoded.isEmpty();
        if (StaysInName(character, isFirst) && !(isFirst && isRoot))
            encoded += character;
        else
            encoded += Escaped(NameEscape, character);
    }
    return encoded;
}

QString TorkConfigText::DecodeName(QString const& encoded, bool* ok)
{
    return Decoded(EncodeName, NameEscape, encoded, ok);
}
