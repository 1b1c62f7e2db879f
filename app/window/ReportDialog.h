// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDialog>
#include <QString>

class QPlainTextEdit;

namespace Velocor {

/// Shows a report for review before it is copied or saved.
class ReportDialog : public QDialog
{
    Q_OBJECT

public:
    /// @param heading  a sentence above the text
    /// @param saves  whether the text can be saved as well as copied
    ReportDialog(QString const& title, QString const& heading, QString const& text, bool saves,
                 QWidget* parent = nullptr);

    /// Copies the text to the clipboard.
    void Copy();

    /// Writes the text to a file, in UTF-8.
    ///
    /// @return the reason for a failure; empty on success
    QString SaveTo(QString const& path) const;

private:
    void chooseFile();

    QPlainTextEdit* m_text;
};

} // namespace Velocor
