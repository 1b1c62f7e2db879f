// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QStringList>

class QColor;
class QFont;
class QPoint;
class QSize;

namespace Velocor {

/// What the text of a value means to the program that reads it.
enum class ValueKind {
    Text,
    YesNo,
    Number,
    Color,
    Size,
    Font,
    WindowPlace, ///< position and size of a window
    FileList     ///< recently used files, separated by "|"
};

/// Texts of a configuration file as typed values.
///
/// The store itself reads and writes them, so a program gets from its file what is shown here, and
/// what is written here is what the program would write. The texts of file lists are those of
/// AppUtils. Reentrant; whatever concerns windows needs the GUI thread.
///
///     if (TypedText::Guess(section, text) == ValueKind::YesNo)
///         text = TypedText::FromYesNo(!TypedText::ToYesNo(text));
class TypedText
{
public:
    /// All kinds, for a menu.
    static QList<ValueKind> AllKinds();

    /// The kind whose value the store would write with exactly this text. The places of windows
    /// are only in the store's screens section, and any that it can read counts. A file list has
    /// at least two entries, all of them empty or with a slash or backslash. Very long texts are
    /// just texts.
    ///
    /// @param section  where the value is
    static ValueKind Guess(QString const& section, QString const& text);

    /// Whether values in a section can be of a kind; the store reads places of windows only in one.
    static bool IsPossible(ValueKind kind, QString const& section);

    /// As TorkConfigFile::ReadBool(): every text has a meaning.
    static bool ToYesNo(QString const& text);
    static QString FromYesNo(bool value);

    /// As TorkConfigFile::ReadInt().
    ///
    /// @param value  untouched on failure
    static bool ToNumber(QString const& text, int& value);
    static QString FromNumber(int value);

    /// As TorkConfigFile::ReadColor(), but false for what would be an invalid color.
    ///
    /// @param value  untouched on failure
    static bool ToColor(QString const& text, QColor& value);
    static QString FromColor(QColor value);

    /// As TorkConfigFile::ReadSize().
    ///
    /// @param value  untouched on failure
    static bool ToSize(QString const& text, QSize& value);
    static QString FromSize(QSize value);

    /// As TorkConfigFile::ReadFont(), but false for what is not a complete description of a font.
    ///
    /// @param value  untouched on failure
    static bool ToFont(QString const& text, QFont& value);
    static QString FromFont(QFont value);

    /// Where a window with this text opens, as TorkConfigFile::ReadScreenMetrics(): fitted to the
    /// desktop. GUI thread; false without a QApplication and for less or more than four numbers.
    ///
    /// @param position, size  in pixels; untouched on failure
    static bool ToWindowPlace(QString const& text, QPoint& position, QSize& size);
    static QString FromWindowPlace(QPoint position, QSize size);

    /// The entries of a file list; an empty text is one empty entry.
    static QStringList ToFileList(QString const& text);

    /// Never null: no entries are an empty text.
    static QString FromFileList(QStringList const& value);
};

} // namespace Velocor
