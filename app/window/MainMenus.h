// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QKeySequence>
#include <QList>
#include <QObject>
#include <QString>

#include <functional>

class QAction;
class QActionGroup;
class QMenu;

namespace Velocor {

class FileOpener;
class FileTabs;
class LineCommands;
class LogPanel;
class TextFont;
class WindowDialogs;

/// The actions that other parts of the window show, change or handle. Owned by their menus.
struct MenuActions
{
    QAction* open = nullptr;
    QAction* save = nullptr;
    QAction* close = nullptr;
    QAction* quit = nullptr;
    QAction* undo = nullptr;
    QAction* redo = nullptr;
    QMenu* settings = nullptr; ///< for the commands of a settings file
    QAction* find = nullptr;
    QAction* filter = nullptr;
    QAction* showPlaces = nullptr;
    QAction* showToolBar = nullptr;
    QAction* nextPane = nullptr;
    QAction* previousPane = nullptr;
    QAction* allFiles = nullptr;
    QAction* family = nullptr;
    QAction* earlierRuns = nullptr;
    QAction* pause = nullptr;
    QAction* follow = nullptr;
    QAction* nextProblem = nullptr;
    QAction* previousProblem = nullptr;
    QAction* reload = nullptr;
    QAction* monospaced = nullptr;
    QAction* lineWrap = nullptr;
    QAction* lineNumbers = nullptr;
    QAction* activity = nullptr;
    QAction* since = nullptr;
    QAction* foldRepeats = nullptr;
    QActionGroup* gaps = nullptr; ///< their data is the least gap shown, in milliseconds
    QAction* reopen = nullptr;
    QActionGroup* encodings = nullptr;
    QActionGroup* languages = nullptr; ///< the data is the code, empty for that of the system
    QList<QAction*> ofSettings;        ///< those that need a settings file that can be edited
    QList<QAction*> ofLogs;            ///< those that need a log in the current tab
};

/// Fills the menus, and does what their items say.
///
/// The window itself handles `quit`, `showPlaces`, `showToolBar`, `nextPane` and `previousPane`.
class MainMenus : public QObject
{
    Q_OBJECT

public:
    /// What the items act on; not owned.
    struct Targets
    {
        FileTabs* tabs;
        FileOpener* files;
        LineCommands* lines;
        TextFont* font;
        WindowDialogs* dialogs;
    };

    /// @param menus  File, Edit, View and Help, still empty; not owned
    MainMenus(QList<QMenu*> const& menus, Targets const& targets);

    MenuActions const& actions() const { return m_actions; }

private:
    using Work = std::function<void()>;
    using SwitchWork = std::function<void(bool)>;
    using LogWork = std::function<void(LogPanel*)>;
    using LogSwitchWork = std::function<void(LogPanel*, bool)>;

    void fillFileMenu(QMenu* menu);
    void fillEditMenu(QMenu* menu);
    void addUndo(QMenu* menu);
    void addCopying(QMenu* menu);
    void addFinding(QMenu* menu);
    void fillViewMenu(QMenu* menu);
    void addMovement(QMenu* menu);
    void addProblems(QMenu* menu);
    void addMarks(QMenu* menu);
    void fillEncodingMenu(QMenu* menu);
    void fillTextMenu(QMenu* menu);
    void fillAnalyzeMenu(QMenu* menu);
    void fillGapMenu(QMenu* menu);
    void fillLanguageMenu(QMenu* menu);
    void fillHelpMenu(QMenu* menu);

    QAction* add(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                 QString const& statusTip, Work const& work);
    QAction* addSwitch(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                       QString const& statusTip, SwitchWork const& work);
    QAction* addForLog(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                       QString const& statusTip, LogWork const& work);
    QAction* addSwitchForLog(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                             QString const& statusTip, LogSwitchWork const& work);

    Targets m_targets;
    MenuActions m_actions;
};

} // namespace Velocor
