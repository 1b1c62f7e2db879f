// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileSection.h"

#include <QtTest>

#include <type_traits>

static_assert(std::has_virtual_destructor<TorkConfigFileSection>::value,
              "the owning file deletes sections of derived classes through this class");

class tst_TorkConfigFileSection : public QObject
{
    Q_OBJECT

private slots:
    void name_data();
    void name();
    void isCalled_data();
    void isCalled();
    void startsEmpty();
    void addValue_data();
    void addValue();
    void findValue_data();
    void findValue();
    void keyListHoldsEachKeyOnce();
    void manyKeys();
    void valuesInTheOrderOfTheKeyList();
    void valuesAreACopy();
    void addValueOfItsOwn_data();
    void addValueOfItsOwn();
    void clear_data();
    void clear();
    void canBeFilledAgainAfterClear();
    void destructorIsVirtual();
};

void tst_TorkConfigFileSection::name_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("isNull");
    QTest::addColumn<QString>("expected");

    const QString replacement = QChar(QChar::ReplacementCharacter);
    QTest::newRow("ASCII") << QByteArray("Window") << false << "Window";
    QTest::newRow("empty") << QByteArray("") << false << "";
    QTest::newRow("null") << QByteArray() << true << "UnknownSection";
    QTest::newRow("blanks stay") << QByteArray(" My Section ") << false << " My Section ";
    QTest::newRow("UTF-8") << QByteArray("Gr\xC3\xB6\xC3\x9F"
                                         "e")
                           << false << QString("Gr\u00F6\u00DFe");
    QTest::newRow("three bytes of UTF-8")
        << QByteArray("\xE2\x82\xAC") << false << QString("\u20AC");
    QTest::newRow("no UTF-8") << QByteArray("a\xE9z") << false << QString("a%1z").arg(replacement);
}

void tst_TorkConfigFileSection::name()
{
    QFETCH(QByteArray, bytes);
    QFETCH(bool, isNull);
    QFETCH(QString, expected);

    TorkConfigFileSection section(isNull ? nullptr : bytes.constData());
    bytes.fill('x'); // the section keeps its own copy
    QVERIFY(section.IsCalled(expected));
}

void tst_TorkConfigFileSection::isCalled_data()
{
    QTest::addColumn<QString>("asked");
    QTest::addColumn<bool>("expected");

    QTest::newRow("same name") << "Config" << true;
    QTest::newRow("other letter case") << "config" << false;
    QTest::newRow("upper case") << "CONFIG" << false;
    QTest::newRow("leading blank") << " Config" << false;
    QTest::newRow("trailing blank") << "Config " << false;
    QTest::newRow("only the beginning") << "Conf" << false;
    QTest::newRow("longer") << "Configs" << false;
    QTest::newRow("empty") << "" << false;
    QTest::newRow("null") << QString() << false;
}

void tst_TorkConfigFileSection::isCalled()
{
    QFETCH(QString, asked);
    TorkConfigFileSection section("Config");
    QTEST(section.IsCalled(asked), "expected");
}

void tst_TorkConfigFileSection::startsEmpty()
{
    TorkConfigFileSection section("Config");
    QCOMPARE(section.keyList(), QStringList());
}

void tst_TorkConfigFileSection::addValue_data()
{
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("value");

    QTest::newRow("plain") << "key"
                           << "value";
    QTest::newRow("empty value") << "key"
                                 << "";
    QTest::newRow("empty key") << ""
                               << "value";
    QTest::newRow("blanks stay in both") << " my key "
                                         << " my value ";
    QTest::newRow("any characters")
        << QString("\u043A\u043B\u044E\u0447") << QString("<&>\"'%1\n\u20AC");
}

void tst_TorkConfigFileSection::addValue()
{
    QFETCH(QString, key);
    QFETCH(QString, value);

    TorkConfigFileSection section("Config");
    QVERIFY(section.AddValue(key, value));

    QString found = QStringLiteral("untouched");
    QVERIFY(section.FindValue(key, found));
    QCOMPARE(found, value);
    QCOMPARE(section.keyList(), QStringList{key});
}

void tst_TorkConfigFileSection::findValue_data()
{
    QTest::addColumn<QString>("key");
    QTest::addColumn<bool>("found");
    QTest::addColumn<QString>("expected");

    QTest::newRow("present") << "Key" << true << "one";
    QTest::newRow("another") << "Other" << true << "two";
    QTest::newRow("missing") << "Third" << false << "untouched";
    QTest::newRow("other letter case") << "key" << false << "untouched";
    QTest::newRow("leading blank") << " Key" << false << "untouched";
    QTest::newRow("trailing blank") << "Key " << false << "untouched";
    QTest::newRow("empty") << "" << false << "untouched";
}

void tst_TorkConfigFileSection::findValue()
{
    QFETCH(QString, key);
    TorkConfigFileSection section("Config");
    section.AddValue("Key", "one");
    section.AddValue("Other", "two");

    QString value = QStringLiteral("untouched");
    QTEST(section.FindValue(key, value), "found");
    QTEST(value, "expected");

    // No default is stored for a missing key.
    QCOMPARE(section.keyList().size(), 2);
}

void tst_TorkConfigFileSection::keyListHoldsEachKeyOnce()
{
    TorkConfigFileSection section("Config");
    QVERIFY(section.AddValue("key", "first"));
    QVERIFY(section.AddValue("key", "second"));

    QCOMPARE(section.keyList(), QStringList{"key"});
    QString value;
    QVERIFY(section.FindValue("key", value));
    QCOMPARE(value, QString("second"));
}

void tst_TorkConfigFileSection::manyKeys()
{
    TorkConfigFileSection section("Config");
    QStringList keys;
    for (int i = 0; i < 1000; ++i) {
        keys.append(QStringLiteral("key%1").arg(i, 4, 10, QLatin1Char('0')));
        section.AddValue(keys.last(), QString::number(i));
    }

    QStringList listed = section.keyList();
    listed.sort();
    QCOMPARE(listed, keys);
    for (int i = 0; i < 1000; ++i) {
        QString value;
        QVERIFY2(section.FindValue(keys[i], value), qPrintable(keys[i]));
        QCOMPARE(value, QString::number(i));
    }
}

void tst_TorkConfigFileSection::valuesInTheOrderOfTheKeyList()
{
    TorkConfigFileSection section("Config");
    QVERIFY(section.values().isEmpty());
    section.AddValue("b", "1");
    section.AddValue("a", "2");
    section.AddValue("b", "3");

    QStringList keys;
    QStringList values;
    const auto items = section.values();
    for (TorkConfigFileSection::Item const& item : items) {
        keys.append(item.key);
        values.append(item.value);
    }
    QCOMPARE(keys, section.keyList());
    QCOMPARE(keys, (QStringList{"b", "a"}));
    QCOMPARE(values, (QStringList{"3", "2"}));
}

void tst_TorkConfigFileSection::valuesAreACopy()
{
    TorkConfigFileSection section("Config");
    section.AddValue("a", "1");
    const auto items = section.values();
    section.AddValue("a", "2");
    section.AddValue("b", "3");
    QCOMPARE(items.size(), 1);
    QCOMPARE(items.first().value, QString("1"));
    section.Clear();
    QCOMPARE(items.first().key, QString("a"));
}

void tst_TorkConfigFileSection::addValueOfItsOwn_data()
{
    QTest::addColumn<int>("present");
    for (int present : {1, 2, 3, 4, 7, 8, 9, 16, 100})
        QTest::addRow("%d keys", present) << present;
}

// Names and texts from the section itself, while it grows.
void tst_TorkConfigFileSection::addValueOfItsOwn()
{
    QFETCH(int, present);
    TorkConfigFileSection section("Config");
    for (int i = 0; i < present; ++i)
        section.AddValue(QStringLiteral("key%1").arg(i), QStringLiteral("value%1").arg(i));

    section.AddValue("new", section.values().begin()->value);
    section.AddValue(section.values().begin()->value, section.values().begin()->key);
    section.AddValue(section.values().begin()->key, section.values().last().value);

    QString value;
    QVERIFY(section.FindValue("new", value));
    QCOMPARE(value, QString("value0"));
    QVERIFY(section.FindValue("value0", value));
    QCOMPARE(value, QString("key0"));
    QVERIFY(section.FindValue("key0", value));
    QCOMPARE(value, QString("key0"));
    QCOMPARE(section.keyList().size(), present + 2);
}

void tst_TorkConfigFileSection::clear_data()
{
    QTest::addColumn<QStringList>("keys");

    QTest::newRow("of an empty section") << QStringList();
    QTest::newRow("of one key") << QStringList{"a"};
    QTest::newRow("of several keys") << QStringList{"a", "b", "c"};
}

void tst_TorkConfigFileSection::clear()
{
    QFETCH(QStringList, keys);
    TorkConfigFileSection section("Config");
    for (QString const& key : std::as_const(keys))
        section.AddValue(key, "value");

    section.Clear();

    QCOMPARE(section.keyList(), QStringList());
    for (QString const& key : std::as_const(keys)) {
        QString value = QStringLiteral("untouched");
        QVERIFY2(!section.FindValue(key, value), qPrintable(key));
        QCOMPARE(value, QString("untouched"));
    }
    QVERIFY(section.IsCalled("Config"));
}

void tst_TorkConfigFileSection::canBeFilledAgainAfterClear()
{
    TorkConfigFileSection section("Config");
    section.AddValue("key", "first");
    section.Clear();
    section.AddValue("key", "second");

    QCOMPARE(section.keyList(), QStringList{"key"});
    QString value;
    QVERIFY(section.FindValue("key", value));
    QCOMPARE(value, QString("second"));
}

void tst_TorkConfigFileSection::destructorIsVirtual()
{
    class Derived : public TorkConfigFileSection
    {
    public:
        explicit Derived(bool& destroyed) : TorkConfigFileSection("Derived"), m_destroyed(destroyed)
        {}
        ~Derived() override { m_destroyed = true; }

    private:
        bool& m_destroyed;
    };

    bool destroyed = false;
    TorkConfigFileSection* section = new Derived(destroyed);
    delete section;
    QVERIFY(destroyed);
}

QTEST_APPLESS_MAIN(tst_TorkConfigFileSection)
#include "tst_TorkConfigFileSection.moc"
