// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QTimer>
#include <QWidget>

class QCheckBox;
class QLabel;
class QLineEdit;
class QToolButton;

namespace Velocor {

/// The filter controls of a log view: text, match options, one button per severity and one for
/// lines without a severity.
class LogFilterBar : public QWidget
{
    Q_OBJECT

public:
    explicit LogFilterBar(QWidget* parent = nullptr);

    /// The current filter; without a text while an invalid expression is entered.
    LogFilter const& filter() const { return m_filter; }

    /// Focuses the text field and selects its text.
    void FocusText();

    /// Resets the text and the severities.
    void Clear();

    void SetEarlierRuns(bool shown);

    /// Says that the expression takes too long at a line, starting at 1; 0 if it does not.
    void ShowSlowLine(size_t line);

Q_SIGNALS:
    void filterChanged();

protected:
    void changeEvent(QEvent* event) override;

private:
    QCheckBox* makeOption(QString const& text, QString const& name, QString const& toolTip);
    void addSeverities();
    void updateIcons();
    void apply();
    void showError(QString const& error);

    QLineEdit* m_text;
    QCheckBox* m_case;
    QCheckBox* m_expression;
    QVector<QToolButton*> m_severities;
    QLabel* m_error;
    QTimer m_typing;
    LogFilter m_filter;
};

} // namespace Velocor
