// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDialog>
#include <QString>

class QPlainTextEdit;

namespace Velocor {

/// Shows a text that is meant for others before it is copied or saved.
class ReportDialog : public QDialog
{
    Q_OBJECT

public:
    /// @param heading  a sentence above the text
    /// @param saves  whether it offers to save the text besides copying it
    ReportDialog(QString const& title, QString const& heading, QString const& text, bool saves,
                 QWidget* parent = nullptr);

    /// Puts the text on the clipboard.
    void Copy();

    /// Writes the text to a file, in UTF-8.
    ///
    /// @return the reason of a failure; empty if all is well
    QString SaveTo(QString const& path) const;

private:
    void chooseFile();

    QPlainTextEdit* m_text;
};

} // namespace Velocor
