// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares what velocor-log prints of random logs, with random options, with what the log view
// shows of each file, and with a filter that looks at each line of an entry. With a span of time,
// and of all files of a log, with what the log view's own scanner shows; of several programs, with
// what its scanner of a family shows.

#include "app/ProgramRuns.h"
#include "app/history/FamilyScanner.h"
#include "app/history/HistoryScanner.h"
#include "app/history/HistoryTime.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/Milliseconds.h"

#include "ProgramLife.h"
#include "Rounds.h"

#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtTest>

#include <algorithm>
#include <memory>

using namespace Velocor;

namespace {

struct Options
{
    QStringList arguments;
    QString expression;
    QString excluded;
    QVector<int> severities; // empty: all
    int context = 0;
    LogSpan span;
};

class Generator
{
public:
    explicit Generator(quint32 seed) : m_random(seed) {}

    Options next()
    {
        Options options;
        if (chance(2)) {
            static const QStringList expressions = {
                "m$",       "L[0-9]*5", "Trace",   "mmm|cc",   "(?i)ERROR.*m{3}", "P0 L1",
                "^2025-03", "^P",       "nowhere", "\\.[0-4]", "Warning|Error"};
            options.expression = expressions[below(expressions.size())];
            options.arguments << "--match" << options.expression;
        }
        if (chance(4)) {
            static const QStringList texts = {"m m", "L1", "mmmmmmmmmm", "Trace", " "};
            options.excluded = texts[below(texts.size())];
            options.arguments << "--exclude" << options.excluded;
        }
        if (chance(2))
            addSeverities(options);
        if (chance(3)) {
            options.context = below(4);
            options.arguments << "--context" << QString::number(options.context);
        }
        return options;
    }

    // Limits the times, mostly to those near some of a log's lines.
    void addSpan(Options& options, ProgramLife const& life)
    {
        const QList<QByteArray> lines = life.lines();
        const qint64 offset = HistoryTime::FromText("1970-01-01T00:00") -
                              QDate(1970, 1, 1).toJulianDay() * Milliseconds::Day;
        QVector<qint64> times{HistoryTime::OfEpoch(life.clock())};
        for (QByteArray const& line : lines) {
            if (ProgramLife::Line const* written = life.written(line))
                times.append(written->time + offset);
        }
        std::sort(times.begin(), times.end());
        const auto some = [&](char const* option, int first) {
            if (chance(3))
                return qint64(-1);
            const qint64 time = times[first + below(times.size() - first)] + below(3) - 1;
            options.arguments << option << QString::fromLatin1(HistoryTime::Text(time));
            return time;
        };
        options.span.since = some("--since", 0);
        options.span.until = some("--until", times.size() / 2);
    }

    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }

private:
    void addSeverities(Options& options)
    {
        static const QStringList names = {"trace", "notification", "warning",
                                          "error", "fatal",        "none"};
        QStringList list;
        for (int severity = 0; severity < names.size(); ++severity) {
            if (chance(2)) {
                options.severities.append(severity);
                list.append(names[severity]);
            }
        }
        if (!list.isEmpty())
            options.arguments << "--severity" << list.join(',');
    }

    std::mt19937 m_random;
};

// A line of a file as the log view sees it, without a filter.
struct Seen
{
    QByteArray text;
    quint8 mark = 0;
    bool isNewest = false;
    QByteArray end;
};

// Follows the last line of a file that has no end, until it is known whether another line follows.
QByteArray const NoEnd = "\4\n";

QVector<Seen> LinesOf(QByteArray const& file, LogIndex const& index, LogRows const& rows)
{
    QVector<Seen> lines;
    for (size_t row = 0; row < rows.size(); ++row) {
        if (rows.isHeading(row))
            continue;
        const auto start = static_cast<int>(rows.start(row));
        const int end = file.indexOf('\n', start);
        lines.append(
            {file.mid(start, end < 0 ? -1 : end - start), rows.mark(row),
             rows.line(row) < (index.RunStarts().size() > 1 ? index.RunStarts()[1] : index.size()),
             end < 0 ? NoEnd : QByteArray("\n")});
    }
    return lines;
}

// The plain filter of the lines of one run: entries as a whole, then context.
QByteArray Filtered(QVector<Seen> const& lines, Options const& options)
{
    const QRegularExpression expression(options.expression);
    QVector<bool> shown(lines.size());
    int entry = 0;
    for (int i = 0; i < lines.size(); i = entry) {
        for (entry = i + 1; entry < lines.size() && (lines[entry].mark & LogRows::Continued) &&
                            !(lines[entry].mark & LogRows::Alone);)
            ++entry;
        bool isMatched = false;
        bool isExcluded = false;
        for (int line = i; line < entry; ++line) {
            const QString text = QString::fromLatin1(lines[line].text);
            isMatched = isMatched || expression.match(text).hasMatch();
            isExcluded =
                isExcluded || (!options.excluded.isEmpty() && text.contains(options.excluded));
        }
        for (int line = i; line < entry; ++line) {
            const int severity = lines[line].mark & LogRows::SeverityMask;
            shown[line] = isMatched && !isExcluded &&
                          (options.severities.isEmpty() || options.severities.contains(severity));
        }
    }
    QByteArray text;
    for (int line = 0; line < lines.size(); ++line) {
        bool isNear = false;
        for (int near = qMax(0, line - options.context);
             near <= qMin(lines.size() - 1, line + options.context); ++near)
            isNear = isNear || shown[near];
        if (isNear)
            text += lines[line].text + lines[line].end;
    }
    return text;
}

// The filter of the log view.
LogFilter FilterOf(Options const& options)
{
    LogFilter filter;
    for (int severity = 0; severity <= LogEntry::None && !options.severities.isEmpty(); ++severity)
        filter.SetSeverity(static_cast<LogEntry::Severity>(severity),
                           options.severities.contains(severity));
    filter.SetText(options.expression, true, true);
    if (!options.excluded.isEmpty())
        filter.SetTerms(LogTerms(), LogTerms(LogTerms::Quoted(options.excluded), true));
    filter.SetContext(options.context);
    filter.SetSpan(options.span);
    return filter;
}

// What the log view shows, each line with a line end.
QByteArray TextOf(HistoryUpdate const& update, LogSource const& source)
{
    QByteArray text;
    LogLineReader reader;
    reader.Open(source, update.type);
    for (size_t row = 0; update.rows && row < update.rows->size(); ++row) {
        if (!update.rows->isHeading(row))
            text += reader.Line(update.rows->start(row)) + '\n';
    }
    return text;
}

// Of a file or of all files of a log.
QByteArray Viewed(QString const& path, LogLineParser const& parser, Options const& options,
                  bool isAll)
{
    HistoryUpdate update;
    HistoryScanner scanner;
    QObject::connect(&scanner, &HistoryScanner::updated, &scanner,
                     [&](HistoryUpdate const& now) { update = now; });
    scanner.Open(0, path, parser, FilterOf(options), isAll);
    return TextOf(update, {path, update.older});
}

// Of several programs as one.
QByteArray ViewedFamily(QList<ProgramLog> const& logs, LogLineParser const& parser,
                        Options const& options)
{
    HistoryUpdate update;
    FamilyScanner scanner;
    QObject::connect(&scanner, &FamilyScanner::updated, &scanner,
                     [&](HistoryUpdate const& now) { update = now; });
    scanner.OpenFamily(0, logs, parser, FilterOf(options), {});
    LogSource source;
    source.logs = update.logs;
    return TextOf(update, source);
}

} // namespace

class tst_PlainTerminal : public QObject
{
    Q_OBJECT

private slots:
    void randomFilters();
    void randomSpans();
    void randomFamilies();
    void cleanupTestCase();

private:
    QStringList makeLog(ProgramLife& life, Generator& generator);
    void compare(ProgramLife& life, QStringList const& files, Options const& options);
    void comparePrinted(QStringList const& arguments, QByteArray const& viewed);
    QByteArray expected(QString const& path, LogLineParser parser, Options const& options);

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable() ? "/dev/shm/tst_PlainTerminal-XXXXXX"
                                                              : "tst_PlainTerminal-XXXXXX"};
    int m_filters = 0;
    int m_empty = 0;
    qint64 m_bytes = 0;
    int m_spans = 0;
    int m_cut = 0; // spans that leave out some of the lines, but not all
    int m_merges = 0;
    int m_mixed = 0; // merges with lines of several programs
};

// Of one file, as the log view shows it and as the plain filter does.
QByteArray tst_PlainTerminal::expected(QString const& path, LogLineParser parser,
                                       Options const& options)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return "cannot open " + path.toLatin1();
    const QByteArray bytes = file.readAll();
    parser.SetFileType(LogFileType::Of(bytes.left(LogFileType::HeadSize), parser,
                                       LogEncoding::Automatic,
                                       QFileInfo(path).lastModified().date()));
    LogIndex index(parser);
    index.Begin();
    index.Feed(bytes.constData(), bytes.size());
    index.End();

    // The runs, oldest first: context ends where a run ends.
    const QVector<Seen> lines = LinesOf(bytes, index, index.Rows(LogFilter()));
    std::vector<size_t> starts = index.RunStarts();
    QByteArray plain;
    int at = 0;
    size_t end = index.size();
    for (size_t run = starts.size(); run > 0; --run) {
        const auto count = static_cast<int>(end - starts[run - 1]);
        plain += Filtered(lines.mid(at, count), options);
        at += count;
        end = starts[run - 1];
    }

    const LogFilter filter = FilterOf(options);
    LogIndex filtering(parser, filter);
    filtering.Begin();
    filtering.Feed(bytes.constData(), bytes.size());
    filtering.End();
    QByteArray viewed;
    for (Seen const& line : LinesOf(bytes, filtering, filtering.Rows(filter)))
        viewed += line.text + line.end;
    return plain == viewed ? plain : "the log view shows:\n" + viewed + "instead of:\n" + plain;
}

void tst_PlainTerminal::compare(ProgramLife& life, QStringList const& files, Options const& options)
{
    QByteArray all;
    for (QString const& file : files)
        all += expected(file, LogLineParser(life.formats(), {}), options);
    if (all.endsWith(NoEnd))
        all.chop(NoEnd.size());
    all.replace(NoEnd, "\n");
    const ProgramResult result =
        RunProgram(VELOCOR_LOG, files + options.arguments, PrivateEnvironment(m_folder.path()));
    QCOMPARE(result.output, all);
    QCOMPARE(result.exitCode, all.isEmpty() ? 1 : 0);
    QCOMPARE(result.errors, QByteArray());
    ++m_filters;
    m_empty += all.isEmpty();
    m_bytes += all.size();
}

// Lets a program live and writes its files and the settings that tell how to read them; returns the
// paths of the files.
QStringList tst_PlainTerminal::makeLog(ProgramLife& life, Generator& generator)
{
    for (int step = generator.below(40); step >= 0; --step)
        life.step();
    life.save();
    const QFileInfo log(life.path());
    QFile settings(log.dir().filePath("logsettings.cfg"));
    if (!settings.open(QIODevice::WriteOnly))
        return {};
    settings.write("<LogSettings><config><dateTimeFormat>" + life.formats()[0].toLatin1() +
                   "</dateTimeFormat></config></LogSettings>\n");
    QStringList files;
    const QStringList names = log.dir().entryList({log.fileName() + "*"}, QDir::Files, QDir::Name);
    for (QString const& name : names)
        files.append(log.dir().filePath(name));
    return files;
}

void tst_PlainTerminal::randomFilters()
{
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(40, 10000, 100000);
    while (m_filters < count) {
        const quint32 seed = random();
        Generator generator(seed);
        ProgramLife life(m_folder.filePath("program.log"), 0,
                         1741000000000 + generator.below(100000000), seed + 1);
        const QStringList files = makeLog(life, generator);
        QVERIFY(!files.isEmpty());
        for (int i = 0; i < 4; ++i)
            compare(life, files, generator.next());
        if (QTest::currentTestFailed()) {
            qWarning("filter %d, of seed %u", m_filters, seed);
            return;
        }
        for (QString const& file : files)
            QFile::remove(file);
    }
    QVERIFY(m_bytes > 100 * count);
    QVERIFY(m_empty < count / 2);
}

// Compares what velocor-log prints with what the log view shows.
void tst_PlainTerminal::comparePrinted(QStringList const& arguments, QByteArray const& viewed)
{
    const ProgramResult result =
        RunProgram(VELOCOR_LOG, arguments, PrivateEnvironment(m_folder.path()));
    QByteArray printed = result.output;
    if (!printed.isEmpty() && !printed.endsWith('\n'))
        printed += '\n'; // the last line of a file has no end
    QCOMPARE(printed, viewed);
    QCOMPARE(result.exitCode, viewed.isEmpty() ? 1 : 0);
    QCOMPARE(result.errors, QByteArray());
}

// Of the current file or of a program's whole log.
void tst_PlainTerminal::randomSpans()
{
    const QString folder = m_folder.filePath("data/yourorganization/Notes/logs");
    QVERIFY(QDir().mkpath(folder));
    const QString path = folder + "/notes.log";
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(40, 10000, 100000);
    while (m_spans < count) {
        const quint32 seed = random();
        Generator generator(seed);
        ProgramLife life(path, 0, 1741000000000 + generator.below(100000000), seed + 1);
        const QStringList files = makeLog(life, generator);
        const LogLineParser parser(life.formats(), {});
        for (int i = 0; i < 4 && QFile::exists(path); ++i) {
            const bool isAll = generator.chance(2);
            Options options = generator.next();
            const QByteArray whole = Viewed(path, parser, options, isAll);
            generator.addSpan(options, life);
            const QByteArray viewed = Viewed(path, parser, options, isAll);
            comparePrinted(QStringList(isAll ? "notes" : path) + options.arguments, viewed);
            if (QTest::currentTestFailed()) {
                qWarning("span %d, of seed %u", m_spans, seed);
                return;
            }
            ++m_spans;
            m_cut += !viewed.isEmpty() && viewed != whole;
        }
        for (QString const& file : files)
            QFile::remove(file);
    }
    QVERIFY2(m_cut > count / 10, qPrintable(QString::number(m_cut)));
}

// Of two or three programs, with and without a span of time. Often they do the same at nearly the
// same time, so that their lines are close to each other, or at the same millisecond.
void tst_PlainTerminal::randomFamilies()
{
    static const QStringList names = {"Mail", "Notes", "Shop"};
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(40, 10000, 100000);
    while (m_merges < count) {
        const quint32 seed = random();
        Generator generator(seed);
        const qint64 start = 1741000000000 + generator.below(100000000);
        const bool isClose = generator.chance(2);
        std::vector<std::unique_ptr<ProgramLife>> lives;
        QList<ProgramLog> logs;
        QStringList files;
        for (int i = 2 + generator.below(2); i > 0; --i) {
            QString const& name = names[i - 1];
            const QString folder = m_folder.filePath("data/yourorganization/" + name + "/logs");
            QVERIFY(QDir().mkpath(folder));
            logs.append({name, folder + '/' + name.toLower() + ".log"});
            lives.push_back(std::make_unique<ProgramLife>(
                logs.last().path, i, start + generator.below(3), isClose ? seed + 1 : random()));
            files += makeLog(*lives.back(), generator);
        }
        const bool isAlike = std::all_of(lives.begin(), lives.end(), [&](auto const& life) {
            return life->formats() == lives[0]->formats() && QFile::exists(life->path());
        });
        for (int i = 0; i < 4 && isAlike; ++i) {
            Options options = generator.next();
            if (generator.chance(2))
                generator.addSpan(options, *lives[0]);
            QStringList arguments{"--merge"};
            for (ProgramLog const& log : qAsConst(logs))
                arguments.append(log.name);
            const QByteArray viewed =
                ViewedFamily(logs, LogLineParser(lives[0]->formats(), {}), options);
            comparePrinted(arguments + options.arguments, viewed);
            if (QTest::currentTestFailed()) {
                qWarning("merge %d, of seed %u", m_merges, seed);
                return;
            }
            ++m_merges;
            m_mixed += viewed.contains("P1 ") && viewed.contains("P2 ");
        }
        for (QString const& file : qAsConst(files))
            QFile::remove(file);
    }
    QVERIFY2(m_mixed > count / 4, qPrintable(QString::number(m_mixed)));
}

void tst_PlainTerminal::cleanupTestCase()
{
    std::printf("plain terminal: %d merges, %d of them with lines of several programs\n", m_merges,
                m_mixed);
    std::printf("plain terminal: %d filters with spans of time, %d that leave out some lines\n",
                m_spans, m_cut);
    std::printf("plain terminal: %d filters, %d that nothing matches, %lld bytes printed\n",
                m_filters, m_empty, static_cast<long long>(m_bytes));
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainTerminal)
#include "tst_PlainTerminal.moc"
