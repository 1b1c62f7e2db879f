// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QTimer>
#include <QWidget>

class QCheckBox;
class QLabel;
class QLineEdit;

namespace Velocor {

/// The bar below a log view to find a text: the lines between the hits stay in view. Hidden until
/// it is opened.
class LogFindBar : public QWidget
{
    Q_OBJECT

public:
    explicit LogFindBar(QWidget* parent = nullptr);

    /// What to find, as the text of a filter; without a text while an invalid expression is
    /// entered or the bar is hidden.
    LogFilter text() const;

    /// Whether there is something to find.
    bool hasText() const;

    /// Shows the bar, focuses the text field and selects its text.
    void Open();

    /// Hides the bar.
    void Close();

    /// Takes over at once what is being typed.
    void Apply();

    /// Shows how many hits there are, and which one is current.
    void ShowCount(QString const& count);

    /// Says that the expression takes too long at a line, starting at 1; 0 if it does not.
    void ShowSlowLine(qint64 line);

Q_SIGNALS:
    void textChanged();

    /// The next (step 1) or previous (step -1) hit is wanted.
    void stepRequested(int step);
    void closed();

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QCheckBox* makeOption(QString const& text, QString const& name);
    void showError(QString const& error);

    QLineEdit* m_text;
    QCheckBox* m_case;
    QCheckBox* m_expression;
    QLabel* m_count;
    QLabel* m_error;
    QTimer m_typing;
    qint64 m_slowLine = 0;
};

} // namespace Velocor
