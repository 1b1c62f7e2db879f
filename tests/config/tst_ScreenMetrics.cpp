// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include <QGuiApplication>
#include <QScreen>
#include <QtTest>

#include <limits>

namespace {

constexpr int MinInt = std::numeric_limits<int>::min();
constexpr int MaxInt = std::numeric_limits<int>::max();

const QPoint UntouchedPosition(11, 12);
const QSize UntouchedSize(13, 14);

} // namespace

// All rows hold on a desktop of 1920 by 1080 pixels.
class tst_ScreenMetrics : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();

    void fits_data();
    void fits();
    void wraps_data();
    void wraps();
    void parses_data();
    void parses();
    void missing_data();
    void missing();
    void readingStoresNothing();
    void write_data();
    void write();
    void writeRefusesNullName();
    void comesBack();

private:
    void checkRead(QString const& stored, QPoint const& position, QSize const& size);
};

void tst_ScreenMetrics::initTestCase()
{
    const QSize desktop = QGuiApplication::primaryScreen()->virtualSize();
    if (desktop != QSize(1920, 1080))
        QSKIP("the desktop is not 1920 by 1080 pixels");
}

void tst_ScreenMetrics::checkRead(QString const& stored, QPoint const& position, QSize const& size)
{
    TorkConfigFile file{QString()};
    file.WriteItem("ApplicationScreens", "Main", stored);

    QPoint readPosition = UntouchedPosition;
    QSize readSize = UntouchedSize;
    QVERIFY(file.ReadScreenMetrics("Main", readPosition, readSize));
    QCOMPARE(readPosition, position);
    QCOMPARE(readSize, size);
}

void tst_ScreenMetrics::fits_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");

    QTest::newRow("inside") << "100,100,800,600" << QPoint(100, 100) << QSize(800, 600);
    QTest::newRow("beyond the left edge") << "-50,10,800,600" << QPoint(0, 10) << QSize(800, 600);
    QTest::newRow("beyond the top edge") << "0,-50,800,600" << QPoint(0, 0) << QSize(800, 600);
    QTest::newRow("beyond the right edge")
        << "1500,100,800,600" << QPoint(1119, 100) << QSize(800, 600);
    QTest::newRow("beyond the bottom edge")
        << "100,900,800,600" << QPoint(100, 479) << QSize(800, 600);
    QTest::newRow("beyond two edges, top left")
        << "-1,-1,1919,1079" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("beyond two edges, bottom right")
        << "5000,5000,400,300" << QPoint(1519, 779) << QSize(400, 300);
    QTest::newRow("the whole desktop") << "0,0,1920,1080" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("one pixel less than the desktop")
        << "0,0,1919,1079" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("one pixel more than the desktop")
        << "0,0,1921,1081" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("reaches the right edge exactly")
        << "1,0,1919,500" << QPoint(0, 0) << QSize(1919, 500);
    QTest::newRow("ends one pixel before the right edge")
        << "1,0,1918,500" << QPoint(1, 0) << QSize(1918, 500);
    QTest::newRow("reaches the bottom edge exactly")
        << "100,500,400,580" << QPoint(100, 499) << QSize(400, 580);
    QTest::newRow("ends one pixel before the bottom edge")
        << "100,500,400,579" << QPoint(100, 500) << QSize(400, 579);
    QTest::newRow("wider than the desktop") << "0,0,3000,500" << QPoint(0, 0) << QSize(1919, 500);
    QTest::newRow("wider than the desktop, away from the edge")
        << "50,60,3000,500" << QPoint(0, 60) << QSize(1919, 500);
    QTest::newRow("wider than the desktop, beyond the left edge")
        << "-100,0,3000,500" << QPoint(0, 0) << QSize(1919, 500);
    QTest::newRow("higher than the desktop")
        << "0,100,400,2000" << QPoint(0, 0) << QSize(400, 1079);
    QTest::newRow("higher than the desktop, beyond the top edge")
        << "0,-100,400,2000" << QPoint(0, 0) << QSize(400, 1079);
    QTest::newRow("larger than the desktop both ways")
        << "50,60,3000,2000" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("too small") << "10,10,100,50" << QPoint(10, 10) << QSize(320, 200);
    QTest::newRow("smallest that stays") << "0,0,320,200" << QPoint(0, 0) << QSize(320, 200);
    QTest::newRow("one pixel too small both ways")
        << "0,0,319,199" << QPoint(0, 0) << QSize(320, 200);
    QTest::newRow("no extent") << "10,10,0,0" << QPoint(10, 10) << QSize(320, 200);
    QTest::newRow("too small, beyond the top left")
        << "-5,-5,10,10" << QPoint(0, 0) << QSize(320, 200);
    QTest::newRow("too narrow, widened to the right edge")
        << "1700,10,100,300" << QPoint(1599, 10) << QSize(320, 300);
    QTest::newRow("too narrow, widened within the desktop")
        << "1590,10,100,300" << QPoint(1590, 10) << QSize(320, 300);
    QTest::newRow("too narrow, just reaching the edge")
        << "1600,10,100,300" << QPoint(1599, 10) << QSize(320, 300);
    QTest::newRow("too low, heightened to the bottom edge")
        << "100,1000,400,100" << QPoint(100, 879) << QSize(400, 200);
    QTest::newRow("too low, just within")
        << "100,879,400,100" << QPoint(100, 879) << QSize(400, 200);
    QTest::newRow("too low, just reaching the edge")
        << "100,880,400,100" << QPoint(100, 879) << QSize(400, 200);
    QTest::newRow("one pixel in the last corner")
        << "1919,1079,1,1" << QPoint(1599, 879) << QSize(320, 200);
    QTest::newRow("just outside the last corner")
        << "1920,1080,1,1" << QPoint(1599, 879) << QSize(320, 200);
    QTest::newRow("negative width keeps the stored edge")
        << "100,100,-5,400" << QPoint(100, 100) << QSize(-5, 400);
    QTest::newRow("negative height keeps the stored edge")
        << "100,100,400,-5" << QPoint(100, 100) << QSize(400, -5);
    QTest::newRow("negative width beyond the left edge")
        << "-10,100,-5,400" << QPoint(0, 100) << QSize(320, 400);
    QTest::newRow("negative height beyond the top edge")
        << "100,-10,400,-5" << QPoint(100, 0) << QSize(400, 200);
    QTest::newRow("very negative width")
        << "1919,0,-2000,400" << QPoint(1919, 0) << QSize(-2000, 400);
    QTest::newRow("negative width at the right edge")
        << "2500,100,-5,400" << QPoint(1599, 100) << QSize(320, 400);
    QTest::newRow("negative height at the bottom edge")
        << "100,2500,400,-5" << QPoint(100, 879) << QSize(400, 200);
}

void tst_ScreenMetrics::fits()
{
    QFETCH(QString, stored);
    QFETCH(QPoint, position);
    QFETCH(QSize, size);
    checkRead(stored, position, size);
}

// Unrealistic numbers: sums and differences wrap in 32 bits.
void tst_ScreenMetrics::wraps_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");

    QTest::newRow("largest x") << "2147483647,0,800,600" << QPoint(MaxInt, 0) << QSize(800, 600);
    QTest::newRow("largest y") << "0,2147483647,800,600" << QPoint(0, MaxInt) << QSize(800, 600);
    QTest::newRow("smallest x") << "-2147483648,0,800,600" << QPoint(0, 0) << QSize(800, 600);
    QTest::newRow("smallest y") << "0,-2147483648,800,600" << QPoint(0, 0) << QSize(800, 600);
    QTest::newRow("largest extent")
        << "0,0,2147483647,2147483647" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("smallest extent")
        << "100,100,-2147483648,-2147483648" << QPoint(100, 100) << QSize(MinInt, MinInt);
    QTest::newRow("everything largest") << "2147483647,2147483647,2147483647,2147483647"
                                        << QPoint(MaxInt, MaxInt) << QSize(MaxInt, MaxInt);
    QTest::newRow("everything smallest")
        << "-2147483648,-2147483648,-2147483648,-2147483648" << QPoint(0, 0) << QSize(320, 200);
    QTest::newRow("largest place, smallest extent")
        << "2147483647,2147483647,-2147483648,-2147483648" << QPoint(MaxInt, MaxInt)
        << QSize(MinInt, MinInt);
    QTest::newRow("smallest place, largest extent")
        << "-2147483648,-2147483648,2147483647,2147483647" << QPoint(0, 0) << QSize(1919, 1079);
    QTest::newRow("just off the desktop, smallest extent")
        << "-1,-1,-2147483648,-2147483648" << QPoint(0, 0) << QSize(320, 200);
    QTest::newRow("largest place, too small")
        << "2147483647,2147483647,1,1" << QPoint(MaxInt, MaxInt) << QSize(320, 200);
    QTest::newRow("largest x, too narrow")
        << "2147483647,10,100,600" << QPoint(MaxInt, 10) << QSize(320, 600);
    QTest::newRow("largest y, too low")
        << "10,2147483647,600,100" << QPoint(10, MaxInt) << QSize(600, 200);
}

void tst_ScreenMetrics::wraps()
{
    QFETCH(QString, stored);
    QFETCH(QPoint, position);
    QFETCH(QSize, size);
    checkRead(stored, position, size);
}

void tst_ScreenMetrics::parses_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<bool>("found");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");

    const QPoint noPosition(0, 0);
    const QSize noSize(0, 0);
    const auto row = [](char const* name, char const* stored, bool found, QPoint const& position,
                        QSize const& size) {
        QTest::newRow(name) << stored << found << position << size;
    };
    row("blanks around numbers", " 1, 2 ,300 , 400", true, {1, 2}, {320, 400});
    row("plus signs", "+1,+2,+300,+400", true, {1, 2}, {320, 400});
    row("minus does not separate", "10,20,400-300", true, noPosition, noSize);
    row("three fields", "1,2,3", true, noPosition, noSize);
    row("five fields", "1,2,3,4,5", true, noPosition, noSize);
    row("one field", "1", true, noPosition, noSize);
    row("trailing comma", "1,2,3,4,", true, noPosition, noSize);
    row("empty", "", true, noPosition, noSize);
    row("three fields that are no numbers", "a,b,c", true, noPosition, noSize);
    row("first is no number", "a,2,300,400", false, UntouchedPosition, UntouchedSize);
    row("second is no number", "1,b,300,400", false, UntouchedPosition, UntouchedSize);
    row("third is no number", "1,2,c,400", false, UntouchedPosition, UntouchedSize);
    row("last is no number", "1,2,300,d", false, UntouchedPosition, UntouchedSize);
    row("last is empty", "1,2,300,", false, UntouchedPosition, UntouchedSize);
    row("all are empty", ",,,", false, UntouchedPosition, UntouchedSize);
    row("last is a fraction", "1,2,300,400.5", false, UntouchedPosition, UntouchedSize);
    row("first is hexadecimal", "0x1,2,300,400", false, UntouchedPosition, UntouchedSize);
    row("one is beyond the int range", "1,2,2147483648,400", false, UntouchedPosition,
        UntouchedSize);
}

void tst_ScreenMetrics::parses()
{
    QFETCH(QString, stored);
    TorkConfigFile file{QString()};
    file.WriteItem("ApplicationScreens", "Main", stored);

    QPoint position = UntouchedPosition;
    QSize size = UntouchedSize;
    QTEST(file.ReadScreenMetrics("Main", position, size), "found");
    QTEST(position, "position");
    QTEST(size, "size");
    QVERIFY(file.m_lastError.isEmpty());
}

void tst_ScreenMetrics::missing_data()
{
    QTest::addColumn<QString>("section");
    QTest::addColumn<QString>("key");

    QTest::newRow("section") << "Other"
                             << "Main";
    QTest::newRow("section in other letter case") << "applicationscreens"
                                                  << "Main";
    QTest::newRow("key") << "ApplicationScreens"
                         << "Other";
    QTest::newRow("key in other letter case") << "ApplicationScreens"
                                              << "main";
}

void tst_ScreenMetrics::missing()
{
    QFETCH(QString, section);
    QFETCH(QString, key);
    TorkConfigFile file{QString()};
    file.WriteItem(section, key, "100,100,800,600");

    QPoint position = UntouchedPosition;
    QSize size = UntouchedSize;
    QVERIFY(!file.ReadScreenMetrics("Main", position, size));
    QCOMPARE(position, QPoint(0, 0));
    QCOMPARE(size, QSize(0, 0));
    QVERIFY(file.m_lastError.isEmpty());
}

void tst_ScreenMetrics::readingStoresNothing()
{
    TorkConfigFile file{QString()};
    QPoint position;
    QSize size;
    file.ReadScreenMetrics("Main", position, size);
    QVERIFY(!file.HasSection("ApplicationScreens"));

    // Nor does fitting change what is stored.
    file.WriteItem("ApplicationScreens", "Main", "-50,10,100,50");
    QVERIFY(file.ReadScreenMetrics("Main", position, size));
    QString none;
    QString stored;
    QVERIFY(file.ReadItem("ApplicationScreens", "Main", none, stored));
    QCOMPARE(stored, QString("-50,10,100,50"));
}

void tst_ScreenMetrics::write_data()
{
    QTest::addColumn<QByteArray>("name");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain") << QByteArray("Main") << QPoint(10, 20) << QSize(800, 600) << "Main"
                           << "10,20,800,600";
    QTest::newRow("negative numbers")
        << QByteArray("Main") << QPoint(-5, -6) << QSize(-7, -8) << "Main"
        << "-5,-6,-7,-8";
    QTest::newRow("not fitted to the desktop")
        << QByteArray("Main") << QPoint(5000, 5000) << QSize(1, 1) << "Main"
        << "5000,5000,1,1";
    QTest::newRow("extreme numbers")
        << QByteArray("Main") << QPoint(MinInt, MaxInt) << QSize(MaxInt, MinInt) << "Main"
        << "-2147483648,2147483647,2147483647,-2147483648";
    QTest::newRow("blanks in the name")
        << QByteArray(" Main Window ") << QPoint(1, 2) << QSize(3, 4) << "MainWindow"
        << "1,2,3,4";
    QTest::newRow("empty name") << QByteArray("") << QPoint(1, 2) << QSize(3, 4) << ""
                                << "1,2,3,4";
}

void tst_ScreenMetrics::write()
{
    QFETCH(QByteArray, name);
    QFETCH(QPoint, position);
    QFETCH(QSize, size);
    QFETCH(QString, key);
    QFETCH(QString, expected);
    TorkConfigFile file{QString()};

    QVERIFY(file.WriteScreenMetrics(name.constData(), position, size));
    QCOMPARE(file.keyList("ApplicationScreens"), QStringList{key});
    QString stored;
    QVERIFY(file.FindSection("ApplicationScreens")->FindValue(key, stored));
    QCOMPARE(stored, expected);
}

void tst_ScreenMetrics::writeRefusesNullName()
{
    TorkConfigFile file{QString()};
    QPoint position(1, 2);
    QSize size(3, 4);
    QVERIFY(!file.WriteScreenMetrics(nullptr, position, size));
    QVERIFY(!file.HasSection("ApplicationScreens"));
}

void tst_ScreenMetrics::comesBack()
{
    TorkConfigFile file{QString()};
    QPoint position(100, 50);
    QSize size(640, 480);
    QVERIFY(file.WriteScreenMetrics("Main Window", position, size));

    QPoint readPosition;
    QSize readSize;
    QVERIFY(file.ReadScreenMetrics("MainWindow", readPosition, readSize));
    QCOMPARE(readPosition, position);
    QCOMPARE(readSize, size);
    QVERIFY(file.ReadScreenMetrics(" Main Window", readPosition, readSize));
    QCOMPARE(readPosition, position);
}

QTEST_MAIN(tst_ScreenMetrics)
#include "tst_ScreenMetrics.moc"
