// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainWindow.h"

#include "app/MruSeparator_p.h"
#include "app/ScreenlessPlatform_p.h"
#include "app/UserMessages.h"
#include "app/runninglog/LogHealth.h"
#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/FileTabs.h"
#include "app/window/MainToolBar.h"
#include "app/window/Manual.h"
#include "app/window/PlacesPanel.h"
#include "app/window/RecentFiles.h"
#include "app/window/ReportDialog.h"
#include "app/window/SelectableMessageBoxes.h"
#include "app/window/ShortcutList.h"
#include "app/window/StandardInput.h"
#include "app/window/SystemReport.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LineSaver.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogSettingsDialog.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QActionGroup>
#include <QApplication>
#include <QCloseEvent>
#include <QDesktopWidget>
#include <QDir>
#include <QFileDialog>
#include <QFontDatabase>
#include <QFontInfo>
#include <QMenuBar>
#include <QMessageBox>
#include <QMimeData>
#include <QSplitter>
#include <QStatusBar>
#include <QUrl>
#include <QVBoxLayout>

#include <cmath>

// Resources of a static library must be initialized explicitly, outside any namespace.
static void InitializeResources()
{
    Q_INIT_RESOURCE(window);
}

namespace Velocor {

namespace {

constexpr int HealthInterval = 2000; // milliseconds
constexpr int MessageTime = 6000;    // milliseconds
constexpr int MaximumDroppedFiles = 20;
constexpr int MaximumZoom = 12; // steps
constexpr qreal ZoomStep = 1.1;
constexpr int MaximumMessageLength = 1000; // characters

QIcon WindowIcon()
{
    QIcon icon;
    for (int size : {16, 32, 48, 128})
        icon.addFile(QStringLiteral(":/velocor/velocor-%1.png").arg(size), QSize(size, size));
    return icon;
}

} // namespace

MainWindow::MainWindow(QWidget* parent)
    : QMainWindow(parent), m_settings(ApplicationProperty("DataPath")),
      m_marks(ApplicationProperty("DataPath"))
{
    setWindowTitle(ApplicationProperty("caption"));
    setAcceptDrops(true);
    // Size limits are for the window manager. Platforms without one log a warning that they do not
    // support them.
    if (IsScreenlessPlatform())
        layout()->setSizeConstraint(QLayout::SetNoConstraint);
    makeFirstContent();
    restoreFirstState();
}

// Deleting an open window hides it, which ends cell editing and makes the tabs send signals. Qt
// would disconnect them only after that, when this object is no more than a QWidget.
MainWindow::~MainWindow()
{
    if (m_tabs)
        disconnect(m_tabs, nullptr, this, nullptr);
}

// The menu bar exists from the start, so that nothing moves when the menus are filled.
void MainWindow::makeFirstContent()
{
    menuBar()->setAccessibleName(tr("Menus"));
    for (QString const& title : {tr("&File"), tr("&Edit"), tr("&View"), tr("&Help")})
        m_menus.append(menuBar()->addMenu(title));
}

void MainWindow::complete()
{
    if (m_tabs)
        return;
    InitializeResources();
    QGuiApplication::setWindowIcon(WindowIcon());
    QCoreApplication::setAttribute(Qt::AA_UseHighDpiPixmaps); // or icons are scaled up
    QGuiApplication::setDesktopFileName(QStringLiteral("org.tork.velocor"));
    new SelectableMessageBoxes(this);
    makeTabs();
    makeStatusBar();
    makeMenus();
    makeToolBar();
    restoreState();
    updateState();
    startWork();
    reopenFiles();
    openFilesOfStart();
}

void MainWindow::makeTabs()
{
    m_notice = new NoticeBar;
    m_tabs = new FileTabs(&m_marks);
    m_splitter = new QSplitter;
    m_splitter->setAccessibleName(tr("Places and files"));
    m_splitter->setChildrenCollapsible(false);
    m_splitter->addWidget(m_tabs);

    auto* content = new QWidget;
    auto* layout = new QVBoxLayout(content);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(m_notice);
    layout->addWidget(m_splitter, 1);
    setCentralWidget(content);
    content->show(); // Qt would do it in the next turn of the event loop

    m_health = new NoticeBar(tr("State of the log"));
    m_tabs->ownLog()->AddBar(m_health);
    connect(m_tabs, &FileTabs::messageReported, this, &MainWindow::showMessage);
    connect(m_tabs, &FileTabs::stateChanged, this, &MainWindow::updateState);
    connect(m_tabs, &FileTabs::zoomRequested, this, [this](int steps) { setZoom(m_zoom + steps); });
    m_tabs->ownLog()->setFocus();
}

void MainWindow::makeStatusBar()
{
    m_summary = new ElidedLabel(Qt::ElideMiddle);
    m_summary->setAccessibleName(tr("Lines shown"));
    m_summary->setContentsMargins(6, 0, 6, 0);
    m_summary->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    statusBar()->setAccessibleName(tr("Status"));
    statusBar()->addWidget(m_summary, 1); // not permanent, to leave all room to messages
}

void MainWindow::makeToolBar()
{
    m_toolBar = new MainToolBar;
    m_toolBar->AddTool(m_open, ActionIcons::Open);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(m_reload, ActionIcons::Reload);
    m_toolBar->AddTool(m_pause, ActionIcons::Pause);
    m_toolBar->AddTool(m_follow, ActionIcons::Follow);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(m_previousProblem, ActionIcons::PreviousProblem);
    m_toolBar->AddTool(m_nextProblem, ActionIcons::NextProblem);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(m_find, ActionIcons::Find);
    m_toolBar->AddTool(m_filter, ActionIcons::Filter);
    m_toolBar->AddSpace();
    m_toolBar->AddTool(m_showPlaces, ActionIcons::Places);
    addToolBar(m_toolBar);
}

// Made when they are shown for the first time.
void MainWindow::showPlaces(bool shown)
{
    m_showPlaces->setChecked(shown);
    if (shown && !m_places) {
        m_places = new PlacesPanel(m_settings.fileName());
        connect(m_places, &PlacesPanel::messageReported, this, &MainWindow::showMessage);
        m_splitter->insertWidget(0, m_places);
        m_splitter->setStretchFactor(1, 1);
        const QList<int> sizes = m_settings.Numbers(QStringLiteral("panes"));
        m_splitter->setSizes(sizes.size() == m_splitter->count() ? sizes : QList<int>{280, 800});
    }
    if (m_places)
        m_places->setVisible(shown);
}

QAction* MainWindow::addAction(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                               QString const& statusTip, std::function<void()> const& work)
{
    QAction* action = menu->addAction(text);
    action->setShortcut(shortcut);
    action->setStatusTip(statusTip);
    action->setMenuRole(QAction::NoRole);
    connect(action, &QAction::triggered, this, work);
    return action;
}

QAction* MainWindow::addSwitch(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                               QString const& statusTip, std::function<void(bool)> const& work)
{
    QAction* action = addAction(menu, text, shortcut, statusTip, [] {});
    action->setCheckable(true);
    connect(action, &QAction::triggered, this, work);
    return action;
}

void MainWindow::makeMenus()
{
    makeFileMenu();
    makeEditMenu();
    makeViewMenu();
    makeHelpMenu();
}

void MainWindow::makeFileMenu()
{
    QMenu* menu = m_menus.at(0);
    m_open = addAction(menu, tr("&Open..."), QKeySequence::Open,
                       tr("Open a log file or a settings file"), [this] { chooseFile(); });
    m_recentMenu = menu->addMenu(tr("Open &Recent"));
    m_recent = new RecentFiles(m_recentMenu, this);
    connect(m_recent, &RecentFiles::fileChosen, this, &MainWindow::OpenFile);
    m_save = addAction(menu, tr("&Save"), QKeySequence::Save, tr("Save the current settings file"),
                       [this] { m_tabs->currentEditor()->Save(); });
    m_close = addAction(menu, tr("&Close Tab"), QKeySequence::Close, tr("Close the current file"),
                        [this] { m_tabs->CloseCurrent(); });
    m_logActions.append(addAction(menu, tr("Save &Lines As..."), QKeySequence(tr("Ctrl+Shift+S")),
                                  tr("Save the lines that the filter shows to a file"),
                                  [this] { saveLines(); }));
    menu->addSeparator();
    addAction(menu, tr("Open Log &Folder"), QKeySequence(tr("Ctrl+Shift+O")),
              tr("Show the log files in the file manager"), [this] { openLogFolder(); });
    addAction(menu, tr("Save Re&port..."), QKeySequence(tr("Ctrl+Shift+R")),
              tr("Review and save the information for a bug report"), [this] { saveReport(); });
    menu->addSeparator();
    QAction* quit = addAction(menu, tr("&Quit"), QKeySequence(tr("Ctrl+Q")),
                              tr("Close the program"), [this] { close(); });
    quit->setMenuRole(QAction::QuitRole);
}

void MainWindow::makeEditMenu()
{
    QMenu* menu = m_menus.at(1);
    addAction(menu, tr("&Copy"), QKeySequence::Copy, tr("Copy the selected lines"),
              [this] { copy(); });
    QMenu* copyAs = menu->addMenu(tr("Copy A&s"));
    m_logActions.append(addAction(copyAs, tr("&Markdown"), QKeySequence(tr("Ctrl+Alt+D")),
                                  tr("Copy the selected lines as a Markdown code block"),
                                  [this] { m_tabs->currentLog()->CopyAsMarkdown(); }));
    m_logActions.append(addAction(copyAs, tr("&CSV"), QKeySequence(tr("Ctrl+Alt+V")),
                                  tr("Copy the selected lines as comma-separated values"),
                                  [this] { m_tabs->currentLog()->CopyAsCsv(); }));
    addAction(menu, tr("Select &All"), QKeySequence::SelectAll, tr("Select all lines"),
              [this] { selectAll(); });
    menu->addSeparator();
    m_find = addAction(menu, tr("&Find"), QKeySequence::Find,
                       tr("Go to lines that contain a text, among the others"),
                       [this] { m_tabs->currentLog()->OpenFind(); });
    m_logActions.append(addAction(menu, tr("Find &Next"), QKeySequence(tr("F3")),
                                  tr("Go to the next line found"),
                                  [this] { m_tabs->currentLog()->FindNext(1); }));
    m_logActions.append(addAction(menu, tr("Find Pre&vious"), QKeySequence(tr("Shift+F3")),
                                  tr("Go to the previous line found"),
                                  [this] { m_tabs->currentLog()->FindNext(-1); }));
    m_logActions.append(addAction(menu, tr("&Go To..."), QKeySequence(tr("Ctrl+G")),
                                  tr("Go to a line or to a time"),
                                  [this] { m_tabs->currentLog()->AskGoTo(); }));
    menu->addSeparator();
    m_filter = addAction(menu, tr("F&ilter"), QKeySequence(tr("Ctrl+L")),
                         tr("Show only lines that contain the filter text"),
                         [this] { m_tabs->currentLog()->FocusFilter(); });
    m_logActions += {m_find, m_filter};
    m_logActions.append(addAction(menu, tr("Clear Fi&lter"), QKeySequence(tr("Ctrl+Shift+F")),
                                  tr("Show all lines again"),
                                  [this] { m_tabs->currentLog()->ClearFilter(); }));
    menu->addSeparator();
    QAction* settings = addAction(menu, tr("Log Se&ttings..."), QKeySequence(tr("Ctrl+,")),
                                  tr("Change what is logged and how many log files are kept"),
                                  [this] { changeLogSettings(); });
    settings->setMenuRole(QAction::PreferencesRole);
}

void MainWindow::makeViewMenu()
{
    QMenu* menu = m_menus.at(2);
    m_showPlaces = addSwitch(menu, tr("&Places"), QKeySequence(tr("F9")),
                             tr("Show program identity and file locations"),
                             [this](bool shown) { showPlaces(shown); });
    m_showToolBar =
        addSwitch(menu, tr("&Tool Bar"), QKeySequence(tr("Ctrl+Alt+B")), tr("Show the tool bar"),
                  [this](bool shown) { m_toolBar->setVisible(shown); });
    menu->addSeparator();
    m_earlierRuns = addSwitch(menu, tr("&Earlier Runs"), QKeySequence(tr("Ctrl+Shift+E")),
                              tr("Show entries from earlier runs"),
                              [this](bool shown) { m_tabs->currentLog()->SetEarlierRuns(shown); });
    m_pause = addSwitch(menu, tr("P&ause"), QKeySequence(tr("Ctrl+Shift+P")),
                        tr("Stop updating the view while logging continues"),
                        [this](bool paused) { m_tabs->currentLog()->SetPaused(paused); });
    m_follow = addSwitch(menu, tr("&Follow Newest"), QKeySequence(tr("Ctrl+Shift+N")),
                         tr("Scroll to new entries as they arrive"),
                         [this](bool follow) { m_tabs->currentLog()->SetFollowing(follow); });
    menu->addSeparator();
    m_logActions += {m_earlierRuns, m_pause, m_follow};
    m_nextProblem = addAction(menu, tr("&Next Problem"), QKeySequence(tr("F8")),
                              tr("Go to the next warning or error"),
                              [this] { m_tabs->currentLog()->GoToProblem(1); });
    m_previousProblem = addAction(menu, tr("Pre&vious Problem"), QKeySequence(tr("Shift+F8")),
                                  tr("Go to the previous warning or error"),
                                  [this] { m_tabs->currentLog()->GoToProblem(-1); });
    menu->addSeparator();
    m_logActions.append(addAction(menu, tr("&Mark"), QKeySequence(tr("Ctrl+M")),
                                  tr("Mark the current line, or remove its mark"),
                                  [this] { m_tabs->currentLog()->ToggleMark(); }));
    m_logActions.append(addAction(menu, tr("N&ote..."), QKeySequence(tr("Ctrl+Shift+M")),
                                  tr("Write a note on the current line"),
                                  [this] { m_tabs->currentLog()->AskNote(); }));
    m_logActions.append(addAction(menu, tr("Next Mar&k"), QKeySequence(tr("F2")),
                                  tr("Go to the next marked line"),
                                  [this] { m_tabs->currentLog()->GoToMark(1); }));
    m_logActions.append(addAction(menu, tr("Previo&us Mark"), QKeySequence(tr("Shift+F2")),
                                  tr("Go to the previous marked line"),
                                  [this] { m_tabs->currentLog()->GoToMark(-1); }));
    menu->addSeparator();
    m_reload = addAction(menu, tr("&Reload"), QKeySequence(tr("F5")), tr("Reload the file"),
                         [this] { m_tabs->currentLog()->Reload(); });
    m_logActions += {m_nextProblem, m_previousProblem, m_reload};
    menu->addSeparator();
    makeEncodingMenu(menu->addMenu(tr("En&coding")));
    makeTextMenu(menu->addMenu(tr("Te&xt")));
    addAction(menu, tr("&Highlight Rules..."), QKeySequence(tr("Ctrl+Shift+H")),
              tr("Give lines with certain texts a color"),
              [this] { m_tabs->EditHighlightRules(); });
    m_reopen =
        addSwitch(menu, tr("Reopen Files at &Start"), QKeySequence(tr("Ctrl+Alt+O")),
                  tr("Open the files of these tabs again when the program starts"), [](bool) {});
}

void MainWindow::makeEncodingMenu(QMenu* menu)
{
    m_logActions.append(menu->menuAction());
    m_encodings = new QActionGroup(menu);
    const auto add = [&](QString const& text, QString const& statusTip, LogEncoding encoding) {
        QAction* action = addSwitch(menu, text, QKeySequence(), statusTip, [this, encoding](bool) {
            m_tabs->currentLog()->SetEncoding(encoding);
        });
        action->setData(encoding.kind());
        m_encodings->addAction(action);
    };
    add(tr("&Automatic"), tr("Find out how the file is encoded"), LogEncoding::Automatic);
    const auto addNamed = [&](QString const& text, LogEncoding encoding) {
        add(text, tr("Read the file as %1").arg(QString(text).remove(QLatin1Char('&'))), encoding);
    };
    addNamed(tr("&Latin-1"), LogEncoding::Latin1);
    addNamed(tr("&UTF-8"), LogEncoding::Utf8);
    addNamed(tr("UTF-&16 LE"), LogEncoding::Utf16Le);
    addNamed(tr("UTF-16 &BE"), LogEncoding::Utf16Be);
}

void MainWindow::makeTextMenu(QMenu* menu)
{
    QAction* larger = addAction(menu, tr("&Larger"), QKeySequence(tr("Ctrl++")),
                                tr("Show logs in larger text"), [this] { setZoom(m_zoom + 1); });
    larger->setShortcuts({QKeySequence(tr("Ctrl++")), QKeySequence(tr("Ctrl+="))});
    addAction(menu, tr("&Smaller"), QKeySequence(tr("Ctrl+-")), tr("Show logs in smaller text"),
              [this] { setZoom(m_zoom - 1); });
    addAction(menu, tr("&Normal Size"), QKeySequence(tr("Ctrl+0")),
              tr("Show logs in the text size of the desktop"), [this] { setZoom(0); });
    menu->addSeparator();
    m_monospaced = addSwitch(menu, tr("&Monospaced Font"), QKeySequence(tr("Ctrl+Alt+M")),
                             tr("Show logs in a font whose characters are equally wide"),
                             [this](bool) { updateTextFont(); });
    m_wrap = addSwitch(menu, tr("Line &Wrap"), QKeySequence(tr("Ctrl+Alt+W")),
                       tr("Show long messages of logs in several lines"),
                       [this](bool wrapped) { m_tabs->SetLineWrap(wrapped); });
}

void MainWindow::setZoom(int zoom)
{
    m_zoom = qBound(-MaximumZoom, zoom, MaximumZoom);
    updateTextFont();
    showMessage(tr("Text size: %1%").arg(qRound(100 * std::pow(ZoomStep, m_zoom))));
}

// The default font, if nothing has been changed, follows the desktop's settings.
void MainWindow::updateTextFont()
{
    const bool monospaced = m_monospaced->isChecked();
    if (m_zoom == 0 && !monospaced) {
        m_tabs->SetTextFont(QFont());
        return;
    }
    const QFont normal = QApplication::font("QAbstractItemView");
    QFont font = monospaced ? QFontDatabase::systemFont(QFontDatabase::FixedFont) : normal;
    font.setPointSizeF(QFontInfo(normal).pointSizeF() * std::pow(ZoomStep, m_zoom));
    m_tabs->SetTextFont(font);
}

void MainWindow::makeHelpMenu()
{
    QMenu* menu = m_menus.at(3);
    addAction(menu, tr("&Manual"), QKeySequence(tr("F1")), tr("Open the manual"),
              [this] { showManual(); });
    addAction(menu, tr("&Keyboard Shortcuts"), QKeySequence(tr("Ctrl+F1")),
              tr("List all keyboard shortcuts"), [this] { showShortcuts(); });
    menu->addSeparator();
    QAction* about = addAction(
        menu, tr("&About %1").arg(QStringLiteral("Velocor")), QKeySequence(tr("Shift+F1")),
        tr("Show version, license, system and directories"), [this] { showAbout(); });
    about->setMenuRole(QAction::AboutRole);
}

void MainWindow::restoreFirstState()
{
    const QSize available = QApplication::desktop()->availableGeometry(this).size();
    resize(QSize(1080, 680).boundedTo(available * 9 / 10));

    m_startupMessage = m_settings.Load();
    m_settings.RestoreGeometry(this);
}

void MainWindow::restoreState()
{
    if (!m_startupMessage.isEmpty())
        m_notice->ShowMessage(m_startupMessage);
    m_monospaced->setChecked(m_settings.Flag(QStringLiteral("monospaced"), false));
    m_zoom = qBound(-MaximumZoom, m_settings.Text(QStringLiteral("zoom")).toInt(), MaximumZoom);
    updateTextFont();
    m_wrap->setChecked(m_settings.Flag(QStringLiteral("lineWrap"), false));
    m_tabs->SetLineWrap(m_wrap->isChecked());
    m_tabs->ownLog()->SetColumnWidths(m_settings.Numbers(QStringLiteral("columns")));
    m_tabs->ownLog()->SetPaneSizes(m_settings.Numbers(QStringLiteral("linePane")));
    m_recent->SetList(m_settings.Text(QStringLiteral("recentFiles")));
    QStringList filters = m_settings.Text(QStringLiteral("filters")).split(QLatin1Char('\n'));
    filters.removeAll(QString());
    m_tabs->SetFilterHistory(filters.mid(0, LogFilterBar::MaximumHistory));
    m_tabs->highlightRules()->SetFromText(m_settings.Text(QStringLiteral("highlights")));
    showPlaces(m_settings.Flag(QStringLiteral("placesShown"), false));
    const bool toolBarShown = m_settings.Flag(QStringLiteral("toolBarShown"), true);
    m_showToolBar->setChecked(toolBarShown);
    m_toolBar->setVisible(toolBarShown);
    m_reopen->setChecked(m_settings.Flag(QStringLiteral("reopenFiles"), true));
}

void MainWindow::saveState()
{
    m_settings.NoteGeometry(this);
    m_settings.SetFlag(QStringLiteral("placesShown"), m_showPlaces->isChecked());
    if (m_showPlaces->isChecked())
        m_settings.SetNumbers(QStringLiteral("panes"), m_splitter->sizes());
    m_settings.SetFlag(QStringLiteral("monospaced"), m_monospaced->isChecked());
    m_settings.SetFlag(QStringLiteral("lineWrap"), m_wrap->isChecked());
    m_settings.SetText(QStringLiteral("zoom"), QString::number(m_zoom));
    m_settings.SetFlag(QStringLiteral("toolBarShown"), m_showToolBar->isChecked());
    m_settings.SetNumbers(QStringLiteral("columns"), m_tabs->ownLog()->columnWidths());
    m_settings.SetNumbers(QStringLiteral("linePane"), m_tabs->ownLog()->paneSizes());
    m_settings.SetText(QStringLiteral("recentFiles"), m_recent->list());
    m_settings.SetText(QStringLiteral("filters"), m_tabs->filterHistory().join(QLatin1Char('\n')));
    m_settings.SetText(QStringLiteral("highlights"), m_tabs->highlightRules()->ToText());
    m_settings.SetFlag(QStringLiteral("reopenFiles"), m_reopen->isChecked());
    const QStringList files = openFiles();
    const QString current = FileTabs::PathOf(m_tabs->currentWidget());
    m_settings.SetText(QStringLiteral("openFiles"), files.join(MruSeparator));
    m_settings.SetText(QStringLiteral("currentFile"),
                       files.contains(current) ? current : QString());

    // No message box: the window may be closing because of a system shutdown.
    const QString error = m_settings.Save();
    if (!error.isEmpty())
        WarningMessage(this, error, false);
}

bool MainWindow::event(QEvent* event)
{
    const bool result = QMainWindow::event(event);
    if (event->type() == QEvent::Paint && !m_painted) {
        m_painted = true;
        QTimer::singleShot(0, this, &MainWindow::complete);
    }
    return result;
}

void MainWindow::startWork()
{
    m_tabs->ownLog()->Open(RunningLog::FileName(), true);
    m_logHealth = std::make_unique<LogHealth>();
    connect(&m_healthTimer, &QTimer::timeout, this, &MainWindow::checkLog);
    m_healthTimer.start(HealthInterval);
    checkLog();
}

// Not standard input, which is gone, and no path that would read back as two.
QStringList MainWindow::openFiles() const
{
    QStringList files;
    for (int i = 1; i < m_tabs->count(); ++i) {
        QWidget const* page = m_tabs->widget(i);
        const QString path = FileTabs::PathOf(page);
        if (!page->findChild<StandardInput*>() && !path.contains(MruSeparator) &&
            path.size() <= RecentFiles::MaximumPathLength && files.size() < MaximumFilesAtStart)
            files.append(path);
    }
    return files;
}

void MainWindow::reopenFiles()
{
    if (!m_reopen->isChecked())
        return;
    const QStringList files = m_settings.Text(QStringLiteral("openFiles"))
                                  .split(MruSeparator)
                                  .mid(0, MaximumFilesAtStart);
    for (QString const& file : files) {
        if (QFileInfo(file).isAbsolute() && QFileInfo(file).isFile())
            m_tabs->OpenInBackground(file);
    }
    m_tabs->GoTo(m_settings.Text(QStringLiteral("currentFile")));
}

void MainWindow::checkLog()
{
    const QString problem = m_logHealth->Check();
    m_health->SetState(problem);
    m_tabs->MarkOwnLog(!problem.isEmpty());
}

void MainWindow::updateTitle()
{
    const QString caption = ApplicationProperty("caption");
    QWidget const* page = m_tabs->currentWidget();
    if (page == m_tabs->ownLog()) {
        setWindowTitle(caption);
        return;
    }
    QString name = QFileInfo(FileTabs::PathOf(page)).fileName();
    if (m_tabs->currentEditor() && m_tabs->currentEditor()->isModified())
        name += QLatin1String(" *");
    // Qt replaces the placeholder, and a file may be called like it.
    name.replace(QLatin1String("[*]"), QLatin1String("[*][*]"));
    setWindowTitle(tr("%1 \u2013 %2").arg(name, caption));
}

void MainWindow::updateState()
{
    updateTitle();
    LogPanel const* log = m_tabs->currentLog();
    SettingsEditor const* editor = m_tabs->currentEditor();
    for (QAction* action : qAsConst(m_logActions))
        action->setEnabled(log != nullptr);
    m_save->setEnabled(editor && editor->CanSave());
    m_close->setEnabled(m_tabs->currentWidget() != m_tabs->ownLog());
    m_summary->setText(log ? log->summary() : editor->path());
    m_summary->setToolTip(PlainToolTip(log ? QString() : editor->path()));
    if (!log)
        return;
    m_pause->setChecked(log->isPaused());
    m_follow->setChecked(log->isFollowing());
    m_earlierRuns->setChecked(log->showsEarlierRuns());
    const QList<QAction*> encodings = m_encodings->actions();
    for (QAction* action : encodings)
        action->setChecked(action->data().toInt() == log->chosenEncoding().kind());
}

void MainWindow::showMessage(QString const& text)
{
    statusBar()->showMessage(Shortened(text, MaximumMessageLength), MessageTime);
}

void MainWindow::chooseFile()
{
    const QString path = QFileDialog::getOpenFileName(
        this, tr("Open"), ApplicationProperty("DataPath"),
        tr("Logs and settings (*.log *.log.* *.cfg *.xml);;All files (*)"));
    if (!path.isEmpty())
        OpenFile(path);
}

void MainWindow::OpenFile(QString const& path)
{
    complete();
    const QString full = QFileInfo(path).absoluteFilePath();
    if (!QFileInfo::exists(full)) {
        offerToForget(path);
        return;
    }
    const QString problem = open(full);
    if (!problem.isEmpty())
        showMessage(problem);
}

// Returns why it cannot be opened; empty if it was.
QString MainWindow::open(QString const& path)
{
    const QFileInfo info(path);
    if (!info.exists())
        return tr("%1 does not exist").arg(path);
    if (info.isDir())
        return tr("%1 is a folder").arg(path);
    if (!info.isFile()) // opening a pipe would block, and a device may have no end
        return tr("%1 is not a regular file").arg(path);
    m_tabs->OpenFile(path);
    m_recent->Add(path);
    return QString();
}

void MainWindow::OpenAtStart(QStringList const& files)
{
    m_filesOfStart = files;
    if (m_tabs)
        openFilesOfStart();
}

void MainWindow::openFilesOfStart()
{
    QStringList problems;
    const QStringList files = m_filesOfStart.mid(0, MaximumFilesAtStart);
    for (QString const& file : files) {
        const bool isInput = file == QLatin1String("-");
        const QString problem = isInput ? openStandardInput() : open(file);
        if (!problem.isEmpty())
            problems.append(Shortened(problem, MaximumMessageLength));
    }
    if (m_filesOfStart.size() > MaximumFilesAtStart)
        problems.append(tr("Only the first %1 of %2 files were opened")
                            .arg(MaximumFilesAtStart)
                            .arg(m_filesOfStart.size()));
    m_filesOfStart.clear();
    if (!problems.isEmpty())
        m_notice->ShowMessage(problems.join(QLatin1Char('\n')));
}

QString MainWindow::openStandardInput()
{
    auto* input = new StandardInput;
    if (input->path().isEmpty()) {
        delete input;
        return tr("Standard input cannot be shown, because no file can be created in %1")
            .arg(QDir::tempPath());
    }
    connect(input, &StandardInput::failed, m_notice, &NoticeBar::ShowMessage);
    input->setParent(m_tabs->OpenLog(input->path())); // ends with its tab
    return QString();
}

bool MainWindow::offerToForget(QString const& path)
{
    if (!m_recent->Contains(path)) {
        showMessage(tr("%1 does not exist").arg(path));
        return false;
    }
    PlainMessageBox box(
        QMessageBox::Question, this,
        tr("%1 no longer exists.\nRemove it from the list of recent files?").arg(path),
        QMessageBox::Yes | QMessageBox::No);
    if (box.exec() != QMessageBox::Yes)
        return false;
    m_recent->Remove(path);
    return true;
}

void MainWindow::openLogFolder()
{
    if (!PlacesPanel::OpenPlace(RunningLog::FileName()))
        showMessage(
            tr("Cannot open the log folder: it does not exist, or there is no file manager"));
}

void MainWindow::saveReport()
{
    ReportDialog dialog(tr("Save Report"),
                        tr("This is the content of the report. Review it before you share it: "
                           "the log may contain private information."),
                        SystemReport::Whole(m_settings.fileName()), true, this);
    dialog.exec();
}

void MainWindow::saveLines()
{
    const QString name = QFileInfo(m_tabs->currentLog()->path()).completeBaseName();
    const QString path = QFileDialog::getSaveFileName(
        this, tr("Save Lines"), ApplicationProperty("DocPath") + name + tr("-lines.log"),
        tr("Logs (*.log);;All files (*)"));
    if (!path.isEmpty())
        saveLinesTo(path);
}

void MainWindow::saveLinesTo(QString const& path)
{
    LogPanel const* log = m_tabs->currentLog();
    if (!log)
        return;
    auto* saver = new LineSaver(log->path(), log->LineStarts(), log->model()->parser().fileType(),
                                path, this);
    connect(saver, &LineSaver::progressed, this,
            [this](int percent) { showMessage(tr("Saving lines: %1%").arg(percent)); });
    connect(saver, &QThread::finished, this, [this, saver] {
        saver->deleteLater();
        const QString error = saver->error();
        if (error.isEmpty())
            showMessage(saver->count() == 1
                            ? tr("1 line saved to %1").arg(saver->target())
                            : tr("%L1 lines saved to %2").arg(saver->count()).arg(saver->target()));
        else
            m_notice->ShowMessage(tr("Could not save lines to %1: %2").arg(saver->target(), error));
    });
    saver->start();
}

void MainWindow::showAbout()
{
    ReportDialog dialog(tr("About %1").arg(QStringLiteral("Velocor")),
                        QStringLiteral("Velocor %1\n").arg(QLatin1String(VELOCOR_VERSION)) +
                            tr("The startup program of the Tork family. MIT license."),
                        SystemReport::Licenses() + SystemReport::Facts(m_settings.fileName()),
                        false, this);
    dialog.exec();
}

void MainWindow::showShortcuts()
{
    ReportDialog dialog(tr("Keyboard Shortcuts"),
                        tr("Alt and the underlined letter open a menu; Tab goes from one control "
                           "to the next."),
                        ShortcutList(this), false, this);
    dialog.exec();
}

void MainWindow::showManual()
{
    if (!OpenManual())
        showMessage(tr("The manual is not installed, or there is no program to show it"));
}

void MainWindow::changeLogSettings()
{
    LogSettingsDialog dialog(this);
    if (dialog.exec() == QDialog::Accepted) {
        showMessage(tr("Log settings saved"));
        checkLog();
    }
}

// A focused text field copies its own selection, also when invoked from the menu.
void MainWindow::copy()
{
    QWidget* focused = QApplication::focusWidget();
    if (focused && focused->metaObject()->indexOfSlot("copy()") >= 0)
        QMetaObject::invokeMethod(focused, "copy");
    else if (LogPanel* log = m_tabs->currentLog())
        log->CopySelected();
}

void MainWindow::selectAll()
{
    QWidget* focused = QApplication::focusWidget();
    if (focused && focused->metaObject()->indexOfSlot("selectAll()") >= 0)
        QMetaObject::invokeMethod(focused, "selectAll");
    else if (LogPanel* log = m_tabs->currentLog())
        log->SelectAll();
}

void MainWindow::closeEvent(QCloseEvent* event)
{
    if (m_tabs && !m_tabs->MayCloseAll()) {
        event->ignore();
        return;
    }
    if (m_tabs) // otherwise there is nothing to save
        saveState();
    event->accept();
}

void MainWindow::dragEnterEvent(QDragEnterEvent* event)
{
    const QList<QUrl> urls = event->mimeData()->urls();
    for (QUrl const& url : urls) {
        if (url.isLocalFile()) {
            event->acceptProposedAction();
            return;
        }
    }
}

void MainWindow::dropEvent(QDropEvent* event)
{
    const QList<QUrl> urls = event->mimeData()->urls().mid(0, MaximumDroppedFiles);
    for (QUrl const& url : urls) {
        if (url.isLocalFile())
            OpenFile(url.toLocalFile());
    }
    event->acceptProposedAction();
}

} // namespace Velocor
