// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"
#include "app/window/widgets/FittingDialog.h"

class QCheckBox;
class QLabel;
class QPlainTextEdit;
class QPushButton;
class QStackedWidget;

namespace Velocor {

class DifferenceTree;

/// Shows two settings documents side by side: sections and keys or, on demand, the lines of their
/// files. GUI thread only.
///
///     DifferenceDialog dialog(tr("What Will Be Written"), this);
///     dialog.SetSides({tr("Now"), before, bytesBefore}, {tr("After saving"), after, bytesAfter});
///     dialog.exec();
class DifferenceDialog : public FittingDialog
{
    Q_OBJECT

public:
    struct Side
    {
        QString title;
        SettingsDocument document;
        QByteArray bytes; ///< of the file
    };

    explicit DifferenceDialog(QString const& title, QWidget* parent = nullptr);

    /// Shows other documents.
    ///
    /// @param losses  what saving loses
    void SetSides(Side const& left, Side const& right,
                  QVector<SettingsDocument::Loss> const& losses = {});

    /// Shows buttons that take over values from right to left, and undo that. From then on,
    /// the one who asked for them answers their signals with SetSides().
    void AllowTakeOver();

    /// Whether there is something to undo.
    void SetCanUndo(bool canUndo);

    DifferenceTree const* tree() const { return m_tree; }

    /// The maximum size of which lines are shown, in bytes.
    static constexpr int ShownLimit = 1 << 20;

Q_SIGNALS:
    /// The user wants other content on the left.
    ///
    /// @param document  the left one with what was selected
    void takeOverRequested(Velocor::SettingsDocument const& document);
    void undoRequested();

private:
    QWidget* makeLinesPage();
    void showLines(bool on);
    void updateButtons();

    SettingsDocument m_left;
    QLabel* m_summary;
    QStackedWidget* m_pages;
    DifferenceTree* m_tree;
    QPlainTextEdit* m_leftLines;
    QPlainTextEdit* m_rightLines;
    QCheckBox* m_onlyDifferences;
    QPushButton* m_takeOver;
    QPushButton* m_undo;
};

} // namespace Velocor
