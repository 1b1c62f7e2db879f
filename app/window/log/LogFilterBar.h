// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"

#include <QStringList>
#include <QTimer>
#include <QWidget>

#include <memory>

class QCheckBox;
class QComboBox;
class QLabel;
class QLayout;
class QLineEdit;
class QToolButton;

namespace Velocor {

class SeveritySwitches;

/// The filter controls of a log view: text, match options, one button per severity and one for
/// lines without a severity; in a second row, which is shown on demand, more terms, a least
/// severity, times, and context. A third row tells the times while they are limited.
class LogFilterBar : public QWidget
{
    Q_OBJECT

public:
    explicit LogFilterBar(QWidget* parent = nullptr);

    /// The current filter; without a text while an invalid expression is entered.
    LogFilter const& filter() const { return m_filter; }

    /// Focuses the text field and selects its text.
    void FocusText();

    /// Opens the second row, focuses the terms that lines also contain or those of lines to hide,
    /// and selects them.
    void FocusRequired() { focusTerms(m_required); }
    void FocusHidden() { focusTerms(m_hidden); }

    /// Resets everything that hides lines, except for earlier runs.
    void Clear();

    void SetEarlierRuns(bool shown);

    /// Shows only lines with this text, as it is.
    void FilterBy(QString const& text);

    /// Shows only lines that match a regular expression.
    void FilterByExpression(QString const& expression);

    /// Hides the lines with this text as well.
    void Hide(QString const& text);

    /// Shows only the entries of this severity, or hides them as well.
    void FilterBy(LogEntry::Severity severity);
    void Hide(LogEntry::Severity severity);

    /// Shows only entries of these times, besides all else.
    void SetSpan(LogSpan const& span);

    /// Sets where the last filter texts are kept, newest first; shared with other bars.
    void SetHistory(std::shared_ptr<QStringList> const& history) { m_history = history; }

    /// How many filter texts are kept.
    static constexpr int MaximumHistory = 20;

    /// Says that the expression takes too long at a line, starting at 1; 0 if it does not.
    void ShowSlowLine(size_t line);

    /// Shows how many entries of each severity are in the file.
    void ShowCounts(LogCounts const& counts);

Q_SIGNALS:
    void filterChanged();

protected:
    void keyPressEvent(QKeyEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QCheckBox* makeOption(QString const& text, QString const& name, QString const& toolTip);
    QLayout* makeFirstRow();
    QLineEdit* makeTerms(QString const& name, QString const& toolTip);
    QLineEdit* makeTime(QString const& name, QString const& toolTip);
    QWidget* makeSecondRow();
    QWidget* makeSpanRow();
    static qint64 readTime(QLineEdit const* field);
    void readSpan();
    void showSpan();
    QString timeError() const;
    QComboBox* makeLeastSeverity();
    QComboBox* makeContext();
    void focusTerms(QLineEdit* field);
    void showMore();
    void keepText();
    void showHistory();
    void filterBy(QString const& text, bool isExpression);
    void apply();
    void showError(QString const& error);

    QLineEdit* m_text;
    QCheckBox* m_case = nullptr;
    QCheckBox* m_expression = nullptr;
    SeveritySwitches* m_severities;
    QToolButton* m_more = nullptr;
    QLineEdit* m_required = nullptr;
    QLineEdit* m_hidden = nullptr;
    QLineEdit* m_since = nullptr;
    QLineEdit* m_until = nullptr;
    QLabel* m_span = nullptr;
    QComboBox* m_least = nullptr;
    QComboBox* m_context = nullptr;
    QLabel* m_error;
    QTimer m_typing;
    LogFilter m_filter;
    std::shared_ptr<QStringList> m_history = std::make_shared<QStringList>();
};

} // namespace Velocor
