// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainWindow.h"

#include "app/ScreenlessPlatform_p.h"
#include "app/UserMessages.h"
#include "app/history/HistoryTime.h"
#include "app/language/Language.h"
#include "app/runninglog/LogHealth.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunMark.h"
#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/CurrentTab.h"
#include "app/window/FileTabs.h"
#include "app/window/LineCommands.h"
#include "app/window/MainMenus.h"
#include "app/window/MainToolBar.h"
#include "app/window/Panes.h"
#include "app/window/PlacesPanel.h"
#include "app/window/SelectableMessageBoxes.h"
#include "app/window/TextFont.h"
#include "app/window/WindowDialogs.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogPanel.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TallArea.h"
#include "app/window/widgets/TurningSplitter.h"
#include "app/window/widgets/UsualTextHeight.h"

#include <QActionGroup>
#include <QCloseEvent>
#include <QFileInfo>
#include <QGuiApplication>
#include <QMenuBar>
#include <QPushButton>
#include <QScreen>
#include <QStatusBar>
#include <QVBoxLayout>

#include <algorithm>

// Resources of a static library must be initialized explicitly, outside any namespace.
static void InitializeResources()
{
    Q_INIT_RESOURCE(window);
}

namespace Velocor {

namespace {

constexpr int HealthInterval = 2000;       // milliseconds, while there is a problem or a change
constexpr int IdleHealthInterval = 60000;  // milliseconds; nothing tells of a disk that fills up
constexpr int SuspiciousRuns = 3;          // in a row
constexpr int MessageTime = 6000;          // milliseconds
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
    : QMainWindow(parent), m_runMark(std::make_unique<RunMark>(RunningLog::FileName())),
      m_settings(ApplicationProperty("DataPath")), m_marks(ApplicationProperty("DataPath"))
{
    setWindowTitle(ApplicationProperty("caption"));
    setAcceptDrops(true);
    // Size limits are for the window manager. Platforms without one log a warning that they do not
    // support them.
    if (IsScreenlessPlatform())
        layout()->setSizeConstraint(QLayout::SetNoConstraint);
    readSettings();
    makeFirstContent();
    restoreFirstState();
}

// What is wrong with the settings is said in the system's language.
void MainWindow::readSettings()
{
    Language::Use(QString());
    m_startupMessage = m_settings.Load();
    const QString language = m_settings.Text(QStringLiteral("language"));
    if (!language.isEmpty())
        Language::Use(language);
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
        m_titles.append(menuBar()->addMenu(title));
}

void MainWindow::complete()
{
    if (m_tabs)
        return;
    InitializeResources();
    QGuiApplication::setWindowIcon(WindowIcon());
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0) // or icons are scaled up, which Qt 6 never does
    QCoreApplication::setAttribute(Qt::AA_UseHighDpiPixmaps);
#endif
    QGuiApplication::setDesktopFileName(QStringLiteral("org.tork.velocor"));
    new SelectableMessageBoxes(this);
    makeTabs();
    makeStatusBar();
    makeMenus();
    makeToolBar();
    restoreState();
    m_currentTab->Update();
    startWork();
    if (m_menus->actions().reopen->isChecked())
        m_files->Reopen(m_settings);
    openFilesOfStart();
}

void MainWindow::makeTabs()
{
    m_notice = new NoticeBar;
    m_tabs = new FileTabs(&m_marks);
    m_splitter = new TurningSplitter;
    m_splitter->setAccessibleName(tr("Places and files"));
    m_splitter->setChildrenCollapsible(false);
    m_splitter->addWidget(m_tabs);

    auto* content = new QWidget;
    auto* layout = new QVBoxLayout(content);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(m_notice);
    layout->addWidget(new TallArea(m_splitter), 1);
    setCentralWidget(content);
    content->show(); // Qt would do it in the next turn of the event loop

    watchOwnSettings();
    m_health = new NoticeBar(tr("State of the log"));
    m_tabs->ownLog()->AddBar(m_health);
    connect(m_tabs, &FileTabs::messageReported, this, &MainWindow::showMessage);
    m_tabs->ownLog()->setFocus();
}

// Files of this program that somebody may edit in it.
void MainWindow::watchOwnSettings()
{
    const QString own = QFileInfo(m_settings.fileName()).absoluteFilePath();
    m_tabs->SetOwnerNotes(
        {{own, tr("These are the settings of this window. It takes over what you save here: your "
                  "changes take effect at the next start, and everything else is written when the "
                  "window closes.")},
         {QFileInfo(LogPreferences::FileName()).absoluteFilePath(),
          tr("These are the settings of this program's log. It reads them at the next start, and "
             "replaces them only when you change something in Log Settings.")}});
    connect(m_tabs, &FileTabs::saved, this, [this, own](QString const& path) {
        if (QFileInfo(path).canonicalFilePath() == QFileInfo(own).canonicalFilePath())
            m_settings.TakeOverEdits();
    });
}

void MainWindow::makeStatusBar()
{
    m_summary = new ElidedLabel(Qt::ElideMiddle);
    m_summary->setAccessibleName(tr("Lines shown"));
    m_summary->setContentsMargins(4, 0, 6, 0); // starts where the messages do
    m_summary->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    statusBar()->setAccessibleName(tr("Status"));
    statusBar()->setSizeGripEnabled(
        false); // too small to hit, and the edges of the window do the same
    statusBar()->addWidget(m_summary, 1); // not permanent, to leave all room to messages
}

void MainWindow::makeMenus()
{
    m_files = std::make_unique<FileOpener>(m_tabs, this);
    connect(m_files.get(), &FileOpener::messageReported, this, &MainWindow::showMessage);
    connect(m_files.get(), &FileOpener::problemReported, m_notice, &NoticeBar::ShowMessage);
    m_lines = std::make_unique<LineCommands>(m_tabs, this);
    connect(m_lines.get(), &LineCommands::messageReported, this, &MainWindow::showMessage);
    connect(m_lines.get(), &LineCommands::problemReported, m_notice, &NoticeBar::ShowMessage);
    m_textFont = std::make_unique<TextFont>(m_tabs);
    connect(m_textFont.get(), &TextFont::messageReported, this, &MainWindow::showMessage);
    connect(m_tabs, &FileTabs::zoomRequested, m_textFont.get(), &TextFont::Enlarge);
    m_dialogs = std::make_unique<WindowDialogs>(m_settings.fileName(), this);
    connect(m_dialogs.get(), &WindowDialogs::messageReported, this, &MainWindow::showMessage);
    connect(m_dialogs.get(), &WindowDialogs::logSettingsChanged, this, &MainWindow::checkLog);

    m_menus = std::make_unique<MainMenus>(m_titles,
                                          MainMenus::Targets{m_tabs, m_files.get(), m_lines.get(),
                                                             m_textFont.get(), m_dialogs.get()});
    MenuActions const& actions = m_menus->actions();
    connect(actions.quit, &QAction::triggered, this, &MainWindow::close);
    connect(actions.showPlaces, &QAction::triggered, this, &MainWindow::showPlaces);
    connect(actions.nextPane, &QAction::triggered, this, [this] { GoToPane(panes(), 1); });
    connect(actions.previousPane, &QAction::triggered, this, [this] { GoToPane(panes(), -1); });
    connect(m_tabs, &FileTabs::sinceRequested, this, [this] {
        if (!m_menus->actions().since->isChecked())
            m_menus->actions().since->trigger();
    });
    connect(actions.languages, &QActionGroup::triggered, this,
            [this] { showMessage(tr("The language changes when the program starts again.")); });
    m_currentTab = std::make_unique<CurrentTab>(m_tabs, actions, m_summary, this);
}

void MainWindow::makeToolBar()
{
    MenuActions const& actions = m_menus->actions();
    m_toolBar = new MainToolBar;
    m_toolBar->AddTool(actions.open, ActionIcons::Open);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(actions.reload, ActionIcons::Reload);
    m_toolBar->AddTool(actions.pause, ActionIcons::Pause);
    m_toolBar->AddTool(actions.follow, ActionIcons::Follow);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(actions.previousProblem, ActionIcons::PreviousProblem);
    m_toolBar->AddTool(actions.nextProblem, ActionIcons::NextProblem);
    m_toolBar->addSeparator();
    m_toolBar->AddTool(actions.find, ActionIcons::Find);
    m_toolBar->AddTool(actions.filter, ActionIcons::Filter);
    m_toolBar->AddSpace();
    m_toolBar->AddTool(actions.showPlaces, ActionIcons::Places);
    addToolBar(m_toolBar);
    connect(actions.showToolBar, &QAction::triggered, m_toolBar, &QToolBar::setVisible);
}

QList<QWidget*> MainWindow::panes() const
{
    QList<QWidget*> all;
    if (LogPanel const* log = m_tabs->currentLog())
        all = log->Panes();
    else
        all.append(m_tabs->currentWidget());
    all.append(m_places);
    return all;
}

// Made when they are shown for the first time.
void MainWindow::showPlaces(bool shown)
{
    m_menus->actions().showPlaces->setChecked(shown);
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

void MainWindow::restoreFirstState()
{
    if (QScreen const* screen = QGuiApplication::primaryScreen()) {
        const qreal scale = std::max(1.0, qreal(fontMetrics().height()) / UsualTextHeight);
        resize((QSize(1080, 680) * scale).boundedTo(screen->availableSize() * 9 / 10));
    }

    m_settings.RestoreGeometry(this);
}

void MainWindow::restoreState()
{
    if (!m_startupMessage.isEmpty())
        m_notice->ShowMessage(m_startupMessage);
    MenuActions const& actions = m_menus->actions();
    m_textFont->Restore(m_settings);
    actions.monospaced->setChecked(m_textFont->isMonospaced());
    actions.lineWrap->setChecked(m_settings.Flag(QStringLiteral("lineWrap"), false));
    m_tabs->SetLineWrap(actions.lineWrap->isChecked());
    actions.lineNumbers->setChecked(m_settings.Flag(QStringLiteral("lineNumbers"), false));
    m_tabs->SetLineNumbers(actions.lineNumbers->isChecked());
    actions.activity->setChecked(m_settings.Flag(QStringLiteral("activity"), false));
    m_tabs->SetActivity(actions.activity->isChecked());
    actions.since->setChecked(m_settings.Flag(QStringLiteral("since"), false));
    m_tabs->SetSince(actions.since->isChecked());
    restoreGaps();
    actions.foldRepeats->setChecked(m_settings.Flag(QStringLiteral("foldRepeats"), false));
    m_tabs->SetFoldsRepeats(actions.foldRepeats->isChecked());
    m_tabs->highlightRules()->SetFromText(m_settings.Text(QStringLiteral("highlights")));
    restoreColumns();
    m_tabs->ownLog()->SetPaneSizes(m_settings.Numbers(QStringLiteral("linePane")));
    m_files->RestoreRecent(m_settings);
    QStringList filters = m_settings.Text(QStringLiteral("filters")).split(QLatin1Char('\n'));
    filters.removeAll(QString());
    m_tabs->SetFilterHistory(filters.mid(0, LogFilterBar::MaximumHistory));
    showPlaces(m_settings.Flag(QStringLiteral("placesShown"), false));
    const bool toolBarShown = m_settings.Flag(QStringLiteral("toolBarShown"), true);
    actions.showToolBar->setChecked(toolBarShown);
    m_toolBar->setVisible(toolBarShown);
    actions.reopen->setChecked(m_settings.Flag(QStringLiteral("reopenFiles"), true));
    restoreLanguage();
}

// Those of another language would be too narrow for titles and severities, or too wide. Older
// versions have not saved for which they were.
void MainWindow::restoreColumns()
{
    const QString language = m_settings.Text(QStringLiteral("columnsLanguage"));
    if (language.isEmpty() || language == Language::Used())
        m_tabs->ownLog()->SetColumnWidths(m_settings.Numbers(QStringLiteral("columns")));
}

// One of those in the menu; that of the system if it is another one, such as that of a newer
// version.
void MainWindow::restoreLanguage()
{
    const QString saved = m_settings.Text(QStringLiteral("language"));
    const QList<QAction*> languages = m_menus->actions().languages->actions();
    languages.constFirst()->setChecked(true);
    for (QAction* action : languages) {
        if (action->data() == saved)
            action->setChecked(true);
    }
}

// One of those in the menu; none if it is another one.
void MainWindow::restoreGaps()
{
    const QList<int> saved = m_settings.Numbers(QStringLiteral("leastGap"));
    const QList<QAction*> gaps = m_menus->actions().gaps->actions();
    QAction* chosen = gaps.first();
    for (QAction* gap : gaps) {
        if (!saved.isEmpty() && gap->data().toLongLong() == saved.first())
            chosen = gap;
    }
    chosen->setChecked(true);
    m_tabs->SetLeastGap(chosen->data().toLongLong());
}

void MainWindow::saveState()
{
    MenuActions const& actions = m_menus->actions();
    m_settings.NoteGeometry(this);
    m_settings.SetFlag(QStringLiteral("placesShown"), actions.showPlaces->isChecked());
    if (actions.showPlaces->isChecked() && m_splitter->orientation() == Qt::Horizontal)
        m_settings.SetNumbers(QStringLiteral("panes"), m_splitter->sizes());
    m_textFont->Save(m_settings);
    m_settings.SetFlag(QStringLiteral("lineWrap"), actions.lineWrap->isChecked());
    m_settings.SetFlag(QStringLiteral("lineNumbers"), actions.lineNumbers->isChecked());
    m_settings.SetFlag(QStringLiteral("activity"), actions.activity->isChecked());
    m_settings.SetFlag(QStringLiteral("since"), actions.since->isChecked());
    m_settings.SetNumbers(QStringLiteral("leastGap"),
                          {actions.gaps->checkedAction()->data().toInt()});
    m_settings.SetFlag(QStringLiteral("foldRepeats"), actions.foldRepeats->isChecked());
    m_settings.SetText(QStringLiteral("highlights"), m_tabs->highlightRules()->ToText());
    m_settings.SetFlag(QStringLiteral("toolBarShown"), actions.showToolBar->isChecked());
    m_settings.SetNumbers(QStringLiteral("columns"), m_tabs->ownLog()->columnWidths());
    m_settings.SetText(QStringLiteral("columnsLanguage"), Language::Used());
    m_settings.SetNumbers(QStringLiteral("linePane"), m_tabs->ownLog()->paneSizes());
    m_settings.SetText(QStringLiteral("filters"), m_tabs->filterHistory().join(QLatin1Char('\n')));
    m_settings.SetFlag(QStringLiteral("reopenFiles"), actions.reopen->isChecked());
    m_settings.SetText(QStringLiteral("language"),
                       actions.languages->checkedAction()->data().toString());
    m_files->Save(m_settings);

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
    if (event->type() == QEvent::WindowActivate && m_logHealth)
        checkLog();
    return result;
}

void MainWindow::startWork()
{
    m_tabs->ownLog()->Open(RunningLog::FileName(), true);
    tellOfAbnormalEnds(m_runMark->CollectOthers());
    m_logHealth = std::make_unique<LogHealth>();
    connect(&m_healthTimer, &QTimer::timeout, this, &MainWindow::checkLog);
    connect(m_logHealth.get(), &LogHealth::mayHaveChanged, this, [this] {
        if (m_healthTimer.remainingTime() > HealthInterval)
            m_healthTimer.start(HealthInterval);
    });
    checkLog();
    QTimer::singleShot(RunEnds::ShortRun, this, [this] { m_runMark->NoteLongLife(); });
}

void MainWindow::tellOfAbnormalEnds(std::vector<RunEnd> const& ends)
{
    if (ends.empty())
        return;
    auto* bar = new NoticeBar(tr("How the last run ended"));
    QPushButton* showButton = bar->AddButton(tr("Show"));
    showButton->setAccessibleName(tr("Show the last entries of that run"));
    connect(showButton, &QPushButton::clicked, m_dialogs.get(), &WindowDialogs::ShowEndOfRun);
    QPushButton* reportButton = bar->AddButton(tr("Report..."));
    reportButton->setAccessibleName(tr("Report how the last run ended"));
    connect(reportButton, &QPushButton::clicked, m_dialogs.get(), &WindowDialogs::SaveReport);
    m_tabs->ownLog()->AddBar(bar);
    const QString start =
        HistoryTime::DateTime(ends.back().start).toString(QStringLiteral("yyyy-MM-dd hh:mm:ss"));
    bar->ShowMessage(
        tr("The program that was started at %1 did not end normally.").arg(LeftToRight(start)));
    const int shortRuns =
        RunEnds::ShortRunsBefore(RunEnds::Of(RunningLog::FileName()), RunMark::ProgramStart());
    if (shortRuns >= SuspiciousRuns && QFileInfo(m_settings.fileName()).isFile())
        offerDefaults(bar);
}

// The window cannot know that its settings are the reason, so it leaves them alone until it is
// told.
void MainWindow::offerDefaults(NoticeBar* bar)
{
    bar->ShowMessage(
        tr("It ended within ten seconds at least three times in a row. If that is because "
           "of its settings, set them aside: %1")
            .arg(LeftToRight(m_settings.fileName())));
    QPushButton* button = bar->AddButton(tr("Set Aside"));
    button->setAccessibleName(tr("Set the settings of this window aside"));
    connect(button, &QPushButton::clicked, this, [this, bar, button] {
        QString name;
        const QString error = m_settings.SetAside(name);
        button->setVisible(!error.isEmpty());
        bar->ShowMessage(
            error.isEmpty()
                ? tr("The next start uses default settings. These are now in %1").arg(name)
                : error);
    });
}

void MainWindow::checkLog()
{
    const QString problem = m_logHealth->Check();
    m_healthTimer.start(problem.isEmpty() ? IdleHealthInterval : HealthInterval);
    m_health->SetState(problem);
    m_tabs->MarkOwnLog(!problem.isEmpty());
}

void MainWindow::showMessage(QString const& text)
{
    statusBar()->showMessage(Shortened(text, MaximumMessageLength), MessageTime);
}

void MainWindow::OpenFile(QString const& path)
{
    complete();
    m_files->Open(path);
}

void MainWindow::OpenAtStart(QStringList const& files)
{
    m_filesOfStart = files;
    if (m_tabs)
        openFilesOfStart();
}

void MainWindow::openFilesOfStart()
{
    const QStringList files = m_filesOfStart;
    m_filesOfStart.clear();
    m_files->OpenAll(files);
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
    if (FileOpener::CanDrop(event->mimeData()))
        event->acceptProposedAction();
}

void MainWindow::dropEvent(QDropEvent* event)
{
    complete();
    m_files->Drop(event->mimeData());
    event->acceptProposedAction();
}

} // namespace Velocor
