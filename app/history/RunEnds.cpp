// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RunEnds.h"

#include "app/history/HistoryTime.h"
#include "app/history/RunMarkFile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <algorithm>
#include <limits>

namespace Velocor {

namespace {

constexpr qint64 MaximumRecordSize = 4 << 20;

// Of two programs that start at the same time, the one that started first may write last.
constexpr qint64 LongestStart = 2000; // milliseconds

char const* NameOf(HistoryRun::Exit exit)
{
    return exit == HistoryRun::Normal ? "normal" : "abnormal";
}

// The latest moment that a stamp may mean: not all formats have milliseconds or seconds.
qint64 LatestMoment(qint64 time)
{
    for (qint64 unit : {60000, 1000}) {
        if (time % unit == 0)
            return time + unit - 1;
    }
    return time;
}

QString InDataFolder(QString const& log, char const* prefix)
{
    const QFileInfo file(log);
    const QDir folder = file.absoluteDir();
    if (folder.dirName() != QLatin1String("logs"))
        return QString();
    return QFileInfo(folder.absolutePath()).path() + QLatin1Char('/') + QLatin1String(prefix) +
           file.fileName();
}

std::vector<RunEnd> Records(QString const& log)
{
    std::vector<RunEnd> ends;
    QFile file(RunEnds::RecordFileOf(log));
    const bool isPlain = !file.fileName().isEmpty() && QFileInfo(file.fileName()).isFile();
    if (!isPlain || !file.open(QIODevice::ReadOnly))
        return ends;
    const QByteArrayList lines = file.read(MaximumRecordSize).split('\n');
    for (QByteArray const& line : lines) {
        const RunEnd end = RunEnds::FromLine(line);
        if (end.start >= 0)
            ends.push_back(end);
    }
    return ends;
}

void AddMarks(QString const& log, std::vector<RunEnd>& ends)
{
    const QString folder = RunEnds::MarkFolderOf(log);
    if (folder.isEmpty())
        return;
    const QStringList names = RunMarkFile::NamesIn(folder);
    for (QString const& name : names) {
        const RunMarkFile mark(folder + QLatin1Char('/') + name);
        RunEnd end;
        end.start = mark.start();
        end.end = std::numeric_limits<qint64>::max();
        if (mark.state() == RunMarkFile::Held)
            end.exit = HistoryRun::Running;
        else if (mark.state() == RunMarkFile::LeftBehind)
            end.exit = HistoryRun::Abnormal;
        if (end.start >= 0 && end.exit != HistoryRun::Unknown)
            ends.push_back(end);
    }
}

// A program that is killed right after its record leaves its mark behind.
bool IsContradicted(RunEnd const& end, std::vector<RunEnd> const& ends)
{
    return end.exit == HistoryRun::Abnormal &&
           std::any_of(ends.begin(), ends.end(), [&end](RunEnd const& other) {
               return other.start == end.start && other.exit == HistoryRun::Normal;
           });
}

// A program has one run. Later runs are those of others, which may have left no mark.
bool IsFirstAfter(HistoryRun const& run, RunEnd const& end, std::vector<HistoryRun> const& runs)
{
    return std::none_of(runs.begin(), runs.end(), [&run, &end](HistoryRun const& other) {
        return other.start < run.start && LatestMoment(other.start) >= end.start;
    });
}

HistoryRun::Exit ExitOf(HistoryRun const& run, std::vector<RunEnd> const& candidates)
{
    RunEnd latest;
    for (RunEnd const& end : candidates) {
        if (end.start > latest.start)
            latest = end;
    }
    const bool isCertain =
        std::all_of(candidates.begin(), candidates.end(), [&](RunEnd const& end) {
            const bool isEarlier = !run.isCut && end.start < latest.start - LongestStart;
            return end.exit == latest.exit || isEarlier;
        });
    return isCertain ? latest.exit : HistoryRun::Unknown;
}

} // namespace

std::vector<RunEnd> RunEnds::Of(QString const& log)
{
    std::vector<RunEnd> all;
    // Marks first: a program that ends meanwhile is in both, not in neither.
    AddMarks(log, all);
    const std::vector<RunEnd> records = Records(log);
    all.insert(all.end(), records.begin(), records.end());
    return all;
}

void RunEnds::Assign(std::vector<RunEnd> const& ends, std::vector<HistoryRun>& runs)
{
    std::vector<RunEnd> known;
    std::copy_if(ends.begin(), ends.end(), std::back_inserter(known),
                 [&ends](RunEnd const& end) { return !IsContradicted(end, ends); });
    for (HistoryRun& run : runs) {
        if (run.start < 0)
            continue;
        std::vector<RunEnd> candidates;
        for (RunEnd const& end : known) {
            const bool isInside = LatestMoment(run.start) >= end.start && run.start <= end.end;
            if (isInside && (end.exit == HistoryRun::Normal || IsFirstAfter(run, end, runs)))
                candidates.push_back(end);
        }
        run.exit = ExitOf(run, candidates);
    }
}

int RunEnds::ShortRunsBefore(std::vector<RunEnd> const& ends, qint64 start)
{
    std::vector<RunEnd> earlier;
    std::copy_if(ends.begin(), ends.end(), std::back_inserter(earlier), [&](RunEnd const& end) {
        return end.start < start && end.exit != HistoryRun::Running && !IsContradicted(end, ends);
    });
    std::sort(earlier.begin(), earlier.end(),
              [](RunEnd const& a, RunEnd const& b) { return a.start > b.start; });
    const auto isLong = [](RunEnd const& end) {
        return end.exit != HistoryRun::Abnormal || end.end - end.start > ShortRun;
    };
    const auto last = std::find_if(earlier.begin(), earlier.end(), isLong);
    return static_cast<int>(last - earlier.begin());
}

QString RunEnds::RecordFileOf(QString const& log)
{
    return InDataFolder(log, "ended-");
}

QString RunEnds::MarkFolderOf(QString const& log)
{
    return InDataFolder(log, "running-");
}

QByteArray RunEnds::Line(RunEnd const& end)
{
    return HistoryTime::Text(end.start) + ' ' + HistoryTime::Text(end.end) + ' ' +
           NameOf(end.exit) + '\n';
}

RunEnd RunEnds::FromLine(QByteArray const& line)
{
    const QByteArrayList parts = line.split(' ');
    if (parts.size() != 3)
        return RunEnd();
    RunEnd end;
    end.end = HistoryTime::FromText(parts[1]);
    for (HistoryRun::Exit exit : {HistoryRun::Normal, HistoryRun::Abnormal}) {
        if (parts[2] == NameOf(exit))
            end.exit = exit;
    }
    if (end.end >= 0 && end.exit != HistoryRun::Unknown)
        end.start = HistoryTime::FromText(parts[0]);
    return end;
}

} // namespace Velocor
