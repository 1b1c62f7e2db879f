// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogScanner.h"

#include <QFile>
#include <QFileInfo>
#include <QFileSystemWatcher>
#include <QStorageInfo>
#include <QTimer>

#include <algorithm>
#include <limits>

namespace Velocor {

namespace {

// With an expression, which may be slow, a newer request is looked for more often.
constexpr int PieceSize = 1 << 12;
constexpr int HeadSize = 256;
constexpr int AnchorSize = 256;
constexpr int TailSize = 256;

// Within this time, two changes may have the same modification time.
constexpr qint64 StampUncertainty = 2000; // milliseconds

QByteArray BytesAt(QFile& file, qint64 offset, qint64 count)
{
    return file.seek(offset) ? file.read(count) : QByteArray();
}

// A change is read after this time: a few lines are usually written at once.
constexpr int LookDelay = 10; // milliseconds

// The least time from one look to the next while changes keep coming: what each of them costs, from
// opening the file to painting, hardly depends on how many lines there are.
constexpr int LookInterval = 45; // milliseconds

// Whether the system tells of every change of a file: on other file systems, another computer or
// the system itself may change it.
bool IsOnLocalDisk(QString const& folder)
{
    static char const* const types[] = {"bcachefs", "btrfs", "exfat", "ext2",  "ext3",    "ext4",
                                        "f2fs",     "jfs",   "msdos", "ntfs3", "overlay", "ramfs",
                                        "reiserfs", "tmpfs", "vfat",  "xfs",   "zfs"};
    const QByteArray type = QStorageInfo(folder).fileSystemType();
    return std::find(std::begin(types), std::end(types), type) != std::end(types);
}

// Why a file could not be opened; empty if it does not exist.
QString ErrorOf(QFile const& file)
{
    const QFileInfo info(file.fileName());
    if (!info.exists())
        return QString();
    return info.isFile() ? file.errorString() : QObject::tr("Not a regular file");
}

} // namespace

LogScanner::LogScanner(QObject* parent) : QObject(parent), m_rows(std::make_shared<LogRows>())
{
    qRegisterMetaType<LogUpdate>();
    qRegisterMetaType<LogFilter>();
    qRegisterMetaType<LogLineParser>();
}

void LogScanner::Open(int request, QString const& path, LogLineParser const& parser,
                      LogFilter const& filter)
{
    m_request = request;
    m_isNewFile = path != m_path;
    m_path = path;
    m_parser = parser;
    m_filter = filter;
    if (isCurrentRequest())
        readFromStart(false);
    if (m_isWatched) {
        m_isFolderChanged = true; // after the first rows, which should not wait
        noteChange();
    }
}

void LogScanner::SetWatched(bool watched)
{
    if (!m_lookTimer) {
        m_lookTimer = new QTimer(this);
        m_lookTimer->setSingleShot(true);
        connect(m_lookTimer, &QTimer::timeout, this, &LogScanner::look);
    }
    m_isWatched = watched;
    m_isFolderChanged = true;
    if (watched) {
        noteChange();
        return;
    }
    m_lookTimer->stop();
    delete m_watcher;
    m_watcher = nullptr;
}

// Watches the file and, as it may be replaced, its folder; and the same where it really is, if the
// path is a link.
void LogScanner::watch()
{
    m_isFolderChanged = false;
    delete m_watcher; // a file that was replaced would still be watched
    m_watcher = new QFileSystemWatcher(this);
    connect(m_watcher, &QFileSystemWatcher::fileChanged, this, &LogScanner::noteChange);
    connect(m_watcher, &QFileSystemWatcher::directoryChanged, this, [this] {
        m_isFolderChanged = true;
        noteChange();
    });

    const QFileInfo file(m_path);
    QStringList paths(file.absolutePath());
    if (file.exists())
        paths.append({m_path, QFileInfo(file.canonicalFilePath()).absolutePath()});
    else if (file.isSymLink())
        paths.append(QFileInfo(file.symLinkTarget()).absolutePath());
    paths.removeDuplicates();
    if (m_folder != paths.last())
        m_isLocal = IsOnLocalDisk(paths.last());
    m_folder = paths.last();
    m_isPolling = !m_isLocal || !m_watcher->addPaths(paths).isEmpty();
}

void LogScanner::noteChange()
{
    if (!m_isWatched || m_lookTimer->isActive())
        return;
    const int sinceLook = m_sinceLook.isValid()
                              ? static_cast<int>(qMin<qint64>(m_sinceLook.elapsed(), LookInterval))
                              : LookInterval;
    m_lookTimer->start(std::max({LookDelay, LookInterval - sinceLook, m_lookDelay}));
}

// The more there is to do, the less often it is done.
void LogScanner::look()
{
    if (m_path.isEmpty())
        return;
    if (!m_isTaken) {
        noteChange();
        return;
    }
    if (m_isFolderChanged || m_isPolling)
        watch();
    QElapsedTimer time;
    time.start();
    Poll();
    m_lookDelay = static_cast<int>(std::min<qint64>(10 * time.elapsed(), PollInterval));
    m_sinceLook.start();
    if (m_isPolling)
        m_lookTimer->start(PollInterval);
}

void LogScanner::SetFilter(int request, LogFilter const& filter)
{
    m_isSearched = m_isSearched && filter.HasSameText(m_filter);
    m_request = request;
    m_filter = filter;
    if (isCurrentRequest() && isComplete()) {
        m_isReset = true;
        report();
    } else if (isCurrentRequest() && !searchAgain()) {
        readFromStart(m_index.isOneRun());
    }
    noteChange(); // which may have been overlooked because of this request
}

// Searches the lines that are known for another text, and reads what the file has got since.
// Returns false if it has to be read from the start.
bool LogScanner::searchAgain()
{
    QFile file(m_path);
    if (!m_complete || !m_exists || !QFileInfo(m_path).isFile() ||
        !file.open(QIODevice::ReadOnly) || !isSameFile(file) || !search(file))
        return false;
    if (!isCurrentRequest())
        return true;
    m_isSearched = true;
    if (looksUnchanged())
        report();
    else
        readChanges(file);
    return true;
}

// Returns false if the file was truncated meanwhile.
bool LogScanner::search(QFile& file)
{
    const qint64 end = m_index.nextOffset();
    QByteArray lines;
    int reported = 0;
    m_isReset = true;
    m_isOtherText = true;
    m_sinceReport.start();
    m_reportCost = 0;
    m_index.BeginSearch(m_filter);
    while (m_index.searchOffset() < end) {
        const qint64 offset = m_index.searchOffset();
        lines.resize(static_cast<int>(m_index.SearchEnd(m_sliceSize) - offset));
        if (!file.seek(offset) || file.read(lines.data(), lines.size()) != lines.size())
            return false;
        m_index.Search(lines, [this] { return isCurrentRequest(); });
        if (!isCurrentRequest())
            return true;
        reported = reportProgress(offset + lines.size(), end, reported);
        if (m_index.searchOffset() < end)
            reportPart();
    }
    return true;
}

void LogScanner::startOver(bool isOneRun)
{
    m_index = LogIndex(m_parser, m_filter, isOneRun);
    m_rows = std::make_shared<LogRows>();
    m_isReset = true;
    m_head.clear();
    m_anchor.clear();
    m_tail.clear();
    m_size = 0;
    m_modified = QDateTime();
    m_complete = false;
    m_isSearched = true; // line by line, while they are read
}

void LogScanner::readFromStart(bool isOneRun)
{
    startOver(isOneRun);
    QFile file(m_path);
    if (!QFileInfo(m_path).isFile() || !file.open(QIODevice::ReadOnly)) {
        m_error = ErrorOf(file);
        reportMissing();
        return;
    }
    m_exists = true;
    m_error.clear();
    m_parser.SetFileType(typeOf(file));
    m_index = LogIndex(m_parser, m_filter, isOneRun);
    if (readFrom(file))
        report();
}

void LogScanner::reportMissing()
{
    startOver(false);
    m_exists = false;
    m_complete = true;
    report();
}

// Returns false if a newer request has arrived.
bool LogScanner::readFrom(QFile& file)
{
    // Of the same moment: what is written later changes both.
    const QFileInfo info(m_path);
    m_modified = info.lastModified();
    const qint64 size = info.size();
    const qint64 end = size > 0 ? size : std::numeric_limits<qint64>::max(); // or it has none
    QByteArray slice(m_sliceSize, Qt::Uninitialized);
    bool more = file.seek(m_index.Begin());
    int reported = 0;
    m_sinceReport.start();
    m_reportCost = 0;
    while (more && file.pos() < end) {
        const qint64 count =
            file.read(slice.data(), std::min<qint64>(slice.size(), end - file.pos()));
        if (count <= 0)
            break;
        if (!feed(slice, count))
            more = file.seek(m_index.nextOffset());
        if (!isCurrentRequest())
            return false;
        reported = reportProgress(file.pos(), size, reported);
        if (file.pos() < end)
            reportPart();
    }
    m_index.End();
    noteFile(file);
    m_complete = file.size() >= m_size; // otherwise it was truncated meanwhile
    return true;
}

// Tells every ten percent, and returns which was told last.
int LogScanner::reportProgress(qint64 offset, qint64 size, int reported)
{
    const int percent = size > 0 ? static_cast<int>(offset * 100 / size) : 100;
    if (percent < reported + 10)
        return reported;
    Q_EMIT progressed(m_request, percent);
    return percent;
}

// Feeds what was read. Returns false if reading must go on elsewhere.
bool LogScanner::feed(QByteArray const& slice, qint64 count)
{
    const bool isSlow = m_filter.hasText() && m_filter.isExpression();
    const qint64 piece = isSlow ? PieceSize : count;
    for (qint64 at = 0; at < count && isCurrentRequest(); at += piece) {
        const auto length = static_cast<int>(std::min(piece, count - at));
        if (!m_index.Feed(slice.constData() + at, length))
            return false;
    }
    return true;
}

// Reads what the file has got since the last pass. A modification without anything new where the
// index expects it was made elsewhere; then, and without the seam that there was, it starts over.
void LogScanner::readChanges(QFile& file)
{
    if (hasNewType(file)) {
        readFromStart(false);
        return;
    }
    const QDateTime modified = m_modified;
    const qint64 end = m_index.nextOffset();
    m_complete = false; // until the pass is over
    if (!readFrom(file))
        return;
    const bool isNew = m_index.hasMoved() || m_index.nextOffset() != end;
    if ((!isNew && m_modified != modified) || m_index.hasLostSeam())
        readFromStart(false);
    else
        report();
}

LogFileType LogScanner::typeOf(QFile& file) const
{
    const QByteArray head = BytesAt(file, 0, LogFileType::HeadSize);
    return LogFileType::Of(head, m_parser, m_parser.chosenEncoding(),
                           QFileInfo(m_path).lastModified().date());
}

// The first lines of a short file may not have said whose it is.
bool LogScanner::hasNewType(QFile& file) const
{
    LogFileType const& known = m_parser.fileType();
    return !known.isOwn && m_size < LogFileType::HeadSize && !typeOf(file).IsLike(known);
}

void LogScanner::noteFile(QFile& file)
{
    m_size = m_index.nextOffset();
    m_anchorEnd = m_index.resumeOffset();
    m_head = BytesAt(file, 0, std::min<qint64>(HeadSize, m_anchorEnd));
    const qint64 start = std::max<qint64>(0, m_anchorEnd - AnchorSize);
    m_anchor = BytesAt(file, start, m_anchorEnd - start);
    const qint64 end = m_index.completeOffset();
    m_tail = BytesAt(file, std::max<qint64>(0, end - TailSize), std::min<qint64>(end, TailSize));
}

bool LogScanner::isSameFile(QFile& file) const
{
    if (file.size() < m_size || !BytesAt(file, 0, HeadSize).startsWith(m_head))
        return false;
    const qint64 end = m_index.completeOffset();
    return BytesAt(file, m_anchorEnd - m_anchor.size(), m_anchor.size()) == m_anchor &&
           BytesAt(file, end - m_tail.size(), m_tail.size()) == m_tail;
}

bool LogScanner::looksUnchanged() const
{
    const QFileInfo file(m_path);
    if (!file.isFile())
        return !m_exists;
    if (!m_exists || file.size() != m_size || file.lastModified() != m_modified)
        return false;
    return qAbs(m_modified.msecsTo(QDateTime::currentDateTime())) > StampUncertainty;
}

void LogScanner::Poll()
{
    if (m_path.isEmpty() || !isCurrentRequest() || (isComplete() && looksUnchanged())) {
        Q_EMIT polled();
        return;
    }

    QFile file(m_path);
    // Without a buffer, which would be filled again for each of the few bytes that are compared.
    const bool opened =
        QFileInfo(m_path).isFile() && file.open(QIODevice::ReadOnly | QIODevice::Unbuffered);
    if (!opened && (m_exists || !isComplete())) {
        m_error = ErrorOf(file);
        reportMissing();
    } else if (opened && (!isComplete() || !m_exists || !isSameFile(file))) {
        readFromStart(false);
    } else if (opened) {
        readChanges(file);
    }
    Q_EMIT polled(); // NOLINT(readability-misleading-indentation): Q_EMIT is empty
}

void LogScanner::SetPace(int sliceSize, int interval, int firstInterval)
{
    m_sliceSize = sliceSize;
    m_interval = interval;
    m_firstInterval = firstInterval;
}

// Most of the time is for reading, even if the rows are many.
void LogScanner::reportPart()
{
    const int interval = m_isNewFile ? m_firstInterval : m_interval;
    if (m_sinceReport.elapsed() < std::max<qint64>(interval, 4 * m_reportCost) ||
        m_index.awaitsKnownLines())
        return;
    m_sinceReport.start();
    report(true);
    m_reportCost = m_interval > 0 ? m_sinceReport.restart() : 0;
}

void LogScanner::report(bool isPartial)
{
    LogUpdate update;
    update.request = m_request;
    const bool isAllNew = m_isReset || m_isOtherText;
    update.rows = std::make_shared<LogRows>(isAllNew ? m_index.Rows(m_filter)
                                                     : m_index.Rows(m_filter, *m_rows));
    m_isOtherText = !m_isSearched;
    update.isPartial = isPartial;
    update.isReset = m_isReset;
    if (!m_isReset)
        update.Compare(*m_rows);
    update.counts = m_index.counts();
    const bool nothingNew = !update.isReset && update.removed == 0 && update.inserted == 0 &&
                            update.changedTail == 0 && update.rows->size() == m_rows->size() &&
                            m_index.searchedLines() == m_lines && update.counts == m_counts &&
                            m_isPartial == isPartial;
    m_isReset = false;
    m_isNewFile = false;
    m_isPartial = isPartial;
    m_rows = update.rows;
    m_lines = m_index.searchedLines();
    m_counts = update.counts;
    update.exists = m_exists;
    update.error = m_error;
    update.lines = m_lines;
    update.hasElapsed = m_index.hasElapsed();
    update.hasTimes = m_index.hasTimes();
    update.hasSeverities = m_index.hasSeverities();
    update.type = m_parser.fileType();
    update.runStarts = m_index.RunStarts();
    update.slowLine = m_index.slowLine();
    if (nothingNew)
        return;
    m_isTaken = false;
    Q_EMIT updated(update);
}

} // namespace Velocor
