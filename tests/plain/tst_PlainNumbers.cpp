// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the numbers that ReadInt() and ReadUint() return with their plain version,
// QString::toInt(), and the names under which they find them with QString::remove().

#include "common/config/TorkConfigFile.h"

#include "Rounds.h"

#include <QHash>
#include <QtTest>

#include <random>

class tst_PlainNumbers : public QObject
{
    Q_OBJECT

private slots:
    void everyShortText();
    void randomTexts();
    void namesWithSpaces();
    void cleanupTestCase();

private:
    void compare(QString const& text);

    TorkConfigFile m_file{QString()};
    int m_texts = 0;
};

void tst_PlainNumbers::compare(QString const& text)
{
    ++m_texts;
    bool converts = false;
    const int expected = text.toInt(&converts);
    m_file.WriteItem("s", "k", text);
    int number = 1;
    unsigned int natural = 1;
    const bool isRead = m_file.ReadInt("s", "k", 7, number) == converts &&
                        m_file.ReadUint("s", "k", 7, natural) == converts;
    const bool isSame = number == (converts ? expected : 7) &&
                        natural == (converts ? static_cast<unsigned int>(expected) : 1U);
    if (!isRead || !isSame)
        QFAIL(qPrintable(QStringLiteral("\"%1\" is read as %2").arg(text).arg(number)));
}

// From all characters that a number may contain or that could be mistaken for part of one.
void tst_PlainNumbers::everyShortText()
{
    const QString characters =
        QStringLiteral("0159-+ .,xeE\t\n\u0661\u06F1\u2212\uFF11") + QChar(0);
    QStringList texts{QLatin1String("")};
    for (int length = 0; length < 3; ++length) {
        QStringList longer;
        for (QString const& text : qAsConst(texts)) {
            compare(text);
            for (QChar character : characters)
                longer.append(text + character);
        }
        texts = longer;
    }
    for (QString const& text : qAsConst(texts))
        compare(text);
    for (int unit = 1; unit <= 0xFFFF; ++unit) {
        compare(QChar(static_cast<ushort>(unit)));
        compare(QChar(static_cast<ushort>(unit)) + QStringLiteral("1"));
        if (QTest::currentTestFailed())
            return;
    }
}

// Numbers around every limit, with leading zeros and an occasional stray character.
void tst_PlainNumbers::randomTexts()
{
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(300000, 3000000);
    for (int i = 0; i < count && !QTest::currentTestFailed(); ++i) {
        QString text = QString(static_cast<int>(random() % 4), QLatin1Char('0'));
        for (unsigned length = random() % 12; length > 0; --length)
            text += QChar('0' + static_cast<int>(random() % 10));
        if (random() % 8 == 0)
            text = QString::number(2147483640 + static_cast<qint64>(random() % 16));
        if (random() % 2)
            text.prepend('-');
        if (random() % 8 == 0)
            text.insert(static_cast<int>(random() % static_cast<unsigned>(text.size() + 1)),
                        QChar(static_cast<ushort>(random() % 0x80 + 1)));
        compare(text);
    }
}

// Sections and keys with spaces anywhere, so that some of them become equal.
void tst_PlainNumbers::namesWithSpaces()
{
    std::mt19937 random(Rounds::seed());
    const auto randomName = [&random]() {
        const QString characters = QStringLiteral("ab  \t_");
        QString name = QStringLiteral("n");
        for (unsigned length = random() % 5; length > 0; --length)
            name.insert(static_cast<int>(random() % static_cast<unsigned>(name.size() + 1)),
                        characters[static_cast<int>(random() % 6)]);
        return name;
    };
    TorkConfigFile file{QString()};
    QHash<QString, int> plain;
    const int count = Rounds::count(100000, 1000000);
    for (int i = 0; i < count; ++i) {
        const QString section = randomName();
        const QString key = randomName();
        const QString place = QString(section).remove(' ') + '/' + QString(key).remove(' ');
        int number = -1;
        QCOMPARE(file.ReadInt(section, key, -2, number), plain.contains(place));
        QCOMPARE(number, plain.value(place, -2));
        if (random() % 4 == 0) {
            file.WriteItem(section, key, i);
            plain.insert(place, i);
        }
        ++m_texts;
    }
}

void tst_PlainNumbers::cleanupTestCase()
{
    std::printf("plain numbers: %d texts compared\n", m_texts);
}

QTEST_APPLESS_MAIN(tst_PlainNumbers)
#include "tst_PlainNumbers.moc"
