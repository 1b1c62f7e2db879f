// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Files that the window opens by itself: those of the command line and of the last session, and
// standard input; and what tabs and the window are called.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/DistinctNames.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QMenu>

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;

namespace {

// A pipe in the place of standard input.
class InputPipe
{
public:
    InputPipe() : m_before(dup(STDIN_FILENO))
    {
        int ends[2] = {-1, -1};
        isOpen = pipe(ends) == 0 && dup2(ends[0], STDIN_FILENO) == STDIN_FILENO;
        close(ends[0]);
        m_end = ends[1];
        fcntl(m_end, F_SETFL, O_NONBLOCK);
    }

    ~InputPipe()
    {
        End();
        dup2(m_before, STDIN_FILENO);
        close(m_before);
    }

    InputPipe(InputPipe const&) = delete;
    InputPipe& operator=(InputPipe const&) = delete;

    bool Write(QByteArray const& text) const
    {
        return write(m_end, text.constData(), static_cast<size_t>(text.size())) == text.size();
    }

    // Whether somebody reads at the other end.
    bool HasReader() const { return Write("x") || errno == EAGAIN; }

    void End()
    {
        if (m_end >= 0)
            close(m_end);
        m_end = -1;
    }

    bool isOpen = false;

private:
    int m_before;
    int m_end = -1;
};

QStringList TabTexts(MainWindow& window)
{
    auto const* tabs = window.findChild<FileTabs*>();
    QStringList texts;
    for (int i = 0; i < tabs->count(); ++i)
        texts.append(tabs->tabText(i));
    return texts;
}

} // namespace

class tst_FilesAtStart : public WindowTestCase
{
    Q_OBJECT

private slots:
    void initTestCase() override;

    void opensFiles();
    void tellsWhatItCannotOpen();
    void opensOnlyTheFirstFiles();
    void followsStandardInput();
    void closingTheTabEndsStandardInput();
    void endOfStandardInputKeepsTheTab();
    void neverWaitsForStandardInput();
    void readsAPipeOfTheShell();

    void reopensFiles();
    void reopensOnlyWhatIsThere();
    void reopensNothingWhenSwitchedOff();
    void reopensNoStandardInput();
    void opensGivenFilesAfterThoseOfTheSession();
    void paintsBeforeItOpensFiles();

    void distinctNames_data();
    void distinctNames();
    void tabsOfEqualNamesSayTheirFolder();
    void titleSaysTheFile();
    void boxesHaveTheCaption();
};

void tst_FilesAtStart::initTestCase()
{
    WindowTestCase::initTestCase();
    signal(SIGPIPE, SIG_IGN);
}

void tst_FilesAtStart::opensFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const QString log = test.folder() + "some.log";
    const QString settings = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(log, run(5, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show({settings, log});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "some.cfg", "some.log"}),
                              Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QVERIFY(!window->findChild<NoticeBar*>()->isVisible());
    QCOMPARE(Action(*window, "Open Recent")->menu()->actions().at(0)->toolTip(), log);
}

void tst_FilesAtStart::tellsWhatItCannotOpen()
{
    const WindowTest test;
    const QString pipe = test.folder() + "pipe";
    const QString log = test.folder() + "some.log";
    QCOMPARE(mkfifo(qPrintable(pipe), 0600), 0);
    QVERIFY(TestFiles::write(log, run(5, QTime(9, 0), "y")));
    const auto window =
        WindowTest::show({test.folder() + "missing", pipe, log, test.folder() + "documents"});
    auto const* notice = window->findChild<NoticeBar*>();
    QVERIFY(notice->isVisible());
    QCOMPARE(notice->text().split('\n'),
             QStringList({test.folder() + "missing does not exist", pipe + " is not a regular file",
                          test.folder() + "documents is a folder"}));
    QCOMPARE(TabTexts(*window), QStringList({"Log", "some.log"}));
}

void tst_FilesAtStart::opensOnlyTheFirstFiles()
{
    const WindowTest test;
    QStringList files;
    for (int i = 0; i < MainWindow::MaximumFilesAtStart + 2; ++i) {
        files.append(test.folder() + QString("%1.log").arg(i, 3, 10, QChar('0')));
        QVERIFY(TestFiles::write(files.last(), "x\n"));
    }
    const auto window = WindowTest::show(files);
    QCOMPARE(TabTexts(*window).size(), MainWindow::MaximumFilesAtStart + 1);
    QCOMPARE(TabTexts(*window).last(), QString("049.log"));
    QCOMPARE(window->findChild<NoticeBar*>()->text(),
             QString("Only the first 50 of 52 files were opened"));
}

void tst_FilesAtStart::followsStandardInput()
{
    const WindowTest test;
    InputPipe input;
    QVERIFY(input.isOpen);
    const auto window = WindowTest::show({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    QVERIFY(input.Write(entry("09:00:00.000", "Trace", "first")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QVERIFY(input.Write(entry("09:00:01.000", "Error", "second")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogModel const* model = Panel(*window)->model();
    QCOMPARE(model->index(1, LogModel::MessageColumn).data().toString(), QString("second"));
    QVERIFY(Panel(*window)->isFollowing());
    QVERIFY(!Action(*window, "Open Recent")->isEnabled());
}

void tst_FilesAtStart::closingTheTabEndsStandardInput()
{
    const WindowTest test;
    const InputPipe input;
    const auto window = WindowTest::show({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    const QString copy = Panel(*window)->path();
    QVERIFY(QFile::exists(copy));
    QVERIFY(input.HasReader());
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(!input.HasReader(), Patience);
    QVERIFY(!QFileInfo::exists(QFileInfo(copy).path()));
}

void tst_FilesAtStart::endOfStandardInputKeepsTheTab()
{
    const WindowTest test;
    InputPipe input;
    QVERIFY(input.Write(run(5, QTime(9, 0), "y")));
    input.End();
    const auto window = WindowTest::show({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QVERIFY(!window->findChild<NoticeBar*>()->isVisible());
}

// Half a line, and then nothing: the window still answers, and the half line is shown.
void tst_FilesAtStart::neverWaitsForStandardInput()
{
    const WindowTest test;
    const InputPipe input;
    const auto window = WindowTest::show({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    QVERIFY(input.Write("half a line"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Panel(*window)->isPaused());
}

// As that of "velocor <(command)".
void tst_FilesAtStart::readsAPipeOfTheShell()
{
    const WindowTest test;
    int ends[2] = {-1, -1};
    QCOMPARE(pipe(ends), 0);
    const QByteArray text = run(5, QTime(9, 0), "y");
    QCOMPARE(write(ends[1], text.constData(), size_t(text.size())), ssize_t(text.size()));
    const auto window = WindowTest::show({QString("/dev/fd/%1").arg(ends[0])});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window),
                              QStringList({"Log", QString("Pipe %1").arg(ends[0])}), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QVERIFY(!window->findChild<NoticeBar*>()->isVisible());
    fcntl(ends[1], F_SETFL, O_NONBLOCK);
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(write(ends[1], "x", 1) < 0 && errno == EPIPE, Patience);
    close(ends[0]);
    close(ends[1]);
}

// Logs and settings files, in their order, at the tab that was current.
void tst_FilesAtStart::reopensFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const QString log = test.folder() + QString::fromUtf8("K\xC3\xB6ln & <b>.log");
    const QString settings = test.folder() + "some.cfg";
    const QString other = test.folder() + "other.log";
    QVERIFY(TestFiles::write(log, run(500, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(settings, Settings));
    QVERIFY(TestFiles::write(other, run(7, QTime(9, 0), "z")));
    QStringList texts;
    {
        const auto window = WindowTest::show({settings, log, other});
        texts = TabTexts(*window);
        QCOMPARE(texts.size(), 4);
        window->findChild<FileTabs*>()->setCurrentIndex(2);
        window->close();
    }
    const auto window = WindowTest::show();
    QCOMPARE(TabTexts(*window), texts);
    QCOMPARE(window->findChild<FileTabs*>()->currentIndex(), 2);
    QCOMPARE(Panel(*window)->path(), log);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 500, Patience);
    QVERIFY(View(*window)->hasFocus());
    // One that was opened in the background follows its end as well.
    window->findChild<FileTabs*>()->setCurrentIndex(3);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 7, Patience);
}

void tst_FilesAtStart::reopensOnlyWhatIsThere()
{
    const WindowTest test;
    const QString pipe = test.folder() + "pipe.log";
    const QString gone = test.folder() + "gone.log";
    const QString kept = test.folder() + "kept.log";
    for (QString const& file : {pipe, gone, kept})
        QVERIFY(TestFiles::write(file, "x\n"));
    {
        const auto window = WindowTest::show({pipe, kept, gone});
        QCOMPARE(TabTexts(*window).size(), 4);
        window->close();
    }
    QVERIFY(QFile::remove(gone) && QFile::remove(pipe));
    QCOMPARE(mkfifo(qPrintable(pipe), 0600), 0);
    const auto window = WindowTest::show();
    QCOMPARE(TabTexts(*window), QStringList({"Log", "kept.log"}));
    QCOMPARE(window->findChild<FileTabs*>()->currentIndex(), 0);
    QVERIFY(!window->findChild<NoticeBar*>()->isVisible());
}

void tst_FilesAtStart::reopensNothingWhenSwitchedOff()
{
    const WindowTest test;
    const QString log = test.folder() + "some.log";
    QVERIFY(TestFiles::write(log, "x\n"));
    {
        const auto window = WindowTest::show({log});
        QVERIFY(Action(*window, "Reopen Files at Start")->isChecked());
        QTest::keyClick(window.get(), Qt::Key_O, Qt::ControlModifier | Qt::AltModifier);
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(!Action(*window, "Reopen Files at Start")->isChecked());
    QCOMPARE(TabTexts(*window), QStringList({"Log"}));
}

void tst_FilesAtStart::reopensNoStandardInput()
{
    const WindowTest test;
    const InputPipe input;
    {
        const auto window = WindowTest::show({"-"});
        QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window).size(), 2, Patience);
        window->close();
    }
    QVERIFY(!TestFiles::read(test.settingsFile()).contains("<openFiles>/"));
    const auto window = WindowTest::show();
    QCOMPARE(TabTexts(*window), QStringList({"Log"}));
}

void tst_FilesAtStart::opensGivenFilesAfterThoseOfTheSession()
{
    const WindowTest test;
    const QString first = test.folder() + "first.log";
    const QString second = test.folder() + "second.log";
    for (QString const& file : {first, second})
        QVERIFY(TestFiles::write(file, "x\n"));
    QVERIFY(WindowTest::show({first})->close());
    const auto window = WindowTest::show({second});
    QCOMPARE(TabTexts(*window), QStringList({"Log", "first.log", "second.log"}));
    QCOMPARE(Panel(*window)->path(), second);
}

// The window is on the screen before any file is looked at.
void tst_FilesAtStart::paintsBeforeItOpensFiles()
{
    const WindowTest test;
    const QString log = test.folder() + "some.log";
    QVERIFY(TestFiles::write(log, "x\n"));
    QVERIFY(WindowTest::show({log})->close());

    class FirstPaint : public QObject
    {
    public:
        explicit FirstPaint(MainWindow& window) : m_window(window) {}
        int tabs = -1;

    protected:
        bool eventFilter(QObject*, QEvent* event) override
        {
            if (event->type() == QEvent::Paint && tabs < 0)
                tabs = m_window.findChildren<FileTabs*>().size();
            return false;
        }

    private:
        MainWindow& m_window;
    };
    MainWindow window;
    FirstPaint paint(window);
    window.installEventFilter(&paint);
    window.show();
    QTRY_COMPARE_WITH_TIMEOUT(window.findChildren<FileTabs*>().size(), 1, Patience);
    QCOMPARE(paint.tabs, 0);
}

void tst_FilesAtStart::distinctNames_data()
{
    QTest::addColumn<QStringList>("paths");
    QTest::addColumn<QString>("expected");

    const auto row = [](char const* name, QStringList const& paths, char const* expected) {
        QTest::newRow(name) << paths << QString(expected).replace(" - ", QString::fromUtf8(" – "));
    };
    row("none", {}, "");
    row("different names", {"/a/x.log", "/a/y.log"}, "x.log|y.log");
    row("different folders", {"/srv/web/a.log", "/srv/db/a.log"}, "a.log - web|a.log - db");
    row("others stay short", {"/w/a.log", "/b.log", "/d/a.log"}, "a.log - w|b.log|a.log - d");
    row("folders of equal names", {"/x/logs/a.log", "/y/logs/a.log"},
        "a.log - x/logs|a.log - y/logs");
    row("one in the root", {"/a.log", "/x/a.log"}, "a.log - /|a.log - x");
    row("one below the other", {"/x/a.log", "/y/x/a.log"}, "a.log - /x|a.log - y/x");
    row("case makes a difference", {"/x/a.log", "/x/A.log"}, "a.log|A.log");
}

void tst_FilesAtStart::distinctNames()
{
    QFETCH(QStringList, paths);
    QFETCH(QString, expected);
    QCOMPARE(DistinctNames(paths).join('|'), expected);
}

void tst_FilesAtStart::tabsOfEqualNamesSayTheirFolder()
{
    const WindowTest test;
    const QString web = test.folder() + "web/a.log";
    const QString db = test.folder() + "db/a.log";
    QVERIFY(TestFiles::write(web, "x\n") && TestFiles::write(db, "x\n"));
    const auto window = WindowTest::show({web, db});
    QCOMPARE(TabTexts(*window), QStringList({"Log", QString::fromUtf8("a.log – web"),
                                             QString::fromUtf8("a.log – db")}));
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QCOMPARE(TabTexts(*window), QStringList({"Log", "a.log"}));
}

void tst_FilesAtStart::titleSaysTheFile()
{
    const WindowTest test;
    const QString log = test.folder() + "%1 [*].log";
    const QString settings = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(log, "x\n") && TestFiles::write(settings, Settings));
    const auto window = WindowTest::show({log});
    QCOMPARE(window->windowTitle(), QString::fromUtf8("%1 [*][*].log – Caption"));
    window->findChild<FileTabs*>()->setCurrentIndex(0);
    QCOMPARE(window->windowTitle(), QString("Caption"));
    window->OpenFile(settings);
    QCOMPARE(window->windowTitle(), QString::fromUtf8("some.cfg – Caption"));
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QCOMPARE(TabTexts(*window).size(), 2);
    QVERIFY(window->windowTitle().endsWith("Caption"));
}

void tst_FilesAtStart::boxesHaveTheCaption()
{
    const WindowTest test;
    const QString log = test.folder() + "some.log";
    QVERIFY(TestFiles::write(log, "x\n"));
    const auto window = WindowTest::show({log});
    QVERIFY(window->windowTitle() != "Caption");
    QCOMPARE(PlainMessageBox(QMessageBox::Critical, window.get(), "text").windowTitle(),
             QString("Caption"));
}

QTEST_MAIN(tst_FilesAtStart)

#include "tst_FilesAtStart.moc"
