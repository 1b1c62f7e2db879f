// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include <QColor>
#include <QFont>
#include <QPoint>
#include <QSize>
#include <QtTest>

#include <algorithm>
#include <functional>
#include <initializer_list>
#include <limits>

namespace {

using Action = std::function<bool(TorkConfigFile&)>;

constexpr int MinInt = std::numeric_limits<int>::min();
constexpr int MaxInt = std::numeric_limits<int>::max();

/// The text stored under section and key, or "(missing)".
QString Stored(TorkConfigFile& file, QString const& section, QString const& key)
{
    QString missing("(missing)");
    QString text;
    file.ReadItem(section, key, missing, text);
    return text;
}

// For several calls, each of which must be made.
bool Any(std::initializer_list<bool> results)
{
    return std::max(results);
}

} // namespace

Q_DECLARE_METATYPE(Action)

class tst_TorkConfigFileValues : public QObject
{
    Q_OBJECT

private slots:
    void written_data();
    void written();
    void namesLoseTheirBlanks_data();
    void namesLoseTheirBlanks();
    void nullKey_data();
    void nullKey();
    void readersLeaveTheFileAlone_data();
    void readersLeaveTheFileAlone();

    void readInt_data();
    void readInt();
    void readUint_data();
    void readUint();
    void readUintMissing_data();
    void readUintMissing();
    void readBool_data();
    void readBool();
    void readBoolMissing_data();
    void readBoolMissing();
    void readColor_data();
    void readColor();
    void readSize_data();
    void readSize();
    void readFont_data();
    void readFont();

    void intComesBack_data();
    void intComesBack();
    void colorComesBack_data();
    void colorComesBack();
    void fontComesBack();
};

void tst_TorkConfigFileValues::written_data()
{
    QTest::addColumn<Action>("write");
    QTest::addColumn<QString>("expected");

    const auto number = [](int value) {
        return Action([=](TorkConfigFile& f) { return f.WriteItem("s", "k", value); });
    };
    QTest::newRow("int") << number(42) << "42";
    QTest::newRow("int 0") << number(0) << "0";
    QTest::newRow("negative int") << number(-12) << "-12";
    QTest::newRow("smallest int") << number(MinInt) << "-2147483648";
    QTest::newRow("largest int") << number(MaxInt) << "2147483647";
    QTest::newRow("int without separators") << number(1234567) << "1234567";

    const auto count = [](unsigned int value) {
        return Action([=](TorkConfigFile& f) { return f.WriteItem("s", "k", value); });
    };
    QTest::newRow("unsigned") << count(4000000000U) << "4000000000";
    QTest::newRow("unsigned 0") << count(0U) << "0";
    QTest::newRow("largest unsigned") << count(4294967295U) << "4294967295";

    const auto truth = [](bool value) {
        return Action([=](TorkConfigFile& f) { return f.WriteBool("s", "k", value); });
    };
    QTest::newRow("true") << truth(true) << "yes";
    QTest::newRow("false") << truth(false) << "no";

    const auto color = [](QColor const& value) {
        return Action([=](TorkConfigFile& f) {
            QColor given = value;
            return f.WriteColor("s", "k", given) && given == value;
        });
    };
    QTest::newRow("color") << color(QColor(255, 128, 0)) << "255,128,0";
    QTest::newRow("transparent color: the same without alpha")
        << color(QColor(255, 128, 0, 0)) << "255,128,0";
    QTest::newRow("half transparent color") << color(QColor(1, 2, 3, 127)) << "1,2,3";
    QTest::newRow("black") << color(QColor(Qt::black)) << "0,0,0";
    QTest::newRow("white") << color(QColor(Qt::white)) << "255,255,255";
    QTest::newRow("color given by hue") << color(QColor::fromHsv(120, 255, 255)) << "0,255,0";
    QTest::newRow("invalid color") << color(QColor()) << "0,0,0";

    const auto size = [](QSize const& value) {
        return Action([=](TorkConfigFile& f) {
            QSize given = value;
            return f.WriteSize("s", "k", given) && given == value;
        });
    };
    QTest::newRow("size") << size(QSize(640, 480)) << "640,480";
    QTest::newRow("size 0") << size(QSize(0, 0)) << "0,0";
    QTest::newRow("invalid size") << size(QSize()) << "-1,-1";
    QTest::newRow("extreme size") << size(QSize(MaxInt, MinInt)) << "2147483647,-2147483648";

    const auto font = [](QFont const& value) {
        return Action([=](TorkConfigFile& f) {
            QFont given = value;
            return f.WriteFont("s", "k", given) && given == value;
        });
    };
    QFont italic("Courier New", 11, QFont::Bold, true);
    italic.setUnderline(true);
    QTest::newRow("font") << font(QFont("Helvetica", 12)) << "Helvetica,12,-1,5,50,0,0,0,0,0";
    QTest::newRow("font with attributes") << font(italic) << "Courier New,11,-1,5,75,1,1,0,0,0";
}

void tst_TorkConfigFileValues::written()
{
    QFETCH(Action, write);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", "before");

    QVERIFY(write(file));
    QTEST(Stored(file, "s", "k"), "expected");
    QCOMPARE(file.keyList("s"), QStringList{"k"});
}

void tst_TorkConfigFileValues::namesLoseTheirBlanks_data()
{
    QTest::addColumn<Action>("write");
    QTest::addColumn<QString>("stored");
    QTest::addColumn<Action>("read");

    const QString section("Main Window");
    const QString key(" my key ");
    QTest::newRow("int") << Action([=](TorkConfigFile& f) { return f.WriteItem(section, key, -5); })
                         << "-5" << Action([=](TorkConfigFile& f) {
                                int value = 0;
                                return f.ReadInt(section, key, 1, value) && value == -5;
                            });
    QTest::newRow("unsigned") << Action([=](TorkConfigFile& f) {
        return f.WriteItem(section, key, 5U);
    }) << "5" << Action([=](TorkConfigFile& f) {
        unsigned int value = 0;
        return f.ReadUint(section, key, 1, value) && value == 5;
    });
    QTest::newRow("bool") << Action([=](TorkConfigFile& f) {
        return f.WriteBool(section, key, true);
    }) << "yes" << Action([=](TorkConfigFile& f) {
        bool value = false;
        return f.ReadBool(section, key, false, value) && value;
    });
    QTest::newRow("color") << Action([=](TorkConfigFile& f) {
        QColor color(1, 2, 3);
        return f.WriteColor(section, key, color);
    }) << "1,2,3" << Action([=](TorkConfigFile& f) {
        QColor color;
        return f.ReadColor(section, key, color) && color == QColor(1, 2, 3);
    });
    QTest::newRow("size") << Action([=](TorkConfigFile& f) {
        QSize size(4, 5);
        return f.WriteSize(section, key, size);
    }) << "4,5" << Action([=](TorkConfigFile& f) {
        QSize size;
        return f.ReadSize(section, key, size) && size == QSize(4, 5);
    });
    QTest::newRow("font") << Action([=](TorkConfigFile& f) {
        QFont font("Helvetica", 12);
        return f.WriteFont(section, key, font);
    }) << QString("Helvetica,12,-1,5,50,0,0,0,0,0")
                          << Action([=](TorkConfigFile& f) {
                                 QFont font("Times", 9);
                                 return f.ReadFont(section, key, font) &&
                                        font == QFont("Helvetica", 12);
                             });
}

void tst_TorkConfigFileValues::namesLoseTheirBlanks()
{
    QFETCH(Action, write);
    QFETCH(QString, stored);
    QFETCH(Action, read);
    TorkConfigFile file{QString()};

    QVERIFY(write(file));
    QVERIFY(!file.HasSection("Main Window"));
    QCOMPARE(file.keyList("MainWindow"), QStringList{"mykey"});
    QString found;
    QVERIFY(file.FindSection("MainWindow")->FindValue("mykey", found));
    QCOMPARE(found, stored);
    QVERIFY(read(file));
}

void tst_TorkConfigFileValues::nullKey_data()
{
    QTest::addColumn<Action>("write");

    QTest::newRow("int") << Action(
        [](TorkConfigFile& f) { return f.WriteItem("s", QString(), 1); });
    QTest::newRow("unsigned") << Action(
        [](TorkConfigFile& f) { return f.WriteItem("s", QString(), 1U); });
    QTest::newRow("bool") << Action(
        [](TorkConfigFile& f) { return f.WriteBool("s", QString(), true); });
    QTest::newRow("color") << Action([](TorkConfigFile& f) {
        QColor color(Qt::red);
        return f.WriteColor("s", QString(), color);
    });
    QTest::newRow("size") << Action([](TorkConfigFile& f) {
        QSize size(1, 2);
        return f.WriteSize("s", QString(), size);
    });
    QTest::newRow("font") << Action([](TorkConfigFile& f) {
        QFont font("Helvetica", 12);
        return f.WriteFont("s", QString(), font);
    });
}

void tst_TorkConfigFileValues::nullKey()
{
    QFETCH(Action, write);
    TorkConfigFile file{QString()};
    QVERIFY(!write(file));
    QVERIFY(!file.HasSection("s"));
    QVERIFY(file.m_lastError.isEmpty());
}

void tst_TorkConfigFileValues::readersLeaveTheFileAlone_data()
{
    QTest::addColumn<Action>("read");

    QTest::newRow("int") << Action([](TorkConfigFile& f) {
        int value = 0;
        return Any({f.ReadInt("s", "missing", 7, value), f.ReadInt("new", "k", 7, value)});
    });
    QTest::newRow("unsigned, default out of range") << Action([](TorkConfigFile& f) {
        unsigned int value = 0;
        return Any({f.ReadUint("s", "missing", 4000000000U, value),
                    f.ReadUint("new", "k", 4000000000U, value)});
    });
    QTest::newRow("bool") << Action([](TorkConfigFile& f) {
        bool value = false;
        return Any({f.ReadBool("s", "missing", true, value), f.ReadBool("new", "k", true, value)});
    });
    QTest::newRow("color") << Action([](TorkConfigFile& f) {
        QColor color(Qt::red);
        return Any({f.ReadColor("s", "missing", color), f.ReadColor("new", "k", color)});
    });
    QTest::newRow("size") << Action([](TorkConfigFile& f) {
        QSize size(1, 2);
        return Any({f.ReadSize("s", "missing", size), f.ReadSize("new", "k", size)});
    });
    QTest::newRow("font") << Action([](TorkConfigFile& f) {
        QFont font("Helvetica", 12);
        return Any({f.ReadFont("s", "missing", font), f.ReadFont("new", "k", font)});
    });
}

void tst_TorkConfigFileValues::readersLeaveTheFileAlone()
{
    QFETCH(Action, read);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", "v");
    file.m_lastError = "kept";

    QVERIFY(!read(file));
    QCOMPARE(file.keyList("s"), QStringList{"k"});
    QCOMPARE(Stored(file, "s", "k"), QString("v"));
    QVERIFY(!file.HasSection("new"));
    QCOMPARE(file.m_lastError, QString("kept"));
}

void tst_TorkConfigFileValues::readInt_data()
{
    QTest::addColumn<QString>("stored"); // null: the key is missing
    QTest::addColumn<bool>("found");
    QTest::addColumn<int>("expected");

    QTest::newRow("plain") << "42" << true << 42;
    QTest::newRow("zero") << "0" << true << 0;
    QTest::newRow("negative") << "-12" << true << -12;
    QTest::newRow("plus sign") << "+5" << true << 5;
    QTest::newRow("leading zeros are decimal") << "010" << true << 10;
    QTest::newRow("blanks around") << " 42 " << true << 42;
    QTest::newRow("largest") << "2147483647" << true << MaxInt;
    QTest::newRow("smallest") << "-2147483648" << true << MinInt;
    QTest::newRow("too large") << "2147483648" << false << 7;
    QTest::newRow("too small") << "-2147483649" << false << 7;
    QTest::newRow("far too large") << "99999999999999999999" << false << 7;
    QTest::newRow("no number") << "abc" << false << 7;
    QTest::newRow("empty") << "" << false << 7;
    QTest::newRow("blank") << " " << false << 7;
    QTest::newRow("number and unit") << "42px" << false << 7;
    QTest::newRow("two numbers") << "4 2" << false << 7;
    QTest::newRow("fraction") << "4.0" << false << 7;
    QTest::newRow("exponent") << "1e3" << false << 7;
    QTest::newRow("hexadecimal") << "0x10" << false << 7;
    QTest::newRow("separator") << "1,000" << false << 7;
    QTest::newRow("two signs") << "--1" << false << 7;
    QTest::newRow("no digit before the point") << ".5" << false << 7;
    QTest::newRow("character after 9") << "1:" << false << 7;
    QTest::newRow("missing") << QString() << false << 7;

    // The 5 of a longer text, which is not copied.
    const auto five = [](char const* name, char16_t const* text) {
        const QString stored = QString::fromRawData(reinterpret_cast<QChar const*>(text) + 1, 1);
        QTest::newRow(name) << stored << true << 5;
    };
    five("after a minus", u"-5 ");
    five("after a digit", u"15 ");
    five("before a minus", u" 5-");
    five("before a digit", u" 51");
}

void tst_TorkConfigFileValues::readInt()
{
    QFETCH(QString, stored);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);

    int value = 99;
    QTEST(file.ReadInt("s", "k", 7, value), "found");
    QTEST(value, "expected");
}

void tst_TorkConfigFileValues::readUint_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<bool>("converted");
    QTest::addColumn<unsigned int>("expected");

    QTest::newRow("plain") << "42" << true << 42U;
    QTest::newRow("zero") << "0" << true << 0U;
    QTest::newRow("largest that is read") << "2147483647" << true << 2147483647U;
    QTest::newRow("one more fails") << "2147483648" << false << 99U;
    QTest::newRow("largest unsigned fails") << "4294967295" << false << 99U;
    QTest::newRow("-1 wraps") << "-1" << true << 4294967295U;
    QTest::newRow("smallest int wraps") << "-2147483648" << true << 2147483648U;
    QTest::newRow("no number: untouched, no default") << "abc" << false << 99U;
    QTest::newRow("empty: untouched, no default") << "" << false << 99U;
    QTest::newRow("fraction") << "4.0" << false << 99U;
    QTest::newRow("blanks around") << " 42 " << true << 42U;
}

void tst_TorkConfigFileValues::readUint()
{
    QFETCH(QString, stored);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);

    unsigned int value = 99;
    QTEST(file.ReadUint("s", "k", 7, value), "converted");
    QTEST(value, "expected");
}

void tst_TorkConfigFileValues::readUintMissing_data()
{
    QTest::addColumn<unsigned int>("defaultValue");
    QTest::addColumn<bool>("converted");
    QTest::addColumn<unsigned int>("expected");

    QTest::newRow("default") << 5U << true << 5U;
    QTest::newRow("default 0") << 0U << true << 0U;
    QTest::newRow("largest default") << 2147483647U << true << 2147483647U;
    QTest::newRow("larger default fails") << 2147483648U << false << 99U;
    QTest::newRow("largest unsigned as default fails") << 4294967295U << false << 99U;
}

void tst_TorkConfigFileValues::readUintMissing()
{
    QFETCH(unsigned int, defaultValue);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "other", "1");

    unsigned int value = 99;
    QTEST(file.ReadUint("s", "k", defaultValue, value), "converted");
    QTEST(value, "expected");
    value = 99;
    QTEST(file.ReadUint("none", "k", defaultValue, value), "converted");
    QTEST(value, "expected");
}

void tst_TorkConfigFileValues::readBool_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<bool>("expected");

    for (char const* yes : {"1", "y", "Y", "yes", "YES", "Yes", "yEs", "t", "T", "true", "TRUE"})
        QTest::addRow("\"%s\" is true", yes) << yes << true;
    for (char const* no : {"0", "n", "no", "f", "false", "on", "off", "2", "-1", "11", "ye", "tru",
                           "yes!", "maybe", " yes", "yes "})
        QTest::addRow("\"%s\" is false", no) << no << false;
    QTest::newRow("empty is false") << "" << false;
    QTest::newRow("blank is false") << " " << false;
    QTest::newRow("trailing line end is false") << "yes\n" << false;
}

void tst_TorkConfigFileValues::readBool()
{
    QFETCH(QString, stored);
    QFETCH(bool, expected);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);

    // Neither the default nor the previous value shows through.
    bool value = !expected;
    QVERIFY(file.ReadBool("s", "k", !expected, value));
    QCOMPARE(value, expected);
}

void tst_TorkConfigFileValues::readBoolMissing_data()
{
    QTest::addColumn<QString>("section");
    QTest::addColumn<bool>("defaultValue");

    QTest::newRow("key, default true") << "s" << true;
    QTest::newRow("key, default false") << "s" << false;
    QTest::newRow("section, default true") << "none" << true;
    QTest::newRow("section, default false") << "none" << false;
}

void tst_TorkConfigFileValues::readBoolMissing()
{
    QFETCH(QString, section);
    QFETCH(bool, defaultValue);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "other", defaultValue ? "no" : "yes");

    bool value = !defaultValue;
    QVERIFY(!file.ReadBool(section, "k", defaultValue, value));
    QCOMPARE(value, defaultValue);
}

void tst_TorkConfigFileValues::readColor_data()
{
    QTest::addColumn<QString>("stored"); // null: the key is missing
    QTest::addColumn<bool>("found");
    QTest::addColumn<QColor>("expected");

    const QColor untouched(9, 8, 7, 6);
    QTest::newRow("plain") << "255,128,0" << true << QColor(255, 128, 0);
    QTest::newRow("limits") << "0,255,0" << true << QColor(0, 255, 0);
    QTest::newRow("minus separates") << "255-0-0" << true << QColor(255, 0, 0);
    QTest::newRow("both separators") << "1,2-3" << true << QColor(1, 2, 3);
    QTest::newRow("no numbers are 0") << "a,b,c" << true << QColor(0, 0, 0);
    QTest::newRow("one that is no number is 0") << "10,x,30" << true << QColor(10, 0, 30);
    QTest::newRow("empty fields are 0") << ",," << true << QColor(0, 0, 0);
    QTest::newRow("blanks around numbers") << " 10, 20 ,30 " << true << QColor(10, 20, 30);
    QTest::newRow("beyond the int range is 0") << "99999999999,20,30" << true << QColor(0, 20, 30);
    QTest::newRow("hexadecimal is 0") << "0x10,20,30" << true << QColor(0, 20, 30);
    QTest::newRow("fraction is 0") << "1.5,20,30" << true << QColor(0, 20, 30);
    QTest::newRow("two fields") << "255,0" << false << untouched;
    QTest::newRow("four fields") << "1,2,3,4" << false << untouched;
    QTest::newRow("trailing comma") << "1,2,3," << false << untouched;
    QTest::newRow("negative component") << "10,-5,3" << false << untouched;
    QTest::newRow("minus in front") << "-1,2,3" << false << untouched;
    QTest::newRow("other separator") << "1;2;3" << false << untouched;
    QTest::newRow("backslash does not separate") << "1\\2\\3" << false << untouched;
    QTest::newRow("color name") << "red" << false << untouched;
    QTest::newRow("hexadecimal name") << "#ff0000" << false << untouched;
    QTest::newRow("empty") << "" << false << untouched;
    QTest::newRow("missing") << QString() << false << untouched;
    QTest::newRow("out of range: invalid") << "256,0,0" << true << QColor();
}

void tst_TorkConfigFileValues::readColor()
{
    QFETCH(QString, stored);
    QFETCH(QColor, expected);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);
    if (!expected.isValid()) // Qt's own range check
        QTest::ignoreMessage(QtWarningMsg, "QColor::setRgb: RGB parameters out of range");

    QColor color(9, 8, 7, 6);
    QTEST(file.ReadColor("s", "k", color), "found");
    QCOMPARE(color, expected);
    QCOMPARE(color.alpha(), expected.alpha());
}

void tst_TorkConfigFileValues::readSize_data()
{
    QTest::addColumn<QString>("stored"); // null: the key is missing
    QTest::addColumn<bool>("found");
    QTest::addColumn<QSize>("expected");

    const QSize untouched(1, 2);
    QTest::newRow("plain") << "640,480" << true << QSize(640, 480);
    QTest::newRow("minus separates") << "800-600" << true << QSize(800, 600);
    QTest::newRow("zero") << "0,0" << true << QSize(0, 0);
    QTest::newRow("no number is 0") << "a,b" << true << QSize(0, 0);
    QTest::newRow("one that is no number is 0") << "640,x" << true << QSize(640, 0);
    QTest::newRow("empty fields are 0") << "," << true << QSize(0, 0);
    QTest::newRow("a lone minus makes two fields") << "-" << true << QSize(0, 0);
    QTest::newRow("minus in front of one number") << "-5" << true << QSize(0, 5);
    QTest::newRow("blanks around numbers") << " 640 , 480 " << true << QSize(640, 480);
    QTest::newRow("largest") << "2147483647,2147483647" << true << QSize(MaxInt, MaxInt);
    QTest::newRow("beyond the int range is 0") << "2147483648,5" << true << QSize(0, 5);
    QTest::newRow("negative width") << "-1,5" << false << untouched;
    QTest::newRow("negative height") << "800,-600" << false << untouched;
    QTest::newRow("one field") << "640" << false << untouched;
    QTest::newRow("three fields") << "1,2,3" << false << untouched;
    QTest::newRow("trailing comma") << "640,480," << false << untouched;
    QTest::newRow("other separator") << "640x480" << false << untouched;
    QTest::newRow("empty") << "" << false << untouched;
    QTest::newRow("missing") << QString() << false << untouched;
}

void tst_TorkConfigFileValues::readSize()
{
    QFETCH(QString, stored);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);

    QSize size(1, 2);
    QTEST(file.ReadSize("s", "k", size), "found");
    QTEST(size, "expected");
}

void tst_TorkConfigFileValues::readFont_data()
{
    QTest::addColumn<QString>("stored"); // null: the key is missing
    QTest::addColumn<QByteArray>("warning");
    QTest::addColumn<bool>("found");
    QTest::addColumn<QFont>("expected");

    QFont bold("Courier New", 11, QFont::Bold, true);
    bold.setStrikeOut(true);
    const QFont untouched("Times", 9);
    QTest::newRow("plain") << QString("Helvetica,12,-1,5,50,0,0,0,0,0") << QByteArray() << true
                           << QFont("Helvetica", 12);
    QTest::newRow("with attributes")
        << QString("Courier New,11,-1,5,75,1,0,1,0,0") << QByteArray() << true << bold;
    QTest::newRow("missing") << QString() << QByteArray() << false << untouched;
    QTest::newRow("three fields are not a font, but the key was found")
        << "a,b,c" << QByteArray("QFont::fromString: Invalid description 'a,b,c'") << true
        << untouched;
    QTest::newRow("empty is not a font, but the key was found")
        << "" << QByteArray("QFont::fromString: Invalid description '(empty)'") << true
        << untouched;
}

void tst_TorkConfigFileValues::readFont()
{
    QFETCH(QString, stored);
    QFETCH(QByteArray, warning);
    TorkConfigFile file{QString()};
    file.WriteItem("s", "k", stored);
    if (!warning.isEmpty()) // Qt's own
        QTest::ignoreMessage(QtWarningMsg, warning.constData());

    QFont font("Times", 9);
    QTEST(file.ReadFont("s", "k", font), "found");
    QTEST(font, "expected");
}

void tst_TorkConfigFileValues::intComesBack_data()
{
    QTest::addColumn<int>("number");
    for (int number : {0, 1, -1, 255, -12, MaxInt, MinInt})
        QTest::addRow("%d", number) << number;
}

void tst_TorkConfigFileValues::intComesBack()
{
    QFETCH(int, number);
    TorkConfigFile file{QString()};
    QVERIFY(file.WriteItem("s", "k", number));
    int value = 99;
    QVERIFY(file.ReadInt("s", "k", 7, value));
    QCOMPARE(value, number);
}

void tst_TorkConfigFileValues::colorComesBack_data()
{
    QTest::addColumn<QColor>("written");
    QTest::addColumn<QColor>("read");

    QTest::newRow("opaque") << QColor(255, 128, 0) << QColor(255, 128, 0, 255);
    QTest::newRow("transparent comes back opaque") << QColor(1, 2, 3, 0) << QColor(1, 2, 3, 255);
}

void tst_TorkConfigFileValues::colorComesBack()
{
    QFETCH(QColor, written);
    TorkConfigFile file{QString()};
    QVERIFY(file.WriteColor("s", "k", written));
    QColor color;
    QVERIFY(file.ReadColor("s", "k", color));
    QTEST(color, "read");
}

void tst_TorkConfigFileValues::fontComesBack()
{
    TorkConfigFile file{QString()};
    QFont written("Courier New", 11, QFont::Light, true);
    QVERIFY(file.WriteFont("s", "k", written));
    QFont font;
    QVERIFY(file.ReadFont("s", "k", font));
    QCOMPARE(font, written);
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileValues)
#include "tst_TorkConfigFileValues.moc"
