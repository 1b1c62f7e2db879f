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

QTEST_APPLESS_MAIN(tst_PlainTable)
#include "tst_PlainTable.moc"
