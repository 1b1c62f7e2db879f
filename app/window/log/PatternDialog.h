// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/PatternCounter.h"
#include "app/window/widgets/FittingDialog.h"

#include <QThread>

#include <memory>

class QLabel;
class QPushButton;
class QTreeView;

namespace Velocor {

class LogModel;
class PatternModel;

/// Lists what the messages shown have in common, and lets the user choose an entry or a filter.
///
/// It counts the rows that there are when it is made, in a thread of its own; closing it cancels
/// that.
class PatternDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param model  not owned
    explicit PatternDialog(LogModel const& model, QWidget* parent = nullptr);
    ~PatternDialog() override;

    enum Answer { Nothing, GoToEntry, Filter };

    Answer answer() const { return m_answer; }

    /// Where the entry that was chosen starts in the file.
    qint64 start() const { return m_start; }

    /// The expression to filter by.
    QString const& expression() const { return m_expression; }

private:
    void makeList();
    QLayout* makeButtons();
    void startCounter(LogModel const& model);
    void take(std::shared_ptr<CountedPatterns const> const& counted);
    QString stateText(CountedPatterns const& counted) const;
    void select(int row);
    void setWidths();
    void update();
    void goTo(bool isLast);
    void filter();

    PatternModel* m_patterns;
    QTreeView* m_list;
    QLabel* m_state;
    QPushButton* m_stop = nullptr;
    QPushButton* m_first = nullptr;
    QPushButton* m_last = nullptr;
    QPushButton* m_filter = nullptr;
    QThread m_thread;
    PatternCounter* m_counter = nullptr;
    size_t m_rows = 0;
    bool m_isStopped = false;
    bool m_isOwn = true;
    Answer m_answer = Nothing;
    qint64 m_start = -1;
    QString m_expression;
};

} // namespace Velocor
