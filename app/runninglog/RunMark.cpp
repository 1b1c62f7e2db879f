// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/RunMark.h"

#include "app/history/HistoryTime.h"
#include "app/history/RunMarkFile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace Velocor {

namespace {

constexpr qint64 MaximumRecordSize = 512 << 10; // some thousand runs

// Before main(), so before the first entry.
const std::chrono::system_clock::time_point s_start = std::chrono::system_clock::now();

// Beside a mark; a change of the mark itself would make it doubtful.
QByteArray LongLifeOf(QByteArray const& mark)
{
    return mark + ".long";
}

// Never deleted, because it is used when the program exits.
std::vector<RunMark*>& AllMarks()
{
    static auto* const marks = new std::vector<RunMark*>;
    return *marks;
}

void RemoveMark(QString const& path)
{
    QFile::remove(path);
    QFile::remove(QFile::decodeName(LongLifeOf(QFile::encodeName(path))));
}

} // namespace

RunMark::RunMark(QString const& log) : m_log(log), m_process(::getpid())
{
    const QString folder = log.isEmpty() ? QString() : RunEnds::MarkFolderOf(log);
    if (folder.isEmpty())
        return;
    m_recordFile = QFile::encodeName(RunEnds::RecordFileOf(log));
    make(folder);
    static const bool isRegistered = std::atexit(&RunMark::endAll) == 0;
    static_cast<void>(isRegistered);
    AllMarks().push_back(this);
}

RunMark::~RunMark()
{
    end();
    std::vector<RunMark*>& marks = AllMarks();
    marks.erase(std::remove(marks.begin(), marks.end(), this), marks.end());
}

qint64 RunMark::ProgramStart()
{
    const auto sinceEpoch = s_start.time_since_epoch();
    return HistoryTime::OfEpoch(
        std::chrono::duration_cast<std::chrono::milliseconds>(sinceEpoch).count());
}

void RunMark::make(QString const& folder)
{
    QDir().mkpath(folder);
    m_folder = QFile::encodeName(folder);
    const QByteArray path =
        m_folder + '/' + QFile::encodeName(RunMarkFile::NameFor(ProgramStart()));
    m_file = ::open(path.constData(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (m_file < 0)
        return;
    // Locked before it says anything, so that nobody takes it for one that was left behind.
    const bool isLocked = ::flock(m_file, LOCK_EX | LOCK_NB) == 0;
    const QByteArray text = RunMarkFile::TextFor(ProgramStart(), m_file);
    if (isLocked && ::write(m_file, text.constData(), static_cast<size_t>(text.size())) ==
                        static_cast<ssize_t>(text.size())) {
        m_path = path;
        return;
    }
    ::close(m_file);
    m_file = -1;
    ::unlink(path.constData());
}

// The record comes first: with both, a run counts as ended normally.
void RunMark::end()
{
    // The child of a fork may exit, too.
    if (m_path.isEmpty() || ::getpid() != m_process)
        return;
    addRecord(RunEnds::Line({ProgramStart(), HistoryTime::Now(), HistoryRun::Normal}));
    ::unlink(m_path.constData());
    ::unlink(LongLifeOf(m_path).constData());
    ::close(m_file);
    ::rmdir(m_folder.constData()); // fails if others are still using it
    m_path.clear();
}

void RunMark::endAll()
{
    for (RunMark* mark : AllMarks())
        mark->end();
}

bool RunMark::addRecord(QByteArray const& line) const
{
    // In one piece, so that lines of programs that end at the same time do not mix.
    const int file = ::open(m_recordFile.constData(),
                            O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NONBLOCK, 0666);
    if (file < 0)
        return false;
    struct stat status = {};
    const bool isWritten = ::fstat(file, &status) == 0 && S_ISREG(status.st_mode) &&
                           ::write(file, line.constData(), static_cast<size_t>(line.size())) ==
                               static_cast<ssize_t>(line.size());
    ::close(file);
    return isWritten;
}

void RunMark::NoteLongLife() const
{
    if (m_path.isEmpty())
        return;
    const int file = ::open(LongLifeOf(m_path).constData(), O_WRONLY | O_CREAT | O_CLOEXEC, 0666);
    if (file >= 0)
        ::close(file);
}

// Of a run that was killed, nobody knows more than this.
qint64 RunMark::latestEnd(QString const& mark, qint64 start)
{
    const bool isLong = QFile::exists(QFile::decodeName(LongLifeOf(QFile::encodeName(mark))));
    return isLong ? ProgramStart() : std::min(ProgramStart(), start + RunEnds::ShortRun);
}

std::vector<RunEnd> RunMark::CollectOthers()
{
    std::vector<RunEnd> ends;
    if (m_path.isEmpty())
        return ends;
    const QString folder = QFile::decodeName(m_folder);
    const QStringList names = RunMarkFile::NamesIn(folder);
    for (QString const& name : names) {
        const QString path = folder + QLatin1Char('/') + name;
        const RunMarkFile mark(path);
        // A program that started before this one, so its entries are not later.
        const RunEnd end = {mark.start(), latestEnd(path, mark.start()), HistoryRun::Abnormal};
        const bool isOver = mark.state() == RunMarkFile::LeftBehind &&
                            mark.start() <= ProgramStart() && addRecord(RunEnds::Line(end));
        if (isOver)
            ends.push_back(end);
        if (isOver || (mark.state() == RunMarkFile::Damaged && !mark.isNew()))
            RemoveMark(path);
    }
    shortenRecord();
    return withoutNormal(std::move(ends));
}

// A program that is killed right after its record leaves its mark behind.
std::vector<RunEnd> RunMark::withoutNormal(std::vector<RunEnd> ends) const
{
    if (ends.empty())
        return ends;
    const std::vector<RunEnd> known = RunEnds::Of(m_log);
    const auto endedNormally = [&known](RunEnd const& end) {
        return std::any_of(known.begin(), known.end(), [&end](RunEnd const& other) {
            return other.start == end.start && other.exit == HistoryRun::Normal;
        });
    };
    ends.erase(std::remove_if(ends.begin(), ends.end(), endedNormally), ends.end());
    std::sort(ends.begin(), ends.end(),
              [](RunEnd const& a, RunEnd const& b) { return a.start < b.start; });
    return ends;
}

// Without a lock: a program that ends at this moment may be missing, so nobody knows how it ended.
void RunMark::shortenRecord() const
{
    QFile file(QFile::decodeName(m_recordFile));
    if (!QFileInfo(file.fileName()).isFile() || file.size() <= MaximumRecordSize ||
        !file.open(QIODevice::ReadOnly) || !file.seek(file.size() - MaximumRecordSize / 2))
        return;
    file.readLine();
    const QByteArray rest = file.readAll();
    QSaveFile shorter(file.fileName());
    if (shorter.open(QIODevice::WriteOnly) && shorter.write(rest) == rest.size())
        shorter.commit();
}

} // namespace Velocor
