// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The program itself, copied into its own installation trees and run as a process.

#include "Installation.h"
#include "ProgramRuns.h"

#include "support/Sanitizers.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonObject>
#include <QRegularExpression>
#include <QStandardPaths>
#include <QTest>

#include <algorithm>
#include <csignal>
#include <sys/stat.h>
#include <unistd.h>

namespace {

// The settings that a first start saves, one per line and sorted, because the table's order is
// random.
QByteArray const FirstSettings("<dateTimeFormat>yyyy-MM-dd hh:mm:ss.z</dateTimeFormat>\n"
                               "<elapsedTimePrefix>dT:</elapsedTimePrefix>\n"
                               "<filePrefix>velocor</filePrefix>\n"
                               "<logElapsedTime>no</logElapsedTime>\n"
                               "<logPipeToConsole>no</logPipeToConsole>\n"
                               "<loggingEnabled>yes</loggingEnabled>\n"
                               "<maxLogFileSize>1000000</maxLogFileSize>\n"
                               "<maxLogFiles>10</maxLogFiles>\n");

// A settings file with its items in a known order; anything else in it is unchanged.
QByteArray WithSortedItems(QByteArray const& file)
{
    const QByteArray head("<LogSettings>\n<config>\n");
    const QByteArray tail("</config>\n</LogSettings>\n");
    if (!file.startsWith(head) || !file.endsWith(tail))
        return file;
    QList<QByteArray> items =
        file.mid(head.size(), file.size() - head.size() - tail.size()).split('\n');
    const QByteArray afterLast = items.takeLast();
    std::sort(items.begin(), items.end());
    return head + items.join('\n') + '\n' + afterLast + tail;
}

bool HasDesktop()
{
    return qgetenv("QT_QPA_PLATFORM") != "offscreen";
}

} // namespace

class tst_Program : public QObject
{
    Q_OBJECT

private slots:
    void firstStart_data();
    void firstStart();
    void launchDataThatIsNoRegularFile_data();
    void launchDataThatIsNoRegularFile();
    void secondStart_data();
    void secondStart();
    void thirdStartWritesOverTheSecond();
    void storedSettings_data();
    void storedSettings();
    void brokenSettings_data();
    void brokenSettings();
    void quitBySignal_data();
    void quitBySignal();
    void manySignals();
    void arguments();
    void bundle_data();
    void bundle();
    void nothingOfQtRunsBeforeTheApplicationObject();
    void startOrder();
    void exitCode_data();
    void exitCode();
    void closingTheWindowQuits();
    void caption_data();
    void caption();
    void windowShowsIdentityAndPlaces();
    void unusableDataFolder_data();
    void unusableDataFolder();
    void dataFolderOfAnotherUser();
    void logFolderRemovedWhileRunning();
};

void tst_Program::firstStart_data()
{
    QTest::addColumn<QByteArray>("launchData");
    QTest::addColumn<QString>("names");

    const QString defaults("yourorganization/yourproduct");
    QTest::newRow("no launch data") << QByteArray() << defaults;
    QTest::newRow("both names") << Option("organization", "Org") + Option("product", "Product")
                                << "Org/Product";
    QTest::newRow("organization only") << Option("organization", "Org") << "Org/yourproduct";
    QTest::newRow("product only") << Option("product", "Product") << "yourorganization/Product";
    QTest::newRow("blanks") << Option("organization", "My Org") + Option("product", "My Product")
                            << "My Org/My Product";
    QTest::newRow("letters beyond ASCII")
        << Option("organization", "K\xC3\xB6ln") + Option("product", "Ger\xC3\xA4t \xE2\x82\xAC")
        << QString::fromUtf8("K\xC3\xB6ln/Ger\xC3\xA4t \xE2\x82\xAC");
    QTest::newRow("ampersand") << Option("product", "P&amp;Q") << "yourorganization/P&Q";
    QTest::newRow("empty organization")
        << Option("organization", "") + Option("product", "Alone") << "Alone";
    QTest::newRow("empty product: Qt substitutes the program's own name")
        << Option("product", "") << "yourorganization/velocor";
    QTest::newRow("empty file") << QByteArray("") << defaults;
    QTest::newRow("malformed") << Option("product", "Product") + "<arg" << defaults;
    QTest::newRow("unknown key") << Option("product", "Product") + Option("colour", "red")
                                 << defaults;
    QTest::newRow("key in capitals") << Option("PRODUCT", "Product") << defaults;
    QTest::newRow("wrapped in a root")
        << "<data>" + Option("product", "Product") + "</data>" << defaults;
    QTest::newRow("10 MB of comment")
        << "<!--" + QByteArray(10 * 1000 * 1000, 'x') + "-->" + Option("product", "Product")
        << "yourorganization/Product";
}

// A first start saves the settings and loads none, so the log begins with the start itself.
void tst_Program::firstStart()
{
    QFETCH(QByteArray, launchData);
    QFETCH(QString, names);
    const Installation installation;
    QVERIFY(installation.installed);
    if (!launchData.isNull())
        QVERIFY(installation.WriteLaunchData(launchData));

    const QString logs = installation.LogFolder(names);
    RunningProgram program(installation);
    const bool started = program.WaitForLog(logs + "velocor.log", StartEntry);
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    QVERIFY2(started, "log: " + TestFiles::read(logs + "velocor.log"));
    if (HasDesktop()) // otherwise it prints the log's location
        QCOMPARE(program.Output(), QByteArray());

    QCOMPARE(QDir(logs).entryList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot),
             QStringList({"logsettings.cfg", "velocor.log"}));
    const QByteArray log = TestFiles::read(logs + "velocor.log");
    QVERIFY2(Matches(log, StartEntry), log);
    QCOMPARE(WithSortedItems(TestFiles::read(logs + "logsettings.cfg")),
             "<LogSettings>\n<config>\n" + FirstSettings + "</config>\n</LogSettings>\n");
    if (!launchData.isNull())
        QCOMPARE(TestFiles::read(installation.root + "/appdata.cfg"), launchData);
}

void tst_Program::launchDataThatIsNoRegularFile_data()
{
    QTest::addColumn<QString>("kind");

    for (char const* kind : {"pipe", "/dev/zero", "/dev/null", "sparse file of 2 GB"})
        QTest::newRow(kind) << QString(kind);
}

// This neither prevents nor delays the start; the defaults apply.
void tst_Program::launchDataThatIsNoRegularFile()
{
    QFETCH(QString, kind);
    Installation installation;
    QVERIFY(installation.installed);
    const QString path = installation.root + "/appdata.cfg";
    if (kind == "pipe")
        QCOMPARE(mkfifo(qPrintable(path), 0600), 0);
    else if (kind.startsWith('/'))
        QVERIFY(QFile::link(kind, path));
    else
        QVERIFY(QFile(path).open(QIODevice::WriteOnly) && QFile::resize(path, 2000000000));
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(installation.Report().value("product").toString(), QString("yourproduct"));
}

void tst_Program::secondStart_data()
{
    QTest::addColumn<QByteArray>("product");
    QTest::addColumn<QString>("folder");

    QTest::newRow("plain") << QByteArray("Product") << "Product";
    QTest::newRow("blanks") << QByteArray("My Product") << "My Product";
    QTest::newRow("letters of Latin-1")
        << QByteArray("Ger\xC3\xA4t") << QString::fromUtf8("Ger\xC3\xA4t");
    QTest::newRow("letters beyond Latin-1")
        << QByteArray("\xE2\x82\xAC") << QString::fromUtf8("\xE2\x82\xAC");
}

// Now the settings file exists, so the log first reports loading it. The log is overwritten from
// the beginning, and the shorter text of the first start is completely covered.
void tst_Program::secondStart()
{
    QFETCH(QByteArray, product);
    QFETCH(QString, folder);
    const Installation installation;
    QVERIFY(installation.installed);
    QVERIFY(installation.WriteLaunchData(Option("product", product)));
    const QString logs = installation.LogFolder("yourorganization/" + folder);

    RunningProgram first(installation);
    QVERIFY(first.WaitForLog(logs + "velocor.log", StartEntry));
    first.Send(SIGTERM);
    QCOMPARE(first.ExitCode(), 0);
    const QByteArray settings = TestFiles::read(logs + "logsettings.cfg");

    const QString path = QString::fromLatin1((logs + "logsettings.cfg").toLatin1());
    const QString expected = Entry("Trace", "Loading configuration from " + path) + StartEntry;
    RunningProgram second(installation);
    const bool started = second.WaitForLog(logs + "velocor.log", expected);
    second.Send(SIGTERM);
    QCOMPARE(second.ExitCode(), 0);
    QVERIFY2(started, "log: " + TestFiles::read(logs + "velocor.log"));
    QVERIFY2(Matches(TestFiles::read(logs + "velocor.log"), expected),
             TestFiles::read(logs + "velocor.log"));
    QCOMPARE(TestFiles::read(logs + "logsettings.cfg"), settings);
}

void tst_Program::thirdStartWritesOverTheSecond()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("0");
    const QString logFile = installation.LogFolder() + "velocor.log";
    for (int start = 1; start <= 2; ++start)
        QCOMPARE(RunProgram(installation.program, {}, installation.environment).exitCode, 0);

    // Whatever is longer than the new text remains after it.
    const QByteArray before = TestFiles::read(logFile) + QByteArray(500, 'x') + "\n";
    QVERIFY(TestFiles::write(logFile, before));
    QCOMPARE(RunProgram(installation.program, {}, installation.environment).exitCode, 0);
    const QByteArray after = TestFiles::read(logFile);
    QCOMPARE(after.size(), before.size());
    const QString settings = installation.LogFolder() + "logsettings.cfg";
    const QString written = Entry("Trace", "Loading configuration from " + settings) + StartEntry;
    const QRegularExpressionMatch match =
        QRegularExpression("\\A" + written).match(QString::fromLatin1(after));
    QVERIFY2(match.hasMatch(), after);
    QCOMPARE(after.mid(match.capturedLength()), before.mid(match.capturedLength()));
}

void tst_Program::storedSettings_data()
{
    QTest::addColumn<QByteArray>("items");
    QTest::addColumn<QString>("rest");

    // %1 in the first entry, which is always the same, is the settings file.
    QTest::newRow("no items: the defaults") << QByteArray("") << StartEntry;
    QTest::newRow("disabled: loading is reported anyway")
        << QByteArray("<loggingEnabled>no</loggingEnabled>\n") << "";
    QTest::newRow("another prefix: the open file stays in use")
        << QByteArray("<filePrefix>other</filePrefix>\n") << StartEntry;
    QTest::newRow("another stamp holds from then on")
        << QByteArray("<dateTimeFormat>'now'</dateTimeFormat>\n")
        << "now Trace app\\.exec\\(\\) starting\n";
    QTest::newRow("elapsed time holds from then on")
        << QByteArray("<logElapsedTime>yes</logElapsedTime>\n")
        << Stamp + " Trace dT:\\[-?\\d+\\] app\\.exec\\(\\) starting\n";
    QTest::newRow("absurd numbers") << QByteArray("<maxLogFiles>99999999999</maxLogFiles>\n"
                                                  "<maxLogFileSize>2147483647</maxLogFileSize>\n")
                                    << StartEntry;
}

void tst_Program::storedSettings()
{
    QFETCH(QByteArray, items);
    QFETCH(QString, rest);
    Installation installation;
    QVERIFY(installation.installed);
    const QString logs = installation.LogFolder();
    const QByteArray settings = "<LogSettings>\n<config>\n" + items + "</config>\n</LogSettings>\n";
    QVERIFY(TestFiles::write(logs + "logsettings.cfg", settings));
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    const QByteArray log = TestFiles::read(logs + "velocor.log");
    const QString loading =
        Entry("Trace", "Loading configuration from " + logs + "logsettings.cfg");
    QVERIFY2(Matches(log, loading + rest), log);
    QCOMPARE(TestFiles::read(logs + "logsettings.cfg"), settings);
    QCOMPARE(QDir(logs).entryList(QDir::AllEntries | QDir::NoDotAndDotDot),
             QStringList({"logsettings.cfg", "velocor.log"}));
}

void tst_Program::brokenSettings_data()
{
    QTest::addColumn<QByteArray>("settings");

    QTest::newRow("empty") << QByteArray("");
    QTest::newRow("cut off") << QByteArray("<LogSettings>\n<config>\n<maxLogFi");
    QTest::newRow("binary") << QByteArray("\x7F\x45\x4C\x46\x00\x01\xFF\xFE", 8);
    QTest::newRow("no XML") << QByteArray("maxLogFiles = 10\n");
}

// The program starts anyway, and its log reports the problem.
void tst_Program::brokenSettings()
{
    QFETCH(QByteArray, settings);
    Installation installation;
    QVERIFY(installation.installed);
    const QString logs = installation.LogFolder();
    QVERIFY(TestFiles::write(logs + "logsettings.cfg", settings));
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    const QByteArray log = TestFiles::read(logs + "velocor.log");
    const QString report = Stamp + " Error TorkErrorHandler::fatalError: [^\n]*\n";
    QVERIFY2(Matches(log, Entry("Trace", "Loading configuration from " + logs + "logsettings.cfg") +
                              report +
                              Entry("Trace", "ConfigFile - Could not parse the input file.") +
                              StartEntry),
             log);
    QCOMPARE(TestFiles::read(logs + "logsettings.cfg"), settings);
}

void tst_Program::quitBySignal_data()
{
    QTest::addColumn<int>("signalNumber");

    QTest::newRow("SIGTERM") << SIGTERM;
    QTest::newRow("SIGINT") << SIGINT;
    QTest::newRow("SIGHUP") << SIGHUP;
}

void tst_Program::quitBySignal()
{
    QFETCH(int, signalNumber);
    const Installation installation;
    QVERIFY(installation.installed);
    const QString logFile = installation.LogFolder() + "velocor.log";
    RunningProgram program(installation);
    QVERIFY(program.WaitForLog(logFile, StartEntry));

    program.Send(signalNumber);
    QCOMPARE(program.ExitCode(), 0);
    QVERIFY2(Matches(TestFiles::read(logFile), StartEntry), TestFiles::read(logFile));
}

void tst_Program::manySignals()
{
    const Installation installation;
    QVERIFY(installation.installed);
    RunningProgram program(installation);
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    // All at the same moment: the process is stopped until they have all been sent.
    program.Send(SIGSTOP);
    for (int i = 0; i < 100; ++i)
        program.Send(i % 2 ? SIGTERM : SIGINT);
    program.Send(SIGCONT);
    QCOMPARE(program.ExitCode(), 0);
}

void tst_Program::arguments()
{
    const Installation installation;
    QVERIFY(installation.installed);
    RunningProgram program(installation, {"--unknown", "file name", QString::fromUtf8("\xC3\xA4")});
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
}

void tst_Program::bundle_data()
{
    QTest::addColumn<QString>("folder");
    QTest::addColumn<QString>("root");

    QTest::newRow("bundle") << "X/Some.app/Contents/MacOS"
                            << "X";
    QTest::newRow("blanks and letters beyond ASCII")
        << QString::fromUtf8("my \xC3\xB6 apps/An App.app/Contents/MacOS")
        << QString::fromUtf8("my \xC3\xB6 apps");
    QTest::newRow("bundle in a bundle") << "X/A.app/Contents/MacOS/Y/B.app/Contents/MacOS"
                                        << "X/A.app/Contents/MacOS/Y";
    QTest::newRow("no bundle") << "X/bin"
                               << "X";
    QTest::newRow("lower case is no bundle") << "X/Some.app/contents/macos"
                                             << "X/Some.app/contents";
}

void tst_Program::bundle()
{
    QFETCH(QString, folder);
    QFETCH(QString, root);
    Installation installation(folder, root);
    QVERIFY(installation.installed);
    QVERIFY(installation.WriteLaunchData(Option("organization", "Org") + Option("product", "Pro")));
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QCOMPARE(result.exitCode, 0);
    const QJsonObject report = installation.Report();
    QCOMPARE(report.value("organization").toString(), QString("Org"));
    QCOMPARE(report.value("product").toString(), QString("Pro"));
    QCOMPARE(report.value("properties").toObject().value("RootPath").toString(),
             installation.root + "/");
    QVERIFY(QFile::exists(installation.LogFolder("Org/Pro") + "velocor.log"));
    QVERIFY(QFile::exists(installation.LogFolder("Org/Pro") + "logsettings.cfg"));
}

// The dynamic loader reports which function of which library the program calls for the first time.
void tst_Program::nothingOfQtRunsBeforeTheApplicationObject()
{
#ifdef TEST_UNDER_ADDRESS_SANITIZER
    QSKIP("The sanitizer starts programs of its own, which the loader reports on as well");
#endif
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("0");
    installation.environment.insert("LD_DEBUG", "bindings");
    installation.environment.insert("LD_DEBUG_OUTPUT", installation.top + "calls");
    QCOMPARE(RunProgram(installation.program, {}, installation.environment).exitCode, 0);

    const QStringList files = QDir(installation.top).entryList({"calls.*"}, QDir::Files);
    QCOMPARE(files.size(), 1);
    const QString byProgram = "binding file " + installation.program + " [0] to ";
    QStringList calls;
    for (QByteArray const& line : TestFiles::read(installation.top + files.first()).split('\n')) {
        if (line.contains(byProgram.toLocal8Bit()))
            calls.append(QString::fromLocal8Bit(line).section(byProgram, 1));
    }
    const int start = calls.indexOf(QRegularExpression(".*`fcntl'.*"));
    const int application = calls.indexOf(QRegularExpression(".*`_ZN12QApplicationC1.*"));
    const int later = calls.indexOf(QRegularExpression(".*`unsetenv'.*"));
    if (!(0 <= start && start < application && application < later))
        QSKIP("this build binds functions at load time");
    const QStringList before = calls.mid(start, application - start);
    QCOMPARE(before.filter("libQt"), QStringList());
}

// The log service starts between the directories and the caption.
void tst_Program::startOrder()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("0");
    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QCOMPARE(result.exitCode, 0);

    // The first RootPath is the one where the launch data is looked up.
    const QJsonArray steps = installation.Report().value("steps").toArray();
    QCOMPARE(steps, QJsonArray({"RootPath", "organization", "product", "DataPath", "DocPath",
                                "caption", "show", "exec"}));
    QCOMPARE(installation.Report().value("logStarted").toArray(),
             QJsonArray({false, false, false, false, false, true, true, true}));
}

void tst_Program::exitCode_data()
{
    QTest::addColumn<QString>("end");
    QTest::addColumn<int>("code");

    QTest::newRow("0") << "0" << 0;
    QTest::newRow("1") << "1" << 1;
    QTest::newRow("77") << "77" << 77;
    QTest::newRow("255") << "255" << 255;
}

void tst_Program::exitCode()
{
    QFETCH(QString, end);
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy(end);
    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QTEST(result.exitCode, "code");
}

void tst_Program::closingTheWindowQuits()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("close");
    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
}

void tst_Program::caption_data()
{
    QTest::addColumn<QByteArray>("launchData");
    QTest::addColumn<QString>("expected");

    QTest::newRow("no launch data") << QByteArray("") << "yourproduct";
    QTest::newRow("product") << Option("product", "Pro") << "Pro";
    QTest::newRow("blanks are kept") << Option("product", " My Pro ") << " My Pro ";
    QTest::newRow("letters beyond ASCII") << Option("product", "Ger\xC3\xA4t \xE2\x82\xAC")
                                          << QString::fromUtf8("Ger\xC3\xA4t \xE2\x82\xAC");
    QTest::newRow("product called like the program") << Option("product", "velocor") << "velocor";
    QTest::newRow("empty product") << Option("product", "") << "Velocor";
}

void tst_Program::caption()
{
    QFETCH(QByteArray, launchData);
    QFETCH(QString, expected);
    Installation installation;
    QVERIFY(installation.installed);
    QVERIFY(installation.WriteLaunchData(launchData));
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QCOMPARE(result.exitCode, 0);
    const QJsonObject report = installation.Report();
    QCOMPARE(report.value("properties").toObject().value("caption").toString(), expected);
    QCOMPARE(report.value("titles").toArray(), QJsonArray({expected}));
}

void tst_Program::windowShowsIdentityAndPlaces()
{
    Installation installation;
    QVERIFY(installation.installed);
    QVERIFY(installation.WriteLaunchData(Option("organization", "My Org") +
                                         Option("product", "P&amp;Q")));
    QVERIFY(TestFiles::write(installation.top + "data/My Org/P&Q/velocor.cfg",
                             "<VelocorSettings><MainWindow><placesShown>yes</placesShown>"
                             "</MainWindow></VelocorSettings>"));
    installation.AddSpy("0");
    installation.environment.insert("SPY_AWAIT", "My Org");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QCOMPARE(result.exitCode, 0);
    const QJsonArray texts = installation.Report().value("texts").toArray();
    const QStringList expected{"My Org",
                               "P&Q",
                               installation.root + "/",
                               installation.top + "data/My Org/P&Q/",
                               installation.top + "home/Documents/",
                               installation.LogFolder("My Org/P&Q") + "velocor.log"};
    for (QString const& text : expected)
        QVERIFY2(texts.contains(text), qPrintable("not shown: " + text));

    QCOMPARE(installation.Report().value("properties").toObject(),
             QJsonObject({{"RootPath", expected[2]},
                          {"DataPath", expected[3]},
                          {"DocPath", expected[4]},
                          {"caption", "P&Q"}}));
}

void tst_Program::unusableDataFolder_data()
{
    QTest::addColumn<QString>("folder");
    QTest::addColumn<QString>("file");

    QTest::newRow("a file in the data folder's place") << "plain"
                                                       << "plain";
    QTest::newRow("a file in the log folder's place") << "other"
                                                      << "other/yourorganization/yourproduct/logs";
    QTest::newRow("a place where nothing can be created") << "../../proc/nowhere"
                                                          << "";
}

// Nothing can be logged; nothing else is affected.
void tst_Program::unusableDataFolder()
{
    QFETCH(QString, folder);
    QFETCH(QString, file);
    Installation installation;
    QVERIFY(installation.installed);
    QString dataFolder = installation.top + folder;
    if (file.isEmpty())
        dataFolder = "/proc/nowhere";
    else
        QVERIFY(TestFiles::write(installation.top + file, "kept"));
    installation.environment.insert("XDG_DATA_HOME", dataFolder);
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(installation.program, {}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(installation.Report().value("properties").toObject().value("DataPath").toString(),
             dataFolder + "/yourorganization/yourproduct/");
    if (!file.isEmpty())
        QCOMPARE(TestFiles::read(installation.top + file), QByteArray("kept"));
}

void tst_Program::dataFolderOfAnotherUser()
{
    const QString setpriv = QStandardPaths::findExecutable("setpriv");
    if (geteuid() != 0 || setpriv.isEmpty())
        QSKIP("needs root and setpriv to become another user");
    Installation installation;
    QVERIFY(installation.installed);
    QVERIFY(QFile::setPermissions(installation.top, QFile::permissions(installation.top) |
                                                        QFile::ReadOther | QFile::ExeOther));
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    installation.AddSpy("0");

    const ProgramResult result = RunProgram(
        setpriv, {"--reuid=65534", "--regid=65534", "--clear-groups", installation.program},
        installation.environment);
    QVERIFY2(result.finished, result.errors);
    QCOMPARE(result.exitCode, 0);
    QVERIFY(!QFile::exists(installation.LogFolder()));
}

void tst_Program::logFolderRemovedWhileRunning()
{
    const Installation installation;
    QVERIFY(installation.installed);
    RunningProgram program(installation);
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    QVERIFY(QDir(installation.LogFolder()).removeRecursively());
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    QVERIFY(!QFile::exists(installation.LogFolder()));
}

QTEST_GUILESS_MAIN(tst_Program)
#include "tst_Program.moc"
