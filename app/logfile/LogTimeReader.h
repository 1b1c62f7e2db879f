// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <array>
#include <vector>

namespace Velocor {

/// Reads the time stamps of log entries in one date format.
///
/// The format is parsed once, because large files contain millions of time stamps. Any thread;
/// reading changes nothing.
///
///     LogTimeReader reader("yyyy-MM-dd hh:mm:ss.z");
///     LogTimeReader::Stamp stamp = reader.Read(line, length);
///     if (stamp.length >= 0 && stamp.key < previous.key)
///         ...; // the clock or the file went back
class LogTimeReader
{
public:
    /// A parsed time stamp.
    struct Stamp
    {
        int length = -1; ///< length in bytes; -1 if there is no time stamp
        qint64 key = -1; ///< in milliseconds; -1 if the format has no time of day
    };

    /// @param format  a date format as QDateTime::toString() understands it
    explicit LogTimeReader(QString const& format);

    /// Reads the time stamp at the start of a line, in Latin-1.
    Stamp Read(char const* text, int length) const;

    /// How a stamp began: the parts before its seconds and before their fraction, which the next
    /// stamps in a log often have, too.
    struct Beginning
    {
        struct Part
        {
            int length = 0; ///< 0: unknown
            qint64 key = 0; ///< what it adds to the key
        };

        std::array<char, 24> text = {};
        std::array<Part, 2> parts = {};
    };

    /// The same, faster for stamps of the same minute or second.
    ///
    /// @param last  of the last stamp that this reader has read, or unknown; is set
    Stamp Read(char const* text, int length, Beginning& last) const;

    /// Whether time stamps have a year, month and day; without them, keys restart at midnight.
    bool hasDate() const { return m_hasDate; }

    /// By how much the keys of different time stamps differ at least: that of a millisecond, a
    /// second or a minute.
    int resolution() const { return m_resolution; }

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
    void splitSeconds();
    static qint64 keyOf(Values const& values);
    Stamp readAndNote(char const* text, int length, size_t known, Beginning& last) const;
    static int inMinute(Values const& values);
    char const* readTokens(size_t first, size_t last, char const* at, char const* end,
                           Values& values) const;
    static char const* readText(Token const& token, char const* at, char const* end);
    char const* readNumber(Token const& token, char const* at, char const* end,
                           Values& values) const;
    char const* readMonth(char const* at, char const* end, Values& values) const;
    static char const* readWord(Token const& token, char const* at, char const* end,
                                Values& values);

    std::vector<Token> m_tokens;
    std::vector<QByteArray> m_monthNames; // long and short names alternate, January first
    std::array<size_t, 4> m_pieces = {};  // the tokens that they begin with, and the end
    size_t m_parts = 0;                   // pieces that can be known, all but the last one
    bool m_hasDate = false;
    int m_resolution = 1;
    bool m_hasTime = false;
    bool m_fractionOfSecond = false;
};

} // namespace Velocor
