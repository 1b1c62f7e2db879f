// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Which entries repeat the one above, kind by kind of row.

#include "app/history/RepeatGroups.h"

#include <QTemporaryFile>
#include <QtTest>

using namespace Velocor;

namespace {

constexpr quint8 Entry = LogEntry::Trace | LogRows::Timed;
constexpr quint8 Other = LogEntry::None; // a line that belongs to no entry
constexpr quint8 More = LogEntry::Trace | LogRows::Continued;

struct Row
{
    QByteArray text;
    quint8 mark;
};

using RowList = QVector<Row>;

QByteArray stamped(char const* severity, QByteArray const& message)
{
    return QByteArray("2025-03-03 09:00:00.000 ") + severity + ' ' + message;
}

RowList same(QByteArray const& text, quint8 mark)
{
    return {{text, mark}, {text, mark}};
}

} // namespace

Q_DECLARE_METATYPE(RowList)

class tst_RepeatGroups : public QObject
{
    Q_OBJECT

private slots:
    void repeats_data();
    void repeats();
    void linesThatAreGone();
    void unreadableFile();
    void headings();
    void context();
    void severalLogs();
    void changes();
    void canceled();

private:
    LogUpdate write(RowList const& rows);
    static QString find(RepeatGroups& groups, LogUpdate const& update, LogSource const& source);

    QTemporaryFile m_file;
};

// As text: "first-end:entries", for each group.
QString tst_RepeatGroups::find(RepeatGroups& groups, LogUpdate const& update,
                               LogSource const& source)
{
    LogLineParser parser({"yyyy-MM-dd hh:mm:ss.zzz"}, {});
    parser.SetOwn(true);
    const auto found = groups.Of(update, source, parser);
    if (!found)
        return "canceled";
    QStringList all;
    for (RepeatGroup const& group : *found)
        all.append(QString("%1-%2:%3").arg(group.first).arg(group.end).arg(group.entries));
    return all.join(' ');
}

// All lines are rows.
LogUpdate tst_RepeatGroups::write(RowList const& rows)
{
    if (!m_file.isOpen() && !m_file.open())
        qFatal("no temporary file");
    m_file.resize(0);
    m_file.seek(0);
    LineTable lines;
    for (Row const& row : rows) {
        lines.Append(m_file.pos(), row.mark, LogRows::CheckOf(row.text.data(), row.text.size()));
        m_file.write(row.text + '\n');
    }
    m_file.flush();
    LogUpdate update;
    LogRows all(lines, lines.size());
    all.AddLines(0, lines.size());
    update.rows = std::make_shared<LogRows>(all);
    return update;
}

void tst_RepeatGroups::repeats_data()
{
    QTest::addColumn<RowList>("rows");
    QTest::addColumn<QString>("expected");

    QTest::newRow("no rows") << RowList() << "";
    QTest::newRow("one row") << RowList{{stamped("Trace", "a"), Entry}} << "";
    QTest::newRow("the same") << same(stamped("Trace", "a"), Entry) << "0-2:2";
    QTest::newRow("other numbers")
        << RowList{{stamped("Trace", "page 1"), Entry}, {stamped("Trace", "page 22"), Entry}}
        << "0-2:2";
    QTest::newRow("other words") << RowList{{stamped("Trace", "a"), Entry},
                                            {stamped("Trace", "b"), Entry}}
                                 << "";
    QTest::newRow("another severity")
        << RowList{{stamped("Trace", "a"), Entry},
                   {stamped("Error", "a"), LogEntry::Error | LogRows::Timed}}
        << "";
    QTest::newRow("three, and two others")
        << same(stamped("Trace", "a"), Entry) + RowList{{stamped("Trace", "a"), Entry}} +
               same(stamped("Trace", "b"), Entry)
        << "0-3:3 3-5:2";
    QTest::newRow("with one between") << RowList{{stamped("Trace", "a"), Entry},
                                                 {stamped("Trace", "b"), Entry},
                                                 {stamped("Trace", "a"), Entry}}
                                      << "";
    QTest::newRow("lines of no entry") << same("page 1", Other) << "0-2:2";
    QTest::newRow("torn lines") << same("page 1", LogRows::Torn) << "";
    QTest::newRow("shown without their entries")
        << same("page 1", LogRows::ContinuedAlone) << "0-2:2";
    QTest::newRow("empty lines") << same("", Other) << "0-2:2";

    const RowList trace{{stamped("Trace", "a"), Entry}, {"at 1", More}, {"at 2", More}};
    QTest::newRow("entries of several lines") << trace + trace << "0-6:2";
    QTest::newRow("one line more")
        << trace + RowList{{stamped("Trace", "a"), Entry}, {"at 1", More}} << "";
    QTest::newRow("another line in the middle")
        << trace + RowList{{stamped("Trace", "a"), Entry}, {"in 1", More}, {"at 2", More}} << "";
    QTest::newRow("lines divided in another way")
        << RowList{{stamped("Trace", "a b"), Entry}, {"c", More}} +
               RowList{{stamped("Trace", "a"), Entry}, {"b c", More}}
        << "";

    const int part = RepeatGroups::MostCompared / 2 - 100;
    const QByteArray large(part, 'x');
    QTest::newRow("large") << same(stamped("Trace", large), Entry) +
                                  RowList{{stamped("Trace", large), Entry}}
                           << "0-3:3";
    const RowList larger{{stamped("Trace", large), Entry}, {large, More}};
    QTest::newRow("nearly too large") << larger + larger << "0-4:2";
    const RowList tooLarge{{stamped("Trace", large), Entry}, {large + QByteArray(200, 'x'), More}};
    QTest::newRow("too large") << tooLarge + tooLarge << "";
}

void tst_RepeatGroups::repeats()
{
    QFETCH(RowList, rows);
    QFETCH(QString, expected);
    const LogUpdate update = write(rows);
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, m_file.fileName()), expected);
    QCOMPARE(find(groups, update, m_file.fileName()), expected); // a reset is read again
}

// What is in their place may repeat each other, but it is not what the rows were made of.
void tst_RepeatGroups::linesThatAreGone()
{
    const LogUpdate update = write(same(stamped("Trace", "abc"), Entry));
    write(same(stamped("Trace", "xyz"), Entry));
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, m_file.fileName()), QString());
}

void tst_RepeatGroups::unreadableFile()
{
    const LogUpdate update = write(same("", Other));
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, m_file.fileName() + "-gone"), QString());
}

void tst_RepeatGroups::headings()
{
    LogUpdate update =
        write(same(stamped("Trace", "a"), Entry) + same(stamped("Trace", "a"), Entry));
    LogRows rows(update.rows->lines());
    rows.AddHeading(LogRows::EarlierHeading);
    rows.AddLines(0, 2);
    rows.EndEarlier();
    rows.AddHeading(LogRows::NewestHeading);
    rows.AddLines(2, 4);
    update.rows = std::make_shared<LogRows>(rows);
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, m_file.fileName()), QString("1-3:2 4-6:2"));
}

void tst_RepeatGroups::context()
{
    LogUpdate update =
        write(same(stamped("Trace", "a"), Entry) + same(stamped("Trace", "a"), Entry));
    LogRows rows(update.rows->lines());
    rows.AddLine(0, true);
    rows.AddLine(1, true);
    rows.AddLine(2, false);
    rows.AddLine(3, false);
    update.rows = std::make_shared<LogRows>(rows);
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, m_file.fileName()), QString("0-2:2 2-4:2"));
}

void tst_RepeatGroups::severalLogs()
{
    LogUpdate update = write(same(stamped("Trace", "a"), Entry));
    LineTable lines;
    LineTable const& one = update.rows->lines();
    for (qint64 log = 0; log < 2; ++log) {
        for (size_t line = 0; line < one.size(); ++line)
            lines.Append(log * LogSource::LogSize + one.start(line), Entry, one.check(line));
    }
    LogRows rows(lines);
    rows.AddLines(0, 4);
    update.rows = std::make_shared<LogRows>(rows);
    LogSource source;
    source.logs = std::make_shared<std::vector<LogSource>>(2, LogSource(m_file.fileName()));
    RepeatGroups groups([] { return true; });
    QCOMPARE(find(groups, update, source), QString("0-2:2 2-4:2"));
}

// Only rows that differ from those before, and those beside them, are read.
void tst_RepeatGroups::changes()
{
    RowList rows;
    for (int number = 0; number < 40; ++number)
        rows += {stamped("Trace", number % 10 < 5 ? "a" : "b"), Entry};
    RepeatGroups groups([] { return true; });
    const QString all = "0-5:5 5-10:5 10-15:5 15-20:5 20-25:5 25-30:5 30-35:5 35-40:5";
    QCOMPARE(find(groups, write(rows), m_file.fileName()), all);
    LogUpdate update = write(rows + RowList{{stamped("Trace", "b"), Entry}});
    update.isReset = false;
    m_file.seek(rows[0].text.size() + 1 + 24); // in the second line, which stays as it was
    m_file.write("Error");
    m_file.flush();
    QCOMPARE(find(groups, update, m_file.fileName()), QString(all).replace("40:5", "41:6"));
    groups.Forget();
    QCOMPARE(find(groups, update, m_file.fileName()),
             QString(all).replace("40:5", "41:6").replace("0-5:5 ", "2-5:3 "));
}

void tst_RepeatGroups::canceled()
{
    RowList rows;
    for (int number = 0; number < 3000; ++number)
        rows += {stamped("Trace", "a"), Entry};
    bool goesOn = false;
    RepeatGroups groups([&] { return goesOn; });
    LogUpdate update = write(rows);
    QCOMPARE(find(groups, update, m_file.fileName()), QString("canceled"));
    goesOn = true;
    update.isReset = false; // nothing is known
    QCOMPARE(find(groups, update, m_file.fileName()), QString("0-3000:3000"));
}

QTEST_GUILESS_MAIN(tst_RepeatGroups)
#include "tst_RepeatGroups.moc"
