// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <vector>

namespace Velocor {

/// Reads the time stamps of log entries that were written in one date format.
///
/// A format is taken apart once; reading a stamp then costs some ten nanoseconds, which matters in
/// files of a million lines. Any thread; reading changes nothing.
///
///     LogTimeReader reader("yyyy-MM-dd hh:mm:ss.z");
///     LogTimeReader::Stamp stamp = reader.Read(line, length);
///     if (stamp.length >= 0 && stamp.key < previous.key)
///         ...; // the clock or the file went back
class LogTimeReader
{
public:
    /// A stamp that was read.
    struct Stamp
    {
        int length = -1; ///< bytes that the stamp takes; -1 if there is none
        qint64 key = -1; ///< grows with time; -1 if the format tells no time of day
    };

    /// @param format  a date format as QDateTime::toString() understands it
    explicit LogTimeReader(QString const& format);

    /// Reads the stamp at the start of a line, in Latin-1.
    Stamp Read(char const* text, int length) const;

    /// Whether stamps tell year, month and day; those of the others start anew at midnight.
    bool hasDate() const { return m_hasDate; }

private:
    enum Field { Literal, Year, ShortYear, Month, Day, Hour, Minute, Second, Fraction, HalfDay };
    enum Kind { Exactly, Number, MonthName, Word };

    struct Token
    {
        Kind kind;
        Field field;
        int minimum;
        int maximum;
        QByteArray text;
    };

    struct Values;

    void parseFormat(QString const& format);
    void addLiteral(QString const& text);
    void addFields(QChar letter, int count);
    void addField(QChar letter, int length);
    void addMonthName();
    void addNumber(Field field, int minimum, int maximum);
    int addQuoted(QString const& format, int position);
    bool readToken(Token const& token, char const*& at, char const* end, Values& values) const;
    bool readNumber(Token const& token, char const*& at, char const* end, Values& values) const;
    bool readMonth(char const*& at, char const* end, Values& values) const;

    std::vector<Token> m_tokens;
    std::vector<QByteArray> m_monthNames; // long and short ones in turn, January first
    bool m_hasDate = false;
    bool m_hasTime = false;
    bool m_fractionOfSecond = false;
};

} // namespace Velocor
