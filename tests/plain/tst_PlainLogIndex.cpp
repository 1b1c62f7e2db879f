// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the index of a log file with a plain one, which splits the file into lines and goes
// through them once, over random files. tst_LogIndex compares later passes with the first one.

#include "app/logfile/LogIndex.h"
#include "plain/Rounds.h"

#include <QtTest>

#include <algorithm>
#include <random>
#include <vector>

using namespace Velocor;

namespace {

constexpr qint64 Day = 86400000; // milliseconds

// A time of day is compared within a day, and whole stamps are compared in milliseconds.
struct PlainRun
{
    std::vector<size_t> lines;
    int timed = 0;
    qint64 first = -1;
    qint64 last = -1;
    bool lastLineIsTimed = false;
    bool hasDate = false;
};

struct PlainLine
{
    qint64 start = 0;
    QByteArray text;
    int mark = 0;
};

// What a line says of itself.
struct PlainEntry
{
    bool isEntry = false;
    int severity = LogEntry::None;
    qint64 time = -1;
    bool hasDate = false;
};

// The severity whose name starts here and ends with the word; None if there is none.
int SeverityAt(QByteArray const& line, int at)
{
    const QList<QByteArray> names = {"Trace", "Notification", "Warning", "Error", "Fatal"};
    const int severity = names.indexOf(line.mid(at).split(' ').first());
    return severity < 0 ? int(LogEntry::None) : severity;
}

// A stamp in one of the two formats used here, followed by a name or by none; or anything with a
// digit, such as the rest of a stamp, in front of the first name.
PlainEntry EntryOf(QByteArray const& line)
{
    PlainEntry entry;
    for (QString const& format :
         {QStringLiteral("HH:mm:ss.zzz"), QStringLiteral("yyyy-MM-dd HH:mm:ss.zzz")}) {
        const QString text = QString::fromLatin1(line.left(format.size()));
        const bool hasDate = format.size() > 12;
        const QDate day =
            hasDate ? QDate::fromString(text.left(10), "yyyy-MM-dd") : QDate(1970, 1, 1);
        const QTime time = QTime::fromString(text.right(12), "HH:mm:ss.zzz");
        const int severity = SeverityAt(line, format.size() + 1);
        if (!day.isValid() || !time.isValid() || line.mid(format.size(), 1) != " " ||
            (severity == LogEntry::None && line.mid(format.size(), 2) != "  "))
            continue;
        entry.isEntry = true;
        entry.severity = severity;
        entry.hasDate = hasDate;
        entry.time = QDate(1970, 1, 1).daysTo(day) * Day + time.msecsSinceStartOfDay();
        return entry;
    }
    for (int blank = 0; blank < std::min(line.size(), 80); ++blank) {
        if (line.at(blank) != ' ' || SeverityAt(line, blank + 1) == LogEntry::None)
            continue;
        const QByteArray before = line.left(blank);
        entry.isEntry = before.isEmpty() || std::any_of(before.begin(), before.end(), [](char c) {
                            return c >= '0' && c <= '9';
                        });
        if (entry.isEntry)
            entry.severity = SeverityAt(line, blank + 1);
        return entry;
    }
    return entry;
}

// A new run starts where an entry is older than the entry before it and than the first one of its
// run, by more than threads may overtake each other; not at midnight if there are no dates. A run
// may log one entry in the default format before it switches to its own.
bool StartsRun(PlainRun const& run, qint64 time, bool hasDate)
{
    if (run.timed == 0)
        return false;
    if (hasDate != run.hasDate)
        return run.timed > 1;
    const bool isOlder = time + 20 < run.first && time < run.last;
    const bool isMidnight = !hasDate && run.last - time > Day / 2;
    return isOlder && !isMidnight;
}

class PlainIndex
{
public:
    PlainIndex(QByteArray const& file, QString const& filter)
    {
        int start = 0;
        while (start < file.size()) {
            int end = file.indexOf('\n', start);
            end = end < 0 ? file.size() : end;
            PlainLine line;
            line.start = start;
            line.text = file.mid(start, end - start);
            if (line.text.endsWith('\r'))
                line.text.chop(1);
            m_lines.push_back(line);
            start = end + 1;
        }
        m_runs.emplace_back();
        for (size_t i = 0; i < m_lines.size(); ++i)
            add(i);
        for (PlainLine& line : m_lines) {
            if (!filter.isEmpty() && !QString::fromLatin1(line.text).contains(filter))
                line.mark |= LogRows::Unmatched;
        }
    }

    LogRows Rows() const
    {
        LogRows rows;
        if (m_runs.size() > 1) {
            for (size_t run = m_runs.size() - 1; run > 0; --run)
                addRows(rows, m_runs[run]);
            if (rows.size() > 0) {
                rows.starts.insert(rows.starts.begin(), LogRows::EarlierHeading);
                rows.marks.insert(rows.marks.begin(), LogEntry::None);
                rows.earlier = rows.size();
                rows.add(LogRows::NewestHeading, LogEntry::None);
            }
        }
        addRows(rows, m_runs[0]);
        return rows;
    }

    size_t runs() const { return m_runs.size(); }

private:
    void add(size_t number)
    {
        PlainLine& line = m_lines[number];
        const PlainEntry entry = EntryOf(line.text);
        const qint64 time = entry.time;
        const bool hasDate = entry.hasDate;
        if (time >= 0 && m_runs.size() < 64 && StartsRun(m_runs.back(), time, hasDate)) {
            PlainRun next;
            next.hasDate = hasDate;
            if (!m_runs.back().lastLineIsTimed) { // the rest of an overwritten entry
                next.lines.push_back(m_runs.back().lines.back());
                m_runs.back().lines.pop_back();
                m_lines[next.lines.back()].mark = LogEntry::None | LogRows::Torn;
            }
            m_runs.push_back(next);
        }
        PlainRun& run = m_runs.back();
        line.mark = entry.severity;
        if (!entry.isEntry && !run.lines.empty())
            line.mark =
                (m_lines[run.lines.back()].mark & LogRows::SeverityMask) | LogRows::Continued;
        if (time >= 0) {
            line.mark |= LogRows::Timed;
            if (run.timed == 0 || hasDate != run.hasDate)
                run.first = time;
            run.hasDate = hasDate;
            run.last = time;
            ++run.timed;
        }
        run.lastLineIsTimed = time >= 0;
        run.lines.push_back(number);
    }

    void addRows(LogRows& rows, PlainRun const& run) const
    {
        for (size_t number : run.lines) {
            PlainLine const& line = m_lines[number];
            if (line.mark & LogRows::Unmatched)
                continue;
            rows.add(line.start, static_cast<quint8>(line.mark));
            const int severity = line.mark & LogRows::SeverityMask;
            if (severity >= LogEntry::Warning && severity <= LogEntry::Fatal &&
                !(line.mark & LogRows::Continued))
                ++rows.problems;
        }
    }

    std::vector<PlainLine> m_lines;
    std::vector<PlainRun> m_runs;
};

class Dice
{
public:
    explicit Dice(quint32 seed) : m_engine(seed) {}
    int below(int end) { return int(m_engine() % uint(end)); }
    bool chance(int percent) { return below(100) < percent; }

private:
    std::mt19937 m_engine;
};

// Entries of one run: a clock that mostly advances, and lines that are no entries.
class Writer
{
public:
    Writer(Dice& dice, qint64 start, bool hasDate) : m_dice(dice), m_time(start), m_hasDate(hasDate)
    {}

    QByteArray Line()
    {
        if (m_dice.chance(12))
            return noEntry();
        static const int steps[] = {0, 1, 3, 500, 4000, 60000, -1, -5, -19, -20, -21, -300};
        const int step = m_dice.below(12);
        m_time += m_dice.chance(2) ? m_dice.below(14) * qint64(3600000) : steps[step];
        m_time = std::max<qint64>(m_time, 0);
        static char const* const names[] = {"Trace", "Warning",      "Error",
                                            "Fatal", "Notification", ""};
        const bool inDefault = m_hasDate || (m_isFirst && m_dice.chance(50));
        m_isFirst = false;
        const QDateTime time(QDate(1970, 1, 1).addDays(m_time / Day),
                             QTime::fromMSecsSinceStartOfDay(int(m_time % Day)));
        const QString stamp = time.toString(inDefault ? "yyyy-MM-dd HH:mm:ss.zzz" : "HH:mm:ss.zzz");
        return stamp.toLatin1() + ' ' + names[m_dice.below(6)] + ' ' +
               QByteArray(m_dice.below(12), char('a' + m_dice.below(3))) + lineEnd();
    }

    QByteArray Text(int lines)
    {
        QByteArray text;
        for (; lines > 0; --lines)
            text += Line();
        return text;
    }

private:
    QByteArray noEntry()
    {
        if (m_dice.chance(1))
            return QByteArray("c\n").repeated(998 + m_dice.below(5));
        static char const* const texts[] = {"goes on", "", "Error a", "b", "00:00", "12:00:00.000"};
        return texts[m_dice.below(6)] + lineEnd();
    }

    QByteArray lineEnd() { return m_dice.chance(10) ? "\r\n" : "\n"; }

    Dice& m_dice;
    qint64 m_time;
    bool m_hasDate;
    bool m_isFirst = true;
};

QByteArray WrittenOver(QByteArray const& older, QByteArray const& newer)
{
    return newer + older.mid(newer.size());
}

qint64 AnyTime(Dice& dice)
{
    static const qint64 near[] = {0, 20, 21, 22, 1000};
    const qint64 base = (20000 + dice.below(3)) * Day;
    return base + (dice.chance(30) ? Day / 2 + near[dice.below(5)] : dice.below(int(Day)));
}

// What is in a file: one or more runs, the newest on top.
QByteArray AnyFile(Dice& dice, bool hasDate)
{
    QByteArray file;
    for (int runs = dice.chance(2) ? 90 : dice.below(4); runs >= 0; --runs) {
        Writer writer(dice, AnyTime(dice), dice.chance(90) ? hasDate : !hasDate);
        const QByteArray text = writer.Text(dice.below(dice.chance(20) ? 40 : 12));
        file = dice.chance(50) ? WrittenOver(file, text) : QByteArray(text + file);
    }
    if (dice.chance(30))
        file.chop(dice.below(30));
    return file;
}

QString Shown(LogRows const& rows)
{
    QString text = QString("%1 earlier, %2 problems:").arg(rows.earlier).arg(rows.problems);
    for (size_t row = 0; row < rows.size(); ++row)
        text += QString(" %1/%2").arg(rows.starts[row]).arg(rows.marks[row], 0, 16);
    return text;
}

// One pass, in slices of any size.
void Pass(LogIndex& index, QByteArray const& file, Dice& dice)
{
    qint64 offset = index.Begin();
    const int slice = dice.chance(50) ? 1 << 16 : 1 + dice.below(100);
    bool more = true;
    while (more && offset < file.size()) {
        const QByteArray bytes = file.mid(int(offset), slice);
        more = index.Feed(bytes.constData(), bytes.size());
        offset += bytes.size();
    }
    index.End();
}

} // namespace

class tst_PlainLogIndex : public QObject
{
    Q_OBJECT

private slots:
    void onePass();
    void cleanupTestCase();

private:
    void compare(LogIndex const& index, QByteArray const& file, LogFilter const& filter,
                 QString const& text);

    int m_passes = 0;
    int m_lines = 0;
};

void tst_PlainLogIndex::compare(LogIndex const& index, QByteArray const& file,
                                LogFilter const& filter, QString const& text)
{
    const PlainIndex plain(file, text);
    ++m_passes;
    m_lines += int(index.size());
    const QString shown = Shown(index.Rows(filter));
    const QString expected = Shown(plain.Rows());
    if (shown != expected || index.runs() != plain.runs())
        qWarning() << file << index.runs() << plain.runs();
    QCOMPARE(shown, expected);
    QCOMPARE(index.runs(), plain.runs());
}

void tst_PlainLogIndex::onePass()
{
    Dice dice(Rounds::seed());
    for (int left = Rounds::count(250, 20000); left > 0; --left) {
        const bool hasDate = dice.chance(60);
        const QByteArray file = AnyFile(dice, hasDate);
        const QString text = dice.chance(30) ? "a" : "";
        LogFilter filter;
        filter.SetText(text, false, true);
        LogIndex index(LogLineParser({"HH:mm:ss.zzz"}, {}), filter);
        Pass(index, file, dice);
        compare(index, file, filter, text);
        if (QTest::currentTestFailed())
            return;
    }
}

void tst_PlainLogIndex::cleanupTestCase()
{
    std::printf("plain log index: %d passes over %d lines\n", m_passes, m_lines);
}

QTEST_GUILESS_MAIN(tst_PlainLogIndex)
#include "tst_PlainLogIndex.moc"
