// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/FamilyScanner.h"

#include "app/history/FamilyChange.h"
#include "app/history/HistoryScanner.h"

#include <QMutexLocker>
#include <QTimer>

#include <algorithm>
#include <limits>
#include <utility>

namespace Velocor {

struct FamilyScanner::Log
{
    ProgramLog log;
    HistoryScanner* scanner = nullptr;
    bool isShown = true;
    bool isKnown = false; // all of it has been read for the current request
    HistoryUpdate update;
    LogKeys keys;
    bool hasKeys = false; // those of the update

    // Among the lines of all logs, as merged last and before.
    LineTable lines;
    FamilyLines place;

    bool isOther(LogFileType const& type) const
    {
        return !update.rows->lines().isEmpty() && !update.type.IsLike(type);
    }
};

namespace {

qint64 StartOf(size_t log)
{
    return static_cast<qint64>(log) * LogSource::LogSize;
}

// Goes through the rows of one of the logs.
class FamilyRows
{
public:
    FamilyRows(LogRows const& rows, LogKeys const& keys, size_t firstLine)
        : m_rows(&rows), m_keys(&keys), m_firstLine(firstLine)
    {
        Skip();
    }

    bool isEnd() const { return m_row == m_rows->size(); }
    qint64 key() const { return m_key; }

    void AddTo(LogRows& rows)
    {
        rows.AddMergedLine(m_firstLine + m_rows->line(m_row), m_rows->isContext(m_row));
        ++m_row;
        Skip();
    }

private:
    void Skip()
    {
        while (!isEnd() && m_rows->isHeading(m_row))
            ++m_row;
        m_key = isEnd() ? 0 : m_keys->key(m_rows->line(m_row));
    }

    LogRows const* m_rows;
    LogKeys const* m_keys;
    size_t m_firstLine;
    size_t m_row = 0;
    qint64 m_key = 0;
};

} // namespace

FamilyScanner::FamilyScanner(QObject* parent)
    : QObject(parent), m_reportTimer(new QTimer(this)), m_rows(std::make_shared<LogRows>()),
      m_repeats([this] { return isCurrentRequest() && m_findsRepeats; })
{
    qRegisterMetaType<HistoryUpdate>();
    qRegisterMetaType<LogFilter>();
    qRegisterMetaType<LogLineParser>();
    qRegisterMetaType<QList<ProgramLog>>("QList<Velocor::ProgramLog>");
    qRegisterMetaType<QSet<QString>>("QSet<QString>");
    m_reportTimer->setSingleShot(true);
    m_reportTimer->setInterval(0);
    connect(m_reportTimer, &QTimer::timeout, this, &FamilyScanner::reportPending);
}

FamilyScanner::~FamilyScanner() = default;

void FamilyScanner::SetCurrentRequest(int request)
{
    const QMutexLocker lock(&m_mutex);
    m_currentRequest = request;
    for (auto const& log : m_logs)
        log->scanner->SetCurrentRequest(request);
}

void FamilyScanner::NoteTaken()
{
    m_isTaken = true;
    const QMutexLocker lock(&m_mutex);
    if (!m_isFamily) {
        for (auto const& log : m_logs)
            log->scanner->NoteTaken();
        return;
    }
    QMetaObject::invokeMethod(this, "reportPending", Qt::QueuedConnection);
}

void FamilyScanner::close()
{
    const QMutexLocker lock(&m_mutex);
    for (auto const& log : m_logs)
        delete log->scanner;
    m_logs.clear();
    m_sources.reset();
    m_lines = LineTable();
}

void FamilyScanner::add(ProgramLog const& log)
{
    auto added = std::make_unique<Log>();
    added->log = log;
    added->scanner = new HistoryScanner(this);
    added->update.rows = std::make_shared<LogRows>();
    Log* const one = added.get();
    connect(one->scanner, &HistoryScanner::updated, this,
            [this, one](HistoryUpdate const& update) { take(*one, update); });
    connect(one->scanner, &HistoryScanner::progressed, this,
            [this](int, int percent) { reportProgress(percent); });
    const QMutexLocker lock(&m_mutex);
    one->scanner->SetCurrentRequest(m_currentRequest);
    m_logs.push_back(std::move(added));
}

// The scanner of a single log stays, because it knows what is folded.
void FamilyScanner::Open(int request, QString const& path, LogLineParser const& parser,
                         LogFilter const& filter, bool isAll)
{
    m_request = request;
    m_parser = parser;
    if (m_isFamily || m_logs.size() != 1) {
        close();
        {
            const QMutexLocker lock(&m_mutex);
            m_isFamily = false;
        }
        add({QString(), path});
        m_logs.front()->scanner->SetWatched(m_isWatched);
    }
    m_logs.front()->scanner->Open(request, path, parser, filter, isAll);
}

void FamilyScanner::OpenFamily(int request, QList<ProgramLog> const& logs,
                               LogLineParser const& parser, LogFilter const& filter,
                               QSet<QString> const& hidden)
{
    m_request = request;
    m_parser = parser;
    close();
    {
        const QMutexLocker lock(&m_mutex);
        m_isFamily = true;
    }
    m_isReset = true;
    m_isPending = false;
    for (ProgramLog const& log : logs)
        add(log);
    m_isAsking = true;
    // Each of them, even if the request is obsolete: the next one may only change the filter.
    for (m_asked = 0; m_asked < m_logs.size(); ++m_asked) {
        Log& log = *m_logs[m_asked];
        log.isShown = !hidden.contains(log.log.path);
        log.scanner->Open(request, log.log.path, parser, filter, true);
        log.scanner->SetWatched(m_isWatched);
    }
    m_isAsking = false;
    m_isPending = false;
    report(false);
}

void FamilyScanner::SetHidden(QSet<QString> const& hidden)
{
    for (auto const& log : m_logs)
        log->isShown = !hidden.contains(log->log.path);
    if (m_isFamily)
        report(true);
}

void FamilyScanner::SetWatched(bool watched)
{
    m_isWatched = watched;
    for (auto const& log : m_logs)
        log->scanner->SetWatched(watched);
}

void FamilyScanner::Poll()
{
    for (auto const& log : m_logs)
        log->scanner->Poll();
}

void FamilyScanner::SetFilter(int request, LogFilter const& filter)
{
    m_request = request;
    if (!m_isFamily) {
        for (auto const& log : m_logs)
            log->scanner->SetFilter(request, filter);
        return;
    }
    m_isReset = true;
    for (auto const& log : m_logs)
        log->isKnown = false;
    m_isAsking = true;
    for (m_asked = 0; m_asked < m_logs.size(); ++m_asked)
        m_logs[m_asked]->scanner->SetFilter(request, filter);
    m_isAsking = false;
    m_isPending = false;
    report(false);
}

void FamilyScanner::SetFolded(quint64 run, bool folded)
{
    if (!m_isFamily && !m_logs.empty())
        m_logs.front()->scanner->SetFolded(run, folded);
}

void FamilyScanner::reportProgress(int percent)
{
    if (!m_isFamily)
        Q_EMIT progressed(m_request, percent);
    else if (m_isAsking)
        Q_EMIT progressed(m_request, (static_cast<int>(m_asked) * 100 + percent) /
                                         static_cast<int>(m_logs.size()));
}

// Rows of a part of a log would be missing in the middle, so they wait for the others.
void FamilyScanner::take(Log& log, HistoryUpdate const& update)
{
    if (!m_isFamily) {
        send(update);
        return;
    }
    log.scanner->NoteTaken();
    if (update.request != m_request || update.isPartial)
        return;
    if (update.isReset && !log.isKnown)
        m_isReset = true;
    if (update.isReset) {
        log.keys.Forget();
        m_sources.reset(); // its file may be another one of the same name
    }
    log.update = update;
    log.isKnown = true;
    log.hasKeys = false;
    m_isPending = true;
    if (!m_isAsking)
        m_reportTimer->start();
}

void FamilyScanner::reportPending()
{
    if (!m_isPending || !m_isTaken || m_isAsking)
        return;
    m_isPending = false;
    report(false);
}

// Returns false if it was stopped.
bool FamilyScanner::updateKeys()
{
    for (auto const& log : m_logs) {
        if (log->hasKeys)
            continue;
        LogLineParser parser = m_parser;
        parser.SetFileType(log->update.type);
        log->hasKeys = log->keys.Update(log->update, {log->log.path, log->update.older}, parser,
                                        [this] { return isCurrentRequest(); });
        if (!log->hasKeys)
            return false;
    }
    return true;
}

// Another one only if files have changed, so that whoever reads lines need not open them again.
void FamilyScanner::makeSource()
{
    auto sources = std::make_shared<std::vector<LogSource>>();
    for (auto const& log : m_logs)
        sources->emplace_back(log->log.path, log->update.older);
    if (!m_sources || *m_sources != *sources)
        m_sources = sources;
}

// The logs before the first one that has changed keep their lines, so that rows share them.
void FamilyScanner::appendLines()
{
    bool isSame = true;
    size_t end = 0;
    for (size_t number = 0; number < m_logs.size(); ++number) {
        Log& log = *m_logs[number];
        LineTable const& lines = log.update.rows->lines();
        log.place.same = log.lines.CountSame(lines);
        size_t line = isSame ? log.place.same : 0;
        const bool isWhole = isSame && line == lines.size() && line == log.lines.size();
        if (isSame && !isWhole)
            m_lines.Truncate(end + line);
        isSame = isWhole;
        LineTable::Reader starts(lines);
        if (m_lines.size() < end + lines.size()) {
            for (line = m_lines.size() - end; line < lines.size(); ++line)
                m_lines.Append(StartOf(number) + starts.start(line), lines.mark(line),
                               lines.check(line));
        }
        log.lines = lines;
        log.place.before = log.place.after;
        log.place.after = end;
        end += lines.size();
    }
}

// The line of the log with the least key is next; of several such logs, that of the first one.
void FamilyScanner::mergeRows(LogRows& rows) const
{
    const LogFileType type = summary().type;
    std::vector<FamilyRows> logs;
    for (auto const& log : m_logs) {
        if (log->isShown && !log->isOther(type))
            logs.emplace_back(*log->update.rows, log->keys, log->place.after);
    }
    constexpr qint64 Last = std::numeric_limits<qint64>::max();
    while (true) {
        size_t first = logs.size();
        size_t second = first; // whose line comes after those of the first one
        const auto isBefore = [&logs](size_t a, size_t b) {
            return b == logs.size() || logs[a].key() < logs[b].key();
        };
        for (size_t log = 0; log < logs.size(); ++log) {
            if (logs[log].isEnd())
                continue;
            if (isBefore(log, first))
                second = std::exchange(first, log);
            else if (isBefore(log, second))
                second = log;
        }
        if (first == logs.size())
            return;
        const qint64 limit = second == logs.size() ? Last : logs[second].key();
        const bool isFirstOfBoth = first < second;
        do
            logs[first].AddTo(rows);
        while (!logs[first].isEnd() &&
               (logs[first].key() < limit || (isFirstOfBoth && logs[first].key() == limit)));
    }
}

std::vector<FamilyLines> FamilyScanner::linesOfLogs() const
{
    std::vector<FamilyLines> lines;
    for (auto const& log : m_logs)
        lines.push_back(log->place);
    return lines;
}

// All but the rows.
HistoryUpdate FamilyScanner::summary() const
{
    HistoryUpdate update;
    update.request = m_request;
    update.exists = false;
    auto family = std::make_shared<std::vector<FamilyLog>>();
    bool hasType = false;
    for (auto const& log : m_logs) {
        HistoryUpdate const& from = log->update;
        if (!hasType && !from.rows->lines().isEmpty()) {
            update.type = from.type;
            hasType = true;
        }
        FamilyLog member;
        member.name = log->log.name;
        member.isShown = log->isShown;
        member.isOther = log->isOther(update.type);
        member.complete = StartOf(family->size()) + from.rows->complete();
        member.end = StartOf(family->size()) + from.rows->end();
        family->push_back(member);
        update.unreadable += from.unreadable;
        if (!from.error.isEmpty() || member.isOther)
            update.unreadable.append(log->log.path);
        if (!member.isShown || member.isOther)
            continue;
        update.exists = update.exists || from.exists;
        if (from.slowLine > 0 && update.slowLine == 0)
            update.slowLine = update.lines + from.slowLine;
        update.lines += from.rows->lines().size();
        for (size_t severity = 0; severity < update.counts.size(); ++severity)
            update.counts[severity] += from.counts[severity];
        update.hasElapsed = update.hasElapsed || from.hasElapsed;
        update.hasTimes = update.hasTimes || from.hasTimes;
        update.hasSeverities = update.hasSeverities || from.hasSeverities;
    }
    update.family = family;
    return update;
}

void FamilyScanner::report(bool isFolding)
{
    const bool isKnown =
        std::all_of(m_logs.begin(), m_logs.end(), [](auto const& log) { return log->isKnown; });
    if (!isKnown || !isCurrentRequest() || !updateKeys())
        return;
    makeSource();
    appendLines();
    HistoryUpdate update = summary();
    constexpr qint64 End = std::numeric_limits<qint64>::max();
    LogRows rows(m_lines, m_lines.size(), End, End);
    mergeRows(rows);
    update.rows = std::make_shared<LogRows>(rows);
    update.logs = m_sources;
    update.isFolding = isFolding;
    update.isReset = m_isReset;
    if (!m_isReset)
        FamilyChange(*m_rows, rows, linesOfLogs()).Find(update);
    m_isReset = false;
    m_rows = update.rows;
    m_isTaken = false;
    send(update);
}

void FamilyScanner::SetFindsRepeats(bool finds)
{
    m_findsRepeats = finds;
    QMetaObject::invokeMethod(this, "updateRepeats");
}

// Of several changes, only the last one counts.
void FamilyScanner::updateRepeats()
{
    if (m_findsRepeats == bool(m_sent.repeats))
        return;
    if (!m_sent.rows || m_sent.isPartial || m_sent.request != m_currentRequest)
        return; // the next report will show it
    HistoryUpdate update = m_sent;
    update.isReset = true;
    update.isFolding = true;
    send(update);
}

// While a file is still being read, its rows are shown without looking at them twice; only what is
// added to rows that are known is compared at once. A file of several parts takes a while, so all
// of its rows are shown before they are compared.
void FamilyScanner::send(HistoryUpdate update)
{
    update.repeats.reset();
    if (update.isReset)
        m_repeats.Forget();
    const bool hasParts = m_sent.isPartial && m_sent.request == update.request;
    if (!m_findsRepeats) {
        m_repeats.Forget();
    } else if (m_repeats.isKnown() || !(update.isPartial || hasParts)) {
        findRepeats(update);
        if (!update.repeats && !isCurrentRequest())
            return; // another request follows
    }
    m_sent = update;
    Q_EMIT updated(update);
    if (hasParts)
        updateRepeats();
}

void FamilyScanner::findRepeats(HistoryUpdate& update)
{
    LogSource source(m_logs.front()->log.path, update.older);
    source.logs = update.logs;
    LogLineParser parser = m_parser;
    parser.SetFileType(update.type);
    update.repeats = m_repeats.Of(update, source, parser);
}

} // namespace Velocor
