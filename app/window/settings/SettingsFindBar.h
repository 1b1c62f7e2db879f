// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QWidget>

class QLabel;
class QLineEdit;
class QToolButton;

namespace Velocor {

class SettingsTree;

/// Finds names and values that contain a text, in any letter case, and goes to them in the tree.
/// Hidden until it is opened. GUI thread only.
class SettingsFindBar : public QWidget
{
    Q_OBJECT

public:
    /// @param tree  not owned; outlives the bar
    explicit SettingsFindBar(SettingsTree* tree, QWidget* parent = nullptr);

    /// Shows the bar, with its text selected for typing over it.
    void Open();

    /// Hides the bar, and gives the tree the keyboard focus.
    void Close();

    /// Goes to the next match after the current row, around the end if necessary; opens the bar if
    /// there is no text yet.
    ///
    /// @param step  1, or -1 for the previous one
    void FindNext(int step);

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    void find(int step, bool fromCurrent);
    QToolButton* makeButton(QString const& text, QString const& name, QString const& toolTip);

    SettingsTree* m_tree;
    QLineEdit* m_text;
    QLabel* m_result;
};

} // namespace Velocor
