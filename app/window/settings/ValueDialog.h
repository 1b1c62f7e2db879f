// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QString>

class QPlainTextEdit;

namespace Velocor {

/// Edits a value that is too long for a table cell. GUI thread only.
///
/// Qt lays out a whole line again on each key press, which makes very long lines unusable. If a
/// line is longer than `MaximumLineLength`, all lines are split for display, and a symbol
/// that the value does not contain marks the real line breaks, which the dialog explains.
///
///     ValueDialog dialog(tr("Editor / style"), value, this);
///     if (dialog.exec() == QDialog::Accepted)
///         value = dialog.value();
class ValueDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param name  the name of the value
    /// @param value  of any length
    ValueDialog(QString const& name, QString const& value, QWidget* parent = nullptr);

    /// Whether the text has been edited.
    bool isModified() const;

    /// The current text; exactly the given value if it has not been edited.
    QString value() const;

    /// The maximum length of a line that is not split, in characters.
    static constexpr int MaximumLineLength = 10000;

    /// Whether the dialog can show all line breaks of a value as what they are. It cannot edit
    /// others.
    static bool CanEdit(QString const& value);

private:
    QString m_value;
    QChar m_mark; ///< marks real line breaks; null if lines are not split
    QPlainTextEdit* m_text;
};

} // namespace Velocor
