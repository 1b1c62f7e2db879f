// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFields.h"

#include <cstring>

namespace Velocor {

namespace {

bool IsWhitespace(char c)
{
    return c == ' ' || c == '\t' || c == '\r' || c == '\n';
}

QChar Unescaped(QChar escape)
{
    switch (escape.toLatin1()) {
    case 'n':
        return QLatin1Char('\n');
    case 't':
        return QLatin1Char('\t');
    case 'r':
        return QLatin1Char('\r');
    case 'b':
        return QLatin1Char('\b');
    case 'f':
        return QLatin1Char('\f');
    case '"':
    case '\\':
    case '/':
        return escape;
    default:
        return QChar();
    }
}

} // namespace

QString LogField::Unescaped(QString const& text)
{
    QString result;
    result.reserve(text.size());
    for (int at = 0; at < text.size(); ++at) {
        if (text.at(at) != QLatin1Char('\\') || at + 1 == text.size()) {
            result += text.at(at);
            continue;
        }
        const QChar escape = text.at(at + 1);
        bool isNumber = false;
        const ushort unit = text.mid(at + 2, 4).toUShort(&isNumber, 16);
        if (escape == QLatin1Char('u') && isNumber && at + 6 <= text.size()) {
            result += QChar(unit);
            at += 5;
        } else if (!Velocor::Unescaped(escape).isNull()) {
            result += Velocor::Unescaped(escape);
            ++at;
        } else {
            result += text.at(at);
        }
    }
    return result;
}

JsonFields::JsonFields(char const* text, int length) : m_text(text), m_length(length)
{
    skipBlanks();
    if (m_at < m_length && m_text[m_at] == '{')
        ++m_at;
    else
        m_at = m_length;
}

void JsonFields::skipBlanks()
{
    while (m_at < m_length && IsWhitespace(m_text[m_at]))
        ++m_at;
}

// Reads a string without its quotation marks. Returns false if there is none or it is cut.
bool JsonFields::readString(int& start, int& length, bool& isEscaped)
{
    isEscaped = false;
    if (m_at == m_length || m_text[m_at] != '"')
        return false;
    start = ++m_at;
    for (; m_at < m_length; ++m_at) {
        if (m_text[m_at] == '"') {
            length = m_at++ - start;
            return true;
        }
        if (m_text[m_at] == '\\') {
            isEscaped = true;
            ++m_at;
        }
    }
    m_at = m_length;
    return false;
}

// Leaves the object or array that starts here; brackets in strings do not count.
void JsonFields::skipNested()
{
    int depth = 0;
    while (m_at < m_length) {
        const char c = m_text[m_at];
        if (c == '"') {
            int start = 0;
            int length = 0;
            bool isEscaped = false;
            readString(start, length, isEscaped);
            continue;
        }
        ++m_at;
        if (c == '{' || c == '[')
            ++depth;
        else if ((c == '}' || c == ']') && --depth == 0)
            return;
    }
}

// Reads `{"$date":"..."}`; at anything else, nothing.
bool JsonFields::readDate(LogField& field)
{
    constexpr char const Wrapper[] = "$date";
    const int before = m_at++;
    int name = 0;
    int nameLength = 0;
    bool isEscaped = false;
    skipBlanks();
    const bool isDate = readString(name, nameLength, isEscaped) &&
                        nameLength + 1 == static_cast<int>(sizeof Wrapper) &&
                        std::memcmp(m_text + name, Wrapper, sizeof Wrapper - 1) == 0;
    skipBlanks();
    if (isDate && m_at < m_length && m_text[m_at] == ':') {
        ++m_at;
        skipBlanks();
        if (readString(field.value, field.valueLength, field.isEscaped)) {
            m_at = before;
            skipNested();
            return true;
        }
    }
    m_at = before;
    return false;
}

bool JsonFields::Next(LogField& field)
{
    for (;;) {
        skipBlanks();
        if (m_at < m_length && m_text[m_at] == ',') {
            ++m_at;
            skipBlanks();
        }
        int name = 0;
        if (!readString(name, field.nameLength, field.isEscaped))
            return false;
        field.name = m_text + name;
        skipBlanks();
        if (m_at == m_length || m_text[m_at] != ':')
            return false;
        ++m_at;
        skipBlanks();
        if (m_at == m_length)
            return false;
        if (m_text[m_at] == '"')
            return readString(field.value, field.valueLength, field.isEscaped);
        if (m_text[m_at] == '{' && readDate(field))
            return true;
        if (m_text[m_at] == '{' || m_text[m_at] == '[') {
            skipNested();
            continue;
        }
        field.isEscaped = false;
        field.value = m_at;
        while (m_at < m_length && m_text[m_at] != ',' && m_text[m_at] != '}' &&
               !IsWhitespace(m_text[m_at]))
            ++m_at;
        field.valueLength = m_at - field.value;
        return true;
    }
}

bool LogfmtFields::Next(LogField& field)
{
    while (m_at < m_length && IsWhitespace(m_text[m_at]))
        ++m_at;
    const int name = m_at;
    while (m_at < m_length && m_text[m_at] != '=' && !IsWhitespace(m_text[m_at]))
        ++m_at;
    if (m_at == m_length || m_text[m_at] != '=' || m_at == name)
        return false;
    field.name = m_text + name;
    field.nameLength = m_at - name;
    field.isEscaped = false;
    const bool isQuoted = m_at + 1 < m_length && m_text[m_at + 1] == '"';
    m_at += isQuoted ? 2 : 1;
    field.value = m_at;
    while (m_at < m_length && (isQuoted ? m_text[m_at] != '"' : !IsWhitespace(m_text[m_at]))) {
        const bool isEscape = isQuoted && m_text[m_at] == '\\' && m_at + 1 < m_length;
        field.isEscaped = field.isEscaped || isEscape;
        m_at += isEscape ? 2 : 1;
    }
    field.valueLength = m_at - field.value;
    if (isQuoted && m_at < m_length)
        ++m_at;
    return true;
}

bool JournalFields::Next(LogField& field)
{
    while (m_at < m_length && m_text[m_at] == '\n')
        ++m_at;
    if (m_at == m_length)
        return false;
    char const* const start = m_text + m_at;
    const auto left = static_cast<size_t>(m_length - m_at);
    auto const* lineEnd = static_cast<char const*>(std::memchr(start, '\n', left));
    const int length = lineEnd ? static_cast<int>(lineEnd - start) : m_length - m_at;
    auto const* equals =
        static_cast<char const*>(std::memchr(start, '=', static_cast<size_t>(length)));
    field.isEscaped = false;
    field.name = start;
    field.nameLength = equals ? static_cast<int>(equals - start) : length;
    m_at += length;
    if (!equals)
        return readSized(field);
    field.value = m_at - length + field.nameLength + 1;
    field.valueLength = m_at - field.value;
    return true;
}

// After the name: a line feed, the size with its lowest byte first, and the value.
bool JournalFields::readSized(LogField& field)
{
    constexpr int SizeBytes = 8;
    if (m_length - m_at < 1 + SizeBytes)
        return false;
    quint64 size = 0;
    for (int i = SizeBytes; i > 0; --i)
        size = size << 8 | static_cast<unsigned char>(m_text[m_at + i]);
    m_at += 1 + SizeBytes;
    if (size > static_cast<quint64>(m_length - m_at))
        return false;
    field.value = m_at;
    field.valueLength = static_cast<int>(size);
    m_at += field.valueLength;
    return true;
}

} // namespace Velocor
