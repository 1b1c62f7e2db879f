// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

#include <QVector>
#include <QWidget>

#include <functional>

class QToolButton;

namespace Velocor {

/// One button per severity and one for lines without a severity, with the numbers of entries in the
/// file. GUI thread.
class SeveritySwitches : public QWidget
{
    Q_OBJECT

public:
    explicit SeveritySwitches(QWidget* parent = nullptr);

    /// Whether entries of a severity are shown.
    bool Shows(LogEntry::Severity severity) const;
    void SetShown(LogEntry::Severity severity, bool shown);
    void ShowOnly(LogEntry::Severity severity);

    /// Shows the severities from this one on, and lines without a severity.
    void SetLeast(int severity);

    /// The severity from which on all are shown; None if it is not so simple.
    int least() const;

    /// Shows all severities. Emits toggled() for each change.
    void ShowAll();

    /// Shows the numbers of entries, shortened so that the buttons keep their size.
    void SetCounts(LogCounts const& counts);

    /// A number in at most four characters, rounded down: 9999 is "9.9k".
    static QString ShortCount(size_t count);

Q_SIGNALS:
    /// What is shown has changed.
    void toggled();

protected:
    void changeEvent(QEvent* event) override;

private:
    QToolButton* makeButton(LogEntry::Severity severity);
    void updateIcons();
    void updateWidths();
    void showCount(int severity);
    void setAll(std::function<bool(int)> const& isShown);

    QVector<QToolButton*> m_buttons;
    LogCounts m_counts{};
};

} // namespace Velocor
