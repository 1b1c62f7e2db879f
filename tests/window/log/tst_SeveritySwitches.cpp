// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/SeveritySwitches.h"

#include <QToolButton>
#include <QtTest>

using namespace Velocor;

namespace {

QList<QToolButton*> Buttons(SeveritySwitches const& switches)
{
    return switches.findChildren<QToolButton*>();
}

} // namespace

class tst_SeveritySwitches : public QObject
{
    Q_OBJECT

private slots:
    void shortCount_data();
    void shortCount();
    void countsKeepWidths();
    void countsKeepShortcuts();
    void toolTips_data();
    void toolTips();
    void least_data();
    void least();
    void oneSignal();
};

void tst_SeveritySwitches::shortCount_data()
{
    QTest::addColumn<quint64>("count");
    QTest::addColumn<QString>("text");
    const auto row = [](char const* text, quint64 count) {
        QTest::newRow(qPrintable(QString::number(count))) << count << QString(text);
    };
    row("0", 0);
    row("999", 999);
    row("1.0k", 1000);
    row("1.0k", 1099);
    row("1.1k", 1100);
    row("9.9k", 9999);
    row("10k", 10000);
    row("999k", 999999);
    row("1.0M", 1000000);
    row("9.9M", 9999999);
    row("10M", 10100000);
    row("999M", 999999999);
    row("1.0G", 1000000000);
    row("4.2G", Q_UINT64_C(4294967296));
    row("10T", Q_UINT64_C(10000000000000));
    row("9999T", Q_UINT64_C(9999000000000000));
}

void tst_SeveritySwitches::shortCount()
{
    QFETCH(quint64, count);
    QTEST(SeveritySwitches::ShortCount(static_cast<size_t>(count)), "text");
}

void tst_SeveritySwitches::countsKeepWidths()
{
    SeveritySwitches switches;
    const QSize before = switches.sizeHint();
    for (size_t count : {1u, 88u, 888u, 8888u, 88888u, 888888u, 8888888u, 888888888u}) {
        LogCounts counts;
        counts.fill(count);
        switches.SetCounts(counts);
        QCOMPARE(Buttons(switches).first()->text(), SeveritySwitches::ShortCount(count));
        QCOMPARE(switches.sizeHint(), before);
    }
}

void tst_SeveritySwitches::countsKeepShortcuts()
{
    SeveritySwitches switches;
    switches.SetCounts({1, 2, 3, 4, 5, 6});
    for (int i = 0; i < 6; ++i)
        QCOMPARE(Buttons(switches).at(i)->shortcut(), QKeySequence(QString("Ctrl+%1").arg(i + 1)));
}

void tst_SeveritySwitches::toolTips_data()
{
    QTest::addColumn<int>("severity");
    QTest::addColumn<quint64>("count");
    QTest::addColumn<QString>("toolTip");
    const auto row = [](char const* name, int severity, quint64 count, char const* toolTip) {
        QTest::newRow(name) << severity << count << QString(toolTip);
    };
    row("none", 0, 0, "Show or hide Trace entries (Ctrl+1): 0 in this file");
    row("one", 2, 1, "Show or hide Warning entries (Ctrl+3): 1 in this file");
    row("many", 3, 1234567, "Show or hide Error entries (Ctrl+4): 1,234,567 in this file");
    row("without a severity", 5, 2,
        "Show or hide lines without a severity (Ctrl+6): 2 in this file");
}

void tst_SeveritySwitches::toolTips()
{
    QFETCH(int, severity);
    QFETCH(quint64, count);
    QLocale::setDefault(QLocale(QLocale::English, QLocale::UnitedStates));
    SeveritySwitches switches;
    LogCounts counts{};
    counts[static_cast<size_t>(severity)] = static_cast<size_t>(count);
    switches.SetCounts(counts);
    QToolButton const* button = Buttons(switches).at(severity);
    QTEST(button->toolTip(), "toolTip");
    QVERIFY(button->toolTip().endsWith(button->accessibleDescription()));
}

void tst_SeveritySwitches::least_data()
{
    QTest::addColumn<QString>("shown"); // a digit for each button that is on
    QTest::addColumn<int>("least");
    const auto row = [](char const* shown, int least) {
        QTest::newRow(shown) << QString(shown) << least;
    };
    row("012345", 0);
    row("12345", 1);
    row("45", 4);
    row("5", 5);
    row("", 5);
    row("0", 5);
    row("01234", 5);
    row("1235", 5);
}

void tst_SeveritySwitches::least()
{
    QFETCH(QString, shown);
    SeveritySwitches switches;
    for (int i = 0; i <= LogEntry::None; ++i)
        switches.SetShown(static_cast<LogEntry::Severity>(i), shown.contains(QString::number(i)));
    QTEST(switches.least(), "least");
}

void tst_SeveritySwitches::oneSignal()
{
    SeveritySwitches switches;
    const QSignalSpy toggled(&switches, &SeveritySwitches::toggled);
    switches.ShowOnly(LogEntry::Error);
    QCOMPARE(toggled.count(), 1);
    QVERIFY(switches.Shows(LogEntry::Error));
    QVERIFY(!switches.Shows(LogEntry::Warning));
    QVERIFY(!switches.Shows(LogEntry::None));
    switches.SetLeast(LogEntry::Warning);
    QCOMPARE(toggled.count(), 2);
    QCOMPARE(switches.least(), int(LogEntry::Warning));
    switches.ShowAll();
    QCOMPARE(toggled.count(), 3);
    QCOMPARE(switches.least(), 0);
}

QTEST_MAIN(tst_SeveritySwitches)

#include "tst_SeveritySwitches.moc"
