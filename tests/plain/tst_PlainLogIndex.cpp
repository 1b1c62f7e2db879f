// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the index of a log file, and the scanner that keeps it up to date, with a plain model
// that splits the whole file into lines again each time, while a log writes the file, starts again
// over older content, and while others truncate and replace it.

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogScanner.h"
#include "plain/WrittenLog.h"
#include "support/TestFiles.h"

#include <QDate>
#include <QHash>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtTest>

#include <vector>

using namespace Velocor;

class tst_PlainLogIndex : public QObject
{
    Q_OBJECT

private slots:
    void indexes();
    void scanners();
};

namespace {

const QStringList SeverityNames({"Trace", "Notification", "Warning", "Error", "Fatal"});

// In a mark: the text filter does not match the line.
constexpr quint8 Unmatched = 0x40;

// A line by regular expressions.
struct PlainLine
{
    int start = 0;
    QByteArray text;
    bool isEntry = false;
    int severity = LogEntry::None;
    bool isTimed = false;
    bool hasDate = false;
    qint64 time = 0; // milliseconds, since an epoch or since midnight
    bool hasElapsed = false;

    PlainLine(QByteArray const& bytes, bool readsTimes) : text(bytes)
    {
        static const QString names = "(Trace|Notification|Warning|Error|Fatal)(?= |$)";
        static const QString clock = "(\\d\\d):(\\d\\d):(\\d\\d)\\.(\\d{1,3})";
        // Otherwise what is left of a stamp with a date would look like one without.
        static const QString otherClock = QString(clock).replace(':', '-').replace("\\.", ",");
        static const QRegularExpression dated("^((\\d{4}-\\d\\d-\\d\\d) )" + clock +
                                              " (?:" + names + "|(?= ))");
        static const QRegularExpression undated("^(())" + otherClock + " (?:" + names + "|(?= ))");
        static const QRegularExpression named("^(.{0,79}?) " + names);
        static const QRegularExpression digit("[0-9]");
        static const QRegularExpression elapsed("^ dT:\\[-?\\d+\\](?: |$)");

        const QString line = QString::fromLatin1(bytes);
        QRegularExpressionMatch match = dated.match(line);
        hasDate = match.hasMatch();
        if (!hasDate && readsTimes)
            match = undated.match(line);
        isTimed = match.hasMatch();
        QString name = match.captured(7);
        int end = match.capturedEnd();
        if (isTimed) {
            time = (match.captured(3).toInt() * 60 + match.captured(4).toInt()) * 60 +
                   match.captured(5).toInt();
            time = time * 1000 + milliseconds(match.captured(6));
            const QDate date = QDate::fromString(match.captured(2), "yyyy-MM-dd");
            if (hasDate)
                time += date.toJulianDay() * 86400000;
        } else {
            match = named.match(line);
            const QString before = match.captured(1);
            if (!match.hasMatch() || !(before.isEmpty() || before.contains(digit)))
                return;
            name = match.captured(2);
            end = match.capturedEnd();
        }
        isEntry = true;
        severity = name.isEmpty() ? int(LogEntry::None) : SeverityNames.indexOf(name);
        hasElapsed = line.mid(end).contains(elapsed);
    }

    // The single z of the default format, as this Qt writes it.
    static int milliseconds(QString const& digits)
    {
        static const bool isFraction = QTime(0, 0, 0, 5).toString("z") == "005";
        return (isFraction ? digits.leftJustified(3, '0') : digits).toInt();
    }
};

// Each line is read again many times, and its text decides what it is.
PlainLine const& parsed(QByteArray const& text, bool readsTimes)
{
    static QHash<QByteArray, PlainLine> known[2];
    QHash<QByteArray, PlainLine>& lines = known[readsTimes];
    if (lines.size() > 100000)
        lines.clear();
    auto line = lines.constFind(text);
    if (line == lines.constEnd())
        line = lines.insert(text, PlainLine(text, readsTimes));
    return *line;
}

// Rows in vectors.
struct PlainRows
{
    PlainRows() = default;

    explicit PlainRows(LogRows const& rows) : earlier(rows.earlier()), problems(rows.problems())
    {
        LogRows::Reader reader(rows);
        for (size_t row = 0; row < rows.size(); ++row)
            add(reader.start(row), rows.mark(row), rows.check(row));
    }

    void add(qint64 start, quint8 mark, quint16 check = 0)
    {
        starts.push_back(start);
        marks.push_back(mark);
        checks.push_back(check);
    }

    void putHeadingFirst(qint64 start)
    {
        starts.insert(starts.begin(), start);
        marks.insert(marks.begin(), LogEntry::None);
        checks.insert(checks.begin(), 0);
    }

    size_t size() const { return starts.size(); }

    std::vector<qint64> starts;
    std::vector<quint8> marks;
    std::vector<quint16> checks;
    size_t earlier = 0;
    size_t problems = 0;
};

// The whole file, split and sorted out again. It may be told which entries were seen after the
// newest run: by where they start, with their text; or that it was seen growing, so that all of it
// is one run.
class PlainIndex
{
public:
    using Entries = QHash<int, QByteArray>;

    PlainIndex() = default;

    PlainIndex(QByteArray const& file, bool readsTimes, LogFilter const& filter,
               Entries const& known = Entries(), bool isGrown = false)
        : m_isGrown(isGrown)
    {
        std::vector<PlainLine> lines;
        for (int at = 0; at < file.size();) {
            int end = file.indexOf('\n', at);
            if (end < 0)
                end = file.size();
            const bool hasReturn = end > at && file[end - 1] == '\r';
            lines.push_back(parsed(file.mid(at, end - at - hasReturn), readsTimes));
            lines.back().start = at;
            at = end + 1;
        }
        lineCount = lines.size();

        std::vector<Row> untimed; // since the last entry with a time
        for (PlainLine const& line : lines) {
            hasElapsed = hasElapsed || line.hasElapsed;
            if (isOlder(line, known.value(line.start) == line.text))
                beginRun();
            Run& run = runs.back();
            if (runs.size() > 1 && line.isTimed)
                older.insert(line.start, line.text);
            Row row{line.start, LogEntry::None,
                    LogRows::CheckOf(line.text.constData(), line.text.size()), line.isEntry};
            if (line.isEntry)
                row.mark = quint8(line.severity);
            else if (!run.rows.empty())
                row.mark = (run.rows.back().mark & LogRows::SeverityMask) | LogRows::Continued;
            if (line.isTimed)
                row.mark |= LogRows::Timed;
            if (filter.hasText() && !filter.Matches(QString::fromLatin1(line.text)))
                row.mark |= Unmatched;
            run.rows.push_back(row);
            if (!line.isTimed)
                continue;
            if (run.timed == 0 || run.hasDate != line.hasDate)
                run.firstTime = line.time;
            run.hasDate = line.hasDate;
            run.lastTime = line.time;
            run.afterTimed = run.rows.size();
            ++run.timed;
        }
        for (Run const& run : runs) {
            for (Row const& row : run.rows) {
                if (!(row.mark & LogRows::Continued))
                    ++counts[row.mark & LogRows::SeverityMask];
            }
        }
        collect(filter);
    }

    bool isOneRun() const { return runs.size() == 1 && runs.front().timed > 0; }

    PlainRows rows;
    LogCounts counts{};
    size_t lineCount = 0;
    bool hasElapsed = false;
    Entries older; // the entries with a time after the newest run

private:
    struct Row
    {
        qint64 start;
        quint8 mark;
        quint16 check;
        bool isEntry;
    };

    struct Run
    {
        std::vector<Row> rows;
        qint64 firstTime = 0;
        qint64 lastTime = 0;
        bool hasDate = false;
        int timed = 0;
        size_t afterTimed = 0; // where the rows after the last one with a time begin
    };

    bool isOlder(PlainLine const& line, bool isKnown) const
    {
        Run const& run = runs.back();
        if (!line.isTimed || run.timed == 0 || runs.size() >= 64 || m_isGrown)
            return false;
        const bool followsRest = run.rows.size() > run.afterTimed;
        if (line.hasDate != run.hasDate)
            return run.timed > 1 && (followsRest || line.hasDate);
        const bool isMidnight = !run.hasDate && run.lastTime - line.time > 12 * 3600 * 1000;
        const bool isFarBack = line.time < run.lastTime - 61 * 60 * 1000;
        return line.time < std::min(run.firstTime, run.lastTime) - 20 && !isMidnight &&
               (followsRest || isFarBack || (isKnown && runs.size() == 1));
    }

    // With what is left of an entry that was written over.
    void beginRun()
    {
        Run next;
        Run& run = runs.back();
        if (run.rows.size() > run.afterTimed) {
            Row torn = run.rows.back();
            run.rows.pop_back();
            torn.mark = (torn.mark & Unmatched) | LogRows::Torn | LogEntry::None;
            torn.isEntry = false;
            next.rows.push_back(torn);
        }
        runs.push_back(next);
    }

    void collect(LogFilter const& filter)
    {
        if (filter.earlierRuns() && runs.size() > 1) {
            for (size_t i = runs.size() - 1; i > 0; --i)
                add(runs[i], filter);
            if (rows.size() > 0) {
                rows.putHeadingFirst(LogRows::EarlierHeading);
                rows.earlier = rows.size();
                rows.add(LogRows::NewestHeading, LogEntry::None);
            }
        }
        add(runs.front(), filter);
    }

    // An entry goes with the lines that continue it; other lines are on their own.
    void add(Run const& run, LogFilter const& filter)
    {
        std::vector<std::vector<Row>> groups;
        for (Row row : run.rows) {
            const bool isContinued = row.mark & LogRows::Continued;
            const bool hasEntry = !groups.empty() && groups.back().front().isEntry &&
                                  groups.back().size() < LogIndex::MaximumEntryLines;
            if (isContinued && !hasEntry)
                row.mark |= LogRows::Alone;
            if (isContinued && hasEntry)
                groups.back().push_back(row);
            else
                groups.push_back({row});
        }
        for (std::vector<Row> const& group : groups) {
            const bool isMatched = std::any_of(
                group.begin(), group.end(), [](Row const& row) { return !(row.mark & Unmatched); });
            for (Row const& row : group) {
                const auto severity = LogEntry::Severity(row.mark & LogRows::SeverityMask);
                if (!isMatched || !filter.Shows(severity))
                    continue;
                rows.add(row.start, quint8(row.mark & ~Unmatched), row.check);
                const bool isProblem = severity >= LogEntry::Warning && severity <= LogEntry::Fatal;
                rows.problems += isProblem && !(row.mark & LogRows::Continued);
            }
        }
    }

    std::vector<Run> runs{1};
    bool m_isGrown = false;
};

// Rows as text: where each line begins, and its mark.
QString Text(PlainRows const& rows)
{
    QStringList texts;
    for (size_t i = 0; i < rows.size(); ++i)
        texts.append(QString("%1:%2").arg(rows.starts[i]).arg(uint(rows.marks[i]), 0, 16));
    return QString("%1 earlier, %2 problems: ").arg(rows.earlier).arg(rows.problems) +
           texts.join(' ');
}

QString Text(LogCounts const& counts)
{
    QStringList texts;
    for (size_t count : counts)
        texts.append(QString::number(count));
    return texts.join(' ');
}

bool IsSame(PlainRows const& left, PlainRows const& right)
{
    return left.starts == right.starts && left.marks == right.marks &&
           left.checks == right.checks && left.earlier == right.earlier &&
           left.problems == right.problems;
}

// A file that a log writes, and what its reader has set.
class Written : public WrittenLog
{
protected:
    QByteArray entry()
    {
        static qint64 const steps[] = {1000, 0, 7, 60000, 3600000, 46800000};
        static char const* const elapsed[] = {"", "", "", "dT:[12] ", "dT:[-5]", "dT:[x] "};
        const qint64 step = steps[m_draws->below(m_isDated ? 6 : 5)]; // half a day back is midnight
        const QByteArray text = m_draws->text("abc xX1", m_draws->once(4) ? 60 : 8).toLatin1();
        const QByteArray line = WrittenLog::entry(step, m_draws->oneOf(elapsed) +
                                                            QByteArray::number(++m_number) + text);
        m_latest = qMax(m_latest, m_time);
        if (!m_hasEntries)
            m_first = m_time;
        m_hasEntries = true;
        return line;
    }

    QByteArray otherLine()
    {
        static char const* const lines[] = {
            "it goes on\n",      "\n",      " Error at the start\n", "5 Error not timed\n",
            "no number Error\n", "Error\n", "7 Error\r\n",           "end of "};
        return m_draws->oneOf(lines);
    }

    void writeSome() { write(m_draws->once(5) ? otherLine() : entry()); }

    // With dates and after all that is left, or nobody can tell where it is. Times that do not rise
    // within an older run would mean less and less as it is written over.
    void startAgain()
    {
        static qint64 const steps[] = {86400000, 1000, 100, 3600000};
        m_isDated = true;
        m_time = m_latest + m_draws->oneOf(steps);
        tell("a new run, at #", stamp());
        m_position = 0;
        m_hasEntries = false;
        if (m_isTurnedBack)
            m_file.clear();
        m_isTurnedBack = false;
    }

    // Only where nothing older is left, and not to a time that could be that of an earlier run: who
    // has seen the file grow knows that it is not, but a fresh pass does not.
    void turnBack()
    {
        static qint64 const steps[] = {1, 19};
        const qint64 step = m_draws->oneOf(steps);
        if (m_position != m_file.size() || m_time - step < m_first - 20)
            return;
        m_time -= step;
        m_isTurnedBack = true;
        tell("the clock goes back # ms", step);
    }

    // Where entries of one run have both, it depends on how many are left whether they are one.
    void changeFormat()
    {
        if (!m_file.isEmpty())
            return;
        m_isDated = !m_isDated;
        tell("entries with dates: #", m_isDated);
    }

    LogFilter filter()
    {
        static char const* const texts[] = {"", "", "a", "x", "Error", "[0-9]x"};
        LogFilter filter;
        filter.SetEarlierRuns(!m_draws->once(4));
        const int hidden = m_draws->below(8) - 1;
        if (hidden >= 0)
            filter.SetSeverity(LogEntry::Severity(qMin(hidden, 5)), false);
        const QString text = m_draws->oneOf(texts);
        const bool isExpression = m_draws->once(2);
        const bool isExact = m_draws->once(2);
        filter.SetText(text, isExpression, isExact);
        tell("filter: earlier runs #, hidden #, text #, expression #, exact #",
             filter.earlierRuns(), hidden, text, isExpression, isExact);
        return filter;
    }

    static LogLineParser parser(bool readsTimes)
    {
        LogLineParser parser = readsTimes ? LogLineParser({"hh-mm-ss,z"}, {}) : LogLineParser();
        parser.SetOwn(true); // a torn line may look like another program's
        return parser;
    }

    qint64 m_latest = m_time;
    bool m_hasEntries = false; // of this run
    qint64 m_first = 0;        // the time of the first of them
    bool m_isTurnedBack = false;
    int m_number = 0;
    bool m_readsTimes = false;
    LogFilter m_filter;
};

class Indexes : public Written
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 18)
            writeSome();
        else if (kind < 20)
            startAgain();
        else if (kind == 20)
            changeFormat();
        else if (kind == 21)
            turnBack();
        else if (kind < 29)
            pass();
        else if (kind == 29)
            startOver();
        else
            look();
    }

    void finish()
    {
        performLast([this] { pass(); });
    }

private:
    void pass()
    {
        const int slice = 1 + m_draws->below(m_draws->once(4) ? 20 : 500);
        tell("a pass, # bytes at a time", slice);
        if (!isSameFile())
            forget();
        read(slice);
        if (m_index.hasLostSeam()) {
            forget();
            read(slice);
        }
        m_passed = m_file;
        m_known = m_older;
        m_older = PlainIndex(m_passed, m_readsTimes, m_filter, m_known).older;
        compare(m_filter);
    }

    void read(int slice)
    {
        qint64 offset = m_index.Begin();
        while (offset < m_file.size()) {
            const QByteArray bytes = m_file.mid(int(offset), slice);
            const bool goesOn = m_index.Feed(bytes.constData(), bytes.size());
            offset = goesOn ? offset + bytes.size() : m_index.nextOffset();
        }
        m_index.End();
    }

    // Whether the index can go on, by what a scanner looks at.
    bool isSameFile() const
    {
        const int tail = qMax(0, m_passed.size() - 256);
        return m_file.startsWith(m_passed.left(int(m_index.resumeOffset()))) &&
               m_file.mid(tail).startsWith(m_passed.mid(tail));
    }

    void forget()
    {
        m_index = LogIndex(parser(m_readsTimes), m_filter);
        m_known.clear();
        m_older.clear();
    }

    void compare(LogFilter const& filter)
    {
        const PlainIndex plain(m_passed, m_readsTimes, filter, m_known);
        const PlainRows rows(m_index.Rows(filter));
        if (!IsSame(rows, plain.rows))
            same("rows", Text(rows), Text(plain.rows));
        same("lines", m_index.size(), plain.lineCount);
        same("counts", Text(m_index.counts()), Text(plain.counts));
        same("elapsed", m_index.hasElapsed() || !plain.hasElapsed, true);
    }

    // The same text filter, as Rows() requires.
    void look()
    {
        LogFilter other = m_filter;
        other.SetEarlierRuns(!m_draws->once(2));
        other.SetSeverity(LogEntry::Severity(m_draws->below(5)), !m_draws->once(2));
        tell("rows of another filter");
        compare(other);
    }

    void startOver()
    {
        m_readsTimes = m_draws->once(2);
        m_filter = filter();
        forget();
        m_passed.clear();
    }

    LogIndex m_index;
    QByteArray m_passed;
    PlainIndex::Entries m_known; // before the last pass
    PlainIndex::Entries m_older; // after it
};

QTemporaryDir* g_folder = nullptr;

class Scanners : public Written
{
public:
    Scanners() : m_path(g_folder->filePath("app.log"))
    {
        QFile::remove(m_path);
        QObject::connect(&m_scanner, &LogScanner::updated,
                         [this](LogUpdate const& update) { take(update); });
        QObject::connect(&m_scanner, &LogScanner::polled, [this] { ++m_polled; });
    }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 14)
            writeSome();
        else if (kind < 16)
            startAgain();
        else if (kind < 25)
            poll();
        else if (kind == 25)
            truncate();
        else if (kind == 26)
            replace();
        else if (kind == 27)
            remove();
        else if (kind == 28 && draws.once(2))
            turnBack();
        else if (kind == 28)
            changeFormat();
        else if (kind == 29)
            open();
        else
            changeFilter();
    }

    void finish()
    {
        performLast([this] { poll(); });
    }

private:
    void store()
    {
        if (m_exists)
            TestFiles::write(m_path, m_file);
        else
            QFile::remove(m_path);
    }

    void poll()
    {
        m_exists = m_exists || !m_file.isEmpty();
        tell("Poll()");
        store();
        const int polled = m_polled;
        m_scanner.Poll();
        same("polled", m_polled, polled + 1);
        compare();
    }

    void compare()
    {
        if (!m_isOpen)
            return;
        // What the scanner knows about the order depends on when it had to read from the start.
        const QByteArray file = m_exists ? m_file : QByteArray();
        const PlainIndex fresh(file, m_readsTimes, m_filter);
        const PlainIndex grown(file, m_readsTimes, m_filter, {}, true);
        PlainIndex plain(file, m_readsTimes, m_filter, m_known);
        const bool isGrown = m_mayBeOneRun && file.startsWith(m_before) && isShown(grown);
        if (isShown(fresh))
            plain = fresh;
        else if (isGrown && !isShown(plain))
            plain = grown;
        m_known = plain.older;
        m_mayBeOneRun = plain.isOneRun() || isGrown;
        m_before = file;
        same("exists", m_update.exists, m_exists);
        same("error", m_update.error, QString());
        if (!IsSame(m_rows, plain.rows))
            same("rows", Text(m_rows), Text(plain.rows));
        same("lines", m_update.lines, plain.lineCount);
        same("counts", Text(m_update.counts), Text(plain.counts));
    }

    bool isShown(PlainIndex const& plain) const
    {
        return IsSame(m_rows, plain.rows) && m_update.counts == plain.counts;
    }

    // What a view makes of an update.
    void take(LogUpdate const& update)
    {
        const PlainRows after(*update.rows);
        if (!update.isReset) {
            PlainRows const& before = m_rows;
            PlainRows shown;
            const auto add = [&](PlainRows const& rows, size_t from, size_t to) {
                for (size_t i = from; i < to; ++i)
                    shown.add(rows.starts[i], rows.marks[i], rows.checks[i]);
            };
            add(before, 0, update.changeAt);
            add(after, update.changeAt, update.changeAt + update.inserted);
            add(before, update.changeAt + update.removed, before.size() - update.changedTail);
            add(after, shown.size(), after.size());
            shown.earlier = after.earlier;
            shown.problems = after.problems;
            if (!IsSame(shown, after))
                same("rows after the update", Text(shown), Text(after));
        }
        same("request", update.request, m_request);
        m_update = update;
        m_rows = after;
    }

    void truncate()
    {
        m_file.truncate(m_draws->below(m_file.size() + 1));
        m_position = qMin(m_position, m_file.size());
        tell("truncate to #", m_file.size());
        poll();
    }

    // Another file, with other bytes, perhaps only after its first lines.
    void replace()
    {
        const bool keepsStart = m_draws->once(2) && m_position == m_file.size();
        m_file.truncate(keepsStart ? m_file.lastIndexOf('\n', 400) + 1 : 0);
        for (int lines = m_draws->below(6); lines > 0; --lines)
            m_file += entry();
        m_position = m_file.size();
        m_exists = true;
        tell("replace by #", m_file);
        poll();
    }

    void remove()
    {
        m_file.clear();
        m_position = 0;
        m_exists = false;
        tell("remove the file");
        poll();
    }

    void open()
    {
        m_readsTimes = m_draws->once(2);
        m_filter = filter();
        m_exists = m_exists || !m_file.isEmpty();
        store();
        m_isOpen = true;
        if (m_draws->once(2))
            m_scanner.SetPace(1 + m_draws->below(300), 0);
        else
            m_scanner.SetPace(1 << 20, 1000000);
        m_scanner.SetCurrentRequest(++m_request);
        m_scanner.Open(m_request, m_path, parser(m_readsTimes), m_filter);
        compare();
    }

    void changeFilter()
    {
        m_filter = filter();
        if (!m_isOpen)
            return;
        m_exists = m_exists || !m_file.isEmpty();
        store();
        m_scanner.SetCurrentRequest(++m_request);
        m_scanner.SetFilter(m_request, m_filter);
        m_scanner.Poll(); // the filter alone may show what was read before
        compare();
    }

    const QString m_path;
    LogScanner m_scanner;
    LogUpdate m_update;
    PlainIndex::Entries m_known; // perhaps, to the scanner
    bool m_mayBeOneRun = false;  // to the scanner
    QByteArray m_before;         // what it was compared with last
    PlainRows m_rows;
    bool m_exists = false;
    bool m_isOpen = false;
    int m_request = 0;
    int m_polled = 0;
};

} // namespace

void tst_PlainLogIndex::indexes()
{
    Program::compare<Indexes>("log index", Rounds::count(20000, 500000, 10000000), 60);
}

void tst_PlainLogIndex::scanners()
{
    QTemporaryDir folder;
    QVERIFY(folder.isValid());
    g_folder = &folder;
    Program::compare<Scanners>("log scanner", Rounds::count(10000, 500000, 10000000), 60);
}

int main(int argc, char** argv)
{
    Program::useMemoryForFiles();
    QCoreApplication application(argc, argv);
    tst_PlainLogIndex test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainLogIndex.moc"
