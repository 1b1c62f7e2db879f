// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFileTest.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QtTest>

#include <fcntl.h>
#include <unistd.h>

#ifdef Q_OS_LINUX
#include <sched.h>
#endif

using namespace LogFileTest;

class tst_TorkLogRotation : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void rotation_data();
    void rotation();
    void rotationWithoutFinalSlash_data();
    void rotationWithoutFinalSlash();
    void rotationInOddDirectories_data();
    void rotationInOddDirectories();
    void rotationInTheRootDirectory_data();
    void rotationInTheRootDirectory();
    void onlyOwnFiles_data();
    void onlyOwnFiles();
    void neighborsAloneAreNotTheLog_data();
    void neighborsAloneAreNotTheLog();

    void hiddenNames_data();
    void hiddenNames();
    void pruningGoesByName_data();
    void pruningGoesByName();
    void linkWithoutTargetInTheWay_data();
    void linkWithoutTargetInTheWay();
    void linkToAFolderInTheWay();
    void unfinishedCopies_data();
    void unfinishedCopies();

    void pipesInPlaceOfFiles_data();
    void pipesInPlaceOfFiles();

private:
    QString m_workingDirectory;
};

namespace {

// A limit that every current file exceeds.
const unsigned int tight = 1;

} // namespace

void tst_TorkLogRotation::init()
{
    m_workingDirectory = QDir::currentPath();
}

void tst_TorkLogRotation::cleanup()
{
    QDir::setCurrent(m_workingDirectory);
}

void tst_TorkLogRotation::rotation_data()
{
    QTest::addColumn<QString>("maxLogFiles");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const auto row = [](const char* name, const char* maxLogFiles, QStringList const& before,
                        QStringList const& after) {
        QTest::newRow(name) << maxLogFiles << before << TestFiles::sorted(after);
    };
    const QString current = "app.log: c";
    const QString becameFirst = "app.log.1: c";

    row("first rotation", "10", {current}, {becameFirst});
    row("older files move up", "10", {current, "app.log.1: a", "app.log.2: b"},
        {becameFirst, "app.log.2: a", "app.log.3: b"});
    row("gaps stay gaps", "10", {current, "app.log.1: a", "app.log.4: d"},
        {becameFirst, "app.log.2: a", "app.log.5: d"});
    row("two digits come after one", "20", {current, "app.log.2: b", "app.log.10: j"},
        {becameFirst, "app.log.3: b", "app.log.11: j"});
    row("no current file", "10", {"app.log.1: a"}, {"app.log.2: a"});
    row("nothing there", "10", {}, {});
    row("empty current file", "10", {"app.log: "}, {"app.log.1: "});

    QStringList ten(current);
    QStringList tenShifted(becameFirst);
    for (int i = 1; i <= 10; ++i) {
        ten.append(QString("app.log.%1: %1").arg(i));
        if (i < 10)
            tenShifted.append(QString("app.log.%1: %2").arg(i + 1).arg(i));
    }
    row("the eleventh is removed", "10", ten, tenShifted);
    row("below the limit nothing is removed", "10", {current, "app.log.9: i"},
        {becameFirst, "app.log.10: i"});
    row("all above the limit are removed", "3",
        {current, "app.log.1: a", "app.log.2: b", "app.log.3: c", "app.log.7: g", "app.log.8: h"},
        {becameFirst, "app.log.2: a", "app.log.3: b"});
    row("limit of one", "1", {current, "app.log.1: a"}, {becameFirst});
    row("limit of zero", "0", {current, "app.log.1: a", "app.log.2: b"}, {becameFirst});
    row("limit of zero, no files", "0", {current}, {becameFirst});
    row("negative limit takes number 0 too", "-1", {current, "app.log.0: z", "app.log.1: a"},
        {becameFirst});

    row("no number", "10", {current, "app.log.old: o", "app.log.: e", "app.log.1x: x"},
        {becameFirst, "app.log.old: o", "app.log.: e", "app.log.1x: x"});
    row("number 0 is never shifted", "10", {current, "app.log.0: z", "app.log.1: a"},
        {becameFirst, "app.log.0: z", "app.log.2: a"});
    row("number 0 alone", "10", {current, "app.log.0: z"}, {becameFirst, "app.log.0: z"});
    row("negative numbers are never shifted", "10",
        {current, "app.log.-1: m", "app.log.-5: n", "app.log.1: a"},
        {becameFirst, "app.log.-1: m", "app.log.-5: n", "app.log.2: a"});
    row("a name between keeps its place", "10", {current, "app.log.old.1: o"},
        {becameFirst, "app.log.old.2: o"});
    row("a name between is not removed", "10", {current, "app.log.old.12: o"},
        {becameFirst, "app.log.old.13: o"});
    // The later name holds the number, so the file numbered 1 stays, and the copy fails.
    row("a name between takes the number away", "10", {current, "app.log.1: a", "app.log.old.1: o"},
        {"app.log.1: a", "app.log.old.2: o"});
    row("plus sign", "10", {current, "app.log.+3: p"}, {becameFirst, "app.log.4: p"});
    row("plus sign yields to the number", "10", {current, "app.log.+3: p", "app.log.3: t"},
        {becameFirst, "app.log.+3: p", "app.log.4: t"});
    row("leading zero", "10", {current, "app.log.03: t"}, {becameFirst, "app.log.4: t"});

    // What is in the way stays, and so does what should have gone there.
    row("directory in place of number 1", "10", {current, "app.log.1/"}, {"app.log.1/"});
    row("directory in place of number 2", "10", {current, "app.log.1: a", "app.log.2/"},
        {"app.log.1: a", "app.log.2/"});
    row("directory above the limit", "10", {current, "app.log.10: j", "app.log.11/"},
        {becameFirst, "app.log.10: j", "app.log.11/"});

    row("highest number of all", "10", {current, "app.log.5: e", "app.log.2147483647: h"},
        {becameFirst, "app.log.6: e"});
    row("highest number of all at the highest limit", "2147483647",
        {current, "app.log.5: e", "app.log.2147483647: h"}, {becameFirst, "app.log.6: e"});
    row("one below the highest at the highest limit", "2147483647",
        {current, "app.log.2147483646: h"}, {becameFirst, "app.log.2147483647: h"});
    row("number out of range", "10", {current, "app.log.2147483648: h", "app.log.99999999999: i"},
        {becameFirst, "app.log.2147483648: h", "app.log.99999999999: i"});
}

void tst_TorkLogRotation::rotation()
{
    QFETCH(QString, maxLogFiles);
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFiles", maxLogFiles}});

    MessageCapture messages;
    log.deleteOldFiles();
    QTEST(folder.listing(), "after");
    QCOMPARE(messages.texts(), QStringList());
}

// Directory and name are concatenated, so nothing is shifted; removing and copying work.
void tst_TorkLogRotation::rotationWithoutFinalSlash_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("no older files")
        << QStringList("app.log: old") << QStringList({"app.log: new\n", "app.log.1: old"});
    QTest::newRow("number 1 stays, the current file is gone")
        << QStringList({"app.log: old", "app.log.1: a"})
        << QStringList({"app.log: new\n", "app.log.1: a"});
    QTest::newRow("number 2 stays")
        << QStringList({"app.log: old", "app.log.2: b"})
        << QStringList({"app.log: new\n", "app.log.1: old", "app.log.2: b"});
    QTest::newRow("number 12 is removed") << QStringList({"app.log: old", "app.log.12: l"})
                                          << QStringList({"app.log: new\n", "app.log.1: old"});
}

void tst_TorkLogRotation::rotationWithoutFinalSlash()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    folder.prepare(log, "app", tight);
    log.setOutputPath(folder.root() + "logs");

    log.write(QStringLiteral("new\n"));
    QTEST(folder.listing(), "after");
}

void tst_TorkLogRotation::rotationInOddDirectories_data()
{
    QTest::addColumn<QString>("directory");

    QTest::newRow("blank") << "my logs/";
    QTest::newRow("marker") << "100%1/";
    QTest::newRow("two markers") << "%2%1/";
    QTest::newRow("wildcards") << "[x]*?/";
    QTest::newRow("semicolon") << "x;y/";
    QTest::newRow("hidden") << ".logs/";
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("Büro 日誌/");
    QTest::newRow("two final slashes") << "logs//";
    QTest::newRow("named like the log") << "app.log.1/";
}

void tst_TorkLogRotation::rotationInOddDirectories()
{
    QFETCH(QString, directory);
    LogFolder folder;
    const QString logs = folder.root() + directory;
    populate(logs, {"app.log: old", "app.log.1: a", "app.log.10: j"});
    TorkLog log;
    folder.prepare(log, "app", tight);
    log.setOutputPath(logs);

    log.write(QStringLiteral("new\n"));
    QCOMPARE(TestFiles::listing(logs),
             QStringList({"app.log: new\n", "app.log.1: old", "app.log.2: a"}));
}

namespace {

// Makes a folder the root directory of this process while it lives.
class RootDirectory
{
    Q_DISABLE_COPY(RootDirectory)

public:
    explicit RootDirectory(QString const& folder) : m_before(::open("/", O_RDONLY | O_DIRECTORY))
    {
        const QByteArray path = QFile::encodeName(folder);
        m_isInForce =
            chroot(path.constData()) == 0 || (isolated() && chroot(path.constData()) == 0);
    }

    ~RootDirectory()
    {
        if (m_isInForce && (fchdir(m_before) != 0 || chroot(".") != 0))
            qFatal("cannot return to the root directory");
        ::close(m_before);
    }

    bool isInForce() const { return m_isInForce; }

private:
    // Whether this process has become one that may change its root directory.
    static bool isolated()
    {
#ifdef Q_OS_LINUX
        return unshare(CLONE_NEWUSER) == 0;
#else
        return false;
#endif
    }

    int m_before;
    bool m_isInForce = false;
};

int rotatesInRoot(QStringList const& arguments)
{
    const RootDirectory root(arguments.at(0));
    if (!root.isInForce() || !QDir::setCurrent("/work"))
        return ChildProcess::skipped;

    TorkLog log("/");
    TestFiles::write("/settings.cfg", LogFolder::settingsText({{"filePrefix", "app"}}));
    log.setPreferencesFileName("/settings.cfg");
    log.loadPreferences();
    QFile::remove("/settings.cfg");
    log.deleteOldFiles();
    return 0;
}

} // namespace

// Without its slash "/" is the working directory: the names there decide which files of the root
// directory are shifted and up to which number they are removed. Nothing there is changed.
void tst_TorkLogRotation::rotationInTheRootDirectory_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const auto row = [](char const* name, QStringList const& before, QStringList const& after) {
        QTest::newRow(name) << before << TestFiles::sorted(after);
    };
    row("no older files", {"app.log: c", "work/"}, {"app.log.1: c", "work/"});
    row("an older file is not found", {"app.log: c", "app.log.2: b", "work/"},
        {"app.log.1: c", "app.log.2: b", "work/"});
    row("a name in the working directory shifts",
        {"app.log: c", "app.log.2: b", "work/", "work/app.log.2: w"},
        {"app.log.1: c", "app.log.3: b", "work/", "work/app.log.2: w"});
    row("a number in the working directory removes up to it",
        {"app.log: c", "app.log.11: k", "work/", "work/app.log.12: w"},
        {"app.log.1: c", "work/", "work/app.log.12: w"});
    row("unfinished copy", {"app.log: c", "app.log.1.aBcXyZ.part: half", "work/"},
        {"app.log.1: c", "work/"});
    row("unfinished copy in the working directory stays",
        {"app.log: c", "work/", "work/app.log.1.aBcXyZ.part: half"},
        {"app.log.1: c", "work/", "work/app.log.1.aBcXyZ.part: half"});
}

void tst_TorkLogRotation::rotationInTheRootDirectory()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);

    const ChildProcess::Result child = ChildProcess::run("rotates in root", {folder.logs()});
    if (child.wasSkipped())
        QSKIP("This user may not change the root directory.");
    QVERIFY2(child.ended(), child.report());
    QTEST(folder.listing(), "after");
}

// The neighbors match what Qt's wildcards would take for the log's own files, and more.
void tst_TorkLogRotation::onlyOwnFiles_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QStringList>("neighbors");

    QTest::newRow("plain") << "app"
                           << QStringList({"app", "app.1", "app.log1", "app.log-1", "app.logx.1",
                                           "appxlog.1", "app.txt.12", "xapp.log", "xapp.log.12",
                                           "app-2.log", "app-2.log.12", "log", ".log.12"});
    QTest::newRow("other letter case")
        << "app" << QStringList({"APP.LOG", "App.log", "APP.LOG.1", "App.log.12", "app.LOG.12"});
    QTest::newRow("upper case") << "APP"
                                << QStringList({"app.log", "App.log", "app.log.1", "app.log.12",
                                                "APP.LOG.12"});
    QTest::newRow("blank") << "my app"
                           << QStringList({"my", "app.log", "app.log.1", "app.log.12", "my.log",
                                           "my.log.12", "myapp.log.12"});
    QTest::newRow("semicolon") << "x;y"
                               << QStringList({"x", "y.log", "y.log.1", "y.log.12", "x.log.12"});
    QTest::newRow("character set") << "a[1]" << QStringList({"a1.log", "a1.log.1", "a1.log.12"});
    QTest::newRow("star") << "a*" << QStringList({"a.log", "ab.log", "ab.log.1", "abc.log.12"});
    QTest::newRow("question mark")
        << "a?" << QStringList({"a.log", "ab.log", "ab.log.1", "ab.log.12"});
    QTest::newRow("backslash") << "a\\b" << QStringList({"ab.log", "ab.log.1", "ab.log.12"});
    QTest::newRow("marker") << "100%1" << QStringList({"1001.log.12", "100.log.12", "100%2.log"});
    QTest::newRow("two markers") << "%2%1" << QStringList({"1.log", "12.log.12"});
    QTest::newRow("dots") << "app.log" << QStringList({"app.log", "app.log.1", "app.log.12"});
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("Büro") << QStringList({"Buro.log", "Buro.log.12"});
}

void tst_TorkLogRotation::onlyOwnFiles()
{
    QFETCH(QString, prefix);
    QFETCH(QStringList, neighbors);
    LogFolder folder;
    const QString name = prefix + ".log";
    const QString full(3000, 'f');
    QStringList untouched;
    for (QString const& neighbor : neighbors)
        untouched.append(neighbor + ": " + full);
    populate(folder.logs(), untouched);
    populate(folder.logs(), {name + ": " + full, name + ".1: a", name + ".10: j"});
    TorkLog log(folder.logs());
    folder.prepare(log, prefix);
    log.setMaxLogFileSize(0);

    if (log.maxLogFileSize() != 2048)
        QFAIL("The files of this test are not beyond the limit.");
    log.write(QStringLiteral("new\n"));
    const QStringList own({name + ": new\n", name + ".1: " + full, name + ".2: a"});
    QCOMPARE(folder.listing(), TestFiles::sorted(own + untouched));
}

void tst_TorkLogRotation::neighborsAloneAreNotTheLog_data()
{
    onlyOwnFiles_data();
}

void tst_TorkLogRotation::neighborsAloneAreNotTheLog()
{
    QFETCH(QString, prefix);
    QFETCH(QStringList, neighbors);
    LogFolder folder;
    QStringList untouched;
    for (QString const& neighbor : neighbors)
        untouched.append(neighbor + ": n");
    populate(folder.logs(), untouched);
    TorkLog log(folder.logs());
    folder.prepare(log, prefix);

    log.write(QStringLiteral("new\n"));
    const QStringList own(prefix + ".log: new\n");
    QCOMPARE(folder.listing(), TestFiles::sorted(own + untouched));
}

// A listing of the directory shows neither hidden files nor those of a subfolder: the size of such
// a log is never checked, and its numbered files are not recognized.
void tst_TorkLogRotation::hiddenNames_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<bool>("rotates"); // rotation requested directly
    QTest::addColumn<QStringList>("after");

    QTest::newRow("full, begins with a dot")
        << ".app" << false << QStringList({".app.log: new\n%1", ".app.log.1: a", ".app.log.12: l"});
    QTest::newRow("full, empty prefix")
        << "" << false << QStringList({".log: new\n%1", ".log.1: a", ".log.12: l"});
    QTest::newRow("rotated, begins with a dot")
        << ".app" << true << QStringList({".app.log.1: a", ".app.log.12: l"});
    QTest::newRow("rotated, empty prefix")
        << "" << true << QStringList({".log.1: a", ".log.12: l"});
    QTest::newRow("full, in a subfolder")
        << "sub/app" << false
        << QStringList({"sub/", "sub/app.log: new\n%1", "sub/app.log.1: a", "sub/app.log.12: l"});
    QTest::newRow("rotated, in a subfolder")
        << "sub/app" << true << QStringList({"sub/", "sub/app.log.1: a", "sub/app.log.12: l"});
}

void tst_TorkLogRotation::hiddenNames()
{
    QFETCH(QString, prefix);
    QFETCH(bool, rotates);
    QFETCH(QStringList, after);
    LogFolder folder;
    const QString name = prefix + ".log";
    const QString full(3000, 'f');
    populate(folder.logs(), {name + ": " + full, name + ".1: a", name + ".12: l"});
    TorkLog log(folder.logs());
    log.setEnable(true);
    if (!prefix.isEmpty()) // a log without a settings file has none
        folder.prepare(log, prefix);
    log.setMaxLogFileSize(0);

    if (rotates)
        log.deleteOldFiles();
    else
        log.write(QStringLiteral("new\n"));
    QCOMPARE(folder.listing(), after.replaceInStrings("%1", full.mid(4)));
}

// Anything with a number above the limit is removed; only listed files move up, though.
void tst_TorkLogRotation::pruningGoesByName_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const QStringList common({"app.log: c", "app.log.5: e"});
    const QStringList usual({"app.log.1", "app.log.6"});
    QTest::newRow("pipe above the highest stays")
        << common + QStringList("app.log.12 |")
        << QStringList({"app.log.1", "app.log.12", "app.log.6"});
    QTest::newRow("pipe") << common + QStringList({"app.log.15: o", "app.log.12 |"}) << usual;
    QTest::newRow("pipe just above the highest")
        << common + QStringList({"app.log.15: o", "app.log.16 |"}) << usual;
    QTest::newRow("dangling link")
        << common + QStringList({"app.log.15: o", "app.log.13 -> nowhere"}) << usual;
    QTest::newRow("link to a pipe")
        << common + QStringList({"pipe |", "app.log.15: o", "app.log.13 -> pipe"})
        << usual + QStringList("pipe");
    QTest::newRow("directory stays") << common + QStringList({"app.log.15: o", "app.log.14/"})
                                     << QStringList({"app.log.1", "app.log.14", "app.log.6"});
    QTest::newRow("pipe within the limit is neither moved nor removed")
        << common + QStringList({"app.log.15: o", "app.log.3 |"})
        << QStringList({"app.log.1", "app.log.3", "app.log.6"});
    QTest::newRow("pipe below a huge number")
        << common + QStringList({"app.log.2147483646: h", "app.log.2147483000 |"}) << usual;
    QTest::newRow("pipes without their own number stay")
        << common +
               QStringList({"app.log.15: o", "app.log.012 |", "app.log.old.12 |", "app.log.x |"})
        << QStringList({"app.log.012", "app.log.1", "app.log.6", "app.log.old.12", "app.log.x"});
}

void tst_TorkLogRotation::pruningGoesByName()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    for (QString const& entry : before)
        make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app");

    log.deleteOldFiles();
    QTEST(namesIn(folder.logs()), "after");
}

// Such a link does not count as existing, and what is copied "to" it ends up at its target.
void tst_TorkLogRotation::linkWithoutTargetInTheWay_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("of the current file")
        << QStringList({"app.log: c", "app.log.1 -> nowhere"}) << QStringList("app.log.1: c");
    QTest::newRow("of an older file")
        << QStringList({"app.log: c", "app.log.1: a", "app.log.2 -> nowhere"})
        << QStringList({"app.log.1: c", "app.log.2: a"});
}

// The link holds nothing: no entry is lost, and nothing is created where it points.
void tst_TorkLogRotation::linkWithoutTargetInTheWay()
{
    LogFolder folder;
    QFETCH(QStringList, before);
    QFETCH(QStringList, after);
    for (QString const& entry : before)
        make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app");

    log.deleteOldFiles();
    QCOMPARE(folder.listing(), after);
    for (QString const& file : namesIn(folder.logs()))
        QVERIFY(!QFileInfo(folder.logs() + file).isSymLink());
}

// Only a link without a target gives way.
void tst_TorkLogRotation::linkToAFolderInTheWay()
{
    LogFolder folder;
    for (char const* entry : {"app.log: c", "app.log.1: a", "app.log.2 -> ."})
        make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app");

    log.deleteOldFiles();
    QVERIFY(QFileInfo(folder.logs() + "app.log.2").isSymLink());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log.1"), QByteArray("a"));
}

void tst_TorkLogRotation::unfinishedCopies_data()
{
    QTest::addColumn<QString>("entry");
    QTest::addColumn<bool>("stays");

    QTest::newRow("copy to number 1") << "app.log.1.aBcXyZ.part: half" << false;
    QTest::newRow("first and last letters") << "app.log.1.aAzZaZ.part: half" << false;
    for (char const* sign : {"`", "{", "@", "["}) {
        QTest::addRow("next to the letters, %s", sign)
            << QString("app.log.1.aBc%1yZ.part: x").arg(sign) << true;
    }
    QTest::newRow("name of another kind") << "app.log.1.part: x" << true;
    QTest::newRow("digits") << "app.log.1.aBc1yZ.part: x" << true;
    QTest::newRow("letters at the ends") << "app.log.1.azAZzA.part: half" << false;
    QTest::newRow("a digit at the end") << "app.log.1.aBcXy1.part: x" << true;
    QTest::newRow("before a") << "app.log.1.aBcXy`.part: x" << true;
    QTest::newRow("after z") << "app.log.1.aBcXy{.part: x" << true;
    QTest::newRow("before A") << "app.log.1.aBcXy@.part: x" << true;
    QTest::newRow("after Z") << "app.log.1.aBcXy[.part: x" << true;
    QTest::newRow("five letters") << "app.log.1.aBcXy.part: x" << true;
    QTest::newRow("seven letters") << "app.log.1.aBcXyZz.part: x" << true;
    QTest::newRow("of another number") << "app.log.2.aBcXyZ.part: x" << true;
    QTest::newRow("of another log") << "app2.log.1.aBcXyZ.part: x" << true;
    QTest::newRow("longer extension") << "app.log.1.aBcXyZ.part.gz: x" << true;
    QTest::newRow("other letter case") << "app.log.1.aBcXyZ.PART: x" << true;
    QTest::newRow("link") << "app.log.1.aBcXyZ.part -> app.log" << true;
    QTest::newRow("dangling link") << "app.log.1.aBcXyZ.part -> nowhere" << true;
    QTest::newRow("directory") << "app.log.1.aBcXyZ.part/" << true;
    QTest::newRow("pipe") << "app.log.1.aBcXyZ.part |" << true;
}

void tst_TorkLogRotation::unfinishedCopies()
{
    QFETCH(QString, entry);
    QFETCH(bool, stays);
    LogFolder folder;
    populate(folder.logs(), {"app.log: full"});
    make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app", tight);

    log.write(QStringLiteral("new\n"));
    QString name = entry.section(' ', 0, 0).section(':', 0, 0);
    name.remove('/');
    QCOMPARE(namesIn(folder.logs()).contains(name), stays);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("new\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log.1"), QByteArray("full"));
}

namespace {

int rotates(QStringList const& arguments)
{
    LogFolder settings;
    TorkLog log;
    settings.prepare(log, "app", tight);
    log.setOutputPath(arguments.at(0));
    if (arguments.at(1) == "directly")
        log.deleteOldFiles();
    log.write(QStringLiteral("new\n"));
    return 0;
}

} // namespace

void tst_TorkLogRotation::pipesInPlaceOfFiles_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QString>("how");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("number 1") << QStringList({"app.log: c", "app.log.1 |"}) << "by an entry"
                              << QStringList({"app.log", "app.log.1"});
    QTest::newRow("number 2") << QStringList({"app.log: c", "app.log.1: a", "app.log.2 |"})
                              << "by an entry"
                              << QStringList({"app.log", "app.log.1", "app.log.2"});
    QTest::newRow("the current file") << QStringList({"app.log |", "app.log.1: a"}) << "directly"
                                      << QStringList({"app.log", "app.log.2"});
}

void tst_TorkLogRotation::pipesInPlaceOfFiles()
{
    QFETCH(QStringList, before);
    QFETCH(QString, how);
    LogFolder folder;
    for (QString const& entry : before)
        make(folder.logs(), entry);

    const ChildProcess::Result child =
        ChildProcess::run("rotates", {folder.logs(), how}, QString(), 10000);
    QVERIFY2(child.ended(), child.report());
    QTEST(namesIn(folder.logs()), "after");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("new\n"));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogRotation>(
        argc, argv, {{"rotates", rotates}, {"rotates in root", rotatesInRoot}});
}

#include "tst_TorkLogRotation.moc"
