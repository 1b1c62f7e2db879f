// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The list of message patterns, driven with keys on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/PatternDialog.h"
#include "support/TestFiles.h"

#include <QLabel>
#include <QPushButton>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

// Three warnings, two errors, and one of a kind.
QByteArray Mixed()
{
    return entry("09:00:01.000", "Trace", "Started \"a.txt\"") +
           entry("09:00:02.000", "Warning", "Page 1 of 'b' (retry)") +
           entry("09:00:03.000", "Error", "No answer from 10.0.0.1") + "  at main.cpp:1\n" +
           entry("09:00:04.000", "Warning", "Page 22 of 'c d' (retry)") +
           entry("09:00:05.000", "Error", "No answer from 10.0.0.77") +
           entry("09:00:06.000", "Warning", "Page 3 of 'e' (retry)");
}

QTreeView* List(QDialog* dialog)
{
    return Child<QTreeView>(dialog, "Message patterns");
}

QString State(QDialog* dialog)
{
    return Child<QLabel>(dialog, "What has been counted")->text();
}

QStringList Listed(QTreeView const* list)
{
    QStringList rows;
    for (int row = 0; row < list->model()->rowCount(); ++row) {
        QStringList cells;
        for (int column = 0; column < list->model()->columnCount(); ++column)
            cells.append(list->model()->index(row, column).data().toString());
        rows.append(cells.join('|'));
    }
    return rows;
}

bool IsCounted(QDialog* dialog)
{
    return State(dialog).endsWith("entries");
}

void WaitUntilCounted(QDialog* dialog)
{
    QTRY_VERIFY_WITH_TIMEOUT(IsCounted(dialog), Patience);
}

void Press(QDialog* dialog, QString const& text)
{
    const QList<QPushButton*> buttons = dialog->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (button->text() == text) {
            Click(button);
            return;
        }
    }
    QFAIL(qPrintable("no button " + text));
}

// Opens the list and does something there.
void InPatterns(MainWindow& window, std::function<void(PatternDialog*)> const& work)
{
    bool isShown = false;
    WindowTest::whenShown<PatternDialog>([&](PatternDialog* dialog) {
        isShown = true;
        WaitUntilCounted(dialog);
        if (!QTest::currentTestFailed())
            work(dialog);
    });
    QTest::keyClick(&window, Qt::Key_P, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY(isShown);
    QVERIFY(WindowTest::activate(&window)); // no window manager does it
}

QString Current(MainWindow& window)
{
    const int row = View(window)->currentIndex().row();
    return View(window)->model()->index(row, LogModel::MessageColumn).data().toString();
}

} // namespace

class tst_PatternsInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void list();
    void order();
    void goToEntries();
    void filterByPattern_data();
    void filterByPattern();
    void onlyWhatIsShown();
    void allFiles();
    void withoutDates();
    void linesWrittenOver();
    void stop();
    void closedWhileCounting();
    void emptyLog();
};

void tst_PatternsInWindow::list()
{
    const WindowTest test(Mixed());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    QStringList rows;
    InPatterns(*window, [&](QDialog* dialog) {
        rows = Listed(List(dialog));
        QCOMPARE(State(dialog), QString("3 patterns in 6 entries"));
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    const QString day = "2025-03-03 09:00:0";
    QCOMPARE(rows,
             QStringList({"3|Warning|" + day + "2.000|" + day + "6.000|Page # of '\u2026' (retry)",
                          "2|Error|" + day + "3.000|" + day + "5.000|No answer from #",
                          "1|Trace|" + day + "1.000|" + day + "1.000|Started \"\u2026\""}));
}

void tst_PatternsInWindow::order()
{
    const WindowTest test(Mixed());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    InPatterns(*window, [&](QDialog* dialog) {
        QTreeView* list = List(dialog);
        const auto counts = [list] {
            QString text;
            for (int row = 0; row < list->model()->rowCount(); ++row)
                text += list->model()->index(row, 0).data().toString();
            return text;
        };
        QStringList orders;
        for (int column = 0; column < list->model()->columnCount(); ++column) {
            list->sortByColumn(column, Qt::AscendingOrder);
            orders.append(counts());
        }
        QCOMPARE(orders, QStringList({"123", "132", "132", "123", "231"}));
        QCOMPARE(list->currentIndex().row(), 1); // the first one before, now by its text
        list->sortByColumn(0, Qt::DescendingOrder);
        QCOMPARE(counts(), QString("321"));
        QCOMPARE(list->currentIndex().row(), 0);
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
}

void tst_PatternsInWindow::goToEntries()
{
    const WindowTest test(Mixed());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    InPatterns(*window, [](QDialog* dialog) {
        QTest::keyClick(List(dialog), Qt::Key_Down);
        QTest::keyClick(List(dialog), Qt::Key_Return);
    });
    QCOMPARE(Current(*window), QString("No answer from 10.0.0.1"));
    InPatterns(*window, [](QDialog* dialog) { Press(dialog, "Go to &Last"); });
    QCOMPARE(Current(*window), QString("Page 3 of 'e' (retry)"));
    InPatterns(*window, [](QDialog* dialog) { QTest::keyClick(dialog, Qt::Key_Escape); });
    QCOMPARE(Current(*window), QString("Page 3 of 'e' (retry)"));
}

void tst_PatternsInWindow::filterByPattern_data()
{
    QTest::addColumn<int>("pattern");
    QTest::addColumn<int>("rows");
    QTest::newRow("special characters") << 0 << 3;
    QTest::newRow("entry of several lines") << 1 << 3;
    QTest::newRow("quoted name") << 2 << 1;
}

void tst_PatternsInWindow::filterByPattern()
{
    QFETCH(int, pattern);
    QFETCH(int, rows);
    const WindowTest test(Mixed() +
                          entry("09:00:07.000", "Trace", "Started \"z\", not like the others") +
                          entry("09:00:08.000", "Trace", "No answer from 10.0.0.2 again"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 9, Patience);
    InPatterns(*window, [pattern](QDialog* dialog) {
        for (int i = 0; i < pattern; ++i)
            QTest::keyClick(List(dialog), Qt::Key_Down);
        Press(dialog, "F&ilter");
    });
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), rows, Patience);
}

void tst_PatternsInWindow::onlyWhatIsShown()
{
    const WindowTest test(Mixed());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "10.0.0.77");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QStringList rows;
    InPatterns(*window, [&](QDialog* dialog) {
        rows = Listed(List(dialog));
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QCOMPARE(rows.size(), 1);
    QVERIFY(rows[0].startsWith("1|Error|"));
}

void tst_PatternsInWindow::allFiles()
{
    const WindowTest test(entry("09:00:01.000", "Error", "Page 3"));
    TestFiles::write(test.logFile() + ".1", "2025-03-01 10:00:00.000 Error Page 1\n"
                                            "2025-03-02 10:00:00.000 Error Page 2\n");
    const auto window = WindowTest::show();
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) >= 5, Patience); // with headings
    QStringList rows;
    InPatterns(*window, [&](QDialog* dialog) {
        rows = Listed(List(dialog));
        QTest::keyClick(List(dialog), Qt::Key_Return);
    });
    QCOMPARE(rows, QStringList({"3|Error|2025-03-01 10:00:00.000|2025-03-03 09:00:01.000|Page #"}));
    QCOMPARE(Current(*window), QString("Page 1"));
}

void tst_PatternsInWindow::withoutDates()
{
    const WindowTest test("");
    const QString path = test.folder() + "other.log";
    TestFiles::write(path, "[23:59:58] [error] page 1\n[23:59:59] [error] page 2\n"
                           "[00:00:01] [error] page 3\n");
    const auto window = WindowTest::show({path});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QStringList rows;
    InPatterns(*window, [&](QDialog* dialog) {
        rows = Listed(List(dialog));
        Press(dialog, "Go to &Last");
    });
    QCOMPARE(rows, QStringList({"3|Error|23:59:58.000|00:00:01.000|page #"}));
    QCOMPARE(Current(*window), QString("page 3"));
}

void tst_PatternsInWindow::linesWrittenOver()
{
    const WindowTest test("");
    const QString path = test.folder() + "other.log";
    const QByteArray first = "2025-03-03 09:00:01 [error] page 1\n";
    TestFiles::write(path, first + "2025-03-03 09:00:02 [error] page 2\n");
    const auto window = WindowTest::show({path});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    Panel(*window)->SetPaused(true);
    TestFiles::writeOver(path, first + "2025-03-03 09:00:02 [error] text a\n");
    QStringList rows;
    InPatterns(*window, [&](QDialog* dialog) {
        rows = Listed(List(dialog));
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QCOMPARE(rows.size(), 1);
    QVERIFY(rows[0].startsWith("1|"));
    QVERIFY(rows[0].endsWith("|page #"));
}

// Without a thread's luck: the counter is stopped before it has looked at a row.
void tst_PatternsInWindow::stop()
{
    const WindowTest test(Mixed());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    LogModel const* model = Panel(*window)->model();
    PatternCounter counter(model->source(), model->parser(), model->state().rows);
    std::shared_ptr<CountedPatterns const> result;
    connect(&counter, &PatternCounter::counted, &counter,
            [&](std::shared_ptr<CountedPatterns const> const& counted) { result = counted; });
    counter.Count();
    QVERIFY(result->isComplete);
    counter.Stop();
    counter.Count();
    QVERIFY(!result->isComplete);
    QCOMPARE(result->rows, size_t(0));
}

void tst_PatternsInWindow::closedWhileCounting()
{
    const WindowTest test(DemoLog::run(50000, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 50000, Patience);
    bool isShown = false;
    WindowTest::whenShown<PatternDialog>([&](PatternDialog* dialog) {
        isShown = true;
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY(isShown);
}

void tst_PatternsInWindow::emptyLog()
{
    const WindowTest test("");
    const auto window = WindowTest::show();
    InPatterns(*window, [](QDialog* dialog) {
        QCOMPARE(State(dialog), QString("0 patterns in 0 entries"));
        QTest::keyClick(List(dialog), Qt::Key_Return);
        QVERIFY(dialog->isVisible());
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
}

QTEST_MAIN(tst_PatternsInWindow)

#include "tst_PatternsInWindow.moc"
