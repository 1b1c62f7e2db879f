// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What the window keeps between two runs, and its small helpers.

#include "WindowTest.h"

#include "app/report/Report.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunningLog.h"
#include "app/window/RecentFiles.h"
#include "app/window/SystemReport.h"
#include "app/window/WindowSettings.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/SeverityIcons.h"
#include "support/ProcessLimits.h"

#include <QCryptographicHash>
#include <QMenu>
#include <QScreen>

#include <algorithm>
#include <cmath>

using namespace Velocor;

class tst_WindowState : public QObject
{
    Q_OBJECT

private slots:
    void texts_data();
    void texts();
    void textsOfEarlierVersions_data();
    void textsOfEarlierVersions();
    void fullDiskLeavesTheFile();
    void numbers_data();
    void numbers();
    void loadLogsNothing();
    void oddItemsDoNotDamageTheFile_data();
    void oddItemsDoNotDamageTheFile();
    void damagedFile();
    void damagedFileOfAnOddProduct();
    void damagedTwice();
    void damagedFileThatCannotBeMoved();
    void geometry_data();
    void geometry();
    void maximized();
    void recentFiles();
    void recentMenu();
    void fileSize_data();
    void fileSize();
    void withoutALog();
    void report();
    void reportOfATroubledLog();
    void fullDiskLeavesTheOldReport();
    void severityIcons();
};

void tst_WindowState::texts_data()
{
    QTest::addColumn<QString>("text");
    QTest::newRow("plain") << "/home/ada/app.log";
    QTest::newRow("markup") << "<a> & \"b\" 'c'";
    QTest::newRow("end of CDATA") << "<x]]>";
    QTest::newRow("placeholder") << "%1 %L2 %%";
    QTest::newRow("placeholder in a file name") << "/a/plan%2Ffinal.txt";
    QTest::newRow("beyond ASCII") << QString::fromUtf8("/K\xC3\xB6ln/\xE2\x82\xAC");
    QTest::newRow("backslashes") << "\\u0041 \\ \\\\u";
    QTest::newRow("control characters") << "a\tb\nc";
    QTest::newRow("blanks around") << "  x  ";
    QTest::newRow("empty") << "";
}

void tst_WindowState::texts()
{
    QFETCH(QString, text);
    const WindowTest test;
    {
        WindowSettings settings(test.folder() + "data/");
        settings.SetText("key", text);
        QCOMPARE(settings.Save(), QString());
    }
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Load(), QString());
    QCOMPARE(settings.Text("key"), text);
}

void tst_WindowState::textsOfEarlierVersions_data()
{
    QTest::addColumn<QByteArray>("stored");
    QTest::addColumn<QString>("text");
    QTest::newRow("plain") << QByteArray("/a/b_20c.log|/d e.log") << "/a/b_20c.log|/d e.log";
    QTest::newRow("markup") << QByteArray("<![CDATA[/a/R&D]]>") << "/a/R&D";
    QTest::newRow("beyond ASCII") << QByteArray("/K\\u00f6ln") << QString::fromUtf8("/Köln");
    QTest::newRow("both") << QByteArray("<![CDATA[R&D/\\u20ac\\u0025]]>")
                          << QString::fromUtf8("R&D/€%");
    QTest::newRow("empty") << QByteArray() << "";
}

void tst_WindowState::textsOfEarlierVersions()
{
    QFETCH(QByteArray, stored);
    const WindowTest test;
    QVERIFY(TestFiles::write(test.settingsFile(), "<VelocorSettings><MainWindow><key>" + stored +
                                                      "</key></MainWindow></VelocorSettings>"));
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Load(), QString());
    QTEST(settings.Text("key"), "text");
}

void tst_WindowState::fullDiskLeavesTheFile()
{
    const WindowTest test;
    WindowSettings settings(test.folder() + "data/");
    settings.SetText("key", "old");
    QCOMPARE(settings.Save(), QString());
    const QByteArray old = TestFiles::read(test.settingsFile());

    settings.SetText("key", QString(1000, 'v'));
    if (!ProcessLimits::limitFileSize(100))
        QSKIP("the size of files cannot be limited here");
    const QString error = settings.Save();
    ProcessLimits::unlimitFileSize();
    QVERIFY(!error.isEmpty());
    QCOMPARE(TestFiles::read(test.settingsFile()), old);
}

void tst_WindowState::numbers_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QList<int>>("expected");
    QTest::newRow("plain") << "1,20,300" << QList<int>({1, 20, 300});
    QTest::newRow("empty") << "" << QList<int>();
    QTest::newRow("no number") << "1,x" << QList<int>();
    QTest::newRow("negative") << "1,-2" << QList<int>();
    QTest::newRow("absurd") << "1,2000000000" << QList<int>();
}

void tst_WindowState::numbers()
{
    QFETCH(QString, text);
    WindowSettings settings("/nowhere/");
    settings.SetText("key", text);
    QTEST(settings.Numbers("key"), "expected");
}

void tst_WindowState::loadLogsNothing()
{
    const WindowTest test;
    QVERIFY(
        TestFiles::write(test.settingsFile(),
                         "<VelocorSettings><MainWindow><k>v</k></MainWindow></VelocorSettings>"));
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Load(), QString());
    QCOMPARE(settings.Text("k"), QString("v"));
    QVERIFY(!QFile::exists(test.logFile()));
}

void tst_WindowState::oddItemsDoNotDamageTheFile_data()
{
    QTest::addColumn<QByteArray>("items");
    QTest::newRow("placeholder") << QByteArray("<Other><x>%1</x></Other>");
    QTest::newRow("placeholder in an item of the window")
        << QByteArray("<MainWindow><panes>%1</panes></MainWindow>");
    QTest::newRow("end of CDATA") << QByteArray("<Other><x>y]]&gt;z</x></Other>");
    QTest::newRow("section beyond ASCII") << QByteArray("<\xC3\x96><x>y</x></\xC3\x96>");
    QTest::newRow("key beyond ASCII") << QByteArray("<Other><\xC3\x96>y</\xC3\x96></Other>");
}

void tst_WindowState::oddItemsDoNotDamageTheFile()
{
    QFETCH(QByteArray, items);
    const WindowTest test;
    const QByteArray flag = "<MainWindow><placesShown>yes</placesShown></MainWindow>";
    QVERIFY(TestFiles::write(test.settingsFile(),
                             "<VelocorSettings>" + items + flag + "</VelocorSettings>"));
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Load(), QString());
    QCOMPARE(settings.Save(), QString());

    WindowSettings again(test.folder() + "data/");
    QCOMPARE(again.Load(), QString());
    QVERIFY(again.Flag("placesShown", false));
}

void tst_WindowState::damagedFile()
{
    const WindowTest test;
    const QByteArray damaged("<VelocorSettings><MainWin");
    QVERIFY(TestFiles::write(test.settingsFile(), damaged));
    WindowSettings settings(test.folder() + "data/");
    const QString told = settings.Load();
    QVERIFY2(told.contains("velocor.cfg.damaged-1"), qPrintable(told));
    QCOMPARE(TestFiles::read(test.settingsFile() + ".damaged-1"), damaged);
    QVERIFY(!QFile::exists(test.settingsFile()));
    QCOMPARE(settings.Save(), QString());
    QVERIFY(QFile::exists(test.settingsFile()));
}

void tst_WindowState::damagedFileOfAnOddProduct()
{
    const WindowTest test;
    const QString folder = test.folder() + "100%1 %2/";
    QVERIFY(TestFiles::write(folder + "velocor.cfg", "damaged"));
    WindowSettings settings(folder);
    QVERIFY(settings.Load().contains("velocor.cfg.damaged-1"));
    QCOMPARE(TestFiles::read(folder + "velocor.cfg.damaged-1"), QByteArray("damaged"));
}

void tst_WindowState::damagedTwice()
{
    const WindowTest test;
    QVERIFY(TestFiles::write(test.settingsFile() + ".damaged-1", "first"));
    QVERIFY(TestFiles::write(test.settingsFile(), "second"));
    WindowSettings settings(test.folder() + "data/");
    QVERIFY(settings.Load().contains("velocor.cfg.damaged-2"));
    QCOMPARE(TestFiles::read(test.settingsFile() + ".damaged-1"), QByteArray("first"));
    QCOMPARE(TestFiles::read(test.settingsFile() + ".damaged-2"), QByteArray("second"));
}

// A directory cannot be read as a file, and is ignored.
void tst_WindowState::damagedFileThatCannotBeMoved()
{
    const WindowTest test;
    QVERIFY(QDir().mkpath(test.settingsFile() + "/in the way"));
    WindowSettings settings(test.folder() + "data/");
    QVERIFY(!settings.Load().isEmpty());
    QCOMPARE(settings.Save(), QString());
    QVERIFY(QFileInfo(test.settingsFile() + "/in the way").isDir());
}

void tst_WindowState::geometry_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<bool>("isStored");
    QTest::newRow("a place on the screen") << "100,120,500,400" << true;
    QTest::newRow("nothing stored") << "" << false;
    QTest::newRow("not four numbers") << "1,2,3" << false;
    QTest::newRow("no numbers") << "a,b,c,d" << false;
}

void tst_WindowState::geometry()
{
    QFETCH(QString, stored);
    QFETCH(bool, isStored);
    const WindowTest test;
    if (!stored.isEmpty())
        QVERIFY(TestFiles::write(test.settingsFile(),
                                 "<VelocorSettings><ApplicationScreens><MainWindow>" +
                                     stored.toLatin1() +
                                     "</MainWindow></ApplicationScreens></VelocorSettings>"));
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Load(), QString());
    QWidget window;
    window.resize(432, 234);
    settings.RestoreGeometry(&window);
    if (isStored)
        QCOMPARE(window.geometry(), QRect(100, 120, 500, 400));
    else
        QCOMPARE(window.size(), QSize(432, 234));

    settings.NoteGeometry(&window);
    QWidget second;
    settings.RestoreGeometry(&second);
    QCOMPARE(second.size(), window.size());
}

void tst_WindowState::maximized()
{
    const WindowTest test;
    WindowSettings settings(test.folder() + "data/");
    QWidget window;
    window.setGeometry(100, 120, 500, 400);
    window.setWindowState(Qt::WindowMaximized);
    settings.NoteGeometry(&window);
    QWidget second;
    settings.RestoreGeometry(&second);
    QVERIFY(second.windowState() & Qt::WindowMaximized);
}

void tst_WindowState::recentFiles()
{
    QMenu menu;
    RecentFiles recent(&menu);
    QVERIFY(!menu.isEnabled());
    recent.Add("/a");
    recent.Add("/b");
    recent.Add("/a");
    QCOMPARE(recent.list(), QString("/a|/b"));
    recent.Add("/has|bar");
    QCOMPARE(recent.list(), QString("/a|/b"));
    recent.Remove("/a");
    QCOMPARE(recent.list(), QString("/b"));
    for (int i = 0; i < 20; ++i)
        recent.Add(QString("/%1").arg(i));
    QCOMPARE(recent.list().split('|').size(), int(RecentFiles::MaximumFiles));
    recent.Clear();
    QCOMPARE(recent.list(), QString());
    QVERIFY(!menu.isEnabled());
    recent.SetList("|/x||/y|");
    QCOMPARE(recent.list(), QString("/x|/y"));
}

void tst_WindowState::recentMenu()
{
    QMenu menu;
    RecentFiles recent(&menu);
    recent.SetList("/one/a&b.log|/two/c.log");
    QVERIFY(menu.toolTipsVisible());
    const QList<QAction*> actions = menu.actions();
    QCOMPARE(actions.size(), 4);
    QCOMPARE(actions[0]->text(), QString("&1 a&&b.log"));
    QCOMPARE(actions[0]->toolTip(), QString("/one/a&b.log"));
    QVERIFY(actions[2]->isSeparator());
    QCOMPARE(actions[3]->text(), QString("&Clear"));

    QSignalSpy chosen(&recent, &RecentFiles::fileChosen);
    actions[0]->trigger();
    QCOMPARE(chosen.count(), 1);
    QCOMPARE(chosen[0][0].toString(), QString("/one/a&b.log"));
    actions[3]->trigger();
    QCOMPARE(chosen.count(), 1);
    QCOMPARE(recent.list(), QString());
}

void tst_WindowState::fileSize_data()
{
    QTest::addColumn<qint64>("bytes");
    QTest::addColumn<QString>("expected");
    QTest::newRow("none") << qint64(0) << "0 bytes";
    QTest::newRow("bytes") << qint64(999) << "999 bytes";
    QTest::newRow("a tenth") << qint64(1234) << "1.2 kB";
    QTest::newRow("whole") << qint64(12340) << "12 kB";
    QTest::newRow("next unit") << qint64(999600) << "1.0 MB";
    QTest::newRow("large") << qint64(1) * 5000000000 << "5.0 GB";
    QTest::newRow("beyond the last unit") << qint64(1) * 5000000000000000 << "5,000 TB";
}

void tst_WindowState::fileSize()
{
    QFETCH(qint64, bytes);
    QTEST(FileSizeText(bytes), "expected");
}

void tst_WindowState::withoutALog()
{
    const WindowTest test;
    TorkLog::shutdown();
    QCOMPARE(RunningLog::FileName(), QString());
    QCOMPARE(LogPreferences::FileName(), QString());
    QCOMPARE(LogPreferences::Read().dateFormat, QString("yyyy-MM-dd hh:mm:ss.z"));
    QCOMPARE(LogPreferences().Apply(), QString("There is no log."));
    const QString facts = SystemReport::Facts(test.settingsFile());
    QVERIFY2(facts.contains("Log: none\n"), qPrintable(facts));
}

void tst_WindowState::report()
{
    const WindowTest test;
    const QString facts = SystemReport::Facts(test.settingsFile());
    for (QString const& expected :
         {QString("Program: Velocor "), QString("Running with Qt: ") + qVersion(),
          QString("Organization: Org\n"), QString("Product: Product\n"), QString("Locale: "),
          QString("Style: "), QString("Screen 1: "), "Data: " + test.folder() + "data/ (",
          "Log file: " + test.logFile() + " ("})
        QVERIFY2(facts.contains(expected), qPrintable("missing: " + expected + "\n" + facts));
}

void tst_WindowState::reportOfATroubledLog()
{
    const WindowTest test;
    QVERIFY(QDir().mkpath(test.logFile()));
    TorkLog::logger()->trace("lost");
    TorkLog::logger()->setEnable(false);
    const QString facts = SystemReport::Facts(test.settingsFile());
    QVERIFY2(facts.contains("Log: off, ") && facts.contains(", last error: "), qPrintable(facts));
}

namespace {

double Luminance(QColor const& color)
{
    const auto linear = [](double part) {
        return part <= 0.03928 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) +
           0.0722 * linear(color.blueF());
}

double Contrast(QColor const& a, QColor const& b)
{
    const auto both = std::minmax({Luminance(a), Luminance(b)});
    return (both.second + 0.05) / (both.first + 0.05);
}

} // namespace

void tst_WindowState::fullDiskLeavesTheOldReport()
{
    const WindowTest test;
    const QString path = test.folder() + "report.zip";
    QVERIFY(TestFiles::write(path, "old"));
    QByteArray random;
    for (int i = 0; i < 20000; ++i)
        random += QCryptographicHash::hash(QByteArray::number(i), QCryptographicHash::Md5).toHex();
    Redactor redactor;
    const Report report({{"Part", random, {}}}, redactor);
    if (!ProcessLimits::limitFileSize(1000))
        QSKIP("the size of files cannot be limited here");
    const QString error = report.Save(path);
    ProcessLimits::unlimitFileSize();
    QVERIFY(!error.isEmpty());
    QCOMPARE(TestFiles::read(path), QByteArray("old"));
}

void tst_WindowState::severityIcons()
{
    QPalette dark;
    dark.setColor(QPalette::Base, Qt::black);
    QPalette light;
    light.setColor(QPalette::Base, Qt::white);
    QVERIFY(SeverityIcons::IsDark(dark) && !SeverityIcons::IsDark(light));
    QVERIFY(SeverityIcons::Icon(LogEntry::None, light).isNull());
    for (int i = LogEntry::Trace; i < LogEntry::None; ++i) {
        const auto severity = static_cast<LogEntry::Severity>(i);
        const auto image = [&](QPalette const& palette) {
            return SeverityIcons::Icon(severity, palette).pixmap(16).toImage();
        };
        QVERIFY(!image(light).isNull());
        // Trace has the color of the text, which is the same in both here.
        const bool isSame = severity == LogEntry::Trace;
        QCOMPARE(image(light) == image(dark), isSame);
        QCOMPARE(SeverityIcons::Color(severity, light) == SeverityIcons::Color(severity, dark),
                 isSame);
        for (QPalette const& palette : {light, dark}) {
            const QColor color = SeverityIcons::Color(severity, palette);
            if (!isSame)
                QVERIFY2(Contrast(color, palette.color(QPalette::Base)) > 4.5,
                         qPrintable(color.name()));
        }
    }
}

QTEST_MAIN(tst_WindowState)
#include "tst_WindowState.moc"
