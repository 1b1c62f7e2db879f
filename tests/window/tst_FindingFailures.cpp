// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Failures that somebody looks for, found with the keys that "Finding a failure" in docs/window.md
// names.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/PatternDialog.h"
#include "support/TestFiles.h"

#include <QComboBox>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

namespace {

QByteArray Line(QString const& day, int minute, char const* severity, QString const& message)
{
    return QString("2025-03-%1 08:%2:00.000 %3 %4\n")
        .arg(day)
        .arg(minute, 2, 10, QLatin1Char('0'))
        .arg(severity, message)
        .toLatin1();
}

// A run in which nothing is wrong.
QByteArray QuietRun(QString const& day)
{
    QByteArray text;
    for (int minute = 0; minute < 50; ++minute)
        text += Line(day, minute, "Trace", QString("Page %1 laid out").arg(minute));
    return text;
}

QString Text(MainWindow& window, int row)
{
    return Panel(window)->model()->index(row, LogModel::MessageColumn).data().toString();
}

QString Current(MainWindow& window)
{
    return Text(window, View(window)->currentIndex().row());
}

QStringList Texts(MainWindow& window)
{
    QStringList texts;
    for (int row = 0; row < Rows(window); ++row)
        texts.append(Text(window, row));
    return texts;
}

} // namespace

class tst_FindingFailures : public WindowTestCase
{
    Q_OBJECT

private slots:
    void crashTwoRunsAgo();
    void crashWithoutAWord();
    void programsThatQuarrel();
    void warningsThatGrow();
};

void tst_FindingFailures::crashTwoRunsAgo()
{
    const WindowTest test;
    TestFiles::write(test.logFile() + ".2", QuietRun("01") +
                                                Line("01", 51, "Warning", "Little ink") +
                                                Line("01", 52, "Trace", "Page 50 laid out") +
                                                Line("01", 55, "Fatal", "Out of ink"));
    TestFiles::write(test.logFile() + ".1", QuietRun("02"));
    TestFiles::write(test.logFile(), QuietRun("03"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 50, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 156, Patience); // with three headings
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Current(*window), QString("Out of ink"), Patience);
    QTest::keyClick(View(*window), Qt::Key_Up); // what led to it
    QCOMPARE(Current(*window), QString("Page 50 laid out"));
}

// No problem was logged, so only the runs lead to it.
void tst_FindingFailures::crashWithoutAWord()
{
    const WindowTest test;
    TestFiles::write(test.logFile() + ".2", QuietRun("01") +
                                                Line("01", 52, "Trace", "Page 50 laid out") +
                                                Line("01", 55, "Trace", "Opening page 51"));
    TestFiles::write(test.logFile() + ".1", QuietRun("02"));
    TestFiles::write(test.logFile(), QuietRun("03"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 50, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 155, Patience); // with three headings
    LogView* view = View(*window);
    view->setFocus();
    for (char const* day : {"2025-03-03", "2025-03-02", "2025-03-01"}) {
        QTest::keyClick(view, Qt::Key_Left);
        const QString heading =
            view->currentIndex().sibling(view->currentIndex().row(), 0).data().toString();
        QVERIFY2(heading.contains(day), qPrintable(heading));
        if (day != QByteArray("2025-03-01"))
            QTest::keyClick(view, Qt::Key_Up);
    }
    QTest::keyClick(view, Qt::Key_Right);
    QCOMPARE(Current(*window), QString("Opening page 51"));
    QTest::keyClick(view, Qt::Key_Up);
    QCOMPARE(Current(*window), QString("Page 50 laid out"));
}

void tst_FindingFailures::programsThatQuarrel()
{
    const WindowTest test;
    QByteArray reader;
    QByteArray editor;
    for (int minute = 0; minute < 6; ++minute) {
        editor += Line("03", 2 * minute, "Trace", "Saved notes.txt");
        reader += Line("03", 2 * minute + 1, "Warning", "Restored notes.txt");
        reader += Line("03", 2 * minute + 1, "Trace", "Idle");
    }
    TestFiles::write(test.logFile(), QuietRun("03"));
    TestFiles::write(test.folder() + "Editor/logs/editor.log", editor);
    TestFiles::write(test.folder() + "Reader/logs/reader.log", reader);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 50, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::AltModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 68, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "notes.txt");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 12, Patience);
    QStringList quarrel;
    for (int i = 0; i < 6; ++i)
        quarrel << "Saved notes.txt"
                << "Restored notes.txt";
    QCOMPARE(Texts(*window), quarrel);
    const auto program = [&](int row) {
        return Panel(*window)->model()->index(row, LogModel::ProgramColumn).data().toString();
    };
    QVERIFY(program(0).contains("editor", Qt::CaseInsensitive));
    QVERIFY(program(1).contains("reader", Qt::CaseInsensitive));
}

void tst_FindingFailures::warningsThatGrow()
{
    const WindowTest test;
    QByteArray log = QuietRun("03");
    for (int hour = 0; hour < 40; ++hour) {
        log += Line("04", hour, "Trace", "Request answered");
        for (int i = 0; i < hour / 8; ++i)
            log += Line("04", hour, "Warning", QString("Disk %1 answers slowly").arg(hour + i));
    }
    TestFiles::write(test.logFile(), log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 170, Patience);
    QString listed;
    WindowTest::whenShown<PatternDialog>([&](PatternDialog* dialog) {
        auto* list = Child<QTreeView>(dialog, "Message patterns");
        QTRY_COMPARE_WITH_TIMEOUT(list->model()->rowCount(), 3, Patience);
        for (int column = 0; column < list->model()->columnCount(); ++column)
            listed += list->model()->index(0, column).data().toString() + '|';
        QTest::keyClick(list, Qt::Key_Home);
        QTest::keyClick(list, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY2(listed.contains("Disk # answers slowly") && listed.contains("80"), qPrintable(listed));
    QCOMPARE(Current(*window), QString("Disk 8 answers slowly")); // the earliest
}

QTEST_MAIN(tst_FindingFailures)
#include "tst_FindingFailures.moc"
