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
};

void tst_LogFilter::filter()
{
    LogFilter filter;
    QVERIFY(filter.Shows(LogEntry::Trace) && filter.Shows(LogEntry::None));
    filter.SetSeverity(LogEntry::None, false); // lines without a severity have no switch
    QVERIFY(filter.Shows(LogEntry::None));
    filter.SetSeverity(LogEntry::Trace, false);
    QVERIFY(!filter.Shows(LogEntry::Trace) && !filter.Shows(LogEntry::None));
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

QTEST_GUILESS_MAIN(tst_LogFilter)
#include "tst_LogFilter.moc"
