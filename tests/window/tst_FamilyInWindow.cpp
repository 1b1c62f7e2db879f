// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The logs of several programs as one, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/ProgramColors.h"
#include "app/window/log/ProgramsButton.h"
#include "support/TestFiles.h"

#include <QClipboard>
#include <QComboBox>
#include <QFileDialog>
#include <QMenu>

using namespace Velocor;
using namespace WindowParts;

namespace {

QByteArray Entry(int second, char const* message, char const* severity = "Trace")
{
    return "2025-03-05 08:00:" + QByteArray::number(second).rightJustified(2, '0') + ".000 " +
           severity + ' ' + message + '\n';
}

// The folder of the window's own program is called "data".
QString EditorLog(WindowTest const& test)
{
    return test.folder() + "Editor/logs/editor.log";
}

QString ReaderLog(WindowTest const& test)
{
    return test.folder() + "Reader/logs/reader.log";
}

QByteArray const EditorLines = Entry(2, "b") + "more\n" + Entry(6, "f", "Warning");

void WriteLogs(WindowTest const& test)
{
    TestFiles::write(test.logFile(), Entry(1, "a") + Entry(5, "e"));
    TestFiles::write(EditorLog(test), EditorLines);
    TestFiles::write(ReaderLog(test) + ".1", Entry(3, "c"));
    TestFiles::write(ReaderLog(test), Entry(4, "d") + Entry(7, "g", "Error"));
}

QString const Whole("abmorecdefg");

QString Shown(MainWindow& window)
{
    QString text;
    LogModel const* model = Panel(window)->model();
    for (int row = 0; row < model->rowCount(); ++row)
        text += model->index(row, LogModel::MessageColumn).data().toString();
    return text;
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

void PressKey(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_F, Qt::ControlModifier | Qt::AltModifier);
}

std::unique_ptr<MainWindow> ShowFamily(WindowTest const& test)
{
    WriteLogs(test);
    auto window = WindowTest::show();
    PressKey(*window);
    [&] {
        QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole, Patience);
    }();
    return window;
}

ProgramsButton* Button(MainWindow& window)
{
    return Panel(window)->findChild<ProgramsButton*>();
}

// Opens the menu of the button with the keyboard and presses keys in it.
void InMenu(MainWindow& window, QList<Qt::Key> const& keys)
{
    QTimer timer;
    QObject::connect(&timer, &QTimer::timeout, &timer, [&] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        if (!menu)
            return;
        timer.stop();
        for (Qt::Key key : keys)
            QTest::keyClick(menu, key);
        if (menu->isVisible())
            menu->close();
    });
    timer.start(20);
    Button(window)->setFocus();
    QTest::keyClick(Button(window), Qt::Key_Space);
}

} // namespace

class tst_FamilyInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void keyShowsFamily();
    void listShowsFamily();
    void programs();
    void switchedWithKeys();
    void switchedWhilePaused();
    void filter();
    void find();
    void problems();
    void goTo();
    void copied();
    void saved();
    void marks();
    void follows();
    void entryInTheMiddle();
    void writesOver();
    void rotates();
    void addedLogs();
    void sinceTheSameProgram();
    void colors();
};

void tst_FamilyInWindow::keyShowsFamily()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    auto* files = Child<QComboBox>(window.get(), "Log file");
    QCOMPARE(files->currentText(), QString("Whole family, by time"));
    QVERIFY(Button(*window)->isVisible());
    QVERIFY(!View(*window)->isColumnHidden(LogModel::ProgramColumn));
    PressKey(*window); // and back
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("ae"), Patience);
    QVERIFY(files->currentText().startsWith("app.log ("));
    QVERIFY(!Button(*window)->isVisible());
    QVERIFY(View(*window)->isColumnHidden(LogModel::ProgramColumn));
}

void tst_FamilyInWindow::listShowsFamily()
{
    const WindowTest test;
    WriteLogs(test);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("ae"), Patience);
    auto* files = Child<QComboBox>(Panel(*window), "Log file");
    files->setFocus();
    QTest::keyClick(files, Qt::Key_F4);
    QTRY_VERIFY_WITH_TIMEOUT(files->view()->isVisible(), Patience);
    QTest::keyClick(files->view(), Qt::Key_End);
    QTest::keyClick(files->view(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(Shown(*window).endsWith("ae"), Patience); // all files of one log
    QVERIFY(!Panel(*window)->showsFamily());
}

void tst_FamilyInWindow::programs()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    QString names;
    for (int row = 0; row < Rows(*window); ++row)
        names +=
            Panel(*window)->model()->index(row, LogModel::ProgramColumn).data().toString() + ' ';
    QCOMPARE(names, QString("data Editor Editor Reader Reader data Editor Reader "));
    View(*window)->GoToRow(RowOf(*window, "c"));
    QVERIFY2(Panel(*window)->summary().startsWith("Line 1 of reader.log.1"),
             qPrintable(Panel(*window)->summary()));
    View(*window)->GoToRow(RowOf(*window, "f"));
    QVERIFY2(Panel(*window)->summary().startsWith("Line 3 of editor.log"),
             qPrintable(Panel(*window)->summary()));
}

void tst_FamilyInWindow::switchedWithKeys()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    QCOMPARE(Button(*window)->accessibleName(), QString("Programs: 3 of 3"));
    View(*window)->GoToRow(RowOf(*window, "d"));
    InMenu(*window, {Qt::Key_Down, Qt::Key_Return}); // Editor
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("acdeg"), Patience);
    QCOMPARE(Button(*window)->accessibleName(), QString("Programs: 2 of 3"));
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "d"));
    InMenu(*window, {Qt::Key_Down, Qt::Key_Down, Qt::Key_Return}); // Reader
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("ae"), Patience);
    InMenu(*window, {Qt::Key_Down, Qt::Key_Return});
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("abmoreef"), Patience);
    QTest::keyClick(window.get(), Qt::Key_F5); // reloading leaves it
    QTRY_VERIFY_WITH_TIMEOUT(!Panel(*window)->model()->isReading(), Patience);
    QCOMPARE(Shown(*window), QString("abmoreef"));
    InMenu(*window, {Qt::Key_S}); // Show All
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole, Patience);
}

void tst_FamilyInWindow::switchedWhilePaused()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    Panel(*window)->SetPaused(true);
    InMenu(*window, {Qt::Key_Down, Qt::Key_Return});
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("acdeg"), Patience);
}

void tst_FamilyInWindow::filter()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    auto* text = Child<QLineEdit>(window.get(), "Filter by text");
    text->setText("more");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("bmore"), Patience);
    text->clear();
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole, Patience);
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier); // no Trace
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("fg"), Patience);
}

void tst_FamilyInWindow::find()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    View(*window)->GoToRow(0);
    Panel(*window)->OpenFind();
    Child<QLineEdit>(window.get(), "Find text")->setText("05 08:00:0");
    for (char const* message : {"b", "c", "d"}) {
        QTest::keyClick(window.get(), Qt::Key_F3);
        QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), RowOf(*window, message),
                                  Patience);
    }
}

void tst_FamilyInWindow::problems()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    View(*window)->GoToRow(0);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "f"));
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "g"));
    QVERIFY2(Panel(*window)->summary().contains("2 problems"),
             qPrintable(Panel(*window)->summary()));
}

void tst_FamilyInWindow::goTo()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    const auto goTo = [&](QString const& place) {
        WindowTest::whenShown<QDialog>([place](QDialog* dialog) {
            dialog->findChild<QLineEdit*>()->setText(place);
            QTest::keyClick(dialog, Qt::Key_Return);
        });
        window->activateWindow(); // no window manager does, after a dialog
        QVERIFY(QTest::qWaitForWindowActive(window.get()));
        QTest::keyClick(window.get(), Qt::Key_G, Qt::ControlModifier);
    };
    View(*window)->GoToRow(RowOf(*window, "b"));
    goTo("3"); // of the file of the current line
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), RowOf(*window, "f"), Patience);
    goTo("08:00:04");
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), RowOf(*window, "d"), Patience);
}

void tst_FamilyInWindow::copied()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    View(*window)->setFocus();
    View(*window)->selectAll();
    Panel(*window)->CopySelected();
    const QByteArray expected = Entry(1, "a") + Entry(2, "b") + "more\n" + Entry(3, "c") +
                                Entry(4, "d") + Entry(5, "e") + Entry(6, "f", "Warning") +
                                Entry(7, "g", "Error");
    QCOMPARE(QGuiApplication::clipboard()->text().trimmed(),
             QString::fromLatin1(expected).trimmed());
}

void tst_FamilyInWindow::saved()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    const QString target = test.folder() + "documents/saved.log";
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
        auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
        name->setText(target);
        QTest::keyClick(name, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(QFile::exists(target), Patience);
    QCOMPARE(TestFiles::read(target), Entry(1, "a") + Entry(2, "b") + "more\n" + Entry(3, "c") +
                                          Entry(4, "d") + Entry(5, "e") + Entry(6, "f", "Warning") +
                                          Entry(7, "g", "Error"));
}

void tst_FamilyInWindow::marks()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    const auto isMarked = [&](char const* message) {
        const QModelIndex line =
            View(*window)->model()->index(RowOf(*window, message), LogModel::TimeColumn);
        return line.data(LogModel::MarkedRole).toBool();
    };
    for (char const* message : {"c", "e", "f"}) {
        View(*window)->GoToRow(RowOf(*window, message));
        QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
        QVERIFY(isMarked(message));
    }
    PressKey(*window); // each mark is one of its file
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("ae"), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(isMarked("e"), Patience);
    QVERIFY(!isMarked("a"));
    PressKey(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(isMarked("c") && isMarked("e") && isMarked("f"), Patience);
    QVERIFY(!isMarked("a") && !isMarked("b") && !isMarked("d") && !isMarked("g"));
}

void tst_FamilyInWindow::follows()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    TestFiles::writeOver(EditorLog(test), EditorLines + Entry(8, "h"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole + "h", Patience);
    TestFiles::writeOver(test.logFile(), Entry(1, "a") + Entry(5, "e") + Entry(9, "i"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole + "hi", Patience);
    TestFiles::writeOver(ReaderLog(test),
                         Entry(4, "d") + Entry(7, "g", "Error") + Entry(10, "j") + "k\n");
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole + "hijk", Patience);
}

// What a program logs late does not take the current line away.
void tst_FamilyInWindow::entryInTheMiddle()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    View(*window)->GoToRow(RowOf(*window, "g"));
    TestFiles::writeOver(test.logFile(), Entry(1, "a") + Entry(5, "e") + Entry(6, "x"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("abmorecdefxg"), Patience);
    QCOMPARE(View(*window)->currentIndex().row(), RowOf(*window, "g"));
}

void tst_FamilyInWindow::writesOver()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    QByteArray lines = EditorLines;
    const QByteArray restarted = Entry(20, "s");
    lines.replace(0, restarted.size(), restarted);
    TestFiles::writeOver(EditorLog(test), lines);
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("acdemorefgs"), Patience);
}

void tst_FamilyInWindow::rotates()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    QFile::rename(ReaderLog(test) + ".1", ReaderLog(test) + ".2");
    QFile::rename(ReaderLog(test), ReaderLog(test) + ".1");
    TestFiles::write(ReaderLog(test), Entry(30, "r"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole + "r", Patience);
    TestFiles::writeOver(EditorLog(test), EditorLines + Entry(31, "h"));
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), Whole + "rh", Patience);
}

void tst_FamilyInWindow::addedLogs()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    const QString log = test.folder() + "documents/other.log";
    TestFiles::write(log, Entry(3, "x"));
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
        auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
        name->setText(log);
        QTest::keyClick(name, Qt::Key_Return);
    });
    InMenu(*window, {Qt::Key_A});
    QTRY_COMPARE_WITH_TIMEOUT(Shown(*window), QString("abmorecxdefg"), Patience);
    QCOMPARE(Button(*window)->accessibleName(), QString("Programs: 4 of 4"));
    QCOMPARE(Panel(*window)->model()->index(RowOf(*window, "x"), LogModel::ProgramColumn).data(),
             QVariant("other.log"));
}

void tst_FamilyInWindow::sinceTheSameProgram()
{
    const WindowTest test;
    const auto window = ShowFamily(test);
    const auto since = [&](char const* message) {
        return Panel(*window)
            ->model()
            ->index(RowOf(*window, message), LogModel::SinceColumn)
            .data()
            .toString();
    };
    QCOMPARE(since("b"), QString());
    QVERIFY2(since("e").contains('4'), qPrintable(since("e")));
    QVERIFY2(since("g").contains('3'), qPrintable(since("g")));
}

void tst_FamilyInWindow::colors()
{
    const auto luminance = [](QColor const& color) {
        const auto part = [](qreal value) {
            return value <= 0.03928 ? value / 12.92 : std::pow((value + 0.055) / 1.055, 2.4);
        };
        return 0.2126 * part(color.redF()) + 0.7152 * part(color.greenF()) +
               0.0722 * part(color.blueF());
    };
    for (QColor const& base : {QColor(Qt::white), QColor(Qt::black), QColor(0x1e, 0x1f, 0x22)}) {
        QPalette palette;
        palette.setColor(QPalette::Base, base);
        for (int log = 0; log < ProgramColors::Count; ++log) {
            const qreal color = luminance(ProgramColors::Color(log, palette));
            const qreal ground = luminance(base);
            const qreal contrast =
                (std::max(color, ground) + 0.05) / (std::min(color, ground) + 0.05);
            QVERIFY2(contrast >= 3, qPrintable(QString::number(log)));
        }
    }
}

QTEST_MAIN(tst_FamilyInWindow)
#include "tst_FamilyInWindow.moc"
