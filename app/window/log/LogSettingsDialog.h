// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/runninglog/LogPreferences.h"
#include "app/window/widgets/FittingDialog.h"

class QCheckBox;
class QDialogButtonBox;
class QFormLayout;
class QLabel;
class QLineEdit;
class QSpinBox;

namespace Velocor {

/// Changes the log settings. Settings that take effect only after a restart are labeled so.
class LogSettingsDialog : public FittingDialog
{
    Q_OBJECT

public:
    explicit LogSettingsDialog(QWidget* parent = nullptr);

    /// The values in the fields.
    LogPreferences preferences() const;

    void accept() override;

private:
    void makeFields();
    static void addRow(QFormLayout* form, QString const& caption, QWidget* field);
    void addNextStartField(QFormLayout* form, QString const& caption, QLineEdit* field);
    void fill(LogPreferences const& preferences);
    void check();
    QString problem() const;

    QCheckBox* m_enabled;
    QCheckBox* m_elapsed;
    QCheckBox* m_echo;
    QSpinBox* m_maxFiles;
    QLineEdit* m_elapsedPrefix;
    QLineEdit* m_dateFormat;
    QLineEdit* m_filePrefix;
    QLabel* m_sample;
    QLabel* m_problem;
    QDialogButtonBox* m_buttons;
};

} // namespace Velocor
