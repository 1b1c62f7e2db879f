// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunEnds.h"
#include "app/window/FileOpener.h"
#include "app/window/MarksFile.h"
#include "app/window/WindowSettings.h"

#include <QMainWindow>
#include <QTimer>

#include <memory>
#include <vector>

class QMenu;

namespace Velocor {

class CurrentTab;
class ElidedLabel;
class FileTabs;
class LineCommands;
class LogHealth;
class MainMenus;
class MainToolBar;
class NoticeBar;
class PlacesPanel;
class RunMark;
class TextFont;
class TurningSplitter;
class WindowDialogs;

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
    static constexpr int MaximumFilesAtStart = FileOpener::MaximumFiles;

protected:
    bool event(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    void readSettings();
    void makeFirstContent();
    void complete();
    void makeTabs();
    void watchOwnSettings();
    void makeStatusBar();
    void makeMenus();
    void makeToolBar();
    void showPlaces(bool shown);
    QList<QWidget*> panes() const;
    void restoreFirstState();
    void restoreState();
    void restoreGaps();
    void restoreColumns();
    void restoreLanguage();
    void saveState();
    void startWork();
    void openFilesOfStart();
    void tellOfAbnormalEnds(std::vector<RunEnd> const& ends);
    void offerDefaults(NoticeBar* bar);
    void checkLog();
    void showMessage(QString const& text);

    std::unique_ptr<RunMark> m_runMark;
    WindowSettings m_settings;
    MarksFile m_marks;
    QStringList m_filesOfStart;
    QString m_startupMessage; ///< about a damaged settings file
    NoticeBar* m_notice = nullptr;
    NoticeBar* m_health = nullptr; ///< above the program's log
    TurningSplitter* m_splitter = nullptr;
    PlacesPanel* m_places = nullptr; ///< null until they are shown
    MainToolBar* m_toolBar = nullptr;
    FileTabs* m_tabs = nullptr; ///< null until the window is complete
    ElidedLabel* m_summary = nullptr;
    QList<QMenu*> m_titles; ///< in menu bar order

    std::unique_ptr<FileOpener> m_files;
    std::unique_ptr<LineCommands> m_lines;
    std::unique_ptr<TextFont> m_textFont;
    std::unique_ptr<WindowDialogs> m_dialogs;
    std::unique_ptr<MainMenus> m_menus;
    std::unique_ptr<CurrentTab> m_currentTab;

    std::unique_ptr<LogHealth> m_logHealth;
    QTimer m_healthTimer;
    bool m_painted = false;
};

} // namespace Velocor
