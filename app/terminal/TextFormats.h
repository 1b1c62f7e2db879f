// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QPair>
#include <QString>
#include <QVector>

namespace Velocor {

/// Texts as the formats of velocor-log write them, in UTF-8. Pure, any thread.
class TextFormats
{
public:
    /// A record of RFC 4180 with its line end.
    static QByteArray CsvRecord(QVector<QString> const& fields);

    /// A JSON object on one line, with its line end.
    ///
    /// @param members  names, and values in JSON
    static QByteArray JsonLine(QVector<QPair<char const*, QString>> const& members);

    /// A text in JSON, with quotation marks.
    static QString JsonText(QString const& text);

    /// Lines as a code block, fenced so that none of them ends it.
    static QByteArray MarkdownBlock(QByteArray const& lines);

    /// A text without the characters that control a terminal or the direction of text; symbols
    /// stand for them.
    static QString Harmless(QString text);

    /// A time as ISO 8601 has it, without a time zone; empty if it is unknown.
    static QString Time(qint64 time);
};

} // namespace Velocor
