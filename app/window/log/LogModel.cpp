// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogModel.h"

#include "app/history/FamilyScanner.h"
#include "app/history/ProgramLogs.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/LogSeverities.h"
#include "app/window/log/ProgramColors.h"
#include "app/window/log/RunText.h"
#include "app/window/log/ShownText.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QGuiApplication>
#include <QPalette>

#include <algorithm>

namespace Velocor {

namespace {

// A longer line is measured no further: rows are read while they are painted.
constexpr qint64 MeasuredLength = 4 * 1000 * 1000; // bytes

// A carriage return and a line feed, of two bytes each.
constexpr qint64 LongestLineEnd = 4; // bytes

// Follows what is shown of a line.
QString Ellipsis(qint64 length)
{
    const QString size = FileSizeText(length);
    return QChar(0x2026) + (length < MeasuredLength ? LogModel::tr(" (%1)").arg(size)
                                                    : LogModel::tr(" (more than %1)").arg(size));
}

QString GoneText()
{
    return LogModel::tr("This line is no longer in the file");
}

QString WithProgram(LogEntry const& entry)
{
    return entry.program.isEmpty() ? entry.message
                                   : entry.program + QLatin1String(": ") + entry.message;
}

// The length of a line, which starts at a character, without its end; -1 if the end is missing.
int EndOfLine(QByteArray const& line, LogLineEnd const& lineEnd)
{
    char const* const last = lineEnd.Find(line.constBegin(), line.constEnd(), 0, '\0');
    return last ? static_cast<int>(last - line.constData()) + 1 - lineEnd.size() : -1;
}

} // namespace

LogModel::LogModel(QObject* parent) : QAbstractTableModel(parent), m_lines(1000)
{
    m_state.rows = std::make_shared<LogRows>();
}

LogModel::~LogModel()
{
    if (m_scanner)
        m_scanner->SetCurrentRequest(-1);
    m_thread.quit();
    m_thread.wait();
}

// Not in the constructor, because starting a thread slows down startup.
void LogModel::startScanner()
{
    if (m_scanner)
        return;
    m_scanner = new FamilyScanner;
    m_scanner->moveToThread(&m_thread);
    connect(&m_thread, &QThread::finished, m_scanner, &QObject::deleteLater);
    connect(this, &LogModel::openRequested, m_scanner, &FamilyScanner::Open);
    connect(this, &LogModel::filterRequested, m_scanner, &FamilyScanner::SetFilter);
    connect(this, &LogModel::familyRequested, m_scanner, &FamilyScanner::OpenFamily);
    connect(this, &LogModel::hideRequested, m_scanner, &FamilyScanner::SetHidden);
    connect(this, &LogModel::foldRequested, m_scanner, &FamilyScanner::SetFolded);
    connect(this, &LogModel::watchRequested, m_scanner, &FamilyScanner::SetWatched);
    connect(this, &LogModel::pollRequested, m_scanner, &FamilyScanner::Poll);
    connect(m_scanner, &FamilyScanner::updated, this, &LogModel::take);
    connect(m_scanner, &FamilyScanner::progressed, this, [this](int request, int percent) {
        if (request == m_request && m_reading)
            Q_EMIT progressed(percent);
    });
    m_thread.start();
    Q_EMIT watchRequested(!m_paused);
    m_scanner->SetFindsRepeats(m_foldsRepeats);
}

void LogModel::setFile(QString const& path, LogLineParser const& parser, bool isCurrent)
{
    m_path = path;
    m_parser = parser;
    m_parser.SetChosenEncoding(m_chosenEncoding);
    m_parser.SetOwn(isCurrent);
    m_isCurrent = isCurrent;
    m_spans.MeasureFromAbove();
    m_lines.clear();
    m_open.clear();
}

void LogModel::Open(QString const& path, LogLineParser const& parser, bool isCurrent, bool isAll)
{
    setFile(path, parser, isCurrent);
    m_isAll = isAll;
    m_isFamily = false;
    Reload();
}

void LogModel::OpenFamily(QString const& path, QList<ProgramLog> const& logs,
                          LogLineParser const& parser, QSet<QString> const& hidden)
{
    setFile(path, parser, false);
    m_isAll = true;
    m_isFamily = true;
    m_logs = logs;
    m_hidden = hidden;
    Reload();
}

void LogModel::SetHiddenLogs(QSet<QString> const& hidden)
{
    m_hidden = hidden;
    if (m_isFamily && m_scanner)
        Q_EMIT hideRequested(hidden);
}

void LogModel::Reload()
{
    if (m_path.isEmpty())
        return;
    startScanner();
    m_reading = true;
    m_awaitsReset = true;
    m_scanner->SetCurrentRequest(++m_request);
    if (m_isFamily)
        Q_EMIT familyRequested(m_request, m_logs, m_parser, m_filter, m_hidden);
    else
        Q_EMIT openRequested(m_request, m_path, m_parser, m_filter, m_isAll);
}

void LogModel::SetEncoding(LogEncoding encoding)
{
    m_chosenEncoding = encoding;
    m_parser.SetChosenEncoding(encoding);
    Reload();
}

void LogModel::SetFilter(LogFilter const& filter)
{
    m_filter = filter;
    if (!m_scanner)
        return;
    m_reading = true;
    m_awaitsReset = true;
    m_scanner->SetCurrentRequest(++m_request);
    Q_EMIT filterRequested(m_request, m_filter);
}

void LogModel::SetPaused(bool paused)
{
    m_paused = paused;
    if (paused)
        openFile(); // so that a rotation does not take the lines away
    Q_EMIT watchRequested(!paused);
    if (paused)
        return;
    if (m_heldBack) // the scanner does not report it again
        take(HistoryUpdate(*m_heldBack));
    Q_EMIT pollRequested();
}

void LogModel::take(HistoryUpdate const& update)
{
    m_scanner->NoteTaken();
    if (update.request != m_request)
        return;
    const bool wasReading = m_reading;
    m_reading = wasReading && update.isPartial;
    const bool isFolding = update.isFolding && !m_heldBack; // of the rows that are shown
    if (m_paused && !wasReading && !isFolding) {
        m_heldBack = std::make_shared<HistoryUpdate>(update);
        return;
    }
    if (!m_paused || !update.type.IsLike(m_parser.fileType()))
        m_lines.clear();
    m_parser.SetFileType(update.type);
    const bool isOtherFolding = bool(update.repeats) != bool(m_state.repeats);
    if (update.isReset || isOtherFolding || m_awaitsReset || m_heldBack)
        reset(update);
    else
        applyChange(update);
    m_awaitsReset = false;
    m_heldBack.reset();
    if (wasReading && !m_reading)
        Q_EMIT progressed(100);
    Q_EMIT refreshed();
}

void LogModel::reset(HistoryUpdate const& update)
{
    beginResetModel();
    m_file.Close();
    m_state = update;
    m_folded = foldedRows(update);
    m_rowCount = m_folded.count();
    endResetModel();
}

// What was removed at the end is first, then come the earlier runs, whose first rows the newest run
// overwrites, and at last the new rows at the end. In between, views see the new rows except those
// at the end.
void LogModel::applyChange(HistoryUpdate const& update)
{
    const FoldedRows folded = foldedRows(update);
    const auto tail = static_cast<int>(update.changedTail);
    const int size = logRowCount() + static_cast<int>(update.inserted) -
                     static_cast<int>(update.removed); // without new rows at the end
    const FoldedRows::Change change =
        FoldedRows::ChangeOf(m_folded, folded,
                             {static_cast<int>(update.changeAt), static_cast<int>(update.removed),
                              static_cast<int>(update.inserted), tail,
                              static_cast<int>(update.rows->size()) - size + tail});
    if (change.newTail < change.tail) {
        const int rest = m_rowCount - change.tail + change.newTail;
        beginRemoveRows(QModelIndex(), rest, m_rowCount - 1);
        m_rowCount = rest;
        endRemoveRows();
    }
    const int difference = change.inserted - change.removed;
    const int changed = std::min(change.inserted, change.removed);
    if (difference < 0)
        beginRemoveRows(QModelIndex(), change.at, change.at - difference - 1);
    else if (difference > 0)
        beginInsertRows(QModelIndex(), change.at, change.at + difference - 1);
    if (m_state.logs != update.logs)
        m_file.Close();
    m_state = update;
    m_folded = folded;
    m_rowCount += difference;
    if (difference < 0)
        endRemoveRows();
    else if (difference > 0)
        endInsertRows();
    if (changed > 0) {
        const int first = change.at + std::max(difference, 0);
        Q_EMIT dataChanged(index(first, 0), index(first + changed - 1, ColumnCount - 1));
    }

    const int changedTail = std::min(change.tail, change.newTail);
    if (changedTail > 0)
        Q_EMIT dataChanged(index(m_rowCount - changedTail, 0),
                           index(m_rowCount - 1, ColumnCount - 1));
    if (m_folded.count() > m_rowCount) {
        beginInsertRows(QModelIndex(), m_rowCount, m_folded.count() - 1);
        m_rowCount = m_folded.count();
        endInsertRows();
    }
}

quint64 LogModel::keyOf(HistoryUpdate const& update, RepeatGroup const& group)
{
    return static_cast<quint64>(update.rows->start(group.first)) << 16 |
           update.rows->check(group.first);
}

FoldedRows LogModel::foldedRows(HistoryUpdate const& update) const
{
    return FoldedRows(static_cast<int>(update.rows->size()), update.repeats,
                      [&](RepeatGroup const& group) {
                          return !m_open.isEmpty() && m_open.contains(keyOf(update, group));
                      });
}

void LogModel::SetFoldsRepeats(bool folds)
{
    if (folds == m_foldsRepeats)
        return;
    m_foldsRepeats = folds;
    if (m_scanner)
        m_scanner->SetFindsRepeats(folds);
}

bool LogModel::AreRepeatsOpen(int row) const
{
    RepeatGroup const* const group = m_folded.GroupOf(row);
    return group && m_open.contains(keyOf(m_state, *group));
}

void LogModel::SetRepeatsOpen(int row, bool open)
{
    RepeatGroup const* const group = m_folded.GroupOf(row);
    if (!group || open == AreRepeatsOpen(row))
        return;
    if (open)
        m_open.insert(keyOf(m_state, *group));
    else
        m_open.remove(keyOf(m_state, *group));
    const int first = TableRowOf(static_cast<int>(group->first));
    const int hidden = static_cast<int>(group->end - group->first) - 1;
    if (open)
        beginInsertRows(QModelIndex(), first + 1, first + hidden);
    else
        beginRemoveRows(QModelIndex(), first + 1, first + hidden);
    m_folded = foldedRows(m_state);
    m_rowCount = m_folded.count();
    if (open)
        endInsertRows();
    else
        endRemoveRows();
    Q_EMIT dataChanged(index(first, 0), index(first, ColumnCount - 1));
}

void LogModel::SetMarkedRows(std::shared_ptr<std::vector<int> const> const& rows)
{
    m_markedRows = rows;
}

// Also if a row that this one hides is marked.
bool LogModel::isMarked(int row) const
{
    RepeatGroup const* const group = m_folded.GroupOf(row);
    if (!group || !m_markedRows || AreRepeatsOpen(row))
        return m_marks.contains(LineStart(row));
    const auto first = std::lower_bound(m_markedRows->begin(), m_markedRows->end(),
                                        static_cast<int>(group->first));
    return first != m_markedRows->end() && *first < static_cast<int>(group->end);
}

// At the first row of a group.
QString LogModel::repeatsText(int row) const
{
    RepeatGroup const* const group = m_folded.GroupOf(row);
    if (!group || static_cast<int>(group->first) != row)
        return QString();
    const QChar arrow(AreRepeatsOpen(row) ? 0x25be : 0x25b8);
    return QStringLiteral("%1 %2%3").arg(arrow).arg(
        QLocale().toString(static_cast<qulonglong>(group->entries)), QChar(0xd7)); // times
}

// The same, with the time of the last entry.
QString LogModel::repeatsInWords(int row) const
{
    if (repeatsText(row).isEmpty())
        return QString();
    RepeatGroup const* const group = m_folded.GroupOf(row);
    const int last = EntryRows(static_cast<int>(group->end) - 1).first;
    const QString times = TimesText(entry(row).time, entry(last).time);
    const auto count = static_cast<int>(group->entries);
    return times.isEmpty() ? tr("%Ln time(s)", nullptr, count)
                           : tr("%Ln time(s), %1", nullptr, count).arg(times);
}

void LogModel::SetMarks(QHash<qint64, QString> const& marks)
{
    m_marks = marks;
}

int LogModel::FindProblem(int row, int step) const
{
    LogRows const& rows = *m_state.rows;
    if (row >= 0 && row < logRowCount())
        row = EntryRows(row).first;
    for (row += step; row >= 0 && row < logRowCount(); row += step) {
        const auto position = static_cast<size_t>(row);
        if (LogSeverities::IsProblem(rows.severity(position)) &&
            !(rows.mark(position) & LogRows::Continued) && !m_folded.IsHidden(row))
            return row;
    }
    return -1;
}

// While another log is being read, the rows are still those of the one before.
bool LogModel::IsFoldable(int row) const
{
    return m_state.runs && row >= 0 && row < logRowCount() && isHeading(row);
}

bool LogModel::isHeading(int row) const
{
    return m_state.rows->isHeading(static_cast<size_t>(row));
}

bool LogModel::openFile() const
{
    if (m_file.isOpen())
        return true;
    return m_file.Open(source());
}

// How much to read of a line: a last one ended where its file did when the row was made.
qint64 LogModel::knownLength(int row, qint64 most) const
{
    LogRows const& rows = *m_state.rows;
    const qint64 start = LineStart(row);
    qint64 complete = rows.complete();
    qint64 end = rows.end();
    if (m_state.family) {
        FamilyLog const& log = (*m_state.family)[static_cast<size_t>(LogOf(row))];
        complete = log.complete;
        end = log.end;
    }
    return start < complete ? most : std::min(most, end - start);
}

LogSource LogModel::source() const
{
    LogSource source(m_path, m_state.older);
    source.logs = m_state.logs;
    return source;
}

int LogModel::LogOf(int row) const
{
    return static_cast<int>(source().LogAt(LineStart(row)));
}

// Up to `limit` bytes of a line, without its line end. Null if the file cannot be read.
QByteArray LogModel::readBytes(int row, qint64 limit) const
{
    LogRows const& rows = *m_state.rows;
    const qint64 start = rows.start(static_cast<size_t>(row));
    if (!openFile() || !m_file.Seek(start))
        return QByteArray();

    // A last line may have got longer since.
    const qint64 most = limit + LongestLineEnd;
    const qint64 length = knownLength(row, most);
    const qint64 first = std::min<qint64>(length, 1024);
    const LogLineEnd lineEnd = m_parser.fileType().lineEnd();
    QByteArray bytes = m_file.Read(first);
    int end = EndOfLine(bytes, lineEnd);
    if (end < 0 && bytes.size() == first && length > first) {
        bytes += m_file.Read(length - first);
        end = EndOfLine(bytes, lineEnd);
    }
    if (end >= 0)
        bytes.truncate(end);
    bytes.truncate(m_parser.fileType().encoding.WithoutReturn(bytes.constData(), bytes.size()));
    bytes.truncate(static_cast<int>(std::min<qint64>(limit, bytes.size())));
    return bytes;
}

// The length of a line in bytes, or MeasuredLength if it has at least that.
qint64 LogModel::lengthOf(int row) const
{
    LogRows const& rows = *m_state.rows;
    const qint64 start = rows.start(static_cast<size_t>(row));
    const qint64 most = knownLength(row, MeasuredLength);
    if (!openFile() || !m_file.Seek(start))
        return 0;
    const LogLineEnd lineEnd = m_parser.fileType().lineEnd();
    qint64 length = 0;
    char before = '\0';
    while (length < most) {
        const QByteArray bytes = m_file.Read(std::min<qint64>(most - length, 1 << 16));
        if (bytes.isEmpty())
            break;
        char const* const last = lineEnd.Find(bytes.constBegin(), bytes.constEnd(), length, before);
        if (last)
            return length + (last - bytes.constBegin()) + 1 - lineEnd.size();
        length += bytes.size();
        before = bytes.back();
    }
    return length;
}

LogModel::Line LogModel::readLine(int row) const
{
    Line line;
    const auto position = static_cast<size_t>(row);
    const int limit = m_parser.fileType().isForeign ? LogIndex::PartsLimit : LogRows::CheckedLength;
    QByteArray bytes = readBytes(row, limit + 1);
    bool isCut = bytes.size() > limit;
    bytes.truncate(limit);
    line.start = bytes.left(LogRows::CheckedLength);
    line.check = m_state.rows->check(position);
    line.isTorn = m_state.rows->mark(position) & LogRows::Torn;
    line.isGone = LogRows::CheckOf(line.start.constData(), line.start.size()) != line.check;
    if (line.isGone)
        line.entry.message = GoneText();
    else if (line.isTorn)
        line.entry.message = m_parser.Text(line.start);
    else
        line.entry = m_parser.Parse(bytes);
    const QString message = WithProgram(line.entry);
    isCut = isCut || message.size() > ShownLimit;
    line.entry.message = ShownText(message.left(ShownLimit));
    if (!line.isGone && isCut)
        line.entry.message += Ellipsis(lengthOf(row));
    return line;
}

LogModel::Line const* LogModel::knownLine(int row) const
{
    const auto position = static_cast<size_t>(row);
    Line const* known = m_lines.object(m_state.rows->start(position));
    const bool isTorn = m_state.rows->mark(position) & LogRows::Torn;
    return known && known->check == m_state.rows->check(position) && known->isTorn == isTorn
               ? known
               : nullptr;
}

LogModel::Line const& LogModel::line(int row) const
{
    if (Line const* known = knownLine(row))
        return *known;
    auto* read = new Line(readLine(row));
    m_lines.insert(m_state.rows->start(static_cast<size_t>(row)), read);
    return *read;
}

// What is known is not read again, because the line may be gone by now. But many lines that are not
// shown must not take the place of those that are.
QString LogModel::LineText(int row, int limit) const
{
    if (row < 0 || row >= logRowCount() || isHeading(row))
        return QString();
    Line const* known = knownLine(row);
    const Line line = known ? *known : readLine(row);
    if (line.isGone)
        return line.entry.message;
    if (line.start.size() < LogRows::CheckedLength || limit <= LogRows::CheckedLength)
        return m_parser.Text(line.start.left(limit));
    const QByteArray whole = readBytes(row, limit);
    return whole.startsWith(line.start) ? m_parser.Text(whole) : GoneText();
}

// An entry that is gone, torn or no entry has nothing but a message.
LogEntry LogModel::wholeEntry(int row) const
{
    LogEntry entry;
    if (row < 0 || row >= logRowCount() || isHeading(row))
        return entry;
    Line const* known = knownLine(row);
    const Line line = known ? *known : readLine(row);
    const bool isMessage = line.isGone || line.isTorn;
    const QByteArray whole = isMessage ? QByteArray() : readBytes(row, LogIndex::LineLimit);
    if (isMessage)
        entry.message = LineText(row, LogIndex::LineLimit);
    else if (whole.startsWith(line.start))
        entry = m_parser.Parse(whole);
    else
        entry.message = line.entry.message;
    return entry;
}

QString LogModel::MessageText(int row) const
{
    return wholeEntry(row).message;
}

QString LogModel::MessageWithProgram(int row) const
{
    return WithProgram(wholeEntry(row));
}

QPair<int, int> LogModel::EntryRows(int row) const
{
    const auto continues = [this](int other) {
        return LogRows::ContinuesEntry(m_state.rows->mark(static_cast<size_t>(other)));
    };
    int first = row;
    while (first > 0 && continues(first))
        --first;
    int last = row;
    while (last + 1 < logRowCount() && continues(last + 1))
        ++last;
    return qMakePair(first, last);
}

QString LogModel::EntryText(int row, int limit) const
{
    if (row < 0 || row >= logRowCount())
        return QString();
    const QPair<int, int> rows = EntryRows(row);
    QString text;
    for (int next = rows.first; next <= rows.second; ++next) {
        const int left = limit - text.size();
        const QString line = LineText(next, left + 1);
        text += line.left(left) + QLatin1Char('\n');
        if (line.size() > left)
            return text + tr("(only the first %1 are shown)").arg(FileSizeText(limit));
    }
    text.chop(1);
    return text;
}

bool LogModel::IsGone(int row) const
{
    if (row < 0 || row >= logRowCount() || isHeading(row))
        return false;
    Line const* known = knownLine(row);
    return known ? known->isGone : readLine(row).isGone;
}

// Of a heading, while the runs are shown.
RunHeading const& LogModel::runOf(int row) const
{
    const qint64 start = m_state.rows->start(static_cast<size_t>(row));
    return start == LogRows::NewestHeading
               ? m_state.runs->back()
               : (*m_state.runs)[static_cast<size_t>(LogRows::FirstRunHeading - start)];
}

void LogModel::SetFolded(int row, bool folded)
{
    if (IsFoldable(row) && folded != IsFolded(row))
        Q_EMIT foldRequested(runOf(row).id, folded);
}

QString LogModel::FileOf(int row) const
{
    return source().FileAt(LineStart(row)).path;
}

size_t LogModel::FirstLineOfFile(int row) const
{
    LineTable const& lines = m_state.rows->lines();
    if (lines.isEmpty() || (!m_state.logs && (!m_state.older || m_state.older->count() == 0)))
        return 0;
    return lines.LineAt(source().FileAt(LineStart(row)).start);
}

QString LogModel::headingText(int row) const
{
    if (m_state.runs)
        return RunTextWithArrow(runOf(row), ProgramLogs::NameOf(m_path));
    const qint64 start = m_state.rows->start(static_cast<size_t>(row));
    if (start == LogRows::EarlierHeading)
        return tr("Earlier");
    return m_isCurrent ? tr("This run") : tr("Latest run in this file");
}

QString LogModel::CellText(int row, int column) const
{
    if (isHeading(row))
        return column == 0 ? headingText(row) : QString();

    switch (column) {
    case TimeColumn:
        return entry(row).time;
    case SeverityColumn:
        return LogSeverities::Name(entry(row).severity);
    case ElapsedColumn:
        return entry(row).elapsed.isEmpty() ? QString() : tr("%1 ms").arg(entry(row).elapsed);
    case SinceColumn:
        return m_spans.Since(row);
    case ProgramColumn:
        return m_state.family ? (*m_state.family)[static_cast<size_t>(LogOf(row))].name : QString();
    default:
        return entry(row).message;
    }
}

QString LogModel::toolTip(int row, int column) const
{
    if (isHeading(row))
        return QString();
    if (column == ProgramColumn)
        return FileOf(row);
    const QString note = m_marks.value(LineStart(row));
    if (!note.isEmpty() && column != MessageColumn)
        return tr("Note: %1").arg(note);
    if (m_state.rows->mark(static_cast<size_t>(row)) & LogRows::Torn)
        return tr("Remainder of an entry that a later run overwrote");
    if (column != MessageColumn)
        return QString();
    const QString repeats = repeatsInWords(row);
    const QString text = CellText(row, column);
    return repeats.isEmpty() ? text : text + QLatin1Char('\n') + repeats;
}

int LogModel::rowCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : m_rowCount;
}

int LogModel::columnCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : static_cast<int>(ColumnCount);
}

QString LogModel::accessibleText(int row, int column) const
{
    if (IsFoldable(row)) {
        const QString run = RunText(runOf(row), ProgramLogs::NameOf(m_path));
        return column > 0 ? QString() : IsFolded(row) ? tr("%1, folded").arg(run) : run;
    }
    return column == TimeColumn && m_marks.contains(LineStart(row))
               ? tr("Marked: %1").arg(CellText(row, TimeColumn))
               : CellText(row, column);
}

QVariant LogModel::accessibleDescription(int row, int column) const
{
    if (column != TimeColumn)
        return QVariant();
    QStringList parts;
    const QString gap = m_spans.Gap(row);
    if (!gap.isEmpty())
        parts.append(tr("%1 after the entry above").arg(gap));
    const QString repeats = repeatsInWords(row);
    if (!repeats.isEmpty())
        parts.append(AreRepeatsOpen(row) ? repeats : tr("%1, folded").arg(repeats));
    return parts.isEmpty() ? QVariant() : parts.join(QStringLiteral("; "));
}

// Of a row that is no heading.
QVariant LogModel::icon(int row, int column) const
{
    if (column == SeverityColumn && entry(row).isEntry)
        return SeverityIcons::Icon(entry(row).severity, QGuiApplication::palette());
    if (column == ProgramColumn && m_state.family)
        return ProgramColors::Icon(LogOf(row), QGuiApplication::palette());
    return QVariant();
}

QVariant LogModel::data(QModelIndex const& index, int role) const
{
    if (!index.isValid() || index.row() >= m_rowCount)
        return QVariant();
    const int row = RowAt(index.row());

    switch (role) {
    case Qt::DisplayRole:
        return CellText(row, index.column());
    case Qt::AccessibleTextRole:
        return accessibleText(row, index.column());
    case Qt::DecorationRole:
        return isHeading(row) ? QVariant() : icon(row, index.column());
    case Qt::ToolTipRole:
        return PlainToolTip(LeftToRight(toolTip(row, index.column())));
    case Qt::TextAlignmentRole:
        return index.column() == ElapsedColumn || index.column() == SinceColumn
                   ? int(Qt::AlignRight | Qt::AlignVCenter)
                   : int(Qt::AlignLeft | Qt::AlignVCenter);
    case SeverityRole:
        return static_cast<int>(m_state.rows->severity(static_cast<size_t>(row)));
    case HeadingRole:
        return isHeading(row);
    case EarlierRole:
        return static_cast<size_t>(row) < m_state.rows->earlier();
    case MarkedRole:
        return isMarked(row);
    case ContextRole:
        return bool(m_state.rows->mark(static_cast<size_t>(row)) & LogRows::Context);
    case LineRole:
        return LineText(row, ShownLimit);
    case GapRole:
        return m_spans.Gap(row);
    case RepeatsRole:
        return repeatsText(row);
    case Qt::AccessibleDescriptionRole:
        return accessibleDescription(row, index.column());
    case NoteRole:
        return m_marks.value(LineStart(row));
    default:
        return QVariant();
    }
}

QVariant LogModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation != Qt::Horizontal)
        return QVariant();
    if (role == Qt::TextAlignmentRole)
        return int(
            (section == ElapsedColumn || section == SinceColumn ? Qt::AlignRight : Qt::AlignLeft) |
            Qt::AlignVCenter | Qt::AlignAbsolute);
    if (role == Qt::ToolTipRole && section == SinceColumn)
        return PlainToolTip(m_spans.base().isEmpty() ? tr("Time since the entry above")
                                                     : tr("Time since %1").arg(m_spans.base()));
    if (role != Qt::DisplayRole)
        return QVariant();
    switch (section) {
    case TimeColumn:
        return tr("Time");
    case SeverityColumn:
        return tr("Severity");
    case ElapsedColumn:
        return tr("Elapsed");
    case SinceColumn:
        return m_spans.base().isEmpty() ? tr("Since") : tr("Since Chosen");
    case ProgramColumn:
        return tr("Program");
    default:
        return tr("Message");
    }
}

Qt::ItemFlags LogModel::flags(QModelIndex const& index) const
{
    if (!index.isValid())
        return Qt::NoItemFlags;
    return isHeading(RowAt(index.row()))
               ? Qt::ItemFlags(Qt::ItemIsEnabled)
               : Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren;
}

} // namespace Velocor
