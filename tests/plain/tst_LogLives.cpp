// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Random lives of a log file, compared with what was written: restarts that write over the old
// content, kills in the middle of an entry, cuts, clocks that are set back and forth, several
// formats and threads, and views that look in between.

#include "app/logfile/LogScanner.h"

#include "Rounds.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <algorithm>
#include <fcntl.h>
#include <random>
#include <sys/stat.h>

using namespace Velocor;

namespace {

// A log file and who wrote each of its bytes. The file's time of modification is simulated: it
// advances with each change, as it does on a disk with fine time stamps.
class Life
{
public:
    Life(QString const& path, quint32 seed) : m_path(path), m_random(seed)
    {
        static const QStringList formats = {"yyyy-MM-dd hh:mm:ss.z", "yyyy-MM-dd hh:mm:ss",
                                            "dd.MM.yyyy hh:mm", "hh:mm:ss.zzz", "hh:mm"};
        m_format = formats[chance(2) ? 0 : below(formats.size())];
        m_clock = QDateTime(QDate(2025, 3, 3), QTime(below(24), 0)).addSecs(below(3600));
        m_hasOneClock = chance(2);
        restart();
        save();
    }

    LogLineParser parser() const
    {
        LogLineParser parser({m_format}, {});
        parser.SetOwn(true); // a torn line may look like another program's
        return parser;
    }

    // One event, and what it changes in the file.
    void step()
    {
        const int event = below(40);
        if (event == 0)
            restart();
        else if (event == 1 && !m_hasOneClock)
            setClock();
        else if (event == 2)
            writeTorn();
        else if (event == 3)
            cut();
        else
            writeEntries(1 + below(event == 4 ? 60 : 4));
        save();
    }

    QByteArray const& file() const { return m_file; }
    int runs() const { return m_run + 1; }

    // The run that wrote a whole line; -1 if more than one did.
    int ownerOf(int start, int end) const
    {
        const auto first = m_owners.begin() + start;
        const int owner = *first;
        return std::all_of(first, m_owners.begin() + end, [=](int o) { return o == owner; }) ? owner
                                                                                             : -1;
    }

    // Whether an entry was written here, of which this is not just the rest.
    bool isEntry(int start) const { return m_isEntry[start]; }

    // Whether the times of a run went back, so that its order may be guessed wrongly. Without dates
    // they do at midnight.
    bool wentBack(int run) const { return m_wentBack.contains(run) || m_format.startsWith('h'); }

    // Whether the order of the runs can be seen from the file.
    bool hasClearOrder() const { return m_hasOneClock && m_format.endsWith(".z"); }

private:
    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }

    void restart()
    {
        ++m_run;
        m_position = 0;
        m_clock = m_clock.addSecs(7200 + below(chance(4) ? 1000000 : 20000));
        const int before = below(4);
        for (int entry = 0; entry < before; ++entry)
            write(stamped("yyyy-MM-dd hh:mm:ss.z", "Trace", "start"));
        writeEntries(1);
    }

    void setClock()
    {
        static const QVector<int> seconds = {-3600, 3600, -90, -1, 40, -86400, -5000};
        const int step = seconds[below(seconds.size())];
        m_clock = m_clock.addSecs(step);
        if (step < 0)
            m_wentBack.insert(m_run);
    }

    QByteArray stamped(QString const& format, char const* severity, QByteArray const& message)
    {
        return m_clock.toString(format).toLatin1() + ' ' + severity + ' ' + message + '\n';
    }

    QByteArray entry()
    {
        static char const* const severities[] = {"Trace", "Notification", "Warning", "Error"};
        QByteArray text = stamped(m_format, severities[below(4)], QByteArray(1 + below(40), 'm'));
        while (chance(6))
            text += QByteArray(1 + below(20), 'c') + '\n';
        return text;
    }

    // Threads may write in another order than they stamped.
    void writeEntries(int count)
    {
        for (; count > 0; --count) {
            m_clock = m_clock.addMSecs(chance(8) ? below(2000000) : below(3000));
            QByteArray first = entry();
            if (chance(10)) {
                m_clock = m_clock.addMSecs(below(15));
                write(entry());
            }
            write(first);
        }
    }

    // A kill in the middle of an entry, and the next start.
    void writeTorn()
    {
        const QByteArray text = entry();
        write(text.left(below(text.size())));
        restart();
    }

    void cut()
    {
        m_file.truncate(m_position);
        m_owners.resize(m_position);
        m_isEntry.resize(m_position);
    }

    void write(QByteArray const& text)
    {
        if (text.isEmpty())
            return;
        const int end = m_position + text.size();
        if (end > m_file.size()) {
            m_file.resize(end);
            m_owners.resize(end);
            m_isEntry.resize(end);
        }
        std::copy(text.begin(), text.end(), m_file.begin() + m_position);
        std::fill(m_owners.begin() + m_position, m_owners.begin() + end, m_run);
        std::fill(m_isEntry.begin() + m_position, m_isEntry.begin() + end, false);
        m_isEntry[m_position] = text.endsWith('\n'); // was not torn
        m_position = end;
    }

    // In place, as the log does it: a file with another content, but the same identity.
    void save()
    {
        QFile file(m_path);
        const bool isSaved = file.open(QIODevice::ReadWrite) &&
                             file.write(m_file) == m_file.size() && file.resize(m_file.size());
        file.close();
        ++m_changes;
        const timespec time = {1600000000 + m_changes / 1000, (m_changes % 1000) * 1000000};
        const timespec times[2] = {time, time};
        if (!isSaved || ::utimensat(AT_FDCWD, QFile::encodeName(m_path), times, 0) != 0)
            qFatal("cannot write the log");
    }

    QString m_path;
    std::mt19937 m_random;
    QString m_format;
    QDateTime m_clock;
    bool m_hasOneClock = false;
    QByteArray m_file;
    QVector<int> m_owners;
    QVector<bool> m_isEntry;
    int m_position = 0;
    int m_run = -1;
    int m_changes = 0;
    QSet<int> m_wentBack;
};

// The scanner of a view, and the rows that the view has.
class View
{
public:
    View()
    {
        QObject::connect(&m_scanner, &LogScanner::updated,
                         [this](LogUpdate const& update) { m_rows = update.rows; });
    }

    void open(QString const& path, LogLineParser const& parser)
    {
        m_scanner.SetCurrentRequest(++m_request);
        m_scanner.Open(m_request, path, parser, LogFilter());
    }

    void poll() { m_scanner.Poll(); }

    LogRows const& rows() const { return *m_rows; }

private:
    LogScanner m_scanner;
    int m_request = 0;
    std::shared_ptr<LogRows const> m_rows;
};

QVector<int> LineStarts(QByteArray const& file)
{
    QVector<int> starts;
    for (int start = 0; start < file.size();) {
        starts.append(start);
        const int end = file.indexOf('\n', start);
        start = end < 0 ? file.size() : end + 1;
    }
    return starts;
}

} // namespace

class tst_LogLives : public QObject
{
    Q_OBJECT

private slots:
    void randomLives();
    void cleanupTestCase();

private:
    void live(quint32 seed);
    void compare(Life const& life, View const& view);
    void compareOrder(Life const& life, QVector<int> const& rows);

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable() ? "/dev/shm/tst_LogLives-XXXXXX"
                                                              : "tst_LogLives-XXXXXX"};
    int m_lives = 0;
    qint64 m_lines = 0;
    int m_views = 0;
    int m_guesses = 0;
};

// All lines, each once; those of a run in the order in which they were written.
void tst_LogLives::compare(Life const& life, View const& view)
{
    QVector<int> rows;
    LogRows::Reader reader(view.rows());
    for (size_t row = 0; row < view.rows().size(); ++row) {
        const int start = static_cast<int>(reader.start(row));
        if (start >= 0)
            rows.append(start);
    }
    QVector<int> sorted = rows;
    std::sort(sorted.begin(), sorted.end());
    QCOMPARE(sorted, LineStarts(life.file()));
    ++m_views;
    m_lines += rows.size();
    compareOrder(life, rows);
}

void tst_LogLives::compareOrder(Life const& life, QVector<int> const& rows)
{
    QVector<int> last(life.runs(), -1);
    int newest = -1;
    bool isGuessedWrongly = false;
    for (int start : rows) {
        const int end = life.file().indexOf('\n', start);
        const int run = life.ownerOf(start, end < 0 ? life.file().size() : end + 1);
        const bool isEntry = life.isEntry(start);
        if (run < 0 || !isEntry)
            continue;
        if (start < last[run]) {
            QVERIFY2(life.wentBack(run), "the lines of a run are not in their order");
            isGuessedWrongly = true;
        }
        last[run] = start;
        if (life.hasClearOrder())
            QVERIFY2(run >= newest, "an older run comes after a newer one");
        newest = run;
    }
    m_guesses += isGuessedWrongly;
}

void tst_LogLives::live(quint32 seed)
{
    const QString path = m_folder.filePath("x.log");
    QFile::remove(path);
    Life life(path, seed);
    View view;
    std::mt19937 random(seed + 1);
    view.open(path, life.parser());
    compare(life, view);
    for (int step = 0; step < 25 && !QTest::currentTestFailed(); ++step) {
        life.step();
        if (random() % 3 == 0)
            continue;
        if (random() % 10 == 0)
            view.open(path, life.parser());
        else
            view.poll();
        compare(life, view);
    }
    ++m_lives;
}

void tst_LogLives::randomLives()
{
    const int count = Rounds::count(500, 20000);
    if (!Rounds::each("life", count, [this](quint32 seed) { live(seed); }))
        return;
    QVERIFY(m_lines > 100 * count);
    QVERIFY2(m_guesses < m_views / 20, "a clock that is set back is taken for a restart too often");
}

void tst_LogLives::cleanupTestCase()
{
    std::printf("log lives: %d lives, %d views of them with %lld lines, %d in which a clock that "
                "was set back was taken for a restart\n",
                m_lives, m_views, static_cast<long long>(m_lines), m_guesses);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_LogLives)
#include "tst_LogLives.moc"
