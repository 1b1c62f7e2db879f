// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

#include <memory>
#include <vector>

namespace Velocor {

class LogFindBar;
class LogModel;
class LogSearch;
class LogView;

/// Finds the text of a find bar in a log: goes to the hits, highlights and counts them. GUI thread.
class FindControl : public QObject
{
    Q_OBJECT

public:
    /// @param model  not owned
    /// @param view   not owned
    /// @param bar    not owned
    FindControl(LogModel* model, LogView* view, LogFindBar* bar, QObject* parent = nullptr);

    /// Goes to the next (step 1) or previous (step -1) line with the text to find, as soon as it is
    /// found. Opens the find bar if there is no text yet.
    void Next(int step);

    /// The rows found so far, ascending.
    std::shared_ptr<std::vector<int> const> const& hits() const;

Q_SIGNALS:
    /// The rows found may be others.
    void foundChanged();

    /// A message for the status bar.
    void messageReported(QString const& text);

private:
    void applyText();
    void goToFound();
    void showFound();
    QString countText() const;

    LogModel* m_model;
    LogView* m_view;
    LogFindBar* m_bar;
    LogSearch* m_search;
    int m_wantedStep = 0; // to a hit that has not been found yet
};

} // namespace Velocor
