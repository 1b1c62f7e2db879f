// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/ProgramLogs.h"
#include "app/logfile/LogEncoding.h"
#include "app/window/log/FindControl.h"
#include "app/window/log/LineCopier.h"
#include "app/window/log/MarkControl.h"

#include <QList>
#include <QString>
#include <QStringList>
#include <QWidget>

#include <memory>

class QModelIndex;
class QSplitter;

namespace Velocor {

class ActivityStrip;
class CurrentLine;
class HighlightRules;
class LineNumberMargin;
class LogFileBox;
class LogFilterBar;
class LogFindBar;
class LogGoTo;
class LogMarkStore;
class LogModel;
class LogOverview;
class LogView;
class NoticeBar;
class ProgramsButton;

/// A log view with its controls: choice of older files, filter, table, and the text of the current
/// line.
///
///     auto* panel = new LogPanel;
///     panel->Open(TorkLog::logger()->newLogFileName(), true);
class LogPanel : public QWidget
{
    Q_OBJECT

public:
    explicit LogPanel(QWidget* parent = nullptr);

    /// Shows a log file.
    ///
    /// @param isCurrent  whether the running program writes to it
    void Open(QString const& path, bool isCurrent);

    /// Reads the file again from the start.
    void Reload();

    void SetPaused(bool paused);
    bool isPaused() const;
    void SetFollowing(bool following);
    bool isFollowing() const;
    void SetEarlierRuns(bool shown);
    bool showsEarlierRuns() const;

    /// Shows the older files of the log, too, as one; or only the current one again.
    void SetAllFiles(bool shown);
    bool showsAllFiles() const;

    /// Shows the logs of all programs of the family, and those added by the user, as one; or only
    /// this log's current file again.
    void SetFamily(bool shown);
    bool showsFamily() const;

    /// Shows further logs with those of the family.
    ///
    /// @param paths  of their files; those that are shown already are left out
    void AddToFamily(QStringList const& paths);

    /// Reads the file in another encoding, also in the next session; Automatic finds out which.
    void SetEncoding(LogEncoding encoding);
    LogEncoding chosenEncoding() const;

    /// Sets the font of the table and of the current line; a default QFont is the application's.
    /// The columns keep their widths in characters.
    void SetTextFont(QFont const& font);

    /// See LogView::SetLineWrap().
    void SetLineWrap(bool wrapped);

    /// Shows the numbers of the lines in the file beside the rows.
    void SetLineNumbers(bool shown);

    /// Shows the bars with the number of entries by time.
    void SetActivity(bool shown);

    /// See LogView::SetSince() and LogView::SetLeastGap().
    void SetSince(bool shown);
    void SetLeastGap(qint64 span);

    /// See LogModel::SetFoldsRepeats().
    void SetFoldsRepeats(bool folds);

    /// Adds a bar above the table. The panel takes ownership.
    void AddBar(QWidget* bar);

    /// Its panes in the order of the screen, some of which may be hidden.
    QList<QWidget*> Panes() const;

    void FocusFilter();

    /// Opens the second row of the filter and focuses one of its fields.
    void FocusRequired();
    void FocusHidden();
    void ClearFilter();

    /// Opens the find bar.
    void OpenFind();

    /// Goes to the next (step 1) or previous (step -1) line with the text to find, as soon as it is
    /// found. Opens the find bar if there is no text yet.
    void FindNext(int step) { m_find->Next(step); }

    /// Asks for a line number or a time, and goes there.
    void AskGoTo();

    /// Lists what the messages shown have in common, to go to an entry or to filter by it.
    void ShowPatterns();

    /// See LogFilterBar::SetHistory().
    void SetFilterHistory(std::shared_ptr<QStringList> const& history);

    /// Sets the rules that highlight lines; shared with other logs.
    void SetHighlightRules(std::shared_ptr<HighlightRules> const& rules);

    /// Sets where the marks and encodings of log files are kept, before a file is opened.
    ///
    /// @param store  not owned
    void SetMarkStore(LogMarkStore* store);

    /// Marks the current line or removes its mark.
    void ToggleMark() { m_marks->Toggle(); }

    /// Asks for a note on the current line.
    void AskNote() { m_marks->AskNote(); }

    /// Goes to the next (step 1) or previous (step -1) marked line, or reports that there is none.
    void GoToMark(int step) { m_marks->GoTo(step); }

    /// Lists the marked lines, to go to one of them.
    void ShowMarks() { m_marks->ShowList(); }

    /// Copies the selected entries, as stored in the file.
    void CopySelected() { m_copier->Copy(); }

    /// Copies the selected lines as a Markdown code block, or as CSV.
    void CopyAsMarkdown() { m_copier->CopyAsMarkdown(); }
    void CopyAsCsv() { m_copier->CopyAsCsv(); }

    /// Where the lines shown start in the file, in the order shown.
    QVector<qint64> LineStarts() const;
    void SelectAll();

    /// Goes to the next (step 1) or previous (step -1) warning or worse, or reports that
    /// there is none.
    void GoToProblem(int step);

    /// The current file.
    QString path() const;

    /// A short summary of the rows, for the status bar.
    QString summary() const;

    QList<int> columnWidths() const;
    void SetColumnWidths(QList<int> const& widths);
    QList<int> paneSizes() const;
    void SetPaneSizes(QList<int> const& sizes);

    LogModel* model() const { return m_model; }
    LogView* view() const { return m_view; }

Q_SIGNALS:
    /// The state shown by the window's actions or status bar has changed.
    void stateChanged();

    /// A message for the status bar.
    void messageReported(QString const& text);

    /// Ctrl and the mouse wheel: larger (1) or smaller (-1) text.
    void zoomRequested(int steps);

    /// The user wants to see the time since another entry.
    void sinceRequested();

protected:
    void keyPressEvent(QKeyEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;

private:
    QWidget* makeTable();
    void makeLayout();
    void connectParts();
    void connectView();
    void connectModel();
    void showFile(QString const& path, bool isAll, bool isFamily = false);
    QList<ProgramLog> familyLogs() const;
    void askForLogs();
    void showCurrentLine();
    void updatePlaceholder();
    void showContent();
    void highlight(QString const& text);
    void measure(bool isFromCurrent);
    void showMenu(QPoint const& position, QModelIndex const& cell);

    LogModel* m_model;
    LogView* m_view;
    LineNumberMargin* m_numbers;
    ActivityStrip* m_activity;
    LogOverview* m_overview;
    LogFileBox* m_files;
    ProgramsButton* m_programs;
    LogFilterBar* m_filterBar;
    LogFindBar* m_findBar;
    CurrentLine* m_line;
    QSplitter* m_splitter;
    FindControl* m_find;
    MarkControl* m_marks;
    LineCopier* m_copier;
    LogGoTo* m_goTo;
    NoticeBar* m_content = nullptr; // null until there is something to tell
    LogMarkStore* m_store = nullptr;
    std::shared_ptr<HighlightRules> m_rules;
    QStringList m_added;   // logs that the user has added to the family
    QString m_currentPath; // the log of the running program; empty for other logs
    int m_percent = 100;
};

} // namespace Velocor
