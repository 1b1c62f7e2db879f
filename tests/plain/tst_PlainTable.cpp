// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the ordered table of sections and values with its plain version: a QHash and a list.

#include "common/config/TorkOrderedHash_p.h"

#include "Rounds.h"

#include <QHash>
#include <QStringList>
#include <QtTest>

#include <random>

namespace {

// What the table has to do, without regard to speed.
class PlainTable
{
public:
    void insert(QString const& key, int value)
    {
        if (!m_values.contains(key))
            m_order.append(key);
        m_values.insert(key, value);
    }
    bool find(QString const& key, int& value) const
    {
        if (m_values.contains(key))
            value = m_values.value(key);
        return m_values.contains(key);
    }
    void clear()
    {
        m_order.clear();
        m_values.clear();
    }
    QStringList const& order() const { return m_order; }

private:
    QHash<QString, int> m_values;
    QStringList m_order;
};

// Short keys that often collide, keys that differ only in case, keys with NUL and beyond Latin-1,
// empty and null ones.
QString RandomKey(std::mt19937& random)
{
    const QString letters = QStringLiteral("aAbB \u00E9\u20AC") + QChar(0) + QChar(0xD800);
    if (random() % 50 == 0)
        return random() % 2 ? QString() : QString(QLatin1String(""));
    if (random() % 3 == 0)
        return QStringLiteral("key%1").arg(random() % 3000);
    QString key;
    for (unsigned length = random() % 6; length > 0; --length)
        key += letters[static_cast<int>(random() % static_cast<unsigned>(letters.size()))];
    return key;
}

} // namespace

class tst_PlainTable : public QObject
{
    Q_OBJECT

private slots:
    void randomOperations();
    void referencesIntoTheTable();
    void keysWithTheSameHash_data();
    void keysWithTheSameHash();

private:
    int m_compared = 0;

    void compare(TorkOrderedHash<int> const& table, PlainTable const& plain);
};

void tst_PlainTable::compare(TorkOrderedHash<int> const& table, PlainTable const& plain)
{
    ++m_compared;
    QStringList order;
    for (auto const& entry : table) {
        order.append(entry.key);
        int value = -1;
        QVERIFY(plain.find(entry.key, value));
        QCOMPARE(entry.value, value);
    }
    QCOMPARE(order, plain.order());
    QCOMPARE(table.size(), static_cast<size_t>(order.size()));
}

void tst_PlainTable::randomOperations()
{
    std::mt19937 random(Rounds::seed());
    const int operations = Rounds::count(1000000, 10000000);
    TorkOrderedHash<int> table;
    PlainTable plain;
    for (int i = 0; i < operations; ++i) {
        const QString key = RandomKey(random);
        if (random() % 3 == 0) {
            table.insert(key, i);
            plain.insert(key, i);
        }
        int expected = -1;
        const bool isThere = plain.find(key, expected);
        int const* found = table.find(key);
        if ((found != nullptr) != isThere || (found && *found != expected))
            QFAIL(qPrintable(QStringLiteral("operation %1, key \"%2\"").arg(i).arg(key)));
        if (random() % 5000 == 0) {
            compare(table, plain);
            if (QTest::currentTestFailed())
                return;
        }
        if (random() % 20000 == 0) {
            table.clear();
            plain.clear();
        }
    }
    std::printf("plain table: %d operations, %d whole tables compared\n", operations, m_compared);
}

// A key or value taken from the table itself is stored in it while it grows.
void tst_PlainTable::referencesIntoTheTable()
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

// Random keys hardly ever have the same hash, so these are searched for.
void tst_PlainTable::keysWithTheSameHash_data()
{
    QTest::addColumn<int>("longer"); // by how many characters the second key is
    QTest::newRow("of the same length") << 0;
    QTest::newRow("of different lengths") << 1;
}

void tst_PlainTable::keysWithTheSameHash()
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
    QCOMPARE(qHash(one, seed), qHash(other, seed));
    QCOMPARE(other.length(), one.length() + longer);

    TorkOrderedHash<int> table;
    table.insert(one, 1);
    QVERIFY(!table.find(other));
    table.insert(other, 2);
    QCOMPARE(table.size(), size_t(2));
    QCOMPARE(*table.find(one), 1);
    QCOMPARE(*table.find(other), 2);
}

QTEST_APPLESS_MAIN(tst_PlainTable)
#include "tst_PlainTable.moc"
