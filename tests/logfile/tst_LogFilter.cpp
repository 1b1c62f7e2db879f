// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFilter.h"

#include <QtTest>

using namespace Velocor;

class tst_LogFilter : public QObject
{
    Q_OBJECT

private slots:
    void filter();
    void text_data();
    void text();
    void errors();
    void sameText();
    void hasText();
    void earlierRuns();
};

void tst_LogFilter::filter()
{
    LogFilter filter;
    QVERIFY(filter.Shows(LogEntry::Trace) && filter.Shows(LogEntry::None));
    filter.SetSeverity(LogEntry::None, false);
    QVERIFY(filter.Shows(LogEntry::Trace) && !filter.Shows(LogEntry::None));
    filter.SetSeverity(LogEntry::Trace, false);
    filter.SetSeverity(LogEntry::None, true);
    QVERIFY(!filter.Shows(LogEntry::Trace) && filter.Shows(LogEntry::None));
    QVERIFY(filter.Shows(LogEntry::Fatal));
    filter.SetSeverity(LogEntry::Trace, true);
    QVERIFY(filter.Shows(LogEntry::Trace) && filter.Shows(LogEntry::None));

    using Ranges = QVector<QPair<int, int>>;
    QCOMPARE(filter.Ranges("any"), Ranges());
    QVERIFY(filter.SetText("a", false, false));
    QCOMPARE(filter.Ranges("Banana"), Ranges({{1, 1}, {3, 1}, {5, 1}}));
    QVERIFY(filter.Matches("BANANA") && !filter.Matches("kiwi"));
    QVERIFY(filter.SetText("A", false, true));
    QVERIFY(filter.Matches("BANANA") && !filter.Matches("banana"));
    QVERIFY(filter.SetText("n*", true, false)); // matches the empty string in many places
    QCOMPARE(filter.Ranges("Banana"), Ranges({{2, 1}, {4, 1}}));
    QVERIFY(!filter.SetText("(", true, false));
    QCOMPARE(filter.Ranges("Banana"), Ranges({{2, 1}, {4, 1}}));
    LogFilter other;
    QVERIFY(!other.HasSameText(filter));
    QVERIFY(other.SetText("n*", false, false));
    QVERIFY(!other.HasSameText(filter));
    QVERIFY(other.SetText("n*", true, false));
    QVERIFY(other.HasSameText(filter));
}

void tst_LogFilter::text_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isExpression");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<QString>("line");
    QTest::addColumn<bool>("matches");
    QTest::addColumn<int>("rangeCount");

    QTest::newRow("no text") << "" << false << true << "any" << true << 0;
    QTest::newRow("no expression") << "" << true << true << "any" << true << 0;
    QTest::newRow("at the start") << "a" << false << true << "abc" << true << 1;
    QTest::newRow("at the end") << "c" << false << true << "abc" << true << 1;
    QTest::newRow("nowhere") << "d" << false << true << "abc" << false << 0;
    QTest::newRow("another case") << "A" << false << true << "abca" << false << 0;
    QTest::newRow("any case") << "A" << false << false << "abca" << true << 2;
    QTest::newRow("expression of another case") << "A." << true << true << "abac" << false << 0;
    QTest::newRow("expression of any case") << "A." << true << false << "abac" << true << 2;
    QTest::newRow("a dot as text") << "." << false << true << "a.b" << true << 1;
    QTest::newRow("a dot as text, nowhere") << "." << false << true << "ab" << false << 0;
    QTest::newRow("a dot as expression") << "." << true << true << "ab" << true << 2;
    QTest::newRow("a bracket as text") << "(" << false << true << "a(b" << true << 1;
}

void tst_LogFilter::text()
{
    QFETCH(QString, text);
    QFETCH(bool, isExpression);
    QFETCH(bool, caseSensitive);
    QFETCH(QString, line);
    LogFilter filter;
    QVERIFY(filter.SetText(text, isExpression, caseSensitive));
    QTEST(filter.Matches(line), "matches");
    QTEST(filter.FindQuickly(line) == LogFilter::Yes, "matches");
    QVERIFY(filter.FindQuickly(line) != LogFilter::TooLong);
    QTEST(int(filter.Ranges(line).size()), "rangeCount");
}

void tst_LogFilter::errors()
{
    QCOMPARE(LogFilter::ErrorOf("a(b)"), QString());
    const QString told = LogFilter::ErrorOf("a(");
    QVERIFY2(told.endsWith(" at character 3"), qPrintable(told));
}

// The same letters are another filter as an expression, or in another case.
void tst_LogFilter::sameText()
{
    LogFilter plain;
    LogFilter expression;
    LogFilter anyCase;
    LogFilter hiding;
    QVERIFY(plain.SetText("a", false, true) && expression.SetText("a", true, true));
    QVERIFY(anyCase.SetText("a", false, false) && hiding.SetText("a", false, true));
    hiding.SetSeverity(LogEntry::Trace, false);
    QVERIFY(!plain.HasSameText(expression));
    QVERIFY(!plain.HasSameText(anyCase));
    QVERIFY(plain.HasSameText(hiding));
}

void tst_LogFilter::hasText()
{
    const LogTerms none;
    const LogTerms some("a", true);
    LogFilter filter;
    QVERIFY(!filter.hasText());
    filter.SetTerms(some, none);
    QVERIFY(filter.hasText());
    filter.SetTerms(none, some);
    QVERIFY(filter.hasText());
    filter.SetTerms(none, none);
    QVERIFY(!filter.hasText());
    QVERIFY(filter.SetText("a", false, true));
    QVERIFY(filter.hasText());
}

void tst_LogFilter::earlierRuns()
{
    LogFilter filter;
    QVERIFY(filter.earlierRuns());
    filter.SetEarlierRuns(false);
    QVERIFY(!filter.earlierRuns());
    filter.SetEarlierRuns(true);
    QVERIFY(filter.earlierRuns());
}

QTEST_GUILESS_MAIN(tst_LogFilter)
#include "tst_LogFilter.moc"
