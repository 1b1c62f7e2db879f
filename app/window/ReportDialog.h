// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QString>

class QPlainTextEdit;

namespace Velocor {

/// Shows a text about the program that can be copied.
class ReportDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param heading  a sentence above the text
    ReportDialog(QString const& title, QString const& heading, QString const& text,
                 QWidget* parent = nullptr);

    /// Copies the text to the clipboard.
    void Copy();

private:
    QPlainTextEdit* m_text;
};

} // namespace Velocor
