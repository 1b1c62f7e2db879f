// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/MarksFile.h"
#include "app/window/WindowSettings.h"

#include <QMainWindow>
#include <QTimer>

#include <functional>
#include <memory>

class QActionGroup;
class QMenu;
class QSplitter;

namespace Velocor {

class ElidedLabel;
class FileTabs;
class LogHealth;
class MainToolBar;
class NoticeBar;
class PlacesPanel;
class RecentFiles;

/// The main window: the live log, program identity and file locations, other log and settings
/// files, the log settings, and reports for bugs.
///
/// Reads the application object's properties and the log when it is constructed, so create it after
/// both are set up. It writes no log entries at startup. To show up quickly, it has only the menu
/// titles for its first paint; everything else is created right after that or on demand.
class MainWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit MainWindow(QWidget* parent = nullptr);
    ~MainWindow() override;

    /// Shows a log file or a settings file in a tab, and remembers it among the recent ones.
    ///
    /// If the file does not exist, offers to remove it from the recent files.
    void OpenFile(QString const& path);

    /// Opens files as soon as the window is complete; the last one gets the current tab. A notice
    /// names those that cannot be opened.
    ///
    /// @param files  absolute paths; "-" is standard input
    void OpenAtStart(QStringList const& files);

    /// The maximum number of files that OpenAtStart() opens.
    static constexpr int MaximumFilesAtStart = 50;

protected:
    bool event(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    void makeFirstContent();
    void complete();
    void makeTabs();
    void makeStatusBar();
    void makeToolBar();
    void showPlaces(bool shown);
    void makeTextMenu(QMenu* menu);
    void setZoom(int zoom);
    void updateTextFont();
    void makeMenus();
    void makeFileMenu();
    void makeEditMenu();
    void makeViewMenu();
    void makeEncodingMenu(QMenu* menu);
    void makeHelpMenu();
    QAction* addAction(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                       QString const& statusTip, std::function<void()> const& work);
    QAction* addSwitch(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                       QString const& statusTip, std::function<void(bool)> const& work);

    void restoreFirstState();
    void restoreState();
    void saveState();
    void startWork();
    void reopenFiles();
    QStringList openFiles() const;
    void openFilesOfStart();
    QString openStandardInput();
    void updateState();
    void updateTitle();
    void checkLog();
    void showMessage(QString const& text);

    void chooseFile();
    QString open(QString const& path);
    void openLogFolder();
    void saveReport();
    void saveLines();
    void saveLinesTo(QString const& path);
    void showAbout();
    void showShortcuts();
    void showManual();
    void changeLogSettings();
    void copy();
    void selectAll();
    bool offerToForget(QString const& path);

    WindowSettings m_settings;
    MarksFile m_marks;
    QStringList m_filesOfStart;
    QString m_startupMessage; ///< about a damaged settings file
    NoticeBar* m_notice = nullptr;
    NoticeBar* m_health = nullptr; ///< above the program's log
    QSplitter* m_splitter = nullptr;
    PlacesPanel* m_places = nullptr; ///< null until they are shown
    MainToolBar* m_toolBar = nullptr;
    FileTabs* m_tabs = nullptr; ///< null until the window is complete
    ElidedLabel* m_summary = nullptr;
    QList<QMenu*> m_menus; ///< in menu bar order
    QMenu* m_recentMenu = nullptr;
    RecentFiles* m_recent = nullptr;

    QAction* m_open = nullptr;
    QAction* m_save = nullptr;
    QAction* m_close = nullptr;
    QAction* m_showPlaces = nullptr;
    QAction* m_showToolBar = nullptr;
    QAction* m_reopen = nullptr;
    QAction* m_monospaced = nullptr;
    QAction* m_wrap = nullptr;
    QAction* m_find = nullptr;
    QAction* m_filter = nullptr;
    QAction* m_nextProblem = nullptr;
    QAction* m_previousProblem = nullptr;
    QAction* m_reload = nullptr;
    QAction* m_earlierRuns = nullptr;
    QAction* m_pause = nullptr;
    QAction* m_follow = nullptr;
    QActionGroup* m_encodings = nullptr;
    QList<QAction*> m_logActions; // those that need a log in the current tab

    std::unique_ptr<LogHealth> m_logHealth;
    QTimer m_healthTimer;
    bool m_painted = false;
    int m_zoom = 0; // steps from the desktop's text size
};

} // namespace Velocor
