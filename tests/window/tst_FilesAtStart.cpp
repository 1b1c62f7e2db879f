// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Files that the window opens by itself: those of the command line, and standard input.

#include "WindowParts.h"

#include "app/window/widgets/NoticeBar.h"

#include <QLoggingCategory>
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

std::unique_ptr<MainWindow> ShowWith(QStringList const& files)
{
    auto window = std::make_unique<MainWindow>();
    window->OpenAtStart(files);
    window->show();
    if (QTest::qWaitForWindowExposed(window.get()))
        window->activateWindow();
    if (!QTest::qWaitForWindowActive(window.get()))
        qWarning("the window does not get the keyboard focus");
    return window;
}

} // namespace

class tst_FilesAtStart : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanup();

    void opensFiles();
    void tellsWhatItCannotOpen();
    void opensOnlyTheFirstFiles();
    void followsStandardInput();
    void closingTheTabEndsStandardInput();
    void endOfStandardInputKeepsTheTab();
    void neverWaitsForStandardInput();
};

void tst_FilesAtStart::initTestCase()
{
    // The X11 plug-in warns when a window disappears while it is being queried, which would end up
    // in a test's log. The environment would be too late: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
    signal(SIGPIPE, SIG_IGN);
}

void tst_FilesAtStart::cleanup()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
}

void tst_FilesAtStart::opensFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const QString log = test.folder() + "some.log";
    const QString settings = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(log, run(5, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = ShowWith({settings, log});
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
        ShowWith({test.folder() + "missing", pipe, log, test.folder() + "documents"});
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
    const auto window = ShowWith(files);
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
    const auto window = ShowWith({"-"});
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
    const auto window = ShowWith({"-"});
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
    const auto window = ShowWith({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QVERIFY(!window->findChild<NoticeBar*>()->isVisible());
}

// Half a line, and then nothing: the window still answers, and the half line is shown.
void tst_FilesAtStart::neverWaitsForStandardInput()
{
    const WindowTest test;
    const InputPipe input;
    const auto window = ShowWith({"-"});
    QTRY_COMPARE_WITH_TIMEOUT(TabTexts(*window), QStringList({"Log", "Standard input"}), Patience);
    QVERIFY(input.Write("half a line"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Panel(*window)->isPaused());
}

QTEST_MAIN(tst_FilesAtStart)

#include "tst_FilesAtStart.moc"
