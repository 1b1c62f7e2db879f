// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The bars of entries by time, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/ActivityStrip.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QHelpEvent>
#include <QLabel>
#include <QLineEdit>
#include <QTextDocument>
#include <QToolButton>
#include <QToolTip>
#include <QWheelEvent>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

// A thousand entries, one a second; an error in the middle of each half.
QByteArray Log(int count = 1000)
{
    QByteArray text;
    for (int i = 0; i < count; ++i) {
        char const* severity = i == 250 || i == 750 ? "Error" : "Trace";
        text += entry(QTime(9, 0).addSecs(i).toString("HH:mm:ss.zzz"), severity,
                      QString("line %1").arg(i));
    }
    return text;
}

ActivityStrip* Strip(MainWindow& window)
{
    return Panel(window)->findChild<ActivityStrip*>();
}

size_t Entries(MainWindow& window)
{
    size_t sum = 0;
    for (Activity::Bar const& bar : Strip(window)->activity().bars)
        sum += bar.entries();
    return sum;
}

qint64 Span(MainWindow& window)
{
    return Strip(window)->activity().to - Strip(window)->activity().from;
}

void Toggle(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_A, Qt::ControlModifier | Qt::AltModifier);
}

std::unique_ptr<MainWindow> ShowWith(int entries)
{
    auto window = WindowTest::show();
    Toggle(*window);
    [&] {
        QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(entries), Patience);
    }();
    return window;
}

int BarCount(MainWindow& window)
{
    return static_cast<int>(Strip(window)->activity().bars.size());
}

QPoint CenterOf(MainWindow& window, int bar)
{
    return Strip(window)->BarRect(bar).center();
}

// The bars in which a severity has its color.
QVector<int> BarsWith(MainWindow& window, LogEntry::Severity severity)
{
    const QColor color = SeverityIcons::Color(severity, window.palette());
    const QImage image = Strip(window)->grab().toImage();
    const double scale = image.devicePixelRatio();
    QVector<int> bars;
    for (int bar = 0; bar < BarCount(window); ++bar) {
        const QRect rect = Strip(window)->BarRect(bar);
        if (image.pixelColor(qRound(rect.center().x() * scale), qRound(rect.bottom() * scale)) ==
            color)
            bars.append(bar);
    }
    return bars;
}

template <class Widget>
Widget* Find(QWidget* parent, char const* name)
{
    const QList<Widget*> all = parent->findChildren<Widget*>();
    for (Widget* widget : all) {
        if (widget->accessibleName() == name)
            return widget;
    }
    return nullptr;
}

QLabel* SpanText(MainWindow& window)
{
    return Find<QLabel>(Panel(window), "Times shown");
}

QToolButton* RemoveSpan(MainWindow& window)
{
    return Find<QToolButton>(Panel(window), "Show all times");
}

void TypeTime(MainWindow& window, char const* field, char const* text)
{
    Find<QToolButton>(Panel(window), "More filters")->setChecked(true);
    auto* edit = Find<QLineEdit>(Panel(window), field);
    edit->setFocus();
    QTest::keyClick(edit, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(edit, Qt::Key_Delete);
    QTest::keyClicks(edit, text);
}

void Drag(MainWindow& window, int from, int to)
{
    QTest::mousePress(Strip(window), Qt::LeftButton, Qt::NoModifier, CenterOf(window, from));
    // A real move has its button, which QTest::mouseMove() lacks.
    const QPoint end = CenterOf(window, to);
    QMouseEvent move(QEvent::MouseMove, end, Strip(window)->mapToGlobal(end), Qt::LeftButton,
                     Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(Strip(window), &move);
    QTest::mouseRelease(Strip(window), Qt::LeftButton, Qt::NoModifier, end);
}

void Turn(MainWindow& window, int steps)
{
    const QPoint place = CenterOf(window, BarCount(window) / 2);
    const QPoint global = Strip(window)->mapToGlobal(place);
    QCursor::setPos(global);
    const QPoint angle(0, 120 * steps);
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    QWheelEvent turn(place, global, QPoint(), angle, angle.y(), Qt::Vertical, Qt::NoButton,
                     Qt::NoModifier);
#else
    QWheelEvent turn(place, global, QPoint(), angle, Qt::NoButton, Qt::NoModifier,
                     Qt::NoScrollPhase, false);
#endif
    QCoreApplication::sendEvent(Strip(window), &turn);
}

} // namespace

class tst_ActivityInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void bars();
    void clickGoesThere();
    void draggingFilters();
    void spanFollowsTheLog();
    void spanByKeys();
    void spanTyped();
    void wheelZooms();
    void keys();
    void keysMoveOn();
    void followsTheFilter();
    void followsTheLog();
    void otherFile();
    void withoutTimes_data();
    void withoutTimes();
    void toolTip();
    void panes();
    void kept();
};

// Of all times, with the problems where they are, light and dark.
void tst_ActivityInWindow::bars()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1000, Patience);
    QVERIFY(!Strip(*window)->isVisible());
    Toggle(*window);
    QVERIFY(Strip(*window)->isVisible());
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(1000), Patience);
    QCOMPARE(Span(*window), qint64(999001));
    const int bars = BarCount(*window);
    QVERIFY(bars > 100);
    const QVector<int> wanted{bars / 4, bars * 3 / 4};
    for (const bool isDark : {false, true}) {
        QPalette palette = window->palette();
        if (isDark)
            palette.setColor(QPalette::Base, QColor(0x1e, 0x1f, 0x22));
        window->setPalette(palette);
        const QVector<int> found = BarsWith(*window, LogEntry::Error);
        QCOMPARE(found.size(), 2);
        for (int i = 0; i < 2; ++i)
            QVERIFY(qAbs(found.at(i) - wanted.at(i)) <= 1);
    }
    QVERIFY(Strip(*window)->accessibleDescription().endsWith(": 1,000 entries, 2 problems") ||
            Strip(*window)->accessibleDescription().endsWith(": 1000 entries, 2 problems"));
    Toggle(*window);
    QVERIFY(!Strip(*window)->isVisible());
}

void tst_ActivityInWindow::clickGoesThere()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    const int bar = BarCount(*window) / 2;
    QTest::mouseClick(Strip(*window), Qt::LeftButton, Qt::NoModifier, CenterOf(*window, bar));
    const int row = View(*window)->currentIndex().row();
    QVERIFY2(qAbs(row - 500) <= 1000 / BarCount(*window) + 1, qPrintable(QString::number(row)));
    QVERIFY(View(*window)->hasFocus());
    QTest::mouseClick(Strip(*window), Qt::LeftButton, Qt::NoModifier, CenterOf(*window, 0));
    QCOMPARE(View(*window)->currentIndex().row(), 0);
    QTest::mouseClick(Strip(*window), Qt::RightButton, Qt::NoModifier, CenterOf(*window, bar));
    QCOMPARE(View(*window)->currentIndex().row(), 0);
}

// The second quarter of the log; the button beside the times shows all again.
void tst_ActivityInWindow::draggingFilters()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    Drag(*window, BarCount(*window) / 2, BarCount(*window) / 4);
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) < 300, Patience);
    QVERIFY(Rows(*window) > 200);
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(Rows(*window)), Patience);
    QVERIFY2(SpanText(*window)->text().startsWith("Only from 2025-03-03 09:04:"),
             qPrintable(SpanText(*window)->text()));
    QVERIFY(SpanText(*window)->isVisible());
    QTest::mouseClick(RemoveSpan(*window), Qt::LeftButton);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1000, Patience);
    QVERIFY(!SpanText(*window)->isVisible());
    QVERIFY(View(*window)->hasFocus());
}

// New entries in the span appear, later ones do not.
void tst_ActivityInWindow::spanFollowsTheLog()
{
    const WindowTest test(Log(400));
    const auto window = ShowWith(400);
    TypeTime(*window, "From", "2025-03-03 09:05:00");
    TypeTime(*window, "Until", "2025-03-03 09:08:19");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), Log(450)));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 150, Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), Log(1000)));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "line 31");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 10, Patience); // not line 31
}

void tst_ActivityInWindow::spanByKeys()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    ActivityStrip* strip = Strip(*window);
    strip->setFocus();
    const qint64 until = strip->activity().TimeOf(3) - strip->activity().from;
    QTest::keyClick(strip, Qt::Key_Home);
    QTest::keyClick(strip, Qt::Key_Right, Qt::ShiftModifier);
    QTest::keyClick(strip, Qt::Key_Right, Qt::ShiftModifier);
    QVERIFY(Status(*window).startsWith("2025-03-03 09:00:00 to 2025-03-03 09:00:"));
    QTest::keyClick(strip, Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), static_cast<int>((until + 999) / 1000), Patience);
    QTest::keyClick(strip, Qt::Key_Escape);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1000, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(1000), Patience);
    QTest::keyClick(strip, Qt::Key_Escape);
    QVERIFY(View(*window)->hasFocus());
}

// What is no time is told, and filters nothing.
void tst_ActivityInWindow::spanTyped()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    TypeTime(*window, "Until", "2025-03-03 09:01");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 61, Patience);
    QCOMPARE(SpanText(*window)->text(), QString("Only until 2025-03-03 09:01:00"));
    TypeTime(*window, "Until", "tea");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1000, Patience);
    const auto* error = Find<QLabel>(Panel(*window), "Filter error");
    QCOMPARE(error->text(), QString("Not a time, which is not filtered: tea"));
    TypeTime(*window, "Until", "");
    QTRY_VERIFY_WITH_TIMEOUT(!error->isVisible(), Patience);
}

void tst_ActivityInWindow::wheelZooms()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    Turn(*window, 1);
    QTRY_VERIFY_WITH_TIMEOUT(qAbs(Span(*window) - 749251) <= 2, Patience);
    QVERIFY(Entries(*window) > 700 && Entries(*window) < 800);
    Turn(*window, 200); // at least a millisecond a bar
    QTRY_COMPARE_WITH_TIMEOUT(Span(*window), qint64(BarCount(*window)), Patience);
    Turn(*window, -200); // no more than there is
    QTRY_COMPARE_WITH_TIMEOUT(Span(*window), qint64(999001), Patience);
    QCOMPARE(Entries(*window), size_t(1000));
}

void tst_ActivityInWindow::keys()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    ActivityStrip* strip = Strip(*window);
    strip->setFocus();
    QTest::keyClick(strip, Qt::Key_End);
    QTest::keyClick(strip, Qt::Key_Left);
    QTest::keyClick(strip, Qt::Key_Return);
    QVERIFY(View(*window)->currentIndex().row() > 980);
    QTest::keyClick(strip, Qt::Key_Home);
    QVERIFY(Status(*window).startsWith("2025-03-03 09:00:00"));
    QTest::keyClick(strip, Qt::Key_Return);
    QCOMPARE(View(*window)->currentIndex().row(), 0);
    QTest::keyClick(strip, Qt::Key_Right);
    QVERIFY(Status(*window).startsWith("2025-03-03 09:00:0"));
    QTest::keyClick(strip, Qt::Key_Plus);
    QTRY_VERIFY_WITH_TIMEOUT(Span(*window) < 900000, Patience);
    QTest::keyClick(strip, Qt::Key_Minus);
    QTRY_COMPARE_WITH_TIMEOUT(Span(*window), qint64(999001), Patience);
    QTest::keyClick(strip, Qt::Key_Plus);
    QTRY_VERIFY_WITH_TIMEOUT(Span(*window) < 900000, Patience);
    QTest::keyClick(strip, Qt::Key_Escape);
    QTRY_COMPARE_WITH_TIMEOUT(Span(*window), qint64(999001), Patience);
    QTest::keyClick(strip, Qt::Key_Escape);
    QVERIFY(View(*window)->hasFocus());
}

// From the last bar shown to later times, up to the end.
void tst_ActivityInWindow::keysMoveOn()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    ActivityStrip* strip = Strip(*window);
    Turn(*window, 4);
    QTRY_VERIFY_WITH_TIMEOUT(Span(*window) < 400000, Patience);
    strip->setFocus();
    for (int i = 0; i < 10; ++i) {
        const qint64 from = strip->activity().from;
        const qint64 end = strip->activity().last + 1;
        if (strip->activity().to == end)
            break;
        QTest::keyClick(strip, Qt::Key_End);
        QTest::keyClick(strip, Qt::Key_Right);
        QTRY_VERIFY_WITH_TIMEOUT(strip->activity().from > from, Patience);
    }
    QCOMPARE(strip->activity().to, strip->activity().last + 1);
    const qint64 from = strip->activity().from;
    QTest::keyClick(strip, Qt::Key_Home);
    QTest::keyClick(strip, Qt::Key_Left);
    QTRY_VERIFY_WITH_TIMEOUT(strip->activity().from < from, Patience);
}

void tst_ActivityInWindow::followsTheFilter()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "line 25");
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(11), Patience); // 25, 250 to 259
    QCOMPARE(Strip(*window)->activity().bars.front().entries(), size_t(1));
}

void tst_ActivityInWindow::followsTheLog()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    QVERIFY(TestFiles::writeOver(test.logFile(), Log(1200)));
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(1200), Patience);
    QCOMPARE(Span(*window), qint64(1199001));
}

// All of its times, whatever was zoomed.
void tst_ActivityInWindow::otherFile()
{
    const WindowTest test(Log());
    QVERIFY(TestFiles::write(test.logFile() + ".1", Log(500)));
    const auto window = ShowWith(1000);
    Turn(*window, 3);
    QTRY_VERIFY_WITH_TIMEOUT(Span(*window) < 500000, Patience);
    Panel(*window)->Open(test.logFile() + ".1", false);
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(500), Patience);
}

void tst_ActivityInWindow::withoutTimes_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<QString>("text");

    QTest::newRow("no times") << QByteArray("one\ntwo\n") << "No times";
    QTest::newRow("no dates") << QByteArray("[    0.000000] a\n[    1.500000] b\n")
                              << "The times in this log have no dates";
    QTest::newRow("no lines") << QByteArray() << "No times";
}

void tst_ActivityInWindow::withoutTimes()
{
    QFETCH(QByteArray, log);
    QFETCH(QString, text);
    const WindowTest test;
    QVERIFY(TestFiles::write(test.folder() + "other.log", log));
    const auto window = WindowTest::show();
    window->OpenFile(test.folder() + "other.log");
    Toggle(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Strip(*window)->accessibleDescription(), text, Patience);
    Strip(*window)->setFocus();
    QTest::keyClick(Strip(*window), Qt::Key_Plus);
    QTest::mouseClick(Strip(*window), Qt::LeftButton, Qt::NoModifier, QPoint(20, 20));
    Turn(*window, 1);
    QCOMPARE(Strip(*window)->accessibleDescription(), text);
}

void tst_ActivityInWindow::toolTip()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    const QPoint place = CenterOf(*window, 0);
    QHelpEvent help(QEvent::ToolTip, place, Strip(*window)->mapToGlobal(place));
    QCoreApplication::sendEvent(Strip(*window), &help);
    QTextDocument shown;
    shown.setHtml(QToolTip::text());
    const QString text = shown.toPlainText();
    QVERIFY2(text.startsWith("2025-03-03 09:00:00") && text.endsWith(" entries, 0 problems"),
             qPrintable(text));
}

void tst_ActivityInWindow::panes()
{
    const WindowTest test(Log());
    const auto window = ShowWith(1000);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_F6);
    QVERIFY(Strip(*window)->hasFocus());
    QTest::keyClick(window.get(), Qt::Key_F6);
    QVERIFY(View(*window)->hasFocus());
    Toggle(*window);
    QTest::keyClick(window.get(), Qt::Key_F6, Qt::ShiftModifier);
    QVERIFY(!Strip(*window)->hasFocus());
}

void tst_ActivityInWindow::kept()
{
    const WindowTest test(Log());
    {
        const auto window = ShowWith(1000);
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(Strip(*window)->isVisible());
    QVERIFY(Action(*window, "Activity")->isChecked());
    QTRY_COMPARE_WITH_TIMEOUT(Entries(*window), size_t(1000), Patience);
}

QTEST_MAIN(tst_ActivityInWindow)
#include "tst_ActivityInWindow.moc"
