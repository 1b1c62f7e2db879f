// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QPointer>
#include <QTimer>

class QWidget;

namespace Velocor {

class ElidedLabel;
class FileTabs;
class LogPanel;
struct MenuActions;

/// What the rest of the window shows of the current tab: the title, the summary in the status bar,
/// which menu items are enabled and which are checked. Follows every change of the tabs.
class CurrentTab : public QObject
{
    Q_OBJECT

public:
    /// @param tabs, actions, summary, window  not owned; they outlive this object
    CurrentTab(FileTabs* tabs, MenuActions const& actions, ElidedLabel* summary, QWidget* window);

    /// Shows the state of the current tab; called whenever it changes.
    void Update();

private:
    void updateEditing();
    void updateTitle();
    void updateSwitches(LogPanel const* log);
    void countProblems(LogPanel const* log);
    void announceProblems();

    FileTabs* m_tabs;
    MenuActions const& m_actions;
    ElidedLabel* m_summary;
    QWidget* m_window;
    QPointer<LogPanel const> m_log; // whose problems are counted
    size_t m_problems = 0;
    size_t m_newProblems = 0; // not announced yet
    QTimer m_news;
};

} // namespace Velocor
