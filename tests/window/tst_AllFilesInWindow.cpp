// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// All files of a log as one, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/history/RunEnds.h"
#include "app/window/log/ActivityStrip.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "support/TestFiles.h"

#include <QClipboard>
#include <QComboBox>
#include <QFileDialog>
#include <QScrollBar>

using namespace Velocor;
using namespace WindowParts;

namespace {

// A run that logs each letter once, a second after the other.
QByteArray Run(char const* day, char const* letters, char const* severity = "Trace")
{
    QByteArray text;
    int second = 0;
    for (char const* letter = letters; *letter; ++letter)
        text += QByteArray(day) + " 08:00:0" + QByteArray::number(second++) + ".000 " + severity +
                ' ' + *letter + '\n';
    return text;
}

// Five runs in three files, two of which others have written over.
void WriteFiles(QString const& log)
{
    TestFiles::write(log + ".2", Run("2025-03-01", "ab", "Warning"));
    TestFiles::write(log + ".1", Run("2025-03-03", "ef") + "rest\n" + Run("2025-03-02", "cd"));
    TestFiles::write(log, Run("2025-03-05", "ij", "Error") + "rest\n" + Run("2025-03-04", "gh"));
}

// What the rows show: messages, and in brackets the headings from the date on.
QString Shown(MainWindow& window)
{
    QString text;
    LogModel const* model = Panel(window)->model();
    for (int row = 0; row < model->rowCount(); ++row) {
        const bool isHeading = model->index(row, 0).data(LogModel::HeadingRole).toBool();
        const QString heading = model->index(row, 0).data().toString();
        text += isHeading ? '[' + heading.mid(heading.indexOf("2025") + 8, 2) + ']'
                          : model->index(row, LogModel::MessageColumn).data().toString();
    }
    return text;
}

QString const All("[01]ab[02]restcd[03]ef[04]restgh[05]ij");

void ShowAll(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
}

int RowOf(MainWindow& window, QString const& message)
{
    LogModel const* model = Panel(window)->model();
    for (int row = 0; row < model->rowCount(); ++row) {
        if (model->index(row, LogModel::MessageColumn).data() == message)
            return row;
    }
    return -1;
}

int HeadingRow(MainWindow& window, QString const& day)
{
    LogModel const* model = Panel(window)->model();
    for (int row = 0; row < model->rowCount(); ++row) {
        if (model->index(row, 0).data(LogModel::HeadingRole).toBool() &&
            model->index(row, 0).data().toString().contains(day))
            return row;
    }
    return -1;
}

QString Heading(MainWindow& window, QString const& day)
{
    return Panel(window)->model()->index(HeadingRow(window, day), 0).data().toString();
}

void ClickRow(MainWindow& window, int row)
{
    LogView* view = View(window);
    view->scrollTo(view->model()->index(row, 0));
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier,
                      view->visualRect(view->model()->index(row, 0)).center());
}

// A window with the runs of all files.
std::unique_ptr<MainWindow> ShowAllOf(WindowTest const& test)
{
    WriteFiles(test.logFile());
    auto window = WindowTest::show();
    ShowAll(*window);
    [&] {
        QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    }();
    return window;
}

} // namespace

class tst_AllFilesInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void keyShowsAll();
    void listShowsAll();
    void headings();
    void howRunsEnded();
    void folding();
    void foldingWithKeys();
    void leftGoesToTheHeading();
    void leftScrollsFirst();
    void leftStaysWithoutHeadings();
    void rightGoesToTheEndOfTheRun();
    void currentHeadingHasAFrame();
    void foldingOfTheNewest();
    void foldingWhilePaused();
    void filter();
    void find();
    void problems();
    void activity();
    void copied();
    void saved();
    void marks();
    void marksAfterRotation();
    void numbers();
    void olderFilesComeAndGo();
    void follows();
    void writesOver();
    void rotates();
    void withoutCurrentFile();
    void lastLineWithoutEnd();
    void unreadableFile();
};

void tst_AllFilesInWindow::keyShowsAll()
{
    const WindowTest test;
    WriteFiles(test.logFile());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    QCOMPARE(Child<QComboBox>(window.get(), "Log file")->currentText(),
             QString("All files, by time"));
    ShowAll(*window); // and back
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    QVERIFY(Child<QComboBox>(window.get(), "Log file")->currentText().startsWith("app.log ("));
}

void tst_AllFilesInWindow::listShowsAll()
{
    const WindowTest test;
    WriteFiles(test.logFile());
    const auto window = WindowTest::show({test.logFile() + ".1"});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    auto* files = Child<QComboBox>(Panel(*window), "Log file");
    files->setFocus();
    QTest::keyClick(files, Qt::Key_F4);
    QTRY_VERIFY_WITH_TIMEOUT(files->view()->isVisible(), Patience);
    QTest::keyClick(files->view(), Qt::Key_End);
    QTest::keyClick(files->view(), Qt::Key_Up); // below it is the whole family
    QTest::keyClick(files->view(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    QCOMPARE(Panel(*window)->path(), test.logFile());
}

void tst_AllFilesInWindow::headings()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    const QString dot = QStringLiteral("  %1  ").arg(QChar(0xb7));
    const QString arrow = QStringLiteral("%1  ").arg(QChar(0x25be));
    QCOMPARE(Heading(*window, "03-01"),
             arrow + "data" + dot + "2025-03-01 08:00:00.000 to 08:00:01.000" + dot + "2 warnings");
    QCOMPARE(Heading(*window, "03-05"),
             arrow + "data" + dot + "2025-03-05 08:00:00.000 to 08:00:01.000" + dot + "2 errors");
}

void tst_AllFilesInWindow::howRunsEnded()
{
    const WindowTest test;
    WriteFiles(test.logFile());
    const QString record = RunEnds::RecordFileOf(test.logFile());
    TestFiles::write(record, "2025-03-01T07:59:59.000 2025-03-01T08:00:09.000 abnormal\n"
                             "2025-03-03T07:59:59.000 2025-03-03T08:00:09.000 normal\n");
    const auto window = WindowTest::show();
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    QVERIFY2(Heading(*window, "03-01").contains("killed or crashed"),
             qPrintable(Heading(*window, "03-01")));
    QVERIFY(Heading(*window, "03-03").contains("ended normally"));
    QVERIFY(!Heading(*window, "03-02").contains("ended"));
}

void tst_AllFilesInWindow::folding()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    ClickRow(*window, HeadingRow(*window, "03-02"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02][03]ef[04]restgh[05]ij"),
                              Patience);
    QVERIFY(Heading(*window, "03-02").startsWith(QChar(0x25b8)));
    const QModelIndex heading = View(*window)->model()->index(HeadingRow(*window, "03-02"), 0);
    QVERIFY(heading.data(Qt::AccessibleTextRole).toString().endsWith(", folded"));
    ClickRow(*window, HeadingRow(*window, "03-04"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02][03]ef[04][05]ij"), Patience);
    ClickRow(*window, HeadingRow(*window, "03-02"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]restcd[03]ef[04][05]ij"),
                              Patience);
    QTest::keyClick(window.get(), Qt::Key_F5); // reloading leaves it
    QTRY_VERIFY_WITH_TIMEOUT(!Panel(*window)->model()->isReading(), Patience);
    QCOMPARE(Shown(*window), QString("[01]ab[02]restcd[03]ef[04][05]ij"));
}

void tst_AllFilesInWindow::foldingWithKeys()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setFocus();
    view->GoToRow(RowOf(*window, "e"));
    QTest::keyClick(view, Qt::Key_Up);
    QCOMPARE(view->currentIndex().row(), HeadingRow(*window, "03-03"));
    QTest::keyClick(view, Qt::Key_Left);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]restcd[03][04]restgh[05]ij"),
                              Patience);
    QCOMPARE(view->currentIndex().row(), HeadingRow(*window, "03-03"));
    QTest::keyClick(view, Qt::Key_Right);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
}

// From one run to the one before, however many lines they have.
void tst_AllFilesInWindow::leftGoesToTheHeading()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setFocus();
    QVERIFY(!view->currentIndex().isValid());
    for (char const* day : {"03-05", "03-04", "03-03", "03-02", "03-01"}) {
        QTest::keyClick(view, Qt::Key_Left);
        QCOMPARE(view->currentIndex().row(), HeadingRow(*window, day));
        QCOMPARE(Shown(*window), All); // no run is folded by it
        QTest::keyClick(view, Qt::Key_Up);
    }
    QCOMPARE(view->currentIndex().row(), HeadingRow(*window, "03-01"));
}

// What has been scrolled sideways is scrolled back first.
void tst_AllFilesInWindow::leftScrollsFirst()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setColumnWidth(LogModel::TimeColumn, 3 * view->width());
    QScrollBar* across = view->horizontalScrollBar();
    QTRY_VERIFY_WITH_TIMEOUT(across->maximum() > 0, Patience);
    view->setFocus();
    const int row = RowOf(*window, "f");
    view->GoToRow(row);
    across->setValue(across->maximum());
    QTest::keyClick(view, Qt::Key_Left);
    QCOMPARE(view->currentIndex().row(), row);
    across->setValue(across->minimum());
    QTest::keyClick(view, Qt::Key_Left);
    QCOMPARE(view->currentIndex().row(), HeadingRow(*window, "03-03"));
}

void tst_AllFilesInWindow::leftStaysWithoutHeadings()
{
    const WindowTest test;
    TestFiles::write(test.logFile(), Run("2025-03-05", "ij"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("ij"), Patience);
    LogView* view = View(*window);
    view->setFocus();
    view->GoToRow(RowOf(*window, "j"));
    QTest::keyClick(view, Qt::Key_Left);
    QCOMPARE(view->currentIndex().row(), RowOf(*window, "j"));
}

void tst_AllFilesInWindow::rightGoesToTheEndOfTheRun()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setFocus();
    for (char const* last : {"j", "h", "f", "d", "b"}) {
        view->GoToRow(RowOf(*window, last));
        QTest::keyClick(view, Qt::Key_Left);
        QVERIFY(Panel(*window)->model()->IsFoldable(view->currentIndex().row()));
        QTest::keyClick(view, Qt::Key_Right);
        QCOMPARE(view->currentIndex().row(), RowOf(*window, last));
    }
    QCOMPARE(Shown(*window), All);
}

// A heading cannot be selected, so it has no background that tells.
void tst_AllFilesInWindow::currentHeadingHasAFrame()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setFocus();
    QTRY_VERIFY_WITH_TIMEOUT(view->hasFocus(), Patience);
    view->GoToRow(RowOf(*window, "f"));
    const int heading = HeadingRow(*window, "03-03");
    const QRect place = view->visualRect(view->model()->index(heading, 0));
    const QImage before = view->viewport()->grab(place).toImage();
    QTest::keyClick(view, Qt::Key_Left);
    QCOMPARE(view->currentIndex().row(), heading);
    const QRect now = view->visualRect(view->model()->index(heading, 0));
    QVERIFY(view->viewport()->grab(now).toImage() != before);
}

void tst_AllFilesInWindow::foldingOfTheNewest()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    LogView* view = View(*window);
    view->setFocus();
    view->GoToRow(RowOf(*window, "i"));
    QTest::keyClick(view, Qt::Key_Up);
    QTest::keyClick(view, Qt::Key_Left);
    const QString folded("[01]ab[02]restcd[03]ef[04]restgh[05]");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), folded, Patience);
    QCOMPARE(view->currentIndex().row(), HeadingRow(*window, "03-05"));
    QTest::keyClick(view, Qt::Key_Right);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
}

void tst_AllFilesInWindow::foldingWhilePaused()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    Panel(*window)->SetPaused(true);
    ClickRow(*window, HeadingRow(*window, "03-03"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]restcd[03][04]restgh[05]ij"),
                              Patience);
}

void tst_AllFilesInWindow::filter()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    auto* text = Child<QLineEdit>(window.get(), "Filter by text");
    text->setText("Trace"); // no line of the first and the last run
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[02]cd[03]ef[04]gh[05]"), Patience);
    text->setText("rest");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[02]rest[04]rest[05]"), Patience);
    text->clear();
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier); // no Trace
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]rest[04]rest[05]ij"), Patience);
}

void tst_AllFilesInWindow::find()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    View(*window)->GoToRow(0);
    Panel(*window)->OpenFind();
    auto* text = Child<QLineEdit>(window.get(), "Find text");
    QVERIFY(text);
    text->setText("rest");
    const auto current = [&] {
        return View(*window)->currentIndex().row();
    };
    const int first = RowOf(*window, "c") - 1;
    const int second = RowOf(*window, "g") - 1;
    QTest::keyClick(window.get(), Qt::Key_F3);
    QTRY_COMPARE_WITH_TIMEOUT(current(), first, Patience);
    QTest::keyClick(window.get(), Qt::Key_F3);
    QTRY_COMPARE_WITH_TIMEOUT(current(), second, Patience);
}

void tst_AllFilesInWindow::problems()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    View(*window)->GoToRow(RowOf(*window, "b"));
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "i"));
    QVERIFY2(Panel(*window)->summary().contains("4 problems"),
             qPrintable(Panel(*window)->summary()));
}

// The bars of all days, and from each of them to its entries.
void tst_AllFilesInWindow::activity()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::AltModifier);
    auto* strip = Panel(*window)->findChild<ActivityStrip*>();
    QVector<int> busy;
    const auto find = [&] {
        busy.clear();
        std::vector<Activity::Bar> const& bars = strip->activity().bars;
        for (size_t bar = 0; bar < bars.size(); ++bar) {
            if (bars[bar].entries() > 0)
                busy.append(static_cast<int>(bar));
        }
        return busy.size();
    };
    QTRY_COMPARE_WITH_TIMEOUT(find(), 5, Patience);
    QCOMPARE(busy.first(), 0);
    char const* const messages[] = {"a", "c", "e", "g", "i"};
    const size_t entries[] = {3, 2, 3, 2, 2}; // a line without a time has that of the row above
    for (int day = 0; day < 5; ++day) {
        QCOMPARE(strip->activity().bars[static_cast<size_t>(busy[day])].entries(), entries[day]);
        QTest::mouseClick(strip, Qt::LeftButton, Qt::NoModifier,
                          strip->BarRect(busy[day]).center());
        QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, messages[day]));
    }
}

void tst_AllFilesInWindow::copied()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    View(*window)->setFocus();
    View(*window)->selectAll();
    Panel(*window)->CopySelected();
    const QByteArray expected = Run("2025-03-01", "ab", "Warning") + "rest\n" +
                                Run("2025-03-02", "cd") + Run("2025-03-03", "ef") + "rest\n" +
                                Run("2025-03-04", "gh") + Run("2025-03-05", "ij", "Error");
    QCOMPARE(QGuiApplication::clipboard()->text().trimmed(),
             QString::fromLatin1(expected).trimmed());
}

void tst_AllFilesInWindow::saved()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    const QString target = test.folder() + "documents/saved.log";
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
        auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
        name->setText(target);
        QTest::keyClick(name, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(QFile::exists(target), Patience);
    QCOMPARE(TestFiles::read(target), Run("2025-03-01", "ab", "Warning") + "rest\n" +
                                          Run("2025-03-02", "cd") + Run("2025-03-03", "ef") +
                                          "rest\n" + Run("2025-03-04", "gh") +
                                          Run("2025-03-05", "ij", "Error"));
}

void tst_AllFilesInWindow::marks()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    const auto isMarked = [&](char const* message) {
        const QModelIndex line =
            View(*window)->model()->index(RowOf(*window, message), LogModel::TimeColumn);
        return line.data(LogModel::MarkedRole).toBool();
    };
    for (char const* message : {"d", "j"}) {
        View(*window)->GoToRow(RowOf(*window, message));
        QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
        QVERIFY(isMarked(message));
    }
    ShowAll(*window); // only the current file
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(isMarked("j"), Patience);
    QVERIFY(!isMarked("i"));
    Panel(*window)->Open(test.logFile() + ".1", false);
    QTRY_VERIFY_WITH_TIMEOUT(RowOf(*window, "d") > 0 && isMarked("d"), Patience);
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(isMarked("d") && isMarked("j"), Patience);
}

void tst_AllFilesInWindow::marksAfterRotation()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    View(*window)->GoToRow(RowOf(*window, "j"));
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QFile::rename(test.logFile() + ".2", test.logFile() + ".3");
    QFile::rename(test.logFile() + ".1", test.logFile() + ".2");
    QFile::rename(test.logFile(), test.logFile() + ".1");
    TestFiles::write(test.logFile(), Run("2025-03-06", "k"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All + "[06]k", Patience);
    const auto isMarked = [&] {
        return View(*window)->model()->index(RowOf(*window, "j"), 0).data(LogModel::MarkedRole);
    };
    QTRY_VERIFY_WITH_TIMEOUT(isMarked().toBool(), Patience);
    View(*window)->GoToRow(RowOf(*window, "j"));
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier); // no more
    QVERIFY(!isMarked().toBool());
    QTest::keyClick(window.get(), Qt::Key_F5);
    QTRY_VERIFY_WITH_TIMEOUT(!Panel(*window)->model()->isReading(), Patience);
    QVERIFY(!isMarked().toBool());
}

void tst_AllFilesInWindow::numbers()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    View(*window)->GoToRow(RowOf(*window, "c"));
    QVERIFY2(Panel(*window)->summary().startsWith("Line 4 of app.log.1"),
             qPrintable(Panel(*window)->summary()));
    View(*window)->GoToRow(RowOf(*window, "j"));
    QVERIFY(Panel(*window)->summary().startsWith("Line 2 of app.log"));
}

void tst_AllFilesInWindow::olderFilesComeAndGo()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    const QString log = test.logFile();
    QFile::remove(log + ".2");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[02]restcd[03]ef[04]restgh[05]ij"),
                              Patience);
    TestFiles::write(log + ".2", Run("2025-03-01", "ab", "Warning"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), All, Patience);
}

void tst_AllFilesInWindow::follows()
{
    const WindowTest test;
    WriteFiles(test.logFile());
    const QByteArray newest = Run("2025-03-05", "ij", "Error");
    TestFiles::write(test.logFile(), newest);
    const auto window = WindowTest::show();
    ShowAll(*window);
    const QString before("[01]ab[02]restcd[03]ef[05]ij");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), before, Patience);
    View(*window)->GoToRow(RowOf(*window, "c"));
    TestFiles::writeOver(test.logFile(), newest + "2025-03-05 08:01:00.000 Warning k\n");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), before + "k", Patience);
    QVERIFY(
        Heading(*window, "03-05").endsWith("1 warning  " + QString(QChar(0xb7)) + "  2 errors"));
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "c"));
}

void tst_AllFilesInWindow::writesOver()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    const QByteArray before = TestFiles::read(test.logFile());
    const QByteArray newest = Run("2025-03-05", "ij", "Error");
    const QByteArray k = "2025-03-05 08:01:00.000 Trace k\n";
    TestFiles::writeOver(test.logFile(), newest + k + before.mid(newest.size() + k.size()));
    QTRY_VERIFY_WITH_TIMEOUT(Shown(*window).endsWith("h[05]ijk"), Patience);
    QVERIFY(Shown(*window).startsWith("[01]ab[02]restcd[03]ef[04]"));
    QVERIFY2(Heading(*window, "03-05").contains("to 08:01:00.000"),
             qPrintable(Heading(*window, "03-05")));
    // A program that has written over all of the earlier run goes on at the end.
    QByteArray all = newest + k;
    for (int i = 0; all.size() <= before.size(); ++i)
        all += "2025-03-05 08:02:00.00" + QByteArray::number(i) + " Trace l\n";
    TestFiles::writeOver(test.logFile(), all);
    QTRY_VERIFY_WITH_TIMEOUT(Shown(*window).startsWith("[01]ab[02]restcd[03]ef[05]ijkl"), Patience);
}

void tst_AllFilesInWindow::rotates()
{
    const WindowTest test;
    const auto window = ShowAllOf(test);
    ClickRow(*window, HeadingRow(*window, "03-03"));
    const QString folded("[01]ab[02]restcd[03][04]restgh[05]ij");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), folded, Patience);
    QFile::rename(test.logFile() + ".2", test.logFile() + ".3");
    QFile::rename(test.logFile() + ".1", test.logFile() + ".2");
    QFile::rename(test.logFile(), test.logFile() + ".1");
    TestFiles::write(test.logFile(), Run("2025-03-06", "kl"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), folded + "[06]kl", Patience);
    TestFiles::writeOver(test.logFile(), Run("2025-03-06", "klm"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), folded + "[06]klm", Patience);
    QFile::remove(test.logFile() + ".3"); // pruned
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), folded.mid(6) + "[06]klm", Patience);
}

void tst_AllFilesInWindow::withoutCurrentFile()
{
    const WindowTest test;
    const QString log = test.folder() + "other/other.log";
    TestFiles::write(log + ".1", Run("2025-03-01", "ab"));
    const auto window = WindowTest::show({log + ".1"});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab"), Patience);
    TestFiles::write(log, Run("2025-03-02", "c"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]c"), Patience);
}

void tst_AllFilesInWindow::lastLineWithoutEnd()
{
    const WindowTest test;
    QByteArray cut = Run("2025-03-01", "ab");
    cut.chop(1);
    TestFiles::write(test.logFile() + ".1", cut);
    TestFiles::write(test.logFile(), Run("2025-03-02", "cd"));
    const auto window = WindowTest::show();
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[01]ab[02]cd"), Patience);
}

void tst_AllFilesInWindow::unreadableFile()
{
    const WindowTest test;
    WriteFiles(test.logFile());
    QFile::remove(test.logFile() + ".2");
    QVERIFY(QFile::link("/nowhere", test.logFile() + ".2"));
    QFile::remove(test.logFile() + ".1");
    QVERIFY(QFile::link("/dev/null", test.logFile() + ".1")); // listed, but no regular file
    const auto window = WindowTest::show();
    ShowAll(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("[04]restgh[05]ij"), Patience);
}

QTEST_MAIN(tst_AllFilesInWindow)
#include "tst_AllFilesInWindow.moc"
