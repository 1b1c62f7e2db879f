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

/// The controls of a log view's filter: a text, how it is meant, and one button per severity.
class LogFilterBar : public QWidget
{
    Q_OBJECT

public:
    explicit LogFilterBar(QWidget* parent = nullptr);

    /// The filter that the controls say; with the last valid expression while one is being typed.
    LogFilter const& filter() const { return m_filter; }

    /// Puts the keyboard into the text field and selects what is there.
    void FocusText();

    /// Takes every restriction away.
    void Clear();

    void SetEarlierRuns(bool shown);

Q_SIGNALS:
    void filterChanged();

protected:
    void changeEvent(QEvent* event) override;

private:
    QCheckBox* makeOption(QString const& text, QString const& name, QString const& toolTip);
    void addSeverities();
    void updateIcons();
    void apply();

    QLineEdit* m_text;
    QCheckBox* m_case;
    QCheckBox* m_expression;
    QVector<QToolButton*> m_severities;
    QLabel* m_error;
    QTimer m_typing;
    LogFilter m_filter;
};

} // namespace Velocor
