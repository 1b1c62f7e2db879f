// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/OlderHistory.h"

#include "app/logfile/LogFileList.h"

#include <QFile>
#include <QFileInfo>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

// A log rotates at the start of its program, so twice in a row is rare.
constexpr int MostOpenings = 10;

LogFileType TypeOf(QString const& path, LogLineParser const& parser)
{
    QFile file(path);
    const QFileInfo info(path);
    const bool isOpen = info.isFile() && file.open(QIODevice::ReadOnly);
    const QByteArray head = isOpen ? file.read(LogFileType::HeadSize) : QByteArray();
    return LogFileType::Of(head, parser, parser.chosenEncoding(), info.lastModified().date());
}

} // namespace

OlderHistory::OlderHistory(std::function<bool()> goesOn, std::function<void(int)> progressed)
    : m_goesOn(std::move(goesOn)), m_progressed(std::move(progressed))
{}

void OlderHistory::Open(QString const& path, LogLineParser const& parser, LogFilter const& filter)
{
    Close();
    m_path = path;
    m_parser = parser;
    m_parser.SetFileType(TypeOf(path, parser));
    m_filter = filter;
}

void OlderHistory::SetFilter(LogFilter const& filter)
{
    m_isSearched = m_isSearched && filter.HasSameText(m_filter);
    m_hasRows = false;
    m_filter = filter;
}

void OlderHistory::SetFileType(LogFileType const& type)
{
    m_parser.SetFileType(type);
    ReadAgain();
}

void OlderHistory::ReadAgain()
{
    m_isRead = false;
    m_hasRows = false;
}

void OlderHistory::Close()
{
    forget();
    m_percent = 0;
}

bool OlderHistory::Prepare(QSet<quint64> const& folded)
{
    if (!m_isRead && !read())
        return false;
    if (!m_isSearched && !search())
        return false;
    if (!m_hasRows) {
        for (IndexedLogFile& file : m_files)
            file.MakeRows(m_filter);
        makeRows(folded);
    }
    m_hasRows = true;
    return true;
}

void OlderHistory::Fold(QSet<quint64> const& folded)
{
    if (m_hasRows)
        makeRows(folded);
}

void OlderHistory::forget()
{
    m_files.clear();
    m_listed.clear();
    m_unreadable.clear();
    m_older = std::make_shared<OlderLogFiles>();
    m_isRead = false;
    m_isSearched = false;
    m_hasRows = false;
}

QStringList OlderHistory::list() const
{
    QStringList paths = LogFileList::FilesOf(m_path);
    paths.removeAll(m_path);
    std::reverse(paths.begin(), paths.end());
    return paths;
}

// Again if the log rotates meanwhile, so that no file is missing.
void OlderHistory::openFiles()
{
    forget();
    m_listed = list();
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
        const QStringList before = std::exchange(m_listed, list());
        if (m_listed == before && !IsChanged())
            break;
    }
}

bool OlderHistory::IsChanged() const
{
    return list() != m_listed ||
           std::any_of(m_files.begin(), m_files.end(),
                       [](IndexedLogFile const& file) { return !file.IsUnchanged(); });
}

bool OlderHistory::read()
{
    openFiles();
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
        if (!file.Read(m_parser, m_filter, m_goesOn))
            return false;
        done += file.size();
        reportProgress(done, total);
    }
    joinLines();
    joinRuns();
    m_isRead = true;
    m_isSearched = true;
    return true;
}

bool OlderHistory::search()
{
    const qint64 total = m_older->size() + QFileInfo(m_path).size();
    for (size_t file = 0; file < m_files.size(); ++file) {
        if (!m_files[file].Search(*m_older, m_older->start(file), m_filter, m_goesOn))
            return false;
        reportProgress(m_older->start(file) + m_files[file].size(), total);
    }
    m_isSearched = true;
    return true;
}

void OlderHistory::reportProgress(qint64 done, qint64 total)
{
    m_percent = total > 0 ? static_cast<int>(std::min<qint64>(done * 100 / total, 99)) : 0;
    m_progressed(m_percent);
}

void OlderHistory::joinLines()
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
    for (size_t file = 0; file < m_files.size(); ++file)
        m_files[file].TakeLines(
            m_lines.Part(m_firstLines[file], endOfFile(file), m_older->start(file)));
}

void OlderHistory::joinRuns()
{
    m_runs = RunList();
    for (size_t file = 0; file < m_files.size(); ++file) {
        LogIndex const& index = m_files[file].index();
        const size_t first = m_runs.size();
        m_runs.Add(index.RunStarts(), m_firstLines[file], endOfFile(file),
                   IndexedLogFile::IdentityOf(m_files[file].path()));
        const bool isOneRun = m_runs.size() == first + 1;
        for (size_t run = first; run < m_runs.size(); ++run)
            m_runs.NoteCounts(run, isOneRun ? index.counts() : m_runs.CountsOf(run, m_lines));
    }
    m_runs.NoteTimes(0, m_lines, LogSource(m_path, m_older), m_parser);
}

// The line after the last one of a file, in the table.
size_t OlderHistory::endOfFile(size_t file) const
{
    return file + 1 < m_files.size() ? m_firstLines[file + 1] : m_lines.size();
}

void OlderHistory::makeRows(QSet<quint64> const& folded)
{
    m_rows = LogRows(m_lines);
    size_t run = 0;
    for (size_t file = 0; file < m_files.size(); ++file) {
        LogRows const& from = m_files[file].rows();
        m_runs.AddEarlierRows(run, from, m_files[file].index().RunStarts(), m_firstLines[file],
                              folded, m_rows);
        if (run < m_runs.size() && m_runs.runs()[run].firstLine == m_firstLines[file] &&
            from.lines().size() > 0)
            m_runs.AddNewestRows(run++, from, m_firstLines[file], folded, m_rows);
    }
}

void OlderHistory::AddTo(HistoryUpdate& update) const
{
    update.older = m_older;
    update.unreadable = m_unreadable;
    update.exists = update.exists || !m_files.empty();
    update.type = m_parser.fileType();
    update.lines += m_lines.size();
    if (update.slowLine > 0)
        update.slowLine += m_lines.size();
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
