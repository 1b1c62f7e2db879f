// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryScanner.h"

#include "app/logfile/LogFileList.h"
#include "app/logfile/LogLineReader.h"

#include <QFile>
#include <QFileInfo>
#include <QTimer>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

// A log rotates at the start of its program, so twice in a row is rare.
constexpr int MostOpenings = 10;

// Nothing in the log tells that its program has ended.
constexpr int EndInterval = 1000; // milliseconds

// Of the runs in one file, so that identities of runs in different files differ.
constexpr quint64 MostRunsInFile = 256;

LogFileType TypeOf(QString const& path, LogLineParser const& parser)
{
    QFile file(path);
    const QFileInfo info(path);
    const bool isOpen = info.isFile() && file.open(QIODevice::ReadOnly);
    const QByteArray head = isOpen ? file.read(LogFileType::HeadSize) : QByteArray();
    return LogFileType::Of(head, parser, parser.chosenEncoding(), info.lastModified().date());
}

LogCounts CountsOf(LineTable const& lines, size_t first, size_t end)
{
    LogCounts counts{};
    for (size_t line = first; line < end; ++line) {
        const quint8 mark = lines.mark(line);
        if (!(mark & LogRows::Continued))
            ++counts[mark & LogRows::SeverityMask];
    }
    return counts;
}

void NoteCounts(LogCounts const& counts, RunHeading& heading)
{
    heading.warnings = counts[LogEntry::Warning];
    heading.errors = counts[LogEntry::Error] + counts[LogEntry::Fatal];
}

// The stamps of the first and the last entry of a run.
class RunTimes
{
public:
    RunTimes(LogSource const& source, LogLineParser const& parser)
        : m_parser(parser), m_isOpen(m_reader.Open(source, parser.fileType()))
    {}

    void Note(LineTable const& lines, HistoryRun& run, RunHeading& heading)
    {
        size_t first = run.firstLine;
        while (first < run.endLine && !(lines.mark(first) & LogRows::Timed))
            ++first;
        if (!m_isOpen || first == run.endLine)
            return;
        size_t last = run.endLine - 1;
        while (!(lines.mark(last) & LogRows::Timed))
            --last;
        const QByteArray line = m_reader.Line(lines.start(first));
        heading.start = m_parser.Parse(line).time;
        run.start = keyOf(line);
        heading.end = m_parser.Parse(m_reader.Line(lines.start(last))).time;
    }

private:
    // Without a date, a stamp does not tell which run it is.
    qint64 keyOf(QByteArray const& line) const
    {
        char const* text = line.constData();
        int length = line.size();
        QByteArray narrow;
        m_parser.fileType().encoding.Narrow(text, length, narrow);
        const LogLineParser::Parts parts =
            m_parser.Find(text, std::min(length, LogIndex::PartsLimit));
        return parts.hasDate ? parts.timeKey : -1;
    }

    LogLineParser const& m_parser;
    LogLineReader m_reader;
    bool m_isOpen;
};

} // namespace

HistoryScanner::HistoryScanner(QObject* parent)
    : QObject(parent), m_scanner(new LogScanner(this)), m_rows(std::make_shared<LogRows>())
{
    qRegisterMetaType<HistoryUpdate>();
    connect(m_scanner, &LogScanner::updated, this, &HistoryScanner::take);
    connect(m_scanner, &LogScanner::polled, this, &HistoryScanner::checkOlder);
    connect(m_scanner, &LogScanner::progressed, this, [this](int request, int percent) {
        Q_EMIT progressed(request, m_olderPercent + percent * (100 - m_olderPercent) / 100);
    });
}

HistoryScanner::~HistoryScanner() = default;

void HistoryScanner::SetCurrentRequest(int request)
{
    m_currentRequest = request;
    m_scanner->SetCurrentRequest(request);
}

void HistoryScanner::Open(int request, QString const& path, LogLineParser const& parser,
                          LogFilter const& filter, bool isAll)
{
    if (path != m_path || !isAll)
        m_folded.clear();
    m_request = request;
    m_path = path;
    m_isAll = isAll;
    m_parser = parser;
    m_filter = wholeFilter(filter);
    m_isReset = true;
    m_hasCurrent = false;
    m_sinceEnds.invalidate();
    m_olderPercent = 0;
    forgetOlder();
    if (m_isAll && isCurrentRequest()) {
        m_parser.SetFileType(TypeOf(m_path, m_parser));
        prepareOlder();
    }
    m_scanner->Open(request, path, parser, m_filter);
}

void HistoryScanner::SetWatched(bool watched)
{
    m_isWatched = watched;
    if (!m_endTimer) {
        m_endTimer = new QTimer(this);
        m_endTimer->setSingleShot(true);
        m_endTimer->setInterval(EndInterval);
        connect(m_endTimer, &QTimer::timeout, this, &HistoryScanner::checkEnds);
    }
    if (!watched)
        m_endTimer->stop();
    m_scanner->SetWatched(watched);
}

void HistoryScanner::SetFilter(int request, LogFilter const& filter)
{
    const LogFilter whole = wholeFilter(filter);
    m_isOlderSearched = m_isOlderSearched && whole.HasSameText(m_filter);
    m_hasOlderRows = false;
    m_request = request;
    m_filter = whole;
    m_isReset = true;
    if (m_isAll && isCurrentRequest())
        prepareOlder();
    m_scanner->SetFilter(request, m_filter);
}

void HistoryScanner::SetFolded(quint64 run, bool folded)
{
    if (!m_isAll)
        return;
    if (folded)
        m_folded.insert(run);
    else
        m_folded.remove(run);
    if (!m_hasCurrent || !m_hasOlderRows)
        return; // the next report will show it
    makeOlderRows();
    report(true);
}

// Without the earlier runs, little would be left of all of a log.
LogFilter HistoryScanner::wholeFilter(LogFilter filter) const
{
    if (m_isAll)
        filter.SetEarlierRuns(true);
    return filter;
}

void HistoryScanner::forgetOlder()
{
    m_files.clear();
    m_listed.clear();
    m_unreadable.clear();
    m_older = std::make_shared<OlderLogFiles>();
    m_isOlderRead = false;
    m_isOlderSearched = false;
    m_hasOlderRows = false;
}

QStringList HistoryScanner::listOlder() const
{
    QStringList paths = LogFileList::FilesOf(m_path);
    paths.removeAll(m_path);
    std::reverse(paths.begin(), paths.end());
    return paths;
}

// Again if the log rotates meanwhile, so that no file is missing.
void HistoryScanner::openOlder()
{
    forgetOlder();
    m_listed = listOlder();
    for (int i = 0; i < MostOpenings; ++i) {
        m_files.clear();
        m_unreadable.clear();
        for (QString const& path : qAsConst(m_listed)) {
            IndexedLogFile file;
            if (file.Open(path))
                m_files.push_back(std::move(file));
            else
                m_unreadable.append(path);
        }
        const QStringList before = std::exchange(m_listed, listOlder());
        if (m_listed == before && !isOlderChanged())
            break;
    }
}

bool HistoryScanner::isOlderChanged() const
{
    return listOlder() != m_listed ||
           std::any_of(m_files.begin(), m_files.end(),
                       [](IndexedLogFile const& file) { return !file.IsUnchanged(); });
}

// Does what is missing to know the rows of the older files. Returns false if a newer request has
// arrived.
bool HistoryScanner::prepareOlder()
{
    if (!m_isOlderRead && !readOlder())
        return false;
    if (!m_isOlderSearched && !searchOlder())
        return false;
    if (!m_hasOlderRows) {
        for (IndexedLogFile& file : m_files)
            file.MakeRows(m_filter);
        makeOlderRows();
    }
    m_hasOlderRows = true;
    return true;
}

bool HistoryScanner::readOlder()
{
    openOlder();
    if (QFileInfo(m_path).size() == 0) { // which does not tell how to read the log
        const auto newest =
            std::find_if(m_files.rbegin(), m_files.rend(),
                         [](IndexedLogFile const& file) { return file.size() > 0; });
        if (newest != m_files.rend())
            m_parser.SetFileType(TypeOf(newest->path(), m_parser));
    }
    qint64 size = 0;
    for (IndexedLogFile const& file : m_files)
        size += file.size();
    const qint64 total = size + QFileInfo(m_path).size();
    qint64 done = 0;
    for (IndexedLogFile& file : m_files) {
        if (!file.Read(m_parser, m_filter, [this] { return isCurrentRequest(); }))
            return false;
        done += file.size();
        reportProgress(done, total);
    }
    joinOlder();
    m_isOlderRead = true;
    m_isOlderSearched = true;
    return true;
}

bool HistoryScanner::searchOlder()
{
    const qint64 total = m_older->size() + QFileInfo(m_path).size();
    for (size_t file = 0; file < m_files.size(); ++file) {
        if (!m_files[file].Search(*m_older, m_older->start(file), m_filter,
                                  [this] { return isCurrentRequest(); }))
            return false;
        reportProgress(m_older->start(file) + m_files[file].size(), total);
    }
    m_isOlderSearched = true;
    return true;
}

void HistoryScanner::reportProgress(qint64 done, qint64 total)
{
    m_olderPercent = total > 0 ? static_cast<int>(std::min<qint64>(done * 100 / total, 99)) : 0;
    Q_EMIT progressed(m_request, m_olderPercent);
}

void HistoryScanner::joinOlder()
{
    auto older = std::make_shared<OlderLogFiles>();
    m_lines = LineTable();
    m_firstLines.clear();
    for (IndexedLogFile const& file : m_files) {
        LineTable const& lines = file.rows().lines();
        LineTable::Reader starts(lines);
        m_firstLines.push_back(m_lines.size());
        for (size_t line = 0; line < lines.size(); ++line)
            m_lines.Append(older->size() + starts.start(line), lines.mark(line), lines.check(line));
        older->Add(file.path(), file.file(), file.size(), file.Separator());
    }
    m_older = older;
    m_olderLines = m_lines.size();
    m_appended = LineTable();

    m_olderRuns.clear();
    m_olderHeadings.clear();
    for (size_t file = 0; file < m_files.size(); ++file) {
        const size_t end = file + 1 < m_files.size() ? m_firstLines[file + 1] : m_olderLines;
        addRuns(m_files[file].index().RunStarts(), m_firstLines[file], end,
                IndexedLogFile::IdentityOf(m_files[file].path()), m_olderRuns, m_olderHeadings);
    }
    RunTimes times(LogSource(m_path, m_older), m_parser);
    for (size_t run = 0; run < m_olderRuns.size(); ++run) {
        NoteCounts(CountsOf(m_lines, m_olderRuns[run].firstLine, m_olderRuns[run].endLine),
                   m_olderHeadings[run]);
        times.Note(m_lines, m_olderRuns[run], m_olderHeadings[run]);
    }
}

// Adds the runs of a file, oldest first.
//
// @param starts  as LogIndex::RunStarts()
// @param first, end  the lines of the file among all lines
void HistoryScanner::addRuns(std::vector<size_t> const& starts, size_t first, size_t end,
                             quint64 file, std::vector<HistoryRun>& runs,
                             std::vector<RunHeading>& headings)
{
    for (size_t number = starts.size(); number > 0; --number) {
        HistoryRun run;
        run.firstLine = first + starts[number - 1];
        run.endLine = number < starts.size() ? first + starts[number] : end;
        run.isCut = number > 1;
        if (run.firstLine == run.endLine)
            continue;
        // What is left of runs is written over from the start, so they are counted from the end.
        RunHeading heading;
        heading.id = file * MostRunsInFile + (run.isCut ? starts.size() - number + 1 : 0);
        runs.push_back(run);
        headings.push_back(heading);
    }
}

void HistoryScanner::makeOlderRows()
{
    m_olderRows = LogRows(m_lines);
    size_t run = 0;
    for (size_t file = 0; file < m_files.size(); ++file) {
        LogRows const& from = m_files[file].rows();
        addEarlierRows(from, m_files[file].index().RunStarts(), m_firstLines[file], run,
                       m_olderHeadings, m_olderRows);
        if (run < m_olderRuns.size() && m_olderRuns[run].firstLine == m_firstLines[file] &&
            from.lines().size() > 0)
            addNewestRows(from, m_firstLines[file], run++, m_olderHeadings, m_olderRows);
    }
}

// Adds the rows of the runs that the newest one of a file has written over.
//
// @param run  the number of the first one; is increased by how many there are
void HistoryScanner::addEarlierRows(LogRows const& from, std::vector<size_t> const& starts,
                                    size_t offset, size_t& run,
                                    std::vector<RunHeading> const& headings, LogRows& rows) const
{
    size_t row = from.earlier() > 0 ? 1 : 0; // after the heading
    for (size_t number = starts.size(); number > 1; --number) {
        const size_t end = number < starts.size() ? starts[number] : from.lines().size();
        if (starts[number - 1] == end)
            continue;
        size_t next = row;
        size_t last = from.earlier();
        while (next < last) { // to the first row of the run after this one
            const size_t middle = next + (last - next) / 2;
            if (from.line(middle) >= starts[number - 1])
                next = middle + 1;
            else
                last = middle;
        }
        if (next > row) {
            rows.AddHeading(LogRows::FirstRunHeading - static_cast<qint64>(run));
            if (!m_folded.contains(headings[run].id))
                rows.AddRows(from, row, next, offset);
        }
        row = next;
        ++run;
    }
}

void HistoryScanner::addNewestRows(LogRows const& from, size_t offset, size_t run,
                                   std::vector<RunHeading> const& headings, LogRows& rows) const
{
    const size_t first = from.earlier() > 0 ? from.earlier() + 1 : 0;
    if (first == from.size())
        return;
    rows.AddHeading(LogRows::FirstRunHeading - static_cast<qint64>(run));
    if (!m_folded.contains(headings[run].id))
        rows.AddRows(from, first, from.size(), offset);
}

void HistoryScanner::take(LogUpdate const& update)
{
    if (!m_isAll) {
        HistoryUpdate one;
        static_cast<LogUpdate&>(one) = update;
        Q_EMIT updated(one);
        return;
    }
    m_current = update;
    m_hasCurrent = true;
    m_isReset = m_isReset || update.isReset;
    const bool hasOtherType =
        !update.rows->lines().isEmpty() && !update.type.IsLike(m_parser.fileType());
    if (hasOtherType)
        m_parser.SetFileType(update.type);
    if (hasOtherType || (update.isReset && isOlderChanged()))
        m_isOlderRead = false;
    if (!m_isOlderRead)
        m_hasOlderRows = false;
    if (prepareOlder())
        report(false);
}

// The older files may have changed without the current one.
void HistoryScanner::checkOlder()
{
    if (m_isAll && m_hasCurrent && m_hasOlderRows && isCurrentRequest() && isOlderChanged()) {
        m_isOlderRead = false;
        m_hasOlderRows = false;
        m_isReset = true;
        if (prepareOlder())
            report(false);
    }
    Q_EMIT polled();
}

void HistoryScanner::checkEnds()
{
    if (!m_isAll || !m_hasCurrent || !m_hasOlderRows || !isCurrentRequest())
        return;
    const HistoryRun::Exit before = m_newestExit;
    m_sinceEnds.invalidate();
    makeHeadings();
    if (m_newestExit != before)
        report(false);
    else
        m_endTimer->start();
}

// Those that are there already stay, so that rows share them.
void HistoryScanner::appendCurrentLines()
{
    LineTable const& lines = m_current.rows->lines();
    LineTable::Reader starts(lines);
    size_t line = m_appended.CountSame(lines);
    m_lines.Truncate(m_olderLines + line);
    for (; line < lines.size(); ++line)
        m_lines.Append(m_older->size() + starts.start(line), lines.mark(line), lines.check(line));
    m_appended = lines;
}

std::vector<RunHeading> HistoryScanner::makeHeadings()
{
    std::vector<HistoryRun> runs = m_olderRuns;
    std::vector<RunHeading> headings = m_olderHeadings;
    addRuns(m_current.runStarts, m_olderLines, m_lines.size(), IndexedLogFile::IdentityOf(m_path),
            runs, headings);
    RunTimes times(LogSource(m_path, m_older), m_parser);
    LogCounts newest = m_current.counts;
    for (size_t run = m_olderRuns.size(); run < runs.size(); ++run) {
        LogCounts counts = newest;
        if (run + 1 < runs.size()) {
            counts = CountsOf(m_lines, runs[run].firstLine, runs[run].endLine);
            for (size_t severity = 0; severity < counts.size(); ++severity)
                newest[severity] -= counts[severity];
        }
        NoteCounts(counts, headings[run]);
        times.Note(m_lines, runs[run], headings[run]);
    }
    if (!m_sinceEnds.isValid() || m_sinceEnds.hasExpired(EndInterval)) {
        m_ends = RunEnds::Of(m_path);
        m_sinceEnds.start();
    }
    RunEnds::Assign(m_ends, runs);
    for (size_t run = 0; run < runs.size(); ++run) {
        headings[run].exit = runs[run].exit;
        headings[run].isFolded = m_folded.contains(headings[run].id);
    }
    m_newestExit = runs.empty() ? HistoryRun::Unknown : runs.back().exit;
    return headings;
}

void HistoryScanner::report(bool isFolding)
{
    appendCurrentLines();
    const std::vector<RunHeading> headings = makeHeadings();
    const qint64 start = m_older->size();
    LogRows const& current = *m_current.rows;
    LogRows rows = m_olderRows;
    rows.SetLines(m_lines, m_olderLines + current.newestEnd(), start + current.complete(),
                  start + current.end());
    size_t run = m_olderRuns.size();
    addEarlierRows(current, m_current.runStarts, m_olderLines, run, headings, rows);
    rows.EndEarlier();
    if (!current.lines().isEmpty()) {
        rows.AddHeading(LogRows::NewestHeading);
        const size_t first = current.earlier() > 0 ? current.earlier() + 1 : 0;
        if (!headings.back().isFolded)
            rows.AddRows(current, first, current.size(), m_olderLines);
    }

    HistoryUpdate update;
    static_cast<LogUpdate&>(update) = m_current;
    update.rows = std::make_shared<LogRows>(rows);
    update.isReset = m_isReset;
    if (!m_isReset)
        update.Compare(*m_rows);
    m_isReset = false;
    m_rows = update.rows;
    update.runs = std::make_shared<std::vector<RunHeading>>(headings);
    update.older = m_older;
    update.unreadable = m_unreadable;
    update.isFolding = isFolding;
    addOlder(update);
    Q_EMIT updated(update);
    if (m_isWatched && m_newestExit == HistoryRun::Running && !m_endTimer->isActive())
        m_endTimer->start();
}

// What is known about the older files.
void HistoryScanner::addOlder(HistoryUpdate& update) const
{
    update.exists = update.exists || !m_files.empty();
    update.type = m_parser.fileType();
    update.lines += m_olderLines;
    if (update.slowLine > 0)
        update.slowLine += m_olderLines;
    for (size_t file = m_files.size(); file > 0; --file) {
        LogIndex const& index = m_files[file - 1].index();
        if (index.slowLine() > 0)
            update.slowLine = m_firstLines[file - 1] + index.slowLine();
        update.hasElapsed = update.hasElapsed || index.hasElapsed();
        update.hasTimes = update.hasTimes || index.hasTimes();
        update.hasSeverities = update.hasSeverities || index.hasSeverities();
        for (size_t severity = 0; severity < update.counts.size(); ++severity)
            update.counts[severity] += index.counts()[severity];
    }
}

} // namespace Velocor
