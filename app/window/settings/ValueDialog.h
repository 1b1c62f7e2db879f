// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDialog>
#include <QString>

class QPlainTextEdit;

namespace Velocor {

/// Edits a value that is too long for a cell of a table. GUI thread only.
///
/// Qt lays out a line as a whole, again with each key, which takes many seconds for one of some
/// megabytes. If a line is longer than `LongestLine`, all lines are shown in pieces, and a sign
/// that the value does not contain marks the real line breaks; the dialog says so.
///
///     ValueDialog dialog(tr("Editor / style"), value, this);
///     if (dialog.exec() == QDialog::Accepted)
///         value = dialog.value();
class ValueDialog : public QDialog
{
public:
    /// @param name  what the value is called
    /// @param value  of any length
    ValueDialog(QString const& name, QString const& value, QWidget* parent = nullptr);

    /// Whether the text has been edited.
    bool isModified() const;

    /// The text as it is now; exactly the value given if it has not been edited.
    QString value() const;

    /// The longest line that is shown in one piece, in characters.
    static constexpr int LongestLine = 10000;

private:
    QString m_value;
    QChar m_mark; ///< of a real line break; null if lines are shown whole
    QPlainTextEdit* m_text;
};

} // namespace Velocor
