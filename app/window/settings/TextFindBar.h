// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QTimer>
#include <QVector>
#include <QWidget>

class QLabel;
class QLineEdit;
class QPlainTextEdit;
class QToolButton;

namespace Velocor {

/// Finds a text, in any letter case, in a text editor and selects it there, and tells which match
/// of how many that is. Matches do not overlap, and are within a line. Hidden until it is opened.
/// GUI thread only.
class TextFindBar : public QWidget
{
    Q_OBJECT

public:
    /// @param text  not owned; outlives the bar
    explicit TextFindBar(QPlainTextEdit* text, QWidget* parent = nullptr);

    /// Shows the bar, with its text selected for typing over it.
    void Open();

    /// Hides the bar, and gives the text editor the keyboard focus.
    void Close();

    /// Selects the next match after the cursor, around the end if necessary; opens the bar if there
    /// is no text yet.
    ///
    /// @param step  1, or -1 for the previous one
    void FindNext(int step);

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    void find(int step, bool fromSelection);
    QVector<int> const& matches();
    void noteChange();
    void showResult();
    static QString resultText(int number, int count, int wrap);
    QToolButton* makeButton(QChar sign, QString const& name, QString const& toolTip);

    QPlainTextEdit* m_text;
    QLineEdit* m_wanted;
    QLabel* m_result;
    QVector<int> m_matches; ///< positions in the text, ascending
    bool m_isStale = true;  ///< m_matches are those of a former text
    int m_wrap = 0;         ///< the step that went around the end; 0 if the last one did not
    int m_wrappedTo = -1;   ///< the position of the match to which it went
    QTimer m_soon;          ///< runs from a change until the result is shown
};

} // namespace Velocor
