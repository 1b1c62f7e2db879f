// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/Redactor.h"
#include "app/report/Report.h"
#include "app/report/ReportPart.h"
#include "app/window/widgets/FittingDialog.h"

#include <QList>
#include <QString>
#include <QTimer>

#include <memory>

class QCheckBox;
class QComboBox;
class QLayout;
class QLineEdit;
class QListWidget;
class QListWidgetItem;
class QPlainTextEdit;

namespace Velocor {

class PlaceholderMarks;

/// Makes a report of a problem: the user chooses its parts and what placeholders replace, and sees
/// each file as it will be saved, with the placeholders marked.
class ProblemReportDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param parts  all that the report can have; all are chosen at first
    /// @param redactor  knows the names of the user and the computer
    ProblemReportDialog(QList<ReportPart> const& parts, Redactor const& redactor,
                        QWidget* parent = nullptr);
    ~ProblemReportDialog() override;

    /// The report as it is shown.
    Report const& report() const { return *m_report; }

    /// Copies the file that is shown to the clipboard.
    void Copy();

private:
    QLayout* newHeading();
    QLayout* newChoices();
    QLayout* newPreview();
    void update();
    void listFiles();
    void listSecrets();
    void showFile();
    void choose(QListWidgetItem const* item);
    void chooseFile();

    QList<ReportPart> m_parts;
    Redactor m_redactor;
    std::unique_ptr<Report> m_report;
    QList<QCheckBox*> m_boxes; // in the order of the parts
    QListWidget* m_secrets;
    QLineEdit* m_words;
    QComboBox* m_files;
    QPlainTextEdit* m_text;
    PlaceholderMarks* m_marks;
    QTimer m_wordsTimer; // until the user has stopped typing
};

} // namespace Velocor
