// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainMenus.h"

#include "app/language/Language.h"
#include "app/logfile/Milliseconds.h"
#include "app/window/FileOpener.h"
#include "app/window/FileTabs.h"
#include "app/window/LineCommands.h"
#include "app/window/TextFont.h"
#include "app/window/WindowDialogs.h"
#include "app/window/log/LogPanel.h"
#include "app/window/settings/SettingsEditor.h"

#include <QActionGroup>
#include <QMenu>

namespace Velocor {

MainMenus::MainMenus(QList<QMenu*> const& menus, Targets const& targets) : m_targets(targets)
{
    fillFileMenu(menus.at(0));
    fillEditMenu(menus.at(1));
    fillViewMenu(menus.at(2));
    fillHelpMenu(menus.at(3));
}

QAction* MainMenus::add(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                        QString const& statusTip, Work const& work)
{
    QAction* action = menu->addAction(text);
    action->setShortcut(shortcut);
    action->setStatusTip(statusTip);
    action->setMenuRole(QAction::NoRole);
    connect(action, &QAction::triggered, this, work);
    return action;
}

QAction* MainMenus::addSwitch(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                              QString const& statusTip, SwitchWork const& work)
{
    QAction* action = add(menu, text, shortcut, statusTip, [] {});
    action->setCheckable(true);
    connect(action, &QAction::triggered, this, work);
    return action;
}

QAction* MainMenus::addForLog(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                              QString const& statusTip, LogWork const& work)
{
    m_actions.ofLogs.append(
        add(menu, text, shortcut, statusTip, [this, work] { work(m_targets.tabs->currentLog()); }));
    return m_actions.ofLogs.last();
}

QAction* MainMenus::addSwitchForLog(QMenu* menu, QString const& text, QKeySequence const& shortcut,
                                    QString const& statusTip, LogSwitchWork const& work)
{
    m_actions.ofLogs.append(addSwitch(menu, text, shortcut, statusTip, [this, work](bool on) {
        work(m_targets.tabs->currentLog(), on);
    }));
    return m_actions.ofLogs.last();
}

void MainMenus::fillFileMenu(QMenu* menu)
{
    m_actions.open =
        add(menu, tr("&Open..."), QKeySequence::Open, tr("Open a log file or a settings file"),
            [this] { m_targets.files->Choose(); });
    m_targets.files->FillRecentMenu(menu->addMenu(tr("Open &Recent")));
    m_actions.save =
        add(menu, tr("&Save"), QKeySequence::Save, tr("Save the current settings file"),
            [this] { m_targets.tabs->currentEditor()->Save(); });
    m_actions.ofSettings.append(
        add(menu, tr("&What Will Be Written..."), QKeySequence(tr("Ctrl+Shift+W")),
            tr("Compare the settings file with what saving would make of it"),
            [this] { m_targets.tabs->currentEditor()->ShowWhatWillBeWritten(); }));
    m_actions.ofSettings.append(
        add(menu, tr("Compare Wit&h..."), QKeySequence(tr("Ctrl+Shift+D")),
            tr("Compare the settings with another file, and take over values"),
            [this] { m_targets.tabs->currentEditor()->CompareWithOther(); }));
    m_actions.close = add(menu, tr("&Close Tab"), QKeySequence::Close, tr("Close the current file"),
                          [this] { m_targets.tabs->CloseCurrent(); });
    addForLog(menu, tr("Save &Lines As..."), QKeySequence(tr("Ctrl+Shift+S")),
              tr("Save the lines that the filter shows to a file"),
              [this](LogPanel*) { m_targets.lines->Save(); });
    menu->addSeparator();
    add(menu, tr("Open Log &Folder"), QKeySequence(tr("Ctrl+Shift+O")),
        tr("Show the log files in the file manager"),
        [this] { m_targets.dialogs->OpenLogFolder(); });
    add(menu, tr("Save Re&port..."), QKeySequence(tr("Ctrl+Shift+R")),
        tr("Review and save the information for a bug report"),
        [this] { m_targets.dialogs->SaveReport(); });
    menu->addSeparator();
    m_actions.quit =
        add(menu, tr("&Quit"), QKeySequence(tr("Ctrl+Q")), tr("Close the program"), [] {});
    m_actions.quit->setMenuRole(QAction::QuitRole);
}

void MainMenus::fillEditMenu(QMenu* menu)
{
    addUndo(menu);
    menu->addSeparator();
    addCopying(menu);
    menu->addSeparator();
    addFinding(menu);
    menu->addSeparator();
    m_actions.filter = addForLog(menu, tr("F&ilter"), QKeySequence(tr("Ctrl+L")),
                                 tr("Show only lines that contain the filter text"),
                                 [](LogPanel* log) { log->FocusFilter(); });
    addForLog(menu, tr("Als&o Filter"), QKeySequence(tr("Ctrl+Shift+L")),
              tr("Show only lines that contain further terms, too"),
              [](LogPanel* log) { log->FocusRequired(); });
    addForLog(menu, tr("&Hide Lines"), QKeySequence(tr("Ctrl+Shift+K")),
              tr("Hide lines that contain certain terms"),
              [](LogPanel* log) { log->FocusHidden(); });
    addForLog(menu, tr("Clear Fi&lter"), QKeySequence(tr("Ctrl+Shift+F")),
              tr("Show all lines again"), [](LogPanel* log) { log->ClearFilter(); });
    menu->addSeparator();
    QAction* settings = add(menu, tr("Log Se&ttings..."), QKeySequence(tr("Ctrl+,")),
                            tr("Change what is logged and how many log files are kept"),
                            [this] { m_targets.dialogs->ChangeLogSettings(); });
    settings->setMenuRole(QAction::PreferencesRole);
}

void MainMenus::addUndo(QMenu* menu)
{
    m_actions.undo = add(menu, tr("&Undo"), QKeySequence::Undo,
                         tr("Take back the last change of the settings file"),
                         [this] { m_targets.lines->Undo(); });
    m_actions.redo = add(menu, tr("&Redo"), QKeySequence::Redo, tr("Make the last change again"),
                         [this] { m_targets.lines->Redo(); });
    m_actions.settings = menu->addMenu(tr("S&ettings File"));
}

void MainMenus::addCopying(QMenu* menu)
{
    add(menu, tr("&Copy"), QKeySequence::Copy, tr("Copy the selected lines"),
        [this] { m_targets.lines->Copy(); });
    QMenu* copyAs = menu->addMenu(tr("Copy A&s"));
    addForLog(copyAs, tr("&Markdown"), QKeySequence(tr("Ctrl+Alt+D")),
              tr("Copy the selected lines as a Markdown code block"),
              [](LogPanel* log) { log->CopyAsMarkdown(); });
    addForLog(copyAs, tr("&CSV"), QKeySequence(tr("Ctrl+Alt+V")),
              tr("Copy the selected lines as comma-separated values"),
              [](LogPanel* log) { log->CopyAsCsv(); });
    add(menu, tr("Select &All"), QKeySequence::SelectAll, tr("Select all lines"),
        [this] { m_targets.lines->SelectAll(); });
}

void MainMenus::addFinding(QMenu* menu)
{
    m_actions.find = addForLog(menu, tr("&Find"), QKeySequence::Find,
                               tr("Go to lines that contain a text, among the others"),
                               [](LogPanel* log) { log->OpenFind(); });
    addForLog(menu, tr("Find &Next"), QKeySequence(tr("F3")), tr("Go to the next line found"),
              [](LogPanel* log) { log->FindNext(1); });
    addForLog(menu, tr("Find Pre&vious"), QKeySequence(tr("Shift+F3")),
              tr("Go to the previous line found"), [](LogPanel* log) { log->FindNext(-1); });
    addForLog(menu, tr("&Go To..."), QKeySequence(tr("Ctrl+G")), tr("Go to a line or to a time"),
              [](LogPanel* log) { log->AskGoTo(); });
}

void MainMenus::fillViewMenu(QMenu* menu)
{
    m_actions.showPlaces = addSwitch(menu, tr("&Places"), QKeySequence(tr("F9")),
                                     tr("Show program identity and file locations"), [](bool) {});
    m_actions.showToolBar = addSwitch(menu, tr("&Tool Bar"), QKeySequence(tr("Ctrl+Alt+B")),
                                      tr("Show the tool bar"), [](bool) {});
    m_actions.nextPane = add(menu, tr("&Go to Next Pane"), QKeySequence(tr("F6")),
                             tr("Go from the filter to the lines, to the full text, ..."), [] {});
    m_actions.previousPane = add(menu, tr("Go to Prev&ious Pane"), QKeySequence(tr("Shift+F6")),
                                 tr("Go to the pane before"), [] {});
    menu->addSeparator();
    addMovement(menu);
    menu->addSeparator();
    addProblems(menu);
    menu->addSeparator();
    addMarks(menu);
    menu->addSeparator();
    m_actions.reload = addForLog(menu, tr("&Reload"), QKeySequence(tr("F5")), tr("Reload the file"),
                                 [](LogPanel* log) { log->Reload(); });
    menu->addSeparator();
    fillEncodingMenu(menu->addMenu(tr("En&coding")));
    fillTextMenu(menu->addMenu(tr("Te&xt")));
    fillAnalyzeMenu(menu->addMenu(tr("Anal&yze")));
    fillLanguageMenu(menu->addMenu(tr("&Display Language")));
    add(menu, tr("&Highlight Rules..."), QKeySequence(tr("Ctrl+Shift+H")),
        tr("Give lines with certain texts a color"),
        [this] { m_targets.tabs->EditHighlightRules(); });
    m_actions.reopen =
        addSwitch(menu, tr("Reopen Files at &Start"), QKeySequence(tr("Ctrl+Alt+O")),
                  tr("Open the files of these tabs again when the program starts"), [](bool) {});
}

void MainMenus::addMovement(QMenu* menu)
{
    m_actions.allFiles =
        addSwitchForLog(menu, tr("All Files, &by Time"), QKeySequence(tr("Ctrl+Shift+A")),
                        tr("Show the older files of the log, too, as one, each run with a heading"),
                        [](LogPanel* log, bool shown) { log->SetAllFiles(shown); });
    m_actions.family =
        addSwitchForLog(menu, tr("&Whole Family, by Time"), QKeySequence(tr("Ctrl+Alt+F")),
                        tr("Show the logs of all programs of the family as one"),
                        [](LogPanel* log, bool shown) { log->SetFamily(shown); });
    m_actions.earlierRuns =
        addSwitchForLog(menu, tr("&Earlier Runs"), QKeySequence(tr("Ctrl+Shift+E")),
                        tr("Show entries from earlier runs"),
                        [](LogPanel* log, bool shown) { log->SetEarlierRuns(shown); });
    m_actions.pause = addSwitchForLog(menu, tr("P&ause"), QKeySequence(tr("Ctrl+Shift+P")),
                                      tr("Stop updating the view while logging continues"),
                                      [](LogPanel* log, bool paused) { log->SetPaused(paused); });
    m_actions.follow =
        addSwitchForLog(menu, tr("&Follow Newest"), QKeySequence(tr("Ctrl+Shift+N")),
                        tr("Scroll to new entries as they arrive"),
                        [](LogPanel* log, bool follow) { log->SetFollowing(follow); });
}

void MainMenus::addProblems(QMenu* menu)
{
    m_actions.nextProblem = addForLog(menu, tr("&Next Problem"), QKeySequence(tr("F8")),
                                      tr("Go to the next warning or error"),
                                      [](LogPanel* log) { log->GoToProblem(1); });
    m_actions.previousProblem = addForLog(
        menu, tr("Pre&vious Problem"), QKeySequence(tr("Shift+F8")),
        tr("Go to the previous warning or error"), [](LogPanel* log) { log->GoToProblem(-1); });
}

void MainMenus::addMarks(QMenu* menu)
{
    addForLog(menu, tr("&Mark"), QKeySequence(tr("Ctrl+M")),
              tr("Mark the current line, or remove its mark"),
              [](LogPanel* log) { log->ToggleMark(); });
    addForLog(menu, tr("N&ote..."), QKeySequence(tr("Ctrl+Shift+M")),
              tr("Write a note on the current line"), [](LogPanel* log) { log->AskNote(); });
    addForLog(menu, tr("Next Mar&k"), QKeySequence(tr("F2")), tr("Go to the next marked line"),
              [](LogPanel* log) { log->GoToMark(1); });
    addForLog(menu, tr("Previo&us Mark"), QKeySequence(tr("Shift+F2")),
              tr("Go to the previous marked line"), [](LogPanel* log) { log->GoToMark(-1); });
    addForLog(menu, tr("A&ll Marks..."), QKeySequence(tr("Ctrl+F2")),
              tr("List the marked lines and their notes"), [](LogPanel* log) { log->ShowMarks(); });
}

void MainMenus::fillEncodingMenu(QMenu* menu)
{
    m_actions.ofLogs.append(menu->menuAction());
    m_actions.encodings = new QActionGroup(menu);
    const auto addEncoding = [&](QString const& text, QString const& statusTip,
                                 LogEncoding encoding) {
        QAction* action = addSwitch(menu, text, QKeySequence(), statusTip, [this, encoding](bool) {
            m_targets.tabs->currentLog()->SetEncoding(encoding);
        });
        action->setData(encoding.kind());
        m_actions.encodings->addAction(action);
    };
    addEncoding(tr("&Automatic"), tr("Find out how the file is encoded"), LogEncoding::Automatic);
    const auto addNamed = [&](QString const& text, LogEncoding encoding) {
        addEncoding(text, tr("Read the file as %1").arg(QString(text).remove(QLatin1Char('&'))),
                    encoding);
    };
    addNamed(tr("&Latin-1"), LogEncoding::Latin1);
    addNamed(tr("&UTF-8"), LogEncoding::Utf8);
    addNamed(tr("UTF-&16 LE"), LogEncoding::Utf16Le);
    addNamed(tr("UTF-16 &BE"), LogEncoding::Utf16Be);
}

void MainMenus::fillTextMenu(QMenu* menu)
{
    QAction* larger = add(menu, tr("&Larger"), QKeySequence(tr("Ctrl++")),
                          tr("Show logs in larger text"), [this] { m_targets.font->Enlarge(1); });
    larger->setShortcuts({QKeySequence(tr("Ctrl++")), QKeySequence(tr("Ctrl+="))});
    add(menu, tr("&Smaller"), QKeySequence(tr("Ctrl+-")), tr("Show logs in smaller text"),
        [this] { m_targets.font->Enlarge(-1); });
    add(menu, tr("&Normal Size"), QKeySequence(tr("Ctrl+0")),
        tr("Show logs in the text size of the desktop"), [this] { m_targets.font->ResetSize(); });
    menu->addSeparator();
    m_actions.monospaced =
        addSwitch(menu, tr("&Monospaced Font"), QKeySequence(tr("Ctrl+Alt+M")),
                  tr("Show logs in a font whose characters are equally wide"),
                  [this](bool monospaced) { m_targets.font->SetMonospaced(monospaced); });
    m_actions.lineWrap = addSwitch(menu, tr("Line &Wrap"), QKeySequence(tr("Ctrl+Alt+W")),
                                   tr("Show long messages of logs in several lines"),
                                   [this](bool wrapped) { m_targets.tabs->SetLineWrap(wrapped); });
    m_actions.lineNumbers =
        addSwitch(menu, tr("Line N&umbers"), QKeySequence(tr("Ctrl+Alt+N")),
                  tr("Show the numbers of the lines in the file beside logs"),
                  [this](bool shown) { m_targets.tabs->SetLineNumbers(shown); });
}

void MainMenus::fillAnalyzeMenu(QMenu* menu)
{
    m_actions.activity =
        addSwitch(menu, tr("&Activity"), QKeySequence(tr("Ctrl+Alt+A")),
                  tr("Show how many entries and problems there are by time, above logs"),
                  [this](bool shown) { m_targets.tabs->SetActivity(shown); });
    m_actions.since = addSwitch(menu, tr("&Time Since"), QKeySequence(tr("Ctrl+Alt+S")),
                                tr("Show the time since the entry above or since a chosen one"),
                                [this](bool shown) { m_targets.tabs->SetSince(shown); });
    fillGapMenu(menu->addMenu(tr("&Gaps")));
    m_actions.foldRepeats =
        addSwitch(menu, tr("Fold &Repeats"), QKeySequence(tr("Ctrl+Alt+R")),
                  tr("Show entries that differ from the one above only in numbers and quoted names "
                     "as one row"),
                  [this](bool folds) { m_targets.tabs->SetFoldsRepeats(folds); });
    addForLog(menu, tr("&Patterns..."), QKeySequence(tr("Ctrl+Alt+P")),
              tr("List what messages have in common, and how often"),
              [](LogPanel* log) { log->ShowPatterns(); });
}

void MainMenus::fillGapMenu(QMenu* menu)
{
    m_actions.gaps = new QActionGroup(menu);
    const auto addGap = [&](QString const& text, QString const& statusTip, qint64 span) {
        QAction* action = addSwitch(menu, text, QKeySequence(), statusTip,
                                    [this, span](bool) { m_targets.tabs->SetLeastGap(span); });
        action->setData(span);
        m_actions.gaps->addAction(action);
    };
    const auto addSpan = [&](QString const& text, qint64 span) {
        addGap(text,
               tr("Show where no entry follows for %1").arg(QString(text).remove(QLatin1Char('&'))),
               span);
    };
    addGap(tr("&None"), tr("Do not show gaps between entries"), 0);
    addSpan(tr("&1 Second"), Milliseconds::Second);
    addSpan(tr("10 &Seconds"), 10 * Milliseconds::Second);
    addSpan(tr("1 &Minute"), Milliseconds::Minute);
    addSpan(tr("10 M&inutes"), 10 * Milliseconds::Minute);
    addSpan(tr("1 &Hour"), Milliseconds::Hour);
}

// A new language takes effect at the next start: by then the window has built many of its texts
// from others, which it does not keep.
void MainMenus::fillLanguageMenu(QMenu* menu)
{
    m_actions.languages = new QActionGroup(menu);
    const auto addLanguage = [&](QString const& text, QString const& statusTip,
                                 QString const& code) {
        QAction* action = addSwitch(menu, text, QKeySequence(), statusTip, [](bool) {});
        action->setData(code);
        m_actions.languages->addAction(action);
    };
    addLanguage(tr("&System Language"), tr("Use the language of the system from the next start on"),
                QString());
    const QList<Language> languages = Language::All();
    for (Language const& language : languages)
        addLanguage(language.name, tr("Use %1 from the next start on").arg(language.name),
                    language.code);
}

void MainMenus::fillHelpMenu(QMenu* menu)
{
    add(menu, tr("&Manual"), QKeySequence(tr("F1")), tr("Open the manual"),
        [this] { m_targets.dialogs->ShowManual(); });
    add(menu, tr("&Keyboard Shortcuts"), QKeySequence(tr("Ctrl+F1")),
        tr("List all keyboard shortcuts"), [this] { m_targets.dialogs->ShowShortcuts(); });
    menu->addSeparator();
    QAction* about =
        add(menu, tr("&About %1").arg(QStringLiteral("Velocor")), QKeySequence(tr("Shift+F1")),
            tr("Show version, license, system and directories"),
            [this] { m_targets.dialogs->ShowAbout(); });
    about->setMenuRole(QAction::AboutRole);
}

} // namespace Velocor
