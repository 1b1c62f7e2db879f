// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogTerms.h"

#include "app/logfile/LogFilter.h"
#include "app/logfile/LogIndex.h"
#include "support/DemoLog.h"

#include <QtTest>

using namespace Velocor;

using DemoLog::entry;

class tst_LogTerms : public QObject
{
    Q_OBJECT

private slots:
    void split_data();
    void split();
    void quoted_data();
    void quoted();
    void matches();
    void inTheFilter();
    void context_data();
    void context();
    void contextOfSeverities();
};

void tst_LogTerms::split_data()
{
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QStringList>("terms");
    QTest::newRow("nothing") << "" << QStringList();
    QTest::newRow("blanks") << "  " << QStringList();
    QTest::newRow("one") << "disk" << QStringList({"disk"});
    QTest::newRow("two") << " disk  full " << QStringList({"disk", "full"});
    QTest::newRow("quoted") << "a \"b c\" d" << QStringList({"a", "b c", "d"});
    QTest::newRow("blanks in quotes are kept") << "\" b \"" << QStringList({" b "});
    QTest::newRow("open quote") << "a \"b c" << QStringList({"a", "b c"});
    QTest::newRow("empty quotes") << "a \"\" b" << QStringList({"a", "b"});
    QTest::newRow("quote within a word") << "a\"b c\"d" << QStringList({"a", "b c", "d"});
    QTest::newRow("doubled quote within quotes")
        << "\"a \"\"b\"\" c\" d" << QStringList({"a \"b\" c", "d"});
    QTest::newRow("doubled quote at the end") << "\"a\"\"" << QStringList({"a\""});
    QTest::newRow("only a quote") << "\"\"\"\"" << QStringList({"\""});
    QTest::newRow("minus is no sign") << "-5" << QStringList({"-5"});
}

void tst_LogTerms::split()
{
    QFETCH(QString, typed);
    QFETCH(QStringList, terms);
    QCOMPARE(LogTerms::Split(typed), terms);
}

void tst_LogTerms::quoted_data()
{
    QTest::addColumn<QString>("term");
    QTest::addColumn<QString>("typed");
    QTest::newRow("word") << "disk"
                          << "disk";
    QTest::newRow("words") << "disk full"
                           << "\"disk full\"";
    QTest::newRow("quotes") << "a\"b"
                            << "\"a\"\"b\"";
    QTest::newRow("quotes at both ends") << "\"a b\""
                                         << "\"\"\"a b\"\"\"";
    QTest::newRow("tab") << "a\tb"
                         << "\"a\tb\"";
}

void tst_LogTerms::quoted()
{
    QFETCH(QString, term);
    QFETCH(QString, typed);
    QCOMPARE(LogTerms::Quoted(term), typed);
    QCOMPARE(LogTerms::Split(typed), QStringList(term));
}

void tst_LogTerms::matches()
{
    const LogTerms none;
    QVERIFY(none.isEmpty() && none.AreAllIn("x") && !none.IsAnyIn("x"));
    const LogTerms two("disk \"is full\"", false);
    QVERIFY(two.AreAllIn("The Disk is full"));
    QVERIFY(!two.AreAllIn("The disk is nearly full"));
    QVERIFY(two.IsAnyIn("The disk is nearly full"));
    QVERIFY(!two.IsAnyIn("full"));
    QVERIFY(!LogTerms("disk", true).IsAnyIn("Disk"));
    QVERIFY(two == LogTerms(" disk  \"is full\"", false));
    QVERIFY(!(two == LogTerms("disk \"is full\"", true)));
    QVERIFY(!(two == LogTerms("disk", false)));
    using Ranges = QVector<QPair<int, int>>;
    QCOMPARE(LogTerms("aa b", false).Ranges("AAAA b"), Ranges({{0, 2}, {2, 2}, {5, 1}}));
}

void tst_LogTerms::inTheFilter()
{
    LogFilter filter;
    filter.SetTerms(LogTerms("disk", false), LogTerms("nearly", false));
    QVERIFY(filter.hasText());
    QVERIFY(filter.Matches("disk full") && !filter.Matches("disk nearly full"));
    QVERIFY(!filter.Matches("tape full"));
    QVERIFY(filter.SetText("ful+", true, false));
    QVERIFY(filter.Matches("disk full") && !filter.Matches("disk gone"));
    QVERIFY(!filter.Matches("disk nearly full"));
    using Ranges = QVector<QPair<int, int>>;
    QCOMPARE(filter.Ranges("disk full"), Ranges({{5, 4}, {0, 4}}));
    LogFilter other;
    QVERIFY(other.SetText("ful+", true, false));
    QVERIFY(!other.HasSameText(filter));
    other.SetTerms(LogTerms("disk", false), LogTerms("nearly", false));
    QVERIFY(other.HasSameText(filter));
    // A text with blanks, quotes or a minus is one text, as it is.
    QVERIFY(filter.SetText("a \"b\" -c", false, false));
    filter.SetTerms(LogTerms(), LogTerms());
    QVERIFY(filter.Matches("xa \"b\" -c") && !filter.Matches("a b"));
}

void tst_LogTerms::context_data()
{
    QTest::addColumn<int>("lines");
    QTest::addColumn<QString>("hits");  // of lines 0 to 9
    QTest::addColumn<QString>("shown"); // in lower case, if as context
    const auto row = [](char const* name, int lines, char const* hits, char const* shown) {
        QTest::newRow(name) << lines << QString(hits) << QString(shown);
    };
    row("none", 0, "..X....X..", "CH");
    row("one", 1, "..X....X..", "bCdgHi");
    row("at the ends", 2, "X........X", "AbchiJ");
    row("that meets", 2, "..X....X..", "abCdefgHij");
    row("that overlaps", 2, "..X..X....", "abCdeFgh");
    row("next to each other", 1, "...XX.....", "cDEf");
    row("more than there is", 10, "....X.....", "abcdEfghij");
    row("without a hit", 5, "..........", "");
}

void tst_LogTerms::context()
{
    QFETCH(int, lines);
    QFETCH(QString, hits);
    QFETCH(QString, shown);
    QByteArray log;
    for (int i = 0; i < 10; ++i)
        log += entry(QString("09:00:0%1.000").arg(i), "Trace", hits.mid(i, 1) + "|");
    LogFilter filter;
    QVERIFY(filter.SetText("X|", false, true));
    filter.SetContext(lines);
    LogIndex index(LogLineParser(), filter);
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    const LogRows rows = index.Rows(filter);
    QString found;
    for (size_t row = 0; row < rows.size(); ++row) {
        const int line = log.left(static_cast<int>(rows.start(row))).count('\n');
        found += QChar((rows.mark(row) & LogRows::Context ? 'a' : 'A') + line);
    }
    QCOMPARE(found, shown);
}

// Context is whatever is beside a hit in the file, also what the severities hide.
void tst_LogTerms::contextOfSeverities()
{
    const QByteArray log =
        entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Error", "b") +
        entry("09:00:02.000", "Trace", "c") + entry("09:00:03.000", "Trace", "d");
    LogFilter filter;
    filter.SetSeverity(LogEntry::Trace, false);
    filter.SetContext(1);
    LogIndex index;
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    const LogRows rows = index.Rows(filter);
    QCOMPARE(rows.size(), size_t(3));
    QVERIFY(rows.mark(0) & LogRows::Context);
    QVERIFY(!(rows.mark(1) & LogRows::Context));
}

QTEST_GUILESS_MAIN(tst_LogTerms)

#include "tst_LogTerms.moc"
