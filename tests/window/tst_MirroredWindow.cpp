// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window in a language that is written from right to left. What files contain stays as it is in
// any other language; the pictures are compared.

#include "PseudoLanguage.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/runninglog/LogHealth.h"
#include "app/settingsfile/SavedStates.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/log/ActivityStrip.h"
#include "app/window/log/LineNumberMargin.h"
#include "app/window/log/LogOverview.h"
#include "app/window/settings/NumberedText.h"
#include "app/window/settings/SettingsTree.h"
#include "app/window/widgets/LongText.h"
#include "app/window/widgets/PlainText.h"

#include <QComboBox>
#include <QGlyphRun>
#include <QHeaderView>
#include <QLabel>
#include <QMenuBar>
#include <QScrollBar>
#include <QStyle>
#include <QStyleOptionButton>
#include <QTextLayout>
#include <QToolBar>
#include <QToolButton>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

using Painter = std::function<QImage(MainWindow&, PseudoLanguage const&)>;
Q_DECLARE_METATYPE(Painter)

// What fails, and the path that the message names.
using Failure = std::function<QPair<QString, QString>(TestRun const&)>;
Q_DECLARE_METATYPE(Failure)

namespace {

// Each has something at an end that would change places.
QByteArray const OddLog = entry("09:00:00.000", "Error", "\"quoted\" and /at/the/end/") +
                          entry("09:00:01.000", "Warning", "(12, 13) ends.") +
                          entry("09:00:02.500", "Trace", "/home/ada/x.log: done!");

QByteArray const OddSettings("<VelocorSettings>\n<Editor>\n<font>.*,10</font>\n"
                             "<path>/usr/share/velocor/</path>\n</Editor>\n</VelocorSettings>\n");

// The part of a picture that is not its background, wherever it is in there.
QImage ink(QImage const& picture)
{
    const QImage image = picture.convertToFormat(QImage::Format_RGB32);
    const QRgb ground = image.pixel(0, 0);
    QRect found;
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            if (image.pixel(x, y) != ground)
                found |= QRect(x, y, 1, 1);
        }
    }
    return image.copy(found);
}

QImage pictureOf(QWidget* widget)
{
    return widget->grab().toImage();
}

// Without the lines between cells.
QImage pictureOf(QAbstractItemView* view, QModelIndex const& cell)
{
    return ink(view->viewport()->grab(view->visualRect(cell).adjusted(2, 2, -2, -2)).toImage());
}

// Whether the characters of a part of a text follow each other from left to right, although the
// text does not.
bool readsLeftToRight(QString const& text, QString const& part)
{
    const int start = text.indexOf(part);
    if (start < 0)
        return false;
    QFont font = QApplication::font();
    font.setLetterSpacing(QFont::AbsoluteSpacing, 1); // without ligatures: one glyph a character
    QTextLayout layout(text, font);
    QTextOption option;
    option.setTextDirection(Qt::RightToLeft);
    layout.setTextOption(option);
    layout.beginLayout();
    QTextLine line = layout.createLine();
    line.setLineWidth(100000);
    layout.endLayout();
    qreal last = -1;
    for (int i = start; i < start + part.size(); ++i) {
        // Not cursorToX(), whose place between two directions depends on the version of Qt.
        const QList<QGlyphRun> runs = line.glyphRuns(i, 1);
        if (runs.size() != 1 || runs[0].positions().isEmpty())
            return false;
        const qreal left = runs[0].positions().at(0).x();
        if (left <= last)
            return false;
        last = left;
    }
    return true;
}

int leftOf(QWidget const* widget)
{
    return widget->mapTo(widget->window(), QPoint()).x();
}

} // namespace

class tst_MirroredWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void staysLeftToRight_data();
    void staysLeftToRight();
    void pathsInSentences_data();
    void pathsInSentences();
    void pathsInErrors_data();
    void pathsInErrors();
    void controlsAreMirrored();
    void sidesOfTheLog();
    void iconsAreNotMirrored();
    void barsAndTimes();
    void keysOfTheLog();
};

void tst_MirroredWindow::staysLeftToRight_data()
{
    QTest::addColumn<Painter>("paint");
    const auto row = [](char const* name, Painter const& paint) {
        QTest::newRow(name) << paint;
    };
    const auto cell = [](int line, int column) {
        return [line, column](MainWindow& window, PseudoLanguage const&) {
            return pictureOf(View(window), View(window)->model()->index(line, column));
        };
    };
    row("time", cell(0, LogModel::TimeColumn));
    row("quotes", cell(0, LogModel::MessageColumn));
    row("parentheses", cell(1, LogModel::MessageColumn));
    row("path", cell(2, LogModel::MessageColumn));
    row("titles of columns", [](MainWindow& window, PseudoLanguage const&) {
        // The titles themselves are translated: black if one begins at the left of its column.
        auto* header = View(window)->horizontalHeader();
        const QRect start(header->sectionViewportPosition(LogModel::MessageColumn), 3, 24, 16);
        const QImage title = header->viewport()->grab(start).toImage();
        QImage where(16, 16, QImage::Format_RGB32);
        where.fill(ink(title).width() > 4 ? Qt::black : Qt::white);
        return where;
    });
    row("match of the filter", [](MainWindow& window, PseudoLanguage const& language) {
        Child<QLineEdit>(&window, language.of("Filter by text"))->setText("ada");
        [&] {
            QTRY_COMPARE_WITH_TIMEOUT(Rows(window), 1, Patience);
        }();
        return pictureOf(View(window), View(window)->model()->index(0, LogModel::MessageColumn));
    });
    row("wrapped message", [](MainWindow& window, PseudoLanguage const&) {
        View(window)->SetLineWrap(true);
        return pictureOf(View(window), View(window)->model()->index(2, LogModel::MessageColumn));
    });
    row("current line", [](MainWindow& window, PseudoLanguage const&) {
        View(window)->GoToRow(2);
        return ink(pictureOf(window.findChild<LongText*>()->viewport()));
    });
    row("line numbers", [](MainWindow& window, PseudoLanguage const&) {
        Panel(window)->SetLineNumbers(true);
        return pictureOf(window.findChild<LineNumberMargin*>()).copy(0, 0, 40, 50);
    });
    const auto setting = [](int item, int column) {
        return [item, column](MainWindow& window, PseudoLanguage const&) {
            window.findChild<FileTabs*>()->setCurrentIndex(1);
            auto* tree = window.findChild<SettingsTree*>();
            return pictureOf(tree, ItemCell(tree, 0, item, column));
        };
    };
    row("key of a setting", setting(1, 0));
    row("value of a setting", setting(1, 1));
    row("expression in a setting", setting(0, 1));
    row("file of settings as text", [](MainWindow& window, PseudoLanguage const&) {
        window.findChild<FileTabs*>()->setCurrentIndex(1);
        QTest::keyClick(window.findChild<SettingsTree*>(), Qt::Key_T, Qt::ControlModifier);
        return pictureOf(window.findChild<NumberedText*>()).copy(0, 0, 300, 150);
    });
}

void tst_MirroredWindow::staysLeftToRight()
{
    QFETCH(Painter, paint);
    QImage pictures[2];
    for (auto writing : {PseudoLanguage::Accented, PseudoLanguage::Mirrored}) {
        const PseudoLanguage language(writing);
        const WindowTest test(OddLog);
        const QString settings = test.folder() + "a.cfg";
        QVERIFY(TestFiles::write(settings, OddSettings));
        const auto window = WindowTest::show({settings});
        QCOMPARE(window->isRightToLeft(), writing == PseudoLanguage::Mirrored);
        window->findChild<FileTabs*>()->setCurrentIndex(0);
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
        pictures[writing] = paint(*window, language);
    }
    QVERIFY(pictures[0].width() > 8);
    QCOMPARE(pictures[1], pictures[0]);
}

void tst_MirroredWindow::pathsInSentences_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::newRow("file that is missing") << QByteArray();
    QTest::newRow("settings that are damaged") << QByteArray("<Velocor");
}

void tst_MirroredWindow::pathsInSentences()
{
    QFETCH(QByteArray, content);
    const PseudoLanguage language(PseudoLanguage::Mirrored);
    const WindowTest test(OddLog);
    const QString path = test.folder() + "office.cfg";
    if (!content.isEmpty())
        QVERIFY(TestFiles::write(path, content));
    const auto window = WindowTest::show({path});
    QTest::keyClick(window.get(), Qt::Key_F9);
    QStringList texts;
    const QList<QLabel*> labels = window->findChildren<QLabel*>();
    for (QLabel const* label : labels) {
        if (label->text().contains(path))
            texts.append(label->text());
    }
    QVERIFY(!texts.isEmpty());
    for (QString const& text : qAsConst(texts))
        QVERIFY2(readsLeftToRight(text, path), qPrintable(text));
    const QString place = Child<QLabel>(window.get(), language.of("Documents"))->text();
    QVERIFY2(readsLeftToRight(place, test.folder() + "documents/"), qPrintable(place));
}

void tst_MirroredWindow::pathsInErrors_data()
{
    QTest::addColumn<Failure>("fail");
    const auto row = [](char const* name, Failure const& fail) {
        QTest::newRow(name) << fail;
    };
    row("log that is a folder", [](TestRun const& run) {
        TorkLog::logger()->setEnable(true);
        QFile::remove(run.logFile());
        QDir().mkpath(run.logFile());
        return qMakePair(LogHealth().Check(), run.logFile());
    });
    row("folder that cannot be created", [](TestRun const& run) {
        const QString folder = run.logFile() + "/states/";
        return qMakePair(SavedStates(folder).Keep(run.logFile()), folder);
    });
    row("file that is gone", [](TestRun const& run) {
        QString error;
        const QString original = run.folder() + "gone.cfg";
        SettingsFileWriter::SaveCopy(run.folder() + "a.cfg", original, &error);
        return qMakePair(error, original);
    });
    row("backup that is a folder", [](TestRun const& run) {
        QString error;
        QDir().mkpath(run.logFile() + ".bak");
        SettingsFileWriter::KeepBackup(run.logFile(), &error);
        return qMakePair(error, run.logFile() + ".bak");
    });
}

void tst_MirroredWindow::pathsInErrors()
{
    QFETCH(Failure, fail);
    const PseudoLanguage language(PseudoLanguage::Mirrored);
    const TestRun run(OddLog);
    const auto failed = fail(run);
    QVERIFY2(readsLeftToRight(failed.first, failed.second), qPrintable(failed.first));
}

void tst_MirroredWindow::controlsAreMirrored()
{
    const PseudoLanguage language(PseudoLanguage::Mirrored);
    const WindowTest test(OddLog);
    const auto window = WindowTest::show();
    const QList<QAction*> menus = window->menuBar()->actions();
    QVERIFY(window->menuBar()->actionGeometry(menus.first()).left() >
            window->menuBar()->actionGeometry(menus.last()).left());
    auto const* tools = window->findChild<QToolBar*>();
    QVERIFY(leftOf(tools->widgetForAction(tools->actions().first())) >
            leftOf(tools->widgetForAction(tools->actions().last())));
    QVERIFY(leftOf(Child<QLineEdit>(window.get(), language.of("Filter by text"))) >
            leftOf(Child<QToolButton>(window.get(), language.of("Earlier filters"))));
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QVERIFY(leftOf(Child<QLineEdit>(window.get(), language.of("Find text"))) >
            leftOf(Child<QToolButton>(window.get(), language.of("Close find bar"))));
}

// Time, severity, message, scroll bar, ticks.
void tst_MirroredWindow::sidesOfTheLog()
{
    const PseudoLanguage language(PseudoLanguage::Mirrored);
    const WindowTest test(DemoLog::run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView const* view = View(*window);
    QVERIFY(view->columnViewportPosition(LogModel::TimeColumn) <
            view->columnViewportPosition(LogModel::MessageColumn));
    QVERIFY(leftOf(view->viewport()) < leftOf(view->verticalScrollBar()));
    QVERIFY(leftOf(view->verticalScrollBar()) < leftOf(window->findChild<LogOverview*>()));
}

// Those of severities, and the check marks.
void tst_MirroredWindow::iconsAreNotMirrored()
{
    QImage icons[2];
    QImage checks[2];
    for (auto writing : {PseudoLanguage::Accented, PseudoLanguage::Mirrored}) {
        const PseudoLanguage language(writing);
        const WindowTest test(OddLog);
        const auto window = WindowTest::show();
        const QModelIndex cell = View(*window)->model()->index(0, LogModel::SeverityColumn);
        const QRect icon(View(*window)->visualRect(cell).topLeft(), QSize(22, 22));
        icons[writing] = ink(View(*window)->viewport()->grab(icon).toImage());
        auto* box = Child<QCheckBox>(window.get(), language.of("Match case"));
        box->setChecked(true);
        QStyleOptionButton option;
        option.initFrom(box);
        const QRect check =
            box->style()->subElementRect(QStyle::SE_CheckBoxIndicator, &option, box);
        checks[writing] = box->grab(check).toImage();
    }
    QVERIFY(icons[0].width() > 8);
    QCOMPARE(icons[1], icons[0]);
    QVERIFY(checks[0].width() > 8);
    QCOMPARE(checks[1], checks[0]);
}

// Later times are on the right, as are their labels.
void tst_MirroredWindow::barsAndTimes()
{
    QByteArray log;
    for (int i = 0; i < 100; ++i)
        log += entry(QTime(9, 0).addSecs(i < 90 ? i / 10 : 3600).toString("HH:mm:ss.zzz"), "Trace",
                     "x");
    QImage pictures[2];
    for (auto writing : {PseudoLanguage::Accented, PseudoLanguage::Mirrored}) {
        const PseudoLanguage language(writing);
        const WindowTest test(log);
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
        auto* strip = window->findChild<ActivityStrip*>();
        QSignalSpy shown(strip, &ActivityStrip::shown);
        strip->SetShown(true);
        QTRY_VERIFY_WITH_TIMEOUT(!shown.isEmpty(), Patience);
        pictures[writing] = pictureOf(strip);
    }
    QCOMPARE(pictures[1], pictures[0]);
}

// Left folds what is below a heading, as the arrow of the heading looks.
void tst_MirroredWindow::keysOfTheLog()
{
    const PseudoLanguage language(PseudoLanguage::Mirrored);
    const WindowTest test(OddLog);
    const auto window = WindowTest::show();
    Panel(*window)->SetAllFiles(true);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    LogView* view = View(*window);
    view->setCurrentIndex(view->model()->index(0, 0));
    const QRect heading(0, 0, view->viewport()->width() / 8, view->rowHeight(0));
    QVERIFY(ink(view->viewport()->grab(heading).toImage()).width() > 8);
    QTest::keyClick(view, Qt::Key_Left);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(view, Qt::Key_Right);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
}

QTEST_MAIN(tst_MirroredWindow)
#include "tst_MirroredWindow.moc"
