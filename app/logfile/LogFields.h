// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// One named value of a log entry: where it is in the entry's text.
struct LogField
{
    char const* name = nullptr;
    int nameLength = 0;
    int value = 0; ///< offset of its first byte, after the quotation mark
    int valueLength = 0;
    bool isEscaped = false; ///< has backslash escapes, as in JSON

    /// Replaces the escapes in the text of an escaped value; those that JSON does not know stay.
    static QString Unescaped(QString const& text);
};

/// The members of a JSON object at the start of a line, without those of nested objects. A date
/// that a database wraps in an object, `{"$date":"2026-11-22T14:03:02Z"}`, counts as a string.
///
/// Needs no complete object: a line may be cut. Pure; the text has to outlive it.
///
///     JsonFields fields(line, length);
///     LogField field;
///     while (fields.Next(field))
///         ...;
class JsonFields
{
public:
    JsonFields(char const* text, int length);
    bool Next(LogField& field);

private:
    void skipBlanks();
    bool readString(int& start, int& length, bool& isEscaped);
    void skipNested();
    bool readDate(LogField& field);

    char const* m_text;
    int m_length;
    int m_at = 0;
};

/// The pairs of a line such as `time=2026-11-22T14:03:02Z level=error msg="disk full"`.
class LogfmtFields
{
public:
    LogfmtFields(char const* text, int length) : m_text(text), m_length(length) {}
    bool Next(LogField& field);

private:
    char const* m_text;
    int m_length;
    int m_at = 0;
};

/// The fields of one entry as `journalctl --output=export` writes it: a line for each, or a name, a
/// 64-bit size and the value.
class JournalFields
{
public:
    JournalFields(char const* text, int length) : m_text(text), m_length(length) {}
    bool Next(LogField& field);

private:
    bool readSized(LogField& field);

    char const* m_text;
    int m_length;
    int m_at = 0;
};

} // namespace Velocor
