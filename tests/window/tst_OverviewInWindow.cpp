// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The strip of problems, lines found and marks beside the scroll bar, driven with the mouse on a
// real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LogOverview.h"
#include "app/window/log/LogView.h"
#include "app/window/log/TickColors.h"
#include "app/window/widgets/SeverityIcons.h"
#include "support/TestFiles.h"
#include "support/WheelTurn.h"

#include <QHelpEvent>
#include <QLineEdit>
#include <QScrollBar>
#include <QTextDocument>
#include <QToolTip>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

using Problems = QMap<int, char const*>;

// Entries without problems but for these.
QByteArray Log(int count, Problems const& problems, char const* what = "line")
{
    QByteArray text;
    for (int row = 0; row < count; ++row) {
        const QTime time = QTime(9, 0).addMSecs(row * 10);
        text += entry(time.toString("HH:mm:ss.zzz"), problems.value(row, "Trace"),
                      QString("%1 %2").arg(what).arg(row));
    }
    return text;
}

LogOverview* Overview(MainWindow& window)
{
    return Child<LogOverview>(&window, "Overview");
}

// Where ticks of a color are, as permilles of the strip, from the top.
QVector<int> Ticks(MainWindow& window, QColor const& color)
{
    const QImage image = Overview(window)->grab().toImage();
    const QColor ground = window.palette().color(QPalette::Base);
    int top = 0;
    while (top < image.height() && image.pixelColor(0, top) != ground)
        ++top;
    int bottom = image.height() - 1;
    while (bottom > top && image.pixelColor(0, bottom) != ground)
        --bottom;
    QVector<int> ticks;
    bool isInTick = false;
    for (int y = top; y <= bottom; ++y) {
        bool hasColor = false;
        for (int x = 0; x < image.width(); ++x)
            hasColor = hasColor || image.pixelColor(x, y) == color;
        if (hasColor && !isInTick)
            ticks.append((y - top) * 1000 / (bottom - top));
        isInTick = hasColor;
    }
    return ticks;
}

QVector<int> Ticks(MainWindow& window, LogEntry::Severity severity)
{
    return Ticks(window, SeverityIcons::Color(severity, window.palette()));
}

QVector<int> FoundTicks(MainWindow& window)
{
    return Ticks(window, TickColors::Found(window.palette()));
}

QVector<int> MarkTicks(MainWindow& window)
{
    return Ticks(window, TickColors::Marked(window.palette()));
}

// Whether ticks are where they should be, give or take three pixels.
bool AreAt(QVector<int> const& ticks, QVector<int> const& wanted)
{
    return ticks.size() == wanted.size() &&
           std::equal(ticks.begin(), ticks.end(), wanted.begin(),
                      [](int tick, int at) { return qAbs(tick - at) <= 15; });
}

// The place of a row in the strip, which is as high as the groove of the scroll bar.
QPoint PlaceOf(MainWindow& window, int row, int x)
{
    const double ratio = double(row) / Rows(window);
    const QImage image = Overview(window)->grab().toImage();
    const QColor ground = window.palette().color(QPalette::Base);
    int top = 0;
    while (image.pixelColor(0, top) != ground)
        ++top;
    int bottom = image.height() - 1;
    while (image.pixelColor(0, bottom) != ground)
        --bottom;
    const double scale = image.devicePixelRatio();
    return QPoint(x, qRound((top + ratio * (bottom - top)) / scale));
}

constexpr int ProblemLane = 3; // pixels from the left
constexpr int FoundLane = 7;
constexpr int MarkLane = 11;

void ClickAt(MainWindow& window, int row, int x)
{
    QTest::mouseClick(Overview(window), Qt::LeftButton, Qt::NoModifier, PlaceOf(window, row, x));
}

QString ToolTipAt(MainWindow& window, int row)
{
    QToolTip::hideText();
    const QPoint place = PlaceOf(window, row, ProblemLane);
    QHelpEvent help(QEvent::ToolTip, place, Overview(window)->mapToGlobal(place));
    QCoreApplication::sendEvent(Overview(window), &help);
    return QToolTip::text();
}

void Find(MainWindow& window, char const* text)
{
    QTest::keyClick(&window, Qt::Key_F, Qt::ControlModifier);
    auto* field = Child<QLineEdit>(&window, "Find text");
    field->selectAll();
    QTest::keyClicks(field, text);
}

} // namespace

class tst_OverviewInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void problems();
    void foundAndMarked();
    void clicks_data();
    void clicks();
    void headings();
    void toolTips();
    void newLines();
    void filter();
    void otherFile();
    void manyRows();
    void wheel();
    void allInView();
    void isAnnounced();
};

// Each with the color that it has in the table, the worst of several in one place, light and dark.
// Only at the top is it certain, on any screen and in any style, that rows share a place.
void tst_OverviewInWindow::problems()
{
    const WindowTest test(Log(4000, {{0, "Warning"},
                                     {1, "Error"},
                                     {2, "Notification"},
                                     {400, "Warning"},
                                     {1200, "Error"},
                                     {2000, "Fatal"},
                                     {3200, "Error"}}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4000, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {0, 300, 800}), Patience);
    QVERIFY(AreAt(Ticks(*window, LogEntry::Warning), {100}));
    QVERIFY(AreAt(Ticks(*window, LogEntry::Fatal), {500}));
    QVERIFY(FoundTicks(*window).isEmpty());
    QVERIFY(MarkTicks(*window).isEmpty());
    const QColor light = SeverityIcons::Color(LogEntry::Error, window->palette());
    QPalette dark = window->palette();
    dark.setColor(QPalette::Base, QColor(0x1e, 0x1f, 0x22));
    window->setPalette(dark);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {0, 300, 800}), Patience);
    QVERIFY(SeverityIcons::Color(LogEntry::Error, dark) != light);
}

void tst_OverviewInWindow::foundAndMarked()
{
    const WindowTest test(Log(2000, {}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2000, Patience);
    Find(*window, "line 500");
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(FoundTicks(*window), {250}), Patience);
    View(*window)->GoToRow(1500);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(MarkTicks(*window), {750}), Patience);
    QTest::keyClick(Child<QLineEdit>(window.get(), "Find text"), Qt::Key_Escape);
    QTRY_VERIFY_WITH_TIMEOUT(FoundTicks(*window).isEmpty(), Patience);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(MarkTicks(*window).isEmpty(), Patience);
}

void tst_OverviewInWindow::clicks_data()
{
    QTest::addColumn<int>("near");
    QTest::addColumn<int>("x");
    QTest::addColumn<int>("row");

    QTest::newRow("problem") << 20000 << ProblemLane << 20003;
    QTest::newRow("worst of several problems") << 40000 << ProblemLane << 40002;
    QTest::newRow("line found") << 60000 << FoundLane << 60005;
    QTest::newRow("mark") << 60000 << MarkLane << 60009;
    QTest::newRow("nearest of any lane") << 20000 << MarkLane << 20003;
    QTest::newRow("mark before a problem") << 80000 << FoundLane << 80004;
}

void tst_OverviewInWindow::clicks()
{
    QFETCH(int, near);
    QFETCH(int, x);
    QFETCH(int, row);
    const WindowTest test(Log(100000, {{20003, "Error"},
                                       {40001, "Warning"},
                                       {40002, "Fatal"},
                                       {40003, "Error"},
                                       {80003, "Error"}}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100000, Patience);
    for (const int marked : {60009, 80004}) {
        View(*window)->GoToRow(marked);
        QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    }
    Find(*window, "line 60005");
    QTRY_COMPARE_WITH_TIMEOUT(FoundTicks(*window).size(), 1, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 2, Patience);
    ClickAt(*window, near, x);
    QCOMPARE(View(*window)->currentIndex().row(), row);
    QVERIFY(View(*window)->hasFocus());
    const QRect cell = View(*window)->visualRect(View(*window)->currentIndex());
    QVERIFY(View(*window)->viewport()->rect().contains(cell.center()));
    // Where nothing is, the row in proportion.
    ClickAt(*window, 50000, x);
    QVERIFY(qAbs(View(*window)->currentIndex().row() - 50000) < 1000);
    QTest::mouseClick(Overview(*window), Qt::LeftButton, Qt::NoModifier, QPoint(x, 0));
    QCOMPARE(View(*window)->currentIndex().row(), 0);
    const int before = View(*window)->currentIndex().row();
    QTest::mouseClick(Overview(*window), Qt::RightButton, Qt::NoModifier,
                      PlaceOf(*window, near, x));
    QCOMPARE(View(*window)->currentIndex().row(), before);
}

// They cannot be current.
void tst_OverviewInWindow::headings()
{
    const WindowTest test(DemoLog::writtenOver(DemoLog::run(100, QTime(9, 0), "old", true),
                                               DemoLog::run(50, QTime(9, 0), "new")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 90, Patience);
    QVERIFY(View(*window)->model()->index(0, 0).data(LogModel::HeadingRole).toBool());
    QTest::mouseClick(Overview(*window), Qt::LeftButton, Qt::NoModifier, QPoint(MarkLane, 0));
    QCOMPARE(View(*window)->currentIndex().row(), 1);
}

void tst_OverviewInWindow::toolTips()
{
    const WindowTest test(Log(2000, {{600, "Error"}}, "<b>line</b>"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2000, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 1, Patience);
    QCOMPARE(ToolTipAt(*window, 1000), QString());
    QTextDocument shown;
    shown.setHtml(ToolTipAt(*window, 600));
    QCOMPARE(shown.toPlainText(), QString("Error: 2025-03-03 09:00:06.000 <b>line</b> 600"));
    View(*window)->GoToRow(600);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    Find(*window, "line</b> 600");
    QTRY_COMPARE_WITH_TIMEOUT(FoundTicks(*window).size(), 1, Patience);
    shown.setHtml(ToolTipAt(*window, 600));
    QCOMPARE(shown.toPlainText(), QString("Error: 2025-03-03 09:00:06.000 <b>line</b> 600\n"
                                          "Found: 2025-03-03 09:00:06.000 <b>line</b> 600\n"
                                          "Marked: 2025-03-03 09:00:06.000 <b>line</b> 600"));
}

void tst_OverviewInWindow::newLines()
{
    const Problems problems{{500, "Error"}, {1500, "Error"}};
    const WindowTest test(Log(1000, problems));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {500}), Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), Log(2000, problems)));
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {250, 750}), Patience);
    // What the newest run writes over is gone.
    QByteArray over;
    for (int second = 0; second < 800; ++second)
        over += entry(QTime(10, 0).addSecs(second).toString("HH:mm:ss.zzz"), "Trace", "new");
    QVERIFY(TestFiles::writeOver(test.logFile(), DemoLog::writtenOver(Log(2000, problems), over)));
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 1, Patience);
}

void tst_OverviewInWindow::filter()
{
    const WindowTest test(Log(2000, {{500, "Error"}, {1001, "Error"}, {1500, "Warning"}}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 2, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), ".000"); // every hundredth line
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {250}), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Warning), {750}), Patience);
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier); // no errors
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 0, Patience);
    QCOMPARE(Ticks(*window, LogEntry::Warning).size(), 1);
}

void tst_OverviewInWindow::otherFile()
{
    const WindowTest test(Log(2000, {{500, "Error"}}));
    QVERIFY(TestFiles::write(test.logFile() + ".1", Log(3000, {{1000, "Warning"}})));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).size(), 1, Patience);
    Panel(*window)->Open(test.logFile() + ".1", false);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Warning), {333}), Patience);
    QVERIFY(Ticks(*window, LogEntry::Error).isEmpty());
}

// They are looked at in several portions.
void tst_OverviewInWindow::manyRows()
{
    const WindowTest test(Log(250000, {{50000, "Error"}, {125000, "Warning"}, {200000, "Error"}}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 250000, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {200, 800}), Patience);
    QVERIFY(AreAt(Ticks(*window, LogEntry::Warning), {500}));
    // While a file is read, there are several refreshes; here there is only one each.
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier); // no errors
    QTRY_VERIFY_WITH_TIMEOUT(Ticks(*window, LogEntry::Error).isEmpty(), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Warning), {500}), Patience);
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {200, 800}), Patience);
}

void tst_OverviewInWindow::wheel()
{
    const WindowTest test(Log(2000, {}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2000, Patience);
    View(*window)->GoToRow(1000);
    const int before = View(*window)->verticalScrollBar()->value();
    TurnWheel(Overview(*window), -120);
    QVERIFY(View(*window)->verticalScrollBar()->value() > before);
}

// Without a scroll bar, the strip is as high as the lines.
void tst_OverviewInWindow::allInView()
{
    const WindowTest test(Log(2, {{1, "Error"}}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(AreAt(Ticks(*window, LogEntry::Error), {500}), Patience);
    ClickAt(*window, 1, ProblemLane);
    QCOMPARE(View(*window)->currentIndex().row(), 1);
}

void tst_OverviewInWindow::isAnnounced()
{
    const WindowTest test(Log(2, {}));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QVERIFY(!Overview(*window)->accessibleDescription().isEmpty());
    QCOMPARE(Overview(*window)->focusPolicy(), Qt::NoFocus); // there are keys for all it does
}

QTEST_MAIN(tst_OverviewInWindow)
#include "tst_OverviewInWindow.moc"
