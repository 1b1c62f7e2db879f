// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The states that are kept of settings files: which, how many, and who may read them.

#include "app/settingsfile/SavedStates.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <ctime>
#include <sys/stat.h>

using namespace Velocor;

class tst_SavedStates : public QObject
{
    Q_OBJECT

private slots:
    void newestFirst();
    void laterThanAllOthers();
    void timesInAnyZone();
    void sameContentIsKeptOnce();
    void tenOfAFile();
    void boundedInAll_data();
    void boundedInAll();
    void nothingIsKept_data();
    void nothingIsKept();
    void onlyItsUserReadsIt_data();
    void onlyItsUserReadsIt();
    void pathsOfOneFileAreTheSame();
    void removesOnlyThoseOfTheFile();
    void strangersStay();
    void failureIsTold();
};

namespace {

class Place
{
public:
    QString path(QString const& name) const { return m_folder.filePath(name); }
    SavedStates states() const { return SavedStates(path("kept/")); }

    QString keep(QString const& name, QByteArray const& content) const
    {
        return TestFiles::write(path(name), content) ? states().Keep(path(name)) : "not written";
    }

    QList<QByteArray> contents(QString const& name) const
    {
        QList<QByteArray> all;
        const auto kept = states().Of(path(name));
        for (SavedStates::State const& state : kept)
            all.append(TestFiles::read(state.path));
        return all;
    }

    int fileCount() const { return QDir(path("kept")).entryList(QDir::Files).size(); }

private:
    QTemporaryDir m_folder;
};

unsigned RightsOf(QString const& path)
{
    struct stat status = {};
    return stat(QFile::encodeName(path).constData(), &status) == 0 ? status.st_mode & 0777U : 0;
}

} // namespace

void tst_SavedStates::newestFirst()
{
    const Place place;
    const QDateTime before = QDateTime::currentDateTime();
    for (char const* content : {"one", "two", "three"})
        QCOMPARE(place.keep("x.cfg", content), QString());
    QCOMPARE(place.contents("x.cfg"), QList<QByteArray>({"three", "two", "one"}));
    QCOMPARE(place.contents("other.cfg"), QList<QByteArray>());
    const auto kept = place.states().Of(place.path("x.cfg"));
    QVERIFY(kept.first().time >= before && kept.first().time < before.addSecs(3600));
    QCOMPARE(kept.first().time.timeSpec(), Qt::LocalTime);
    QCOMPARE(kept.first().size, qint64(5));
}

// The clock may have been set back.
void tst_SavedStates::laterThanAllOthers()
{
    const Place place;
    QCOMPARE(place.keep("x.cfg", "one"), QString());
    const QString kept = place.states().Of(place.path("x.cfg")).first().path;
    const QString hash = QFileInfo(kept).fileName().left(41);
    QVERIFY(QFile::rename(kept, place.path("kept/" + hash + "29990101T000000999.cfg")));
    QCOMPARE(place.keep("x.cfg", "two"), QString());
    QCOMPARE(place.contents("x.cfg"), QList<QByteArray>({"two", "one"}));
    QVERIFY(QFile::exists(place.path("kept/" + hash + "29990101T000001000.cfg")));
}

// A kept state has the same name in each of them.
void tst_SavedStates::timesInAnyZone()
{
    const QByteArray zone = qgetenv("TZ");
    for (char const* other : {"UTC-9", "UTC+7"}) {
        qputenv("TZ", other);
        tzset();
        const Place place;
        const QDateTime before = QDateTime::currentDateTime();
        QCOMPARE(place.keep("x.cfg", "one"), QString());
        const QDateTime time = place.states().Of(place.path("x.cfg")).first().time;
        QVERIFY(time >= before && time < before.addSecs(3600));
    }
    if (zone.isEmpty())
        qunsetenv("TZ");
    else
        qputenv("TZ", zone);
    tzset();
}

void tst_SavedStates::sameContentIsKeptOnce()
{
    const Place place;
    for (char const* content : {"one", "one", "two", "two", "one"})
        QCOMPARE(place.keep("x.cfg", content), QString());
    QCOMPARE(place.contents("x.cfg"), QList<QByteArray>({"one", "two", "one"}));
}

void tst_SavedStates::tenOfAFile()
{
    const Place place;
    QCOMPARE(place.keep("other.cfg", "other"), QString());
    for (int i = 1; i <= 13; ++i)
        QCOMPARE(place.keep("x.cfg", QByteArray::number(i)), QString());
    const QList<QByteArray> contents = place.contents("x.cfg");
    QCOMPARE(contents.size(), SavedStates::MaximumOfFile);
    QCOMPARE(contents.first(), QByteArray("13"));
    QCOMPARE(contents.last(), QByteArray("4"));
    QCOMPARE(place.contents("other.cfg"), QList<QByteArray>({"other"}));
}

void tst_SavedStates::boundedInAll_data()
{
    QTest::addColumn<int>("files");
    QTest::addColumn<int>("size");
    QTest::addColumn<int>("newest"); // its size
    QTest::addColumn<int>("left");
    const int most = SavedStates::MaximumFileSize;
    QTest::newRow("in number") << SavedStates::MaximumOfAll + 3 << 1 << 1
                               << SavedStates::MaximumOfAll;
    QTest::newRow("in size") << 35 << most << most << 32;
    QTest::newRow("by one byte") << 33 << most << 1 << 32;
}

// The oldest go first, whosever they are.
void tst_SavedStates::boundedInAll()
{
    QFETCH(int, files);
    QFETCH(int, size);
    QFETCH(int, newest);
    const Place place;
    const QString hash(40, 'a');
    QVERIFY(QDir().mkpath(place.path("kept")));
    for (int i = 1; i < files; ++i) {
        const QString name = hash + "-20200101T000000" + QString::number(i).rightJustified(3, '0');
        QVERIFY(TestFiles::write(place.path("kept/" + name + ".cfg"), QByteArray(size, 'x')));
    }
    QCOMPARE(place.keep("x.cfg", QByteArray(newest, 'y')), QString());
    QTEST(place.fileCount(), "left");
    QCOMPARE(place.contents("x.cfg").size(), 1);
    QVERIFY(!QFile::exists(place.path("kept/" + hash + "-20200101T000000001.cfg")));
}

void tst_SavedStates::nothingIsKept_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<bool>("hasFolder");
    QTest::addColumn<QString>("told");
    QTest::newRow("no such file") << QByteArray() << true << "";
    QTest::newRow("no folder") << QByteArray("x") << false << "";
    QTest::newRow("too large") << QByteArray(int(SavedStates::MaximumFileSize) + 1, 'x') << true
                               << "it is larger than 1 MiB";
}

void tst_SavedStates::nothingIsKept()
{
    QFETCH(QByteArray, content);
    QFETCH(bool, hasFolder);
    const Place place;
    const QString path = place.path("x.cfg");
    QVERIFY(content.isNull() || TestFiles::write(path, content));
    const SavedStates states = hasFolder ? place.states() : SavedStates();
    QTEST(states.Keep(path), "told");
    QVERIFY(states.Of(path).isEmpty());
    QVERIFY(!QFile::exists(place.path("kept")));
}

void tst_SavedStates::onlyItsUserReadsIt_data()
{
    QTest::addColumn<unsigned>("rights");
    QTest::addColumn<unsigned>("kept");
    QTest::newRow("everybody") << 0777U << 0700U;
    QTest::newRow("the group may read") << 0640U << 0600U;
    QTest::newRow("read-only") << 0444U << 0400U;
}

void tst_SavedStates::onlyItsUserReadsIt()
{
    QFETCH(unsigned, rights);
    const mode_t mask = umask(0);
    const Place place;
    QVERIFY(TestFiles::write(place.path("x.cfg"), "x"));
    QCOMPARE(chmod(QFile::encodeName(place.path("x.cfg")).constData(), rights), 0);
    const QString told = place.states().Keep(place.path("x.cfg"));
    umask(mask);
    QCOMPARE(told, QString());
    QCOMPARE(RightsOf(place.path("kept")), 0700U);
    QTEST(RightsOf(place.states().Of(place.path("x.cfg")).first().path), "kept");
}

void tst_SavedStates::pathsOfOneFileAreTheSame()
{
    const Place place;
    QCOMPARE(place.keep("x.cfg", "x"), QString());
    QVERIFY(QFile::link(place.path("x.cfg"), place.path("link")));
    QCOMPARE(place.contents("link"), QList<QByteArray>({"x"}));
    QCOMPARE(place.contents("kept/../x.cfg"), QList<QByteArray>({"x"}));
}

void tst_SavedStates::removesOnlyThoseOfTheFile()
{
    const Place place;
    for (char const* content : {"one", "two"})
        QCOMPARE(place.keep("x.cfg", content), QString());
    QCOMPARE(place.keep("other.cfg", "other"), QString());
    QVERIFY(place.states().RemoveAll(place.path("x.cfg")));
    QCOMPARE(place.contents("x.cfg"), QList<QByteArray>());
    QCOMPARE(place.contents("other.cfg"), QList<QByteArray>({"other"}));
    QCOMPARE(TestFiles::read(place.path("x.cfg")), QByteArray("two"));
}

// What somebody else puts into the folder is neither shown nor removed.
void tst_SavedStates::strangersStay()
{
    const Place place;
    QVERIFY(TestFiles::write(place.path("kept/notes.cfg"), "notes"));
    for (int i = 0; i <= SavedStates::MaximumOfFile; ++i)
        QCOMPARE(place.keep("x.cfg", QByteArray::number(i)), QString());
    QVERIFY(place.states().RemoveAll(place.path("x.cfg")));
    QCOMPARE(TestFiles::listing(place.path("kept")), QStringList({"notes.cfg: notes"}));

    for (int i = 0; i < SavedStates::MaximumOfAll; ++i)
        QVERIFY(TestFiles::write(place.path(QString("kept/notes%1.cfg").arg(i)), "notes"));
    QCOMPARE(place.keep("x.cfg", "x"), QString());
    QCOMPARE(place.fileCount(), SavedStates::MaximumOfAll + 2);
}

void tst_SavedStates::failureIsTold()
{
    const Place place;
    QVERIFY(TestFiles::write(place.path("kept"), "a file"));
    QVERIFY(place.keep("x.cfg", "x").startsWith("Cannot create the folder "));
    QCOMPARE(TestFiles::read(place.path("kept")), QByteArray("a file"));
}

QTEST_GUILESS_MAIN(tst_SavedStates)

#include "tst_SavedStates.moc"
