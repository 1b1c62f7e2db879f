// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Marks and notes, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/MarksFile.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/NoteDialog.h"

#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QPlainTextEdit>
#include <QTreeWidget>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

QColor const MarkColor(0x8a, 0x2b, 0xe2);

QVector<int> Marked(MainWindow& window)
{
    QVector<int> rows;
    QAbstractItemModel const* model = View(window)->model();
    for (int row = 0; row < model->rowCount(); ++row) {
        if (model->index(row, 0).data(LogModel::MarkedRole).toBool())
            rows.append(row);
    }
    return rows;
}

QString Note(MainWindow& window)
{
    auto const* label = Child<QLabel>(&window, "Note on the current line");
    return label->isVisible() ? label->text() : QString();
}

void WriteNote(MainWindow& window, char const* note)
{
    WindowTest::whenShown<NoteDialog>([note](NoteDialog* dialog) {
        auto* field = dialog->findChild<QLineEdit*>();
        field->selectAll();
        QTest::keyClicks(field, note);
        QTest::keyClick(field, Qt::Key_Return);
    });
    QTest::keyClick(&window, Qt::Key_M, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(WindowTest::activate(&window)); // no window manager does it
}

void MarkRow(MainWindow& window, int row)
{
    View(window)->GoToRow(row);
    QTest::keyClick(&window, Qt::Key_M, Qt::ControlModifier);
}

} // namespace

class tst_MarksInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void marks();
    void nextAndPrevious();
    void list();
    void listIsLeft();
    void notes();
    void looks();
    void outliveTheSession();
    void moveWithTheirLines();
    void lineWrittenOver();
    void filteredOut();
    void nothingSelected();
    void contextMenu();
    void selectionInTheLineStays();
    void fileIsBounded();
    void twoWindows();
    void damagedFile();
    void hostileNotes();
    void encodings();
    void encodingIsKept();
};

void tst_MarksInWindow::marks()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    MarkRow(*window, 30);
    MarkRow(*window, 60);
    QCOMPARE(Marked(*window), QVector<int>({30, 60}));
    QCOMPARE(View(*window)->model()->index(30, 0).data(Qt::AccessibleTextRole).toString(),
             QString("Marked: 2025-03-03 09:00:30.000"));
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QCOMPARE(Marked(*window), QVector<int>({30}));
}

void tst_MarksInWindow::nextAndPrevious()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    QTest::keyClick(window.get(), Qt::Key_F2);
    QCOMPARE(Status(*window), QString("No marks in the lines shown"));
    for (int row : {60, 30, 90})
        MarkRow(*window, row);
    View(*window)->GoToRow(40);
    for (int row : {60, 90, 30, 60}) {
        QTest::keyClick(window.get(), Qt::Key_F2);
        QCOMPARE(View(*window)->currentIndex().row(), row);
        QCOMPARE(Status(*window), row == 30 ? QString("Continued from the top") : QString());
        QCOMPARE(View(*window)->selectionModel()->selectedRows().size(), 1);
    }
    for (int row : {30, 90}) {
        QTest::keyClick(window.get(), Qt::Key_F2, Qt::ShiftModifier);
        QCOMPARE(View(*window)->currentIndex().row(), row);
    }
    QCOMPARE(Status(*window), QString("Continued from the bottom"));
}

void tst_MarksInWindow::list()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    QTest::keyClick(window.get(), Qt::Key_F2, Qt::ControlModifier);
    QCOMPARE(Status(*window), QString("No marks in the lines shown"));
    for (int row : {60, 30, 90})
        MarkRow(*window, row);
    View(*window)->GoToRow(60);
    WriteNote(*window, "it began here");
    QStringList texts;
    WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
        auto* list = Child<QTreeWidget>(dialog, "Marked lines");
        for (int i = 0; i < list->topLevelItemCount(); ++i) {
            const QTreeWidgetItem* item = list->topLevelItem(i);
            texts.append(QStringList({item->text(0), item->text(1), item->text(2), item->text(3)})
                             .join('|'));
        }
        QCOMPARE(list->indexOfTopLevelItem(list->currentItem()), 1); // where the reader is
        QTest::keyClick(list, Qt::Key_Down);
        QTest::keyClick(list, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_F2, Qt::ControlModifier);
    QCOMPARE(texts, QStringList({"31|2025-03-03 09:00:30.000||x 30",
                                 "61|2025-03-03 09:01:00.000|it began here|x 60",
                                 "91|2025-03-03 09:01:30.000||x 90"}));
    QCOMPARE(View(*window)->currentIndex().row(), 90);
    QVERIFY(View(*window)->viewport()->rect().contains(
        View(*window)->visualRect(View(*window)->currentIndex()).center()));
}

void tst_MarksInWindow::listIsLeft()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    MarkRow(*window, 30);
    View(*window)->GoToRow(60);
    bool isShown = false;
    WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
        isShown = Child<QTreeWidget>(dialog, "Marked lines");
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_F2, Qt::ControlModifier);
    QVERIFY(isShown);
    QCOMPARE(View(*window)->currentIndex().row(), 60);
}

void tst_MarksInWindow::notes()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    View(*window)->GoToRow(30);
    WriteNote(*window, "it began here");
    QCOMPARE(Marked(*window), QVector<int>({30}));
    QCOMPARE(Note(*window), QString("Note: it began here"));
    QCOMPARE(View(*window)->model()->index(30, 0).data(Qt::ToolTipRole).toString(),
             QString("Note: it began here"));
    View(*window)->GoToRow(31);
    QCOMPARE(Note(*window), QString());
    View(*window)->GoToRow(30);
    WriteNote(*window, "or not");
    QCOMPARE(Note(*window), QString("Note: or not"));
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QCOMPARE(Note(*window), QString());
    QVERIFY(Marked(*window).isEmpty());
}

// In the table and beside the scroll bar.
void tst_MarksInWindow::looks()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    const auto pixels = [](QWidget* widget) {
        return Pixels(widget, MarkColor);
    };
    LogView* view = View(*window);
    auto* overview = Child<QWidget>(window.get(), "Overview");
    QCOMPARE(pixels(view->viewport()), 0);
    QCOMPARE(pixels(overview), 0);
    MarkRow(*window, 50);
    QTRY_VERIFY_WITH_TIMEOUT(pixels(view->viewport()) > 4 * 10, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(pixels(overview) >= 8, Patience);
    const int withoutNote = pixels(view->viewport());
    WriteNote(*window, "why");
    QTRY_VERIFY_WITH_TIMEOUT(pixels(view->viewport()) > withoutNote + 10, Patience);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(pixels(view->viewport()), 0, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(pixels(overview), 0, Patience);
}

void tst_MarksInWindow::outliveTheSession()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
        MarkRow(*window, 70);
        View(*window)->GoToRow(30);
        WriteNote(*window, "<b>\"]]> & 100%1");
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Marked(*window), QVector<int>({30, 70}), Patience);
    View(*window)->GoToRow(30);
    QTRY_COMPARE_WITH_TIMEOUT(Note(*window), QString("Note: <b>\"]]> & 100%1"), Patience);
}

// Found by content: lines were added before, and the file has been written over.
void tst_MarksInWindow::moveWithTheirLines()
{
    const QByteArray older = run(100, QTime(17, 0), "older", true);
    const WindowTest test(older);
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
        MarkRow(*window, 80);
    }
    QVERIFY(TestFiles::write(test.logFile(),
                             writtenOver(older, run(20, QTime(9, 0), "a much longer entry"))));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 20, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Marked(*window).size(), 1, Patience);
    const int row = Marked(*window).first();
    QVERIFY(row != 80);
    QCOMPARE(View(*window)->model()->index(row, LogModel::MessageColumn).data().toString(),
             QString("older 80"));

    // While the window is open.
    QVERIFY(TestFiles::writeOver(test.logFile(), "new\n" + older));
    QTRY_COMPARE_WITH_TIMEOUT(Marked(*window), QVector<int>({81}), Patience);
}

// The new lines start exactly where the old ones did.
void tst_MarksInWindow::lineWrittenOver()
{
    const QByteArray older = run(100, QTime(17, 0), "older", true);
    const QByteArray newer = run(60, QTime(9, 0), "newer");
    const WindowTest test(writtenOver(older, newer.left(newer.indexOf("newer 40") + 9)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 102, Patience);
    int row = 0;
    while (View(*window)->model()->index(row, LogModel::MessageColumn).data().toString() !=
           "older 50")
        ++row;
    MarkRow(*window, row);
    QCOMPARE(Marked(*window).size(), 1);
    QVERIFY(TestFiles::writeOver(test.logFile(), writtenOver(older, newer)));
    QTRY_COMPARE_WITH_TIMEOUT(
        View(*window)->model()->index(101, LogModel::MessageColumn).data().toString(),
        QString("newer 59"), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(Marked(*window).isEmpty(), Patience);
}

void tst_MarksInWindow::filteredOut()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    MarkRow(*window, 15);
    MarkRow(*window, 72);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "x 7");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 11, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Marked(*window), QVector<int>({3}), Patience);
    QTest::keyClick(window.get(), Qt::Key_F2);
    QCOMPARE(View(*window)->currentIndex().row(), 3);
    Panel(*window)->ClearFilter();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Marked(*window), QVector<int>({15, 72}), Patience);
    QTest::keyClick(window.get(), Qt::Key_F2, Qt::ShiftModifier);
    QCOMPARE(View(*window)->currentIndex().row(), 15);
}

void tst_MarksInWindow::nothingSelected()
{
    const WindowTest test(run(10, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 10, Patience);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QCOMPARE(Status(*window), QString("Select a line first"));
    QVERIFY(Marked(*window).isEmpty());
}

void tst_MarksInWindow::contextMenu()
{
    const WindowTest test(run(10, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 10, Patience);
    LogView* view = View(*window);
    view->GoToRow(4);
    QContextMenuEvent byKey(QContextMenuEvent::Keyboard, QPoint(1, 1));
    QApplication::sendEvent(view->viewport(), &byKey);
    auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
    QVERIFY(menu);
    const QPoint row =
        view->viewport()->mapToGlobal(view->visualRect(view->currentIndex()).center());
    QVERIFY(qAbs(menu->y() - row.y()) < 2 * view->rowHeight(4));
    QTest::keyClick(menu, Qt::Key_M);
    QCOMPARE(Marked(*window), QVector<int>({4}));
}

void tst_MarksInWindow::selectionInTheLineStays()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    MarkRow(*window, 50);
    auto* line = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    line->setFocus();
    QTest::keyClick(line, Qt::Key_A, Qt::ControlModifier);
    QVERIFY(line->textCursor().hasSelection());
    QVERIFY(TestFiles::writeOver(test.logFile(), run(120, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 120, Patience);
    QVERIFY(line->textCursor().hasSelection());
    QCOMPARE(View(*window)->currentIndex().row(), 50);
}

void tst_MarksInWindow::fileIsBounded()
{
    const WindowTest test;
    MarksFile file(test.folder());
    LogMark mark;
    mark.line = "1:a";
    mark.note = "n";
    for (int i = 0; i <= MarksFile::MaximumFiles; ++i)
        QCOMPARE(file.SetMarks(QString("/log %1 a").arg(i), {mark}), QString());
    QCOMPARE(file.Marks("/log 0 a").size(), 0);
    QCOMPARE(file.Marks(QString("/log 1 a")).size(), 1);
    QCOMPARE(file.Marks(QString("/log 50 a")).value(0).note, QString("n"));
    QCOMPARE(file.SetMarks(QString("/log 1 a"), {}), QString());
    QCOMPARE(file.Marks(QString("/log 1 a")).size(), 0);
    QVector<LogMark> many(LogMark::MaximumMarks + 1, mark);
    QCOMPARE(file.SetMarks("/many", many), QString());
    QCOMPARE(file.Marks("/many").size(), int(LogMark::MaximumMarks));
}

// Both have the same log open; what one adds is not lost when the other saves.
void tst_MarksInWindow::twoWindows()
{
    const WindowTest test;
    const auto mark = [](QByteArray const& line, QString const& note) {
        LogMark made;
        made.line = line;
        made.note = note;
        return made;
    };
    const auto saved = [&] {
        QStringList lines;
        const QVector<LogMark> marks = MarksFile(test.folder()).Marks("/log");
        for (LogMark const& one : marks)
            lines.append(QString::fromLatin1(one.line) + '=' + one.note);
        lines.sort();
        return lines.join(' ');
    };
    const LogMark common = mark("1:c", "common");
    MarksFile first(test.folder());
    QCOMPARE(first.SetMarks("/log", {common}), QString());
    MarksFile second(test.folder());
    QCOMPARE(second.Marks("/log").size(), 1);
    QCOMPARE(first.SetMarks("/log", {common, mark("1:a", "first")}), QString());
    QCOMPARE(second.SetMarks("/log", {common, mark("1:b", "second")}), QString());
    QCOMPARE(saved(), QString("1:a=first 1:b=second 1:c=common"));
    // Once more, with marks that came from the other one.
    QCOMPARE(second.SetMarks("/log", {mark("1:b", "changed")}), QString());
    QCOMPARE(saved(), QString("1:a=first 1:b=changed"));
    QCOMPARE(first.SetMarks("/log", {}), QString());
    QCOMPARE(saved(), QString("1:b=changed"));
    // Both mark the same line.
    QCOMPARE(first.SetMarks("/log", {mark("1:b", "mine")}), QString());
    QCOMPARE(saved(), QString("1:b=mine"));
}

void tst_MarksInWindow::damagedFile()
{
    const WindowTest test(run(10, QTime(9, 0), "x"));
    const QByteArray damaged("<VelocorSettings><Log1>");
    QVERIFY(TestFiles::write(test.folder() + "data/marks.cfg", damaged));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 10, Patience);
    MarkRow(*window, 4);
    QCOMPARE(Marked(*window), QVector<int>({4}));
    QVERIFY2(Status(*window).contains("is damaged"), qPrintable(Status(*window)));
    QCOMPARE(TestFiles::read(test.folder() + "data/marks.cfg"), damaged);
}

// Whatever a note holds, it comes back.
void tst_MarksInWindow::hostileNotes()
{
    const WindowTest test;
    MarksFile file(test.folder());
    for (QString const& note :
         {QString(), QString("a b  c"), QString("]]>"), QString("\\n\\"), QString("<x>&amp;"),
          QString::fromUtf8("\xE2\x82\xAC \xF0\x9F\x98\x80"), QString(" x "), QString("-")}) {
        LogMark mark;
        mark.line = "1:a";
        mark.start = 7;
        mark.note = note;
        QCOMPARE(file.SetMarks("/log", {mark}), QString());
        const QVector<LogMark> marks = file.Marks("/log");
        QCOMPARE(marks.size(), 1);
        QCOMPARE(marks[0].note, note);
        QCOMPARE(marks[0].start, qint64(7));
        QVERIFY(marks[0].above.isEmpty() && marks[0].below.isEmpty());
    }
}

// Beside the marks of a file, and without.
void tst_MarksInWindow::encodings()
{
    const WindowTest test;
    MarksFile file(test.folder());
    LogMark mark;
    mark.line = "1:a";
    QCOMPARE(file.SetMarks("/a", {mark}), QString());
    QVERIFY(file.Encoding("/a") == LogEncoding::Automatic);
    for (LogEncoding::Kind kind :
         {LogEncoding::Latin1, LogEncoding::Utf8, LogEncoding::Utf16Le, LogEncoding::Utf16Be}) {
        for (char const* path : {"/a", "/b"}) {
            QCOMPARE(file.SetEncoding(path, kind), QString());
            QVERIFY(file.Encoding(path) == kind);
        }
        QCOMPARE(file.Marks("/a").size(), 1);
    }
    QCOMPARE(file.SetMarks("/a", {}), QString());
    QVERIFY(file.Encoding("/a") == LogEncoding::Utf16Be);
    QCOMPARE(file.SetEncoding("/a", LogEncoding::Automatic), QString());
    const QByteArray stored = TestFiles::read(test.folder() + "marks.cfg");
    QVERIFY2(stored.contains("/b") && !stored.contains("/a<"), stored.constData());
    QVERIFY(TestFiles::write(test.folder() + "marks.cfg",
                             "<VelocorSettings><Log1><path>/c</path><encoding>utf-99</encoding>"
                             "</Log1></VelocorSettings>"));
    QVERIFY(file.Encoding("/c") == LogEncoding::Automatic);
}

void tst_MarksInWindow::encodingIsKept()
{
    const WindowTest test;
    const QString path = test.folder() + "other.log";
    QVERIFY(TestFiles::write(path, "caf\xc3\xa9\n"));
    const auto message = [](MainWindow& window) {
        return View(window)->model()->index(0, LogModel::MessageColumn).data().toString();
    };
    {
        const auto window = WindowTest::show();
        window->OpenFile(path);
        QTRY_COMPARE_WITH_TIMEOUT(message(*window), QString("caf\u00e9"), Patience);
        Action(*window, "Latin-1")->trigger();
        QTRY_COMPARE_WITH_TIMEOUT(message(*window), QString("caf\u00c3\u00a9"), Patience);
    }
    {
        const auto window = WindowTest::show();
        window->OpenFile(path);
        QTRY_COMPARE_WITH_TIMEOUT(message(*window), QString("caf\u00c3\u00a9"), Patience);
        QVERIFY(Action(*window, "Latin-1")->isChecked());
        Action(*window, "Automatic")->trigger();
        QTRY_COMPARE_WITH_TIMEOUT(message(*window), QString("caf\u00e9"), Patience);
    }
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(message(*window), QString("caf\u00e9"), Patience);
    QVERIFY(Action(*window, "Automatic")->isChecked());
}

QTEST_MAIN(tst_MarksInWindow)

#include "tst_MarksInWindow.moc"
