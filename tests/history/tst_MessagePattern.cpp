// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/MessagePattern.h"

#include <QRegularExpression>
#include <QtTest>

using namespace Velocor;

class tst_MessagePattern : public QObject
{
    Q_OBJECT

private slots:
    void pattern_data();
    void pattern();
    void list();
    void places();
    void expression_data();
    void expression();
    void manyPatterns();
};

void tst_MessagePattern::pattern_data()
{
    QTest::addColumn<QString>("message");
    QTest::addColumn<QString>("pattern");
    const auto row = [](char const* name, char const* message, char const* pattern) {
        QTest::newRow(name) << QString::fromUtf8(message) << QString::fromUtf8(pattern);
    };
    row("empty", "", "");
    row("words", "The disk is full", "The disk is full");
    row("number", "page 12 of 300", "page # of #");
    row("negative number", "-5 degrees", "-# degrees");
    row("number with a fraction", "3.25 s", "# s");
    row("at the end of a sentence", "took 5.", "took #.");
    row("time", "at 14:03:02.123", "at #");
    row("date", "on 2025-03-03, then", "on #, then");
    row("version", "Qt 5.15.8", "Qt #");
    row("network address", "from 10.0.0.1:8080", "from #");
    row("address", "at 0x7f31c0aa", "at #");
    row("address without digits", "at 0xdeadbeef", "at #");
    row("no address", "at 0x.", "at #x.");
    row("identifier", "6fa459ea-ee8a-3ca4-894e-db77e160355e failed", "# failed");
    row("hash", "commit deadbeef12", "commit #");
    row("hexadecimal that begins with a digit", "code 1f", "code #");
    row("a short word with a digit", "a4 paper", "a# paper");
    row("letters that could be hexadecimal", "added facade", "added facade");
    row("number with a comma", "1,234 files", "# files");
    row("version in a word", "lib v1.2x", "lib v#x");
    row("digits at the end of a word and of a sentence", "see g4.", "see g#.");
    row("digits in a word, before a separator", "see g4.x", "see g#.x");
    row("digits in a word", "utf8 id42x", "utf# id#x");
    row("number before a colon", "line 5: x", "line #: x");
    row("number with a unit", "12g of it", "#g of it");
    row("two numbers with a letter between", "8x86 pixels", "#x# pixels");
    row("address of one digit", "at 0xa", "at #");
    row("letter between digits of a word", "v1x2 on", "v#x# on");
    row("version at the end", "lib v1.2", "lib v#");
    row("shortest hash", "commit abcde1", "commit #");
    row("shorter than a hash", "commit abcd1", "commit abcd#");
    row("apostrophe before quotes", "the user's 'disk'", "the user's '…'");
    row("double quotes", "cannot read \"a b.txt\" now", "cannot read \"…\" now");
    row("single quotes", "user 'ada'", "user '…'");
    row("backquotes", "run `ls -l`", "run `…`");
    row("apostrophe", "the user's disk isn't full", "the user's disk isn't full");
    row("apostrophe in quotes", "'the user's disk'", "'…'");
    row("an open quote", "say \"yes 3", "say \"yes #");
    row("empty quotes", "name \"\"", "name \"…\"");
    row("letters beyond ASCII", "größe 3 für é5", "größe # für é#");
}

void tst_MessagePattern::pattern()
{
    QFETCH(QString, message);
    QFETCH(QString, pattern);
    QCOMPARE(MessagePattern::Of(message), pattern);
}

void tst_MessagePattern::list()
{
    PatternList list;
    list.Add(LogEntry::Error, "page 1", 50);
    list.Add(LogEntry::Trace, "start", -1);
    list.Add(LogEntry::Warning, "page 1", 20);
    list.Add(LogEntry::Warning, "page 2", 10);
    list.Add(LogEntry::Warning, "page 3", -1);
    const std::vector<PatternList::Pattern> sorted = list.Sorted();
    QCOMPARE(sorted.size(), size_t(3));
    QCOMPARE(sorted[0].text, QString("page #"));
    QCOMPARE(sorted[0].severity, LogEntry::Warning);
    QCOMPARE(sorted[0].count, size_t(3));
    QCOMPARE(sorted[0].first, qint64(10));
    QCOMPARE(sorted[0].last, qint64(20));
    QCOMPARE(sorted[1].severity, LogEntry::Error); // came before the next one
    QCOMPARE(sorted[2].text, QString("start"));
    QCOMPARE(sorted[2].first, qint64(-1));

    PatternList fromZero;
    fromZero.Add(LogEntry::Error, "page 1", 0);
    fromZero.Add(LogEntry::Error, "page 2", 5);
    QCOMPARE(fromZero.Sorted()[0].first, qint64(0));
    QCOMPARE(fromZero.Sorted()[0].last, qint64(5));
}

void tst_MessagePattern::places()
{
    PatternList list;
    list.Add(LogEntry::Error, "page 1", -1, 100);
    QCOMPARE(list.Sorted()[0].firstPlace, qint64(100));
    QCOMPARE(list.Sorted()[0].lastPlace, qint64(100));
    list.Add(LogEntry::Error, "page 2", -1, 200);
    QCOMPARE(list.Sorted()[0].firstPlace, qint64(100));
    QCOMPARE(list.Sorted()[0].lastPlace, qint64(200));
    list.Add(LogEntry::Error, "page 3", 50, 300);
    list.Add(LogEntry::Error, "page 4", 50, 400);
    list.Add(LogEntry::Error, "page 5", 20, 500);
    list.Add(LogEntry::Error, "page 6", -1, 600);
    QCOMPARE(list.Sorted()[0].first, qint64(20));
    QCOMPARE(list.Sorted()[0].firstPlace, qint64(500));
    QCOMPARE(list.Sorted()[0].last, qint64(50));
    QCOMPARE(list.Sorted()[0].lastPlace, qint64(400));
}

void tst_MessagePattern::expression_data()
{
    QTest::addColumn<QString>("message");
    QTest::addColumn<QString>("other");
    const auto row = [](char const* name, char const* message, char const* other) {
        QTest::newRow(name) << QString(message) << QString(other);
    };
    row("number", "page 12 of 3", "page xyz of 3");
    row("address", "at 0x7F31c0", "at z");
    row("number sign", "issue #12", "issue none");
    row("quoted", "no \"a.txt\"", "no a.txt");
    row("special characters", "f(1) [a] {b} \\c ^d$ e|f? *+.", "f(1)");
    row("ellipsis", "wait\u2026", "wait x");
    row("plain", "x", "X");
}

void tst_MessagePattern::expression()
{
    QFETCH(QString, message);
    QFETCH(QString, other);
    const QRegularExpression expression(MessagePattern::Expression(MessagePattern::Of(message)));
    QVERIFY(expression.match(message).hasMatch());
    QVERIFY(!expression.match(other).hasMatch());
}

void tst_MessagePattern::manyPatterns()
{
    PatternList list;
    for (int i = 0; i < PatternList::MaximumPatterns + 10; ++i) {
        QString word;
        for (int rest = i; rest > 0; rest /= 10)
            word += QChar('g' + rest % 10);
        list.Add(LogEntry::Trace, word, i);
    }
    const std::vector<PatternList::Pattern> sorted = list.Sorted();
    QCOMPARE(sorted.size(), size_t(PatternList::MaximumPatterns + 1));
    QCOMPARE(sorted[0].text, QString(QChar(0x2026)));
    QCOMPARE(sorted[0].count, size_t(10));
    QCOMPARE(sorted[0].severity, LogEntry::None);
}

QTEST_GUILESS_MAIN(tst_MessagePattern)
#include "tst_MessagePattern.moc"
