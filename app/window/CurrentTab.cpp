// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/CurrentTab.h"

#include "app/window/ApplicationProperty.h"
#include "app/window/FileTabs.h"
#include "app/window/MainMenus.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/Announcer.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/PlainText.h"

#include <QActionGroup>
#include <QFileInfo>
#include <QMenu>

namespace Velocor {

namespace {

// So that one burst of problems is one announcement.
constexpr int NewsInterval = 1000; // milliseconds

constexpr int MaximumNewsLength = 200;

} // namespace

CurrentTab::CurrentTab(FileTabs* tabs, MenuActions const& actions, ElidedLabel* summary,
                       QWidget* window)
    : m_tabs(tabs), m_actions(actions), m_summary(summary), m_window(window)
{
    connect(m_tabs, &FileTabs::stateChanged, this, &CurrentTab::Update);
    m_news.setSingleShot(true);
    m_news.setInterval(NewsInterval);
    connect(&m_news, &QTimer::timeout, this, &CurrentTab::announceProblems);
}

void CurrentTab::Update()
{
    updateTitle();
    LogPanel const* log = m_tabs->currentLog();
    for (QAction* action : m_actions.ofLogs)
        action->setEnabled(log != nullptr);
    updateEditing();
    m_actions.close->setEnabled(m_tabs->currentWidget() != m_tabs->ownLog());
    const QString path = FileTabs::PathOf(m_tabs->currentWidget());
    m_summary->setText(log ? log->summary() : LeftToRight(path));
    m_summary->setToolTip(PlainToolTip(log ? QString() : LeftToRight(path)));
    if (log)
        updateSwitches(log);
    countProblems(log);
}

// Those that the log got since the last time, not those of another tab, filter or file.
void CurrentTab::countProblems(LogPanel const* log)
{
    HistoryUpdate const* state = log ? &log->model()->state() : nullptr;
    const size_t problems = state ? state->rows->problems() : 0;
    const bool isSame = state && log == m_log && !state->isReset && !state->isFolding;
    if (!isSame)
        m_newProblems = 0;
    else if (problems > m_problems)
        m_newProblems += problems - m_problems;
    m_log = log;
    m_problems = problems;
    if (m_newProblems > 0 && !m_news.isActive())
        m_news.start();
}

void CurrentTab::announceProblems()
{
    if (!m_log || m_newProblems == 0)
        return;
    LogModel const* model = m_log->model();
    const int row = model->FindProblem(model->logRowCount(), -1);
    const QString last = row < 0 ? QString() : model->MessageText(row);
    Announcer::Say(m_window, tr("%Ln new problem(s): %1", nullptr, static_cast<int>(m_newProblems))
                                 .arg(Shortened(last, MaximumNewsLength)));
    m_newProblems = 0;
}

void CurrentTab::updateEditing()
{
    SettingsEditor* editor = m_tabs->currentEditor();
    m_actions.save->setEnabled(editor && editor->CanSave());
    m_actions.undo->setEnabled(editor && editor->CanUndo());
    m_actions.redo->setEnabled(editor && editor->CanRedo());
    m_actions.undo->setText(tr("&Undo %1").arg(editor ? editor->UndoText() : QString()).trimmed());
    m_actions.redo->setText(tr("&Redo %1").arg(editor ? editor->RedoText() : QString()).trimmed());

    const QList<QAction*> commands = editor ? editor->commands() : QList<QAction*>();
    if (m_actions.settings->actions() != commands) {
        m_actions.settings->clear();
        m_actions.settings->addActions(commands);
    }
    m_actions.settings->menuAction()->setEnabled(!commands.isEmpty());
    for (QAction* action : m_actions.ofSettings)
        action->setEnabled(editor && editor->ShowsTree());
    if (editor)
        editor->AddOuterActions({m_actions.undo, m_actions.redo});
}

void CurrentTab::updateTitle()
{
    const QString caption = ApplicationProperty("caption");
    QWidget const* page = m_tabs->currentWidget();
    if (page == m_tabs->ownLog()) {
        m_window->setWindowTitle(caption);
        return;
    }
    QString name = QFileInfo(FileTabs::PathOf(page)).fileName();
    if (m_tabs->currentEditor() && m_tabs->currentEditor()->isModified())
        name += QLatin1String(" *");
    // Qt replaces the placeholder, and a file may be called like it.
    name.replace(QLatin1String("[*]"), QLatin1String("[*][*]"));
    m_window->setWindowTitle(tr("%1 \u2013 %2").arg(name, caption));
}

void CurrentTab::updateSwitches(LogPanel const* log)
{
    m_actions.pause->setChecked(log->isPaused());
    m_actions.follow->setChecked(log->isFollowing());
    m_actions.allFiles->setChecked(log->showsAllFiles());
    m_actions.family->setChecked(log->showsFamily());
    m_actions.earlierRuns->setChecked(log->showsEarlierRuns());
    const QList<QAction*> encodings = m_actions.encodings->actions();
    for (QAction* action : encodings)
        action->setChecked(action->data().toInt() == log->chosenEncoding().kind());
}

} // namespace Velocor
