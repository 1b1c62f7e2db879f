// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SavedStates.h"
#include "app/window/widgets/FittingDialog.h"

class QLabel;
class QPushButton;
class QTreeWidget;

namespace Velocor {

/// Lists the saved states of a settings file, with what changed from each to the next. GUI thread
/// only.
class SavedStatesDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param canCompare  whether the states can be compared with something
    SavedStatesDialog(SavedStates const& states, QString const& path, bool canCompare,
                      QWidget* parent = nullptr);

Q_SIGNALS:
    /// The user wants to see what differs from a state, or to have it back. The dialog stays open
    /// for the former, and closes before the latter.
    ///
    /// @param path  of the state
    /// @param title  what to call it
    void compareRequested(QString const& path, QString const& title);
    void bringBackRequested(QString const& path, QString const& title);

private:
    void fill();
    void updateButtons();
    void compare();
    void bringBack();
    void removeAll();
    QPushButton* makeButton(QString const& text, QString const& toolTip,
                            void (SavedStatesDialog::*work)());

    SavedStates m_states;
    QString m_path;
    bool m_canCompare;
    QLabel* m_heading;
    QTreeWidget* m_list;
    QPushButton* m_compare;
    QPushButton* m_bringBack;
    QPushButton* m_removeAll;
};

} // namespace Velocor
