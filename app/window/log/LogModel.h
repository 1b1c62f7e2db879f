// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryUpdate.h"
#include "app/history/ProgramLogs.h"
#include "app/logfile/LogBytes.h"
#include "app/logfile/LogEntry.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/window/log/FoldedRows.h"
#include "app/window/log/RowSpans.h"

#include <QAbstractTableModel>
#include <QCache>
#include <QHash>
#include <QSet>
#include <QThread>

#include <memory>

namespace Velocor {

class FamilyScanner;

/// A log file as a table, live: time, severity, elapsed time, time since another entry, and message
/// of each line, oldest first.
///
/// Lines are read from the file when a view needs them; all searching is done by a FamilyScanner
/// in another thread. A line that is not in the file anymore, because the log has overwritten it,
/// is shown as gone until the next update; what is in its place is not. Heading rows separate the
/// runs. GUI thread.
///
/// What repeats the entry above may be folded. Then the rows of indexes and of the model's signals
/// are table rows, and all other rows are those of the log, also those that are hidden; see
/// FoldedRows.
///
///     LogModel model;
///     model.Open(TorkLog::logger()->newLogFileName(), LogLineParser());
///     view->setModel(&model);
class LogModel : public QAbstractTableModel
{
    Q_OBJECT

public:
    enum Column {
        TimeColumn,
        SeverityColumn,
        ElapsedColumn,
        SinceColumn,
        ProgramColumn, ///< whose log the line is in, if there are several
        MessageColumn,
        ColumnCount
    };
    enum Role {
        SeverityRole = Qt::UserRole, ///< a LogEntry::Severity
        HeadingRole,                 ///< whether the row is a heading
        EarlierRole,                 ///< whether the row belongs to an earlier run
        MarkedRole,                  ///< whether the user has marked the row
        NoteRole,                    ///< the user's note on it
        LineRole,    ///< the start of the line in the file, of up to ShownLimit bytes
        ContextRole, ///< whether it is shown only as the context of others
        GapRole,     ///< the gap before the row, in words; empty if there is none
        RepeatsRole  ///< how often the entry is repeated, with an arrow; empty if it is not
    };

    explicit LogModel(QObject* parent = nullptr);
    ~LogModel() override;

    /// Shows another file, or reloads the same one. Rows appear when they have been read.
    ///
    /// @param isCurrent  whether the running program writes it: then it is read as the log's own
    /// @param isAll  whether to show the older files of the log, too, as one; see HistoryScanner
    void Open(QString const& path, LogLineParser const& parser, bool isCurrent, bool isAll = false);

    /// Shows several logs, each with its older files, as one by time.
    ///
    /// @param path  whose tab this is
    /// @param hidden  paths of logs that are not shown
    void OpenFamily(QString const& path, QList<ProgramLog> const& logs, LogLineParser const& parser,
                    QSet<QString> const& hidden);

    /// Shows only some of these logs.
    ///
    /// @param hidden  as above
    void SetHiddenLogs(QSet<QString> const& hidden);

    /// Whether the older files of the log are shown, too.
    bool isAll() const { return m_isAll; }

    /// Whether several logs are shown; then isAll(), too.
    bool isFamily() const { return m_isFamily; }

    /// Which of several logs the line of a row is in; 0 if there is only one.
    int LogOf(int row) const;

    /// Whether a row is a heading that folds.
    bool IsFoldable(int row) const;

    /// Hides the rows under a heading, or shows them again. Does nothing for other rows.
    void SetFolded(int row, bool folded);

    /// Whether the rows under a heading are hidden.
    bool IsFolded(int row) const { return IsFoldable(row) && runOf(row).isFolded; }

    /// Folds entries that repeat the one above: they become one row with their number. Takes effect
    /// as soon as they have been found.
    void SetFoldsRepeats(bool folds);
    bool foldsRepeats() const { return m_foldsRepeats; }

    /// Shows all rows of the group of entries that a row is in, or only the first one again. Does
    /// nothing for other rows. Lasts until another log is opened.
    void SetRepeatsOpen(int row, bool open);

    /// The group of entries that repeat each other a row is in; null if there is none. Valid until
    /// the rows change.
    RepeatGroup const* RepeatsOf(int row) const { return m_folded.GroupOf(row); }

    /// Whether all rows of its group are shown; false for rows in no group.
    bool AreRepeatsOpen(int row) const;

    /// See FoldedRows.
    int RowAt(int tableRow) const { return m_folded.RowAt(tableRow); }
    int TableRowOf(int row) const { return m_folded.TableRowOf(row); }
    bool IsHidden(int row) const { return m_folded.IsHidden(row); }

    /// The number of rows of the log.
    int logRowCount() const { return static_cast<int>(m_state.rows->size()); }

    /// Reads the file again from the start.
    void Reload();

    /// Reads the file again in another encoding; Automatic finds out which. Another file that is
    /// opened afterwards is read in it, too.
    void SetEncoding(LogEncoding encoding);

    /// The encoding that was chosen; Automatic if none was.
    LogEncoding chosenEncoding() const { return m_chosenEncoding; }

    /// Shows only the rows that match a filter.
    void SetFilter(LogFilter const& filter);
    LogFilter const& filter() const { return m_filter; }

    /// While the model is paused, it does not check for changes: its rows remain those of that
    /// moment. Whether their lines are still in the file is found when they are read.
    void SetPaused(bool paused);
    bool isPaused() const { return m_paused; }

    /// Sets the lines that the user has marked: where they start, and their notes.
    void SetMarks(QHash<qint64, QString> const& marks);

    /// Sets the rows of these lines, ascending.
    void SetMarkedRows(std::shared_ptr<std::vector<int> const> const& rows);

    /// The times between rows. Views have to be told if it is to measure something else.
    RowSpans& spans() { return m_spans; }

    /// What a column shows of a row.
    QString CellText(int row, int column) const;

    /// What a row shows of its line, with the start of the message; of a heading, nothing.
    LogEntry Entry(int row) const { return isHeading(row) ? LogEntry() : entry(row); }

    /// The first row of the nearest entry after (step 1) or before (step -1) that of `row` that is
    /// a warning or worse; -1 if there is none. Those that are hidden do not count.
    int FindProblem(int row, int step) const;

    /// Where the line of a row starts in the file; negative for a heading.
    qint64 LineStart(int row) const { return m_state.rows->start(static_cast<size_t>(row)); }

    /// The row whose line starts there or, if it is filtered out, as near to it as possible; -1 if
    /// there are no lines.
    int RowNear(qint64 start) const { return m_state.rows->RowNear(start); }

    /// The text of a row's line in the file, without its line end; empty for a heading. If the line
    /// is gone, a sentence that says so.
    ///
    /// @param limit  maximum number of bytes to read
    QString LineText(int row, int limit) const;

    /// The message of a row, whole even if the row shows only its start.
    QString MessageText(int row) const;

    /// The same, after the program that wrote it if that is known, as the row shows it.
    QString MessageWithProgram(int row) const;

    /// The first and the last row of the entry that a row belongs to: its first line and the lines
    /// that follow without a stamp. Of a line that belongs to no entry, and of a heading, the row
    /// itself.
    QPair<int, int> EntryRows(int row) const;

    /// The lines of the entry that a row belongs to, as LineText() gives them, with line ends
    /// between them.
    ///
    /// @param limit  maximum number of bytes to show; if there is more, a last line says so
    QString EntryText(int row, int limit) const;

    /// Whether the line of a row was in the file when the row was made, but is no longer there.
    bool IsGone(int row) const;

    QString const& path() const { return m_path; }

    /// Where the bytes of the lines are.
    LogSource source() const;

    /// The file that the line of a row is in.
    QString FileOf(int row) const;

    /// The first line of that file among all lines.
    size_t FirstLineOfFile(int row) const;

    LogLineParser const& parser() const { return m_parser; }
    HistoryUpdate const& state() const { return m_state; }
    bool isReading() const { return m_reading; }

    int rowCount(QModelIndex const& parent = QModelIndex()) const override;
    int columnCount(QModelIndex const& parent = QModelIndex()) const override;
    QVariant data(QModelIndex const& index, int role) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    Qt::ItemFlags flags(QModelIndex const& index) const override;

    /// The maximum length that a row shows of a line, in bytes. The size of a longer one follows.
    static constexpr int ShownLimit = 4096;

Q_SIGNALS:
    /// The rows have been updated.
    void refreshed();

    /// Progress of reading, in percent; 100 when done.
    void progressed(int percent);

    // To the scanner's thread. Fully qualified, because queued connections look up types by name.
    void openRequested(int request, QString const& path, Velocor::LogLineParser const& parser,
                       Velocor::LogFilter const& filter, bool isAll);
    void familyRequested(int request, QList<Velocor::ProgramLog> const& logs,
                         Velocor::LogLineParser const& parser, Velocor::LogFilter const& filter,
                         QSet<QString> const& hidden);
    void hideRequested(QSet<QString> const& hidden);
    void foldRequested(quint64 run, bool folded);
    void filterRequested(int request, Velocor::LogFilter const& filter);
    void watchRequested(bool watched);
    void pollRequested();

private:
    // What a row shows.
    struct Line
    {
        LogEntry entry;
        QByteArray start; // of the line, and all of it unless it is long
        quint16 check = 0;
        bool isTorn = false;
        bool isGone = false;
    };

    void startScanner();
    void setFile(QString const& path, LogLineParser const& parser, bool isCurrent);
    void take(HistoryUpdate const& update);
    void reset(HistoryUpdate const& update);
    void applyChange(HistoryUpdate const& update);
    FoldedRows foldedRows(HistoryUpdate const& update) const;
    static quint64 keyOf(HistoryUpdate const& update, RepeatGroup const& group);
    QString repeatsText(int row) const;
    QString repeatsInWords(int row) const;
    bool isMarked(int row) const;
    bool isHeading(int row) const;
    bool openFile() const;
    qint64 knownLength(int row, qint64 most) const;
    QByteArray readBytes(int row, qint64 limit) const;
    qint64 lengthOf(int row) const;
    Line readLine(int row) const;
    Line const* knownLine(int row) const;
    Line const& line(int row) const;
    LogEntry const& entry(int row) const { return line(row).entry; }
    LogEntry wholeEntry(int row) const;
    RunHeading const& runOf(int row) const;
    QString headingText(int row) const;
    QString toolTip(int row, int column) const;
    QString accessibleText(int row, int column) const;
    QVariant accessibleDescription(int row, int column) const;
    QVariant icon(int row, int column) const;

    QThread m_thread;
    FamilyScanner* m_scanner = nullptr;
    bool m_paused = false;
    std::shared_ptr<HistoryUpdate const> m_heldBack; // the last update that arrived after the pause
    bool m_reading = false;
    bool m_awaitsReset = false; // what was requested has not been reported yet
    bool m_isCurrent = false;
    bool m_isAll = false;
    bool m_isFamily = false;
    QList<ProgramLog> m_logs; // of the family
    QSet<QString> m_hidden;
    int m_request = 0;

    QString m_path;
    LogLineParser m_parser;
    LogEncoding m_chosenEncoding = LogEncoding::Automatic;
    LogFilter m_filter;
    HistoryUpdate m_state;
    FoldedRows m_folded;
    bool m_foldsRepeats = false;
    QSet<quint64> m_open; // groups of repeats
    int m_rowCount = 0;   // fewer than those of m_folded only while a change is being signaled
    QHash<qint64, QString> m_marks;
    std::shared_ptr<std::vector<int> const> m_markedRows;
    RowSpans m_spans{*this};
    mutable LogBytes m_file;
    mutable QCache<qint64, Line> m_lines;
};

} // namespace Velocor
