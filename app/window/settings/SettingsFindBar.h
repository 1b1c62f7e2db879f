// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/settings/SettingsModel.h"

#include <QTimer>
#include <QWidget>

#include <vector>

class QLabel;
class QLineEdit;
class QToolButton;

namespace Velocor {

class SettingsTree;

/// Finds names and values that contain a text, in any letter case, and goes to them in the tree, or
/// makes it show only them, only what was changed, or only what differs from defaults. Hidden until
/// it is opened; then it tells which match of how many is current, whatever is changed. GUI thread
/// only.
class SettingsFindBar : public QWidget
{
    Q_OBJECT

public:
    /// @param tree, model  not owned; outlive the bar
    SettingsFindBar(SettingsTree* tree, SettingsModel const* model, QWidget* parent = nullptr);

    /// Shows the bar, with its text selected for typing over it.
    void Open();

    /// Hides the bar, shows all keys again, and gives the tree the keyboard focus.
    void Close();

    /// Applies the filter to what the keys are now, and offers only what the file has.
    void Refresh();

    /// Goes to the next match after the current row, around the end if necessary; opens the bar if
    /// there is no text yet.
    ///
    /// @param step  1, or -1 for the previous one
    void FindNext(int step);

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    SettingsFilter filter() const;
    void search();
    void find(int step, bool fromCurrent);
    std::vector<SettingsModel::Match> const& matches();
    void noteChange();
    void showResult();
    QString resultText();
    QToolButton* makeButton(QString const& text, QString const& name, QString const& toolTip);
    QToolButton* makeSwitch(QString const& text, QString const& toolTip);

    SettingsTree* m_tree;
    SettingsModel const* m_model;
    QLineEdit* m_text;
    QToolButton* m_onlyMatches;
    QToolButton* m_onlyChanged;
    QToolButton* m_onlyDiffering;
    QLabel* m_result;
    std::vector<SettingsModel::Match> m_matches; ///< of the text, in the order of the tree
    bool m_isStale = true;                       ///< m_matches are those of a former text or file
    QTimer m_soon;                               ///< runs from a change until the result is shown
};

} // namespace Velocor
