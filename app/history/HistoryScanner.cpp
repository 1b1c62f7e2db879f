// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryScanner.h"

#include "app/history/HistoryTime.h"

#include <QFileInfo>
#include <QTimer>

#include <algorithm>

namespace Velocor {

namespace {

// Nothing in the log tells that its program has ended.
constexpr int EndInterval = 1000; // milliseconds

} // namespace

HistoryScanner::HistoryScanner(QObject* parent)
    : QObject(parent), m_scanner(new LogScanner(this)),
      m_older([this] { return isCurrentRequest(); },
              [this](int percent) { Q_EMIT progressed(m_request, percent); }),
      m_inSpan([this] { return isCurrentRequest(); }), m_rows(std::make_shared<LogRows>())
{
    qRegisterMetaType<HistoryUpdate>();
    connect(m_scanner, &LogScanner::updated, this, &HistoryScanner::take);
    connect(m_scanner, &LogScanner::polled, this, &HistoryScanner::checkOlder);
    connect(m_scanner, &LogScanner::progressed, this, [this](int request, int percent) {
        const int older = m_older.percent();
        Q_EMIT progressed(request, older + percent * (100 - older) / 100);
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
    m_parser = parser;
    m_isAll = isAll;
    m_isReset = true;
    m_hasCurrent = false;
    m_sinceEnds.invalidate();
    const LogFilter whole = wholeFilter(filter);
    m_span = filter.span();
    m_inSpan.Forget();
    if (m_isAll)
        m_older.Open(path, parser, whole);
    else
        m_older.Close();
    if (m_isAll && isCurrentRequest())
        m_older.Prepare(m_folded);
    m_scanner->Open(request, path, parser, whole);
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
    m_span = filter.span();
    m_older.SetFilter(whole);
    m_request = request;
    m_isReset = true;
    if (m_isAll && isCurrentRequest())
        m_older.Prepare(m_folded);
    m_scanner->SetFilter(request, whole);
}

void HistoryScanner::SetFolded(quint64 run, bool folded)
{
    if (!m_isAll)
        return;
    if (folded)
        m_folded.insert(run);
    else
        m_folded.remove(run);
    if (!m_hasCurrent || !m_older.isPrepared())
        return; // the next report will show it
    m_older.Fold(m_folded);
    report(true);
}

// Without the earlier runs, little would be left of all of a log.
LogFilter HistoryScanner::wholeFilter(LogFilter filter) const
{
    if (m_isAll)
        filter.SetEarlierRuns(true);
    return filter;
}

void HistoryScanner::take(LogUpdate const& update)
{
    if (!m_isAll) {
        m_current = update;
        reportOne();
        return;
    }
    m_current = update;
    m_hasCurrent = true;
    m_isReset = m_isReset || update.isReset;
    const bool hasOtherType =
        !update.rows->lines().isEmpty() && !update.type.IsLike(m_older.parser().fileType());
    if (hasOtherType)
        m_older.SetFileType(update.type);
    else if (update.isReset && m_older.IsChanged())
        m_older.ReadAgain();
    if (m_older.Prepare(m_folded))
        report(false);
}

void HistoryScanner::reportOne()
{
    HistoryUpdate one;
    static_cast<LogUpdate&>(one) = m_current;
    if (m_span.isLimited()) {
        RunList runs;
        runs.Add(m_current.runStarts, 0, m_current.rows->lines().size(), 0);
        one.rows = rowsInSpan(*m_current.rows, runs);
        if (!one.rows)
            return; // another request follows
        one.isReset = one.isReset || m_isReset;
        if (!one.isReset)
            one.Compare(*m_rows);
        m_rows = one.rows;
    }
    m_isReset = false;
    Q_EMIT updated(one);
}

// Null if another request is to be answered.
std::shared_ptr<LogRows const> HistoryScanner::rowsInSpan(LogRows const& rows, RunList const& runs)
{
    const std::shared_ptr<OlderLogFiles const> older = m_isAll ? m_files : nullptr;
    const auto modified = [](QString const& path) {
        const qint64 time = QFileInfo(path).lastModified().toMSecsSinceEpoch();
        return std::max<qint64>(0, HistoryTime::OfEpoch(time));
    };
    std::vector<RowsInSpan::Run> spans;
    for (HistoryRun const& run : runs.runs()) {
        const qint64 start = rows.lines().start(run.firstLine);
        const bool isOlder = older && start < older->size();
        spans.push_back({run.firstLine, run.endLine,
                         modified(isOlder ? older->path(older->FileAt(start)) : m_path)});
    }
    LogLineParser parser = m_isAll ? m_older.parser() : m_parser;
    parser.SetFileType(m_current.type);
    return m_inSpan.Of(rows, spans, LogSource(m_path, older), parser, m_span);
}

// The older files may have changed without the current one.
void HistoryScanner::checkOlder()
{
    if (m_isAll && m_hasCurrent && m_older.isPrepared() && isCurrentRequest() &&
        m_older.IsChanged()) {
        m_older.ReadAgain();
        m_isReset = true;
        if (m_older.Prepare(m_folded))
            report(false);
    }
    Q_EMIT polled();
}

void HistoryScanner::checkEnds()
{
    if (!m_isAll || !m_hasCurrent || !m_older.isPrepared() || !isCurrentRequest())
        return;
    const HistoryRun::Exit before = m_newestExit;
    m_sinceEnds.invalidate();
    makeRuns();
    if (m_newestExit != before)
        report(false);
    else
        m_endTimer->start();
}

// Those that are there already stay, so that rows share them.
void HistoryScanner::appendCurrentLines()
{
    if (m_files != m_older.files()) {
        m_files = m_older.files();
        m_lines = m_older.lines();
        m_appended = LineTable();
    }
    LineTable const& lines = m_current.rows->lines();
    LineTable::Reader starts(lines);
    size_t line = m_appended.CountSame(lines);
    m_lines.Truncate(m_older.lines().size() + line);
    for (; line < lines.size(); ++line)
        m_lines.Append(m_files->size() + starts.start(line), lines.mark(line), lines.check(line));
    m_appended = lines;
}

RunList HistoryScanner::makeRuns()
{
    RunList list = m_older.runs();
    const size_t first = list.size();
    list.Add(m_current.runStarts, m_older.lines().size(), m_lines.size(),
             IndexedLogFile::IdentityOf(m_path));
    LogCounts newest = m_current.counts;
    for (size_t run = first; run < list.size(); ++run) {
        LogCounts counts = newest;
        if (run + 1 < list.size()) {
            counts = list.CountsOf(run, m_lines);
            for (size_t severity = 0; severity < counts.size(); ++severity)
                newest[severity] -= counts[severity];
        }
        list.NoteCounts(run, counts);
    }
    list.NoteTimes(first, m_lines, LogSource(m_path, m_older.files()), m_older.parser());
    if (!m_sinceEnds.isValid() || m_sinceEnds.hasExpired(EndInterval)) {
        m_ends = RunEnds::Of(m_path);
        m_sinceEnds.start();
    }
    RunEnds::Assign(m_ends, list.runs());
    for (size_t run = 0; run < list.size(); ++run) {
        RunHeading& heading = list.headings()[run];
        heading.exit = list.runs()[run].exit;
        heading.isFolded = m_folded.contains(heading.id);
    }
    m_newestExit = list.isEmpty() ? HistoryRun::Unknown : list.runs().back().exit;
    return list;
}

void HistoryScanner::report(bool isFolding)
{
    appendCurrentLines();
    const RunList runs = makeRuns();
    const size_t offset = m_older.lines().size();
    const qint64 start = m_files->size();
    LogRows const& current = *m_current.rows;
    LogRows rows = m_older.rows();
    rows.SetLines(m_lines, offset + current.newestEnd(), start + current.complete(),
                  start + current.end());
    size_t run = m_older.runs().size();
    runs.AddEarlierRows(run, current, m_current.runStarts, offset, m_folded, rows);
    rows.EndEarlier();
    if (!current.lines().isEmpty()) {
        rows.AddHeading(LogRows::NewestHeading);
        const size_t first = current.earlier() > 0 ? current.earlier() + 1 : 0;
        if (!runs.headings().back().isFolded)
            rows.AddRows(current, first, current.size(), offset);
    }

    HistoryUpdate update;
    static_cast<LogUpdate&>(update) = m_current;
    update.rows = m_span.isLimited() ? rowsInSpan(rows, runs) : std::make_shared<LogRows>(rows);
    if (!update.rows)
        return; // another request follows
    update.isReset = m_isReset;
    if (!m_isReset)
        update.Compare(*m_rows);
    m_isReset = false;
    m_rows = update.rows;
    update.runs = std::make_shared<std::vector<RunHeading>>(runs.headings());
    update.runLines = std::make_shared<std::vector<HistoryRun>>(runs.runs());
    update.isFolding = isFolding;
    m_older.AddTo(update);
    Q_EMIT updated(update);
    if (m_isWatched && m_newestExit == HistoryRun::Running && !m_endTimer->isActive())
        m_endTimer->start();
}

} // namespace Velocor
