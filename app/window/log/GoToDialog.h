// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogPlace.h"
#include "app/window/widgets/FittingDialog.h"

class QLabel;
class QLineEdit;
class QPushButton;

namespace Velocor {

/// Asks for a line number or a time to go to. Says what is wrong while the user types.
class GoToDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param lines  the number of lines in the file
    /// @param hasCurrent  whether there is a current entry for intervals to count from
    GoToDialog(qint64 lines, bool hasCurrent, QWidget* parent);

    /// What the user has entered; valid once the dialog is accepted.
    LogPlace const& place() const { return m_place; }

private:
    static QLayout* newSamples();
    void check();

    qint64 m_lines;
    bool m_hasCurrent;
    LogPlace m_place;
    QLineEdit* m_text;
    QLabel* m_error;
    QPushButton* m_ok;
};

} // namespace Velocor
