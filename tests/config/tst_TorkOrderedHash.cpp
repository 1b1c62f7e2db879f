// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkOrderedHash_p.h"

#include <QHash>
#include <QtTest>

#include <random>

// tests/plain/tst_PlainTable.cpp compares it with a QHash and a list.
class tst_TorkOrderedHash : public QObject
{
    Q_OBJECT

private slots:
    void keepsTheOrder();
    void referencesIntoTheTable();
    void keysWithTheSameHash_data();
    void keysWithTheSameHash();
};

void tst_TorkOrderedHash::keepsTheOrder()
{
    TorkOrderedHash<int> table;
    QCOMPARE(table.size(), size_t(0));
    QVERIFY(!table.find("b"));
    table.insert("b", 1);
    table.insert("a", 2);
    table.insert("b", 3);
    QCOMPARE(table.size(), size_t(2));
    QCOMPARE(table.begin()->key, QString("b"));
    QCOMPARE(table.begin()->value, 3);
    QCOMPARE(*table.find("a"), 2);

    table.clear();
    QCOMPARE(table.size(), size_t(0));
    QVERIFY(table.begin() == table.end());
    QVERIFY(!table.find("a"));
}

// A key or value taken from the table itself is stored in it while it grows.
void tst_TorkOrderedHash::referencesIntoTheTable()
{
    TorkOrderedHash<QString> table;
    table.insert("0", "first");
    for (int i = 1; i < 1000; ++i) {
        table.insert(QString::number(i), table.begin()->value);
        table.insert((table.end() - 1)->key, (table.begin() + i / 2)->value);
        QCOMPARE(*table.find(QString::number(i)), QString("first"));
    }
    QCOMPARE(table.size(), size_t(1000));
}

// Keys hardly ever have the same hash, so these are searched for.
void tst_TorkOrderedHash::keysWithTheSameHash_data()
{
    QTest::addColumn<int>("longer"); // by how many characters the second key is
    QTest::newRow("of the same length") << 0;
    QTest::newRow("of different lengths") << 1;
}

void tst_TorkOrderedHash::keysWithTheSameHash()
{
    QFETCH(int, longer);
    const uint seed = static_cast<uint>(qGlobalQHashSeed());
    std::mt19937 random(1);
    const auto key = [&random](int length) {
        QString text(length, QLatin1Char(' '));
        for (QChar& character : text)
            character = QChar(static_cast<ushort>('!' + random() % 90));
        return text;
    };

    // One pair of keys in 2^32 collides, so some hundred thousand keys are enough.
    QHash<uint, QString> byHash;
    QString one;
    QString other;
    for (int i = 0; i < 10000000 && (one.isNull() || one == other); ++i) {
        const QString shortKey = key(8);
        const QString longKey = key(8 + longer);
        one = byHash.value(qHash(longKey, seed));
        other = longKey;
        byHash.insert(qHash(shortKey, seed), shortKey);
    }
    QVERIFY(!one.isNull() && one != other);
    QCOMPARE(uint(qHash(one, seed)), uint(qHash(other, seed)));
    QCOMPARE(other.length(), one.length() + longer);

    TorkOrderedHash<int> table;
    table.insert(one, 1);
    QVERIFY(!table.find(other));
    table.insert(other, 2);
    QCOMPARE(table.size(), size_t(2));
    QCOMPARE(*table.find(one), 1);
    QCOMPARE(*table.find(other), 2);
}

QTEST_APPLESS_MAIN(tst_TorkOrderedHash)

#include "tst_TorkOrderedHash.moc"
