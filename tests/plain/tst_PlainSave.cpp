// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the lines of a saved settings file with their plain version: three arguments substituted
// one at a time, and the line converted to Latin-1.

#include "common/config/TorkConfigFile.h"

#include "PlainLine.h"
#include "Rounds.h"

#include <QFile>
#include <QSet>
#include <QTemporaryDir>
#include <QVector>
#include <QtTest>

#include <random>
#include <utility>

namespace {

using Pairs = QVector<std::pair<QString, QString>>;

QByteArray PlainFile(Pairs const& items)
{
    QByteArray file = "<VelocorSettings>\n<s>\n";
    for (auto const& item : items)
        file += PlainLine::item(item.first, item.second);
    return file + "</s>\n</VelocorSettings>\n";
}

// Characters that matter to a line, to its conversion, or to neither.
QString Chosen()
{
    return QStringLiteral("%123456789 0Ln&'<>\"[]!CDATA/\\-_.:;=#aZz\n\t\r\u007F\u0080\u00A0\u00E9"
                          "\u00FF\u0100\u0125\u0126\u013C\u20AC\uFEFF\uFFFD") +
           QChar(0) + QChar(0xD83D) + QChar(0xDE00);
}

QString RandomText(std::mt19937& random)
{
    static const QString chosen = Chosen();
    QString text;
    for (unsigned length = random() % 12; length > 0; --length) {
        if (random() % 20 == 0)
            text += QChar(static_cast<ushort>(random()));
        else
            text += chosen[static_cast<int>(random() % static_cast<unsigned>(chosen.size()))];
    }
    return text;
}

} // namespace

class tst_PlainSave : public QObject
{
    Q_OBJECT

private slots:
    void everyCharacter();
    void everyPair();
    void randomLines();
    void names();
    void cleanupTestCase();

private:
    void compare(Pairs const& items);

    QTemporaryDir m_folder;
    int m_lines = 0;
};

// Keys are stored unchanged in a section that belongs to the test, where no operation cleans them.
void tst_PlainSave::compare(Pairs const& items)
{
    TorkConfigFile file(m_folder.filePath("x.cfg"));
    auto* section = new TorkConfigFileSection("s");
    file.AppendSection(section);
    for (auto const& item : items)
        section->AddValue(item.first, item.second);
    QCOMPARE(section->values().size(), items.size()); // no duplicate keys

    QVERIFY(file.Save());
    QVERIFY2(file.m_lastError.isEmpty(), qPrintable(file.m_lastError));
    QFile saved(m_folder.filePath("x.cfg"));
    QVERIFY(saved.open(QIODevice::ReadOnly));
    const QByteArray bytes = saved.readAll();
    m_lines += items.size();
    if (bytes == PlainFile(items))
        return;

    for (auto const& item : items) {
        if (!bytes.contains(PlainLine::item(item.first, item.second)))
            qWarning() << "key" << item.first << "value" << item.second << "should be"
                       << PlainLine::item(item.first, item.second);
    }
    QFAIL("the saved file is another");
}

void tst_PlainSave::everyCharacter()
{
    for (QString const& after : {QString(), QStringLiteral("1"), QStringLiteral("%1")}) {
        Pairs values;
        Pairs keys;
        for (int unit = 0; unit <= 0xFFFF; ++unit) {
            const QString character = QChar(static_cast<ushort>(unit)) + after;
            values.append({QStringLiteral("k%1").arg(unit), character});
            keys.append({character, QStringLiteral("v%1").arg(unit)});
        }
        compare(values);
        compare(keys);
        if (QTest::currentTestFailed())
            return;
    }
}

void tst_PlainSave::everyPair()
{
    const QString chosen = Chosen();
    QVERIFY(chosen.size() >= 50);
    Pairs values;
    Pairs keys;
    QSet<QString> seen;
    for (QChar first : chosen) {
        for (QChar second : chosen) {
            const QString pair = QString(first) + second;
            values.append({QStringLiteral("k%1").arg(values.size()), pair});
            if (!seen.contains(pair))
                keys.append({pair, pair});
            seen.insert(pair);
        }
    }
    compare(values);
    compare(keys);
}

void tst_PlainSave::randomLines()
{
    std::mt19937 random(Rounds::seed());
    const int lines = Rounds::count(100000, 1000000);
    for (int left = lines; left > 0; left -= 10000) {
        Pairs items;
        QSet<QString> seen;
        while (items.size() < qMin(left, 10000)) {
            const QString key = RandomText(random);
            if (!seen.contains(key))
                items.append({key, RandomText(random)});
            seen.insert(key);
        }
        compare(items);
        if (QTest::currentTestFailed())
            return;
    }
}

// The lines of the root element and of sections have a single substitution each.
void tst_PlainSave::names()
{
    for (char const* name : {"s", "%1", "a%2b", "%L1", "<&>", "", "\xC3\xA9", "\xE2\x82\xAC"}) {
        TorkConfigFile file(m_folder.filePath("x.cfg"), QString::fromUtf8(name));
        file.AppendSection(new TorkConfigFileSection(name));
        QVERIFY(file.Save());
        const QByteArray start = PlainLine::tag("<%1>\n", QString::fromUtf8(name));
        const QByteArray end = PlainLine::tag("</%1>\n", QString::fromUtf8(name));
        QFile saved(m_folder.filePath("x.cfg"));
        QVERIFY(saved.open(QIODevice::ReadOnly));
        QCOMPARE(saved.readAll(), start + start + end + end);
    }
}

void tst_PlainSave::cleanupTestCase()
{
    std::printf("plain save: %d lines compared\n", m_lines);
}

QTEST_APPLESS_MAIN(tst_PlainSave)
#include "tst_PlainSave.moc"
