// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/RequiredLiterals.h"

#include "app/logfile/AsciiCharacters.h"

#include <cstring>

namespace Velocor {

namespace {

bool IsOneOf(QChar c, char const* characters)
{
    const char latin1 = c.toLatin1(); // 0 if there is none
    return latin1 != '\0' && std::strchr(characters, latin1);
}

bool IsDigit(QChar c)
{
    return IsAsciiDigit(c.toLatin1());
}

bool IsLetterOrDigit(QChar c)
{
    return IsDigit(c) || IsAsciiLetter(c.toLatin1());
}

bool IsPrintableAscii(QChar c)
{
    return c >= QLatin1Char(' ') && c <= QLatin1Char('~');
}

class ExpressionReader
{
public:
    explicit ExpressionReader(QString const& expression) : m_expression(expression) {}

    // Whether all of it was understood; only then the literals are valid.
    bool Read()
    {
        while (m_at < m_expression.size()) {
            if (!readNext())
                return false;
        }
        endLiteral();
        return m_depth == 0;
    }

    QStringList literals;

private:
    // The null character at the end of the expression. One within it is not understood either,
    // except as a literal.
    QChar peek(int ahead) const
    {
        return m_at + ahead < m_expression.size() ? m_expression.at(m_at + ahead) : QChar();
    }

    bool readNext()
    {
        const QChar c = m_expression.at(m_at);
        switch (c.unicode()) {
        case '|':
            ++m_at;
            return m_depth > 0;
        case '(':
            return readGroup();
        case ')':
            ++m_at;
            return --m_depth >= 0;
        case '[':
            return readClass();
        case '\\':
            return readEscape();
        case '{':
            return readBrace();
        case '*':
        case '?':
            ++m_at;
            dropLast();
            return true;
        case '+':
        case '.':
        case '^':
        case '$':
            ++m_at;
            endLiteral();
            return true;
        default:
            ++m_at;
            append(c);
            return true;
        }
    }

    void append(QChar c)
    {
        if (m_depth == 0)
            m_literal += c;
    }

    void endLiteral()
    {
        if (!m_literal.isEmpty())
            literals.append(m_literal);
        m_literal.clear();
    }

    // The last character may be missing in a match.
    void dropLast()
    {
        const int size = m_literal.size();
        const bool isPair = size > 1 && m_literal.at(size - 1).isLowSurrogate() &&
                            m_literal.at(size - 2).isHighSurrogate();
        m_literal.chop(isPair ? 2 : 1);
        endLiteral();
    }

    // Comments, options, conditions, recursion and verbs are not understood.
    bool readGroup()
    {
        endLiteral();
        ++m_depth;
        ++m_at;
        if (peek(0) == QLatin1Char('*'))
            return false;
        if (peek(0) != QLatin1Char('?'))
            return true;
        if (IsOneOf(peek(1), ":=!>|")) {
            m_at += 2;
            return true;
        }
        if (peek(1) != QLatin1Char('<'))
            return false;
        m_at += 2;
        if (IsOneOf(peek(0), "=!")) {
            ++m_at;
            return true;
        }
        return readName();
    }

    bool readName()
    {
        int length = 0;
        while (IsLetterOrDigit(peek(length)) || peek(length) == QLatin1Char('_'))
            ++length;
        const bool isName = length > 0 && peek(length) == QLatin1Char('>');
        m_at += length + 1;
        return isName;
    }

    bool readClass()
    {
        endLiteral();
        ++m_at;
        if (peek(0) == QLatin1Char('^'))
            ++m_at;
        if (peek(0) == QLatin1Char(']'))
            ++m_at; // as the first one, it does not end the class
        while (peek(0) != QLatin1Char(']')) {
            const bool isEscape = peek(0) == QLatin1Char('\\');
            if (m_at >= m_expression.size() || (isEscape && IsOneOf(peek(1), "cQE")) ||
                (peek(0) == QLatin1Char('[') && IsOneOf(peek(1), ":.=")))
                return false;
            m_at += isEscape ? 2 : 1;
        }
        ++m_at;
        return true;
    }

    bool readEscape()
    {
        const QChar c = peek(1);
        m_at += 2;
        if (c == QLatin1Char('Q')) {
            readQuoted();
        } else if (c == QLatin1Char('E')) {
            // Without a \Q it has no meaning, not even to a quantifier after it.
        } else if (IsPrintableAscii(c) && !IsLetterOrDigit(c)) {
            append(c);
        } else if (IsOneOf(c, "AaBbCDdefGHhKnNRrSstVvWwXZz")) {
            endLiteral();
            return c != QLatin1Char('N') || peek(0) != QLatin1Char('{');
        } else {
            return false; // what follows may be part of it
        }
        return true;
    }

    void readQuoted()
    {
        const int end = m_expression.indexOf(QLatin1String("\\E"), m_at);
        const int length = (end < 0 ? m_expression.size() : end) - m_at;
        for (int i = 0; i < length; ++i)
            append(peek(i));
        m_at += length + (end < 0 ? 0 : 2);
    }

    // A quantifier, or a brace that no version of the library takes for the start of one.
    bool readBrace()
    {
        ++m_at;
        if (!IsDigit(peek(0)) && !IsOneOf(peek(0), ", \t")) {
            append(QLatin1Char('{'));
            return true;
        }
        bool isOptional = true;
        for (; IsDigit(peek(0)); ++m_at)
            isOptional = isOptional && peek(0) == QLatin1Char('0');
        if (!IsDigit(peek(-1)))
            return false;
        if (peek(0) == QLatin1Char(',')) {
            ++m_at;
            while (IsDigit(peek(0)))
                ++m_at;
        }
        if (isOptional)
            dropLast();
        else
            endLiteral();
        return m_at < m_expression.size() && m_expression.at(m_at++) == QLatin1Char('}');
    }

    QString m_expression;
    QString m_literal; // at the end of what was read
    int m_at = 0;
    int m_depth = 0; // of groups
};

} // namespace

QStringList RequiredLiterals(QString const& expression)
{
    ExpressionReader reader(expression);
    return reader.Read() ? reader.literals : QStringList();
}

} // namespace Velocor
