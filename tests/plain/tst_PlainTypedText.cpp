// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Texts as typed values: random values and random texts give exactly what the store and the recent
// files give, and a kind is guessed only where that would write the same text.

#include "app/AppUtils.h"
#include "app/settingsfile/TypedText.h"
#include "common/config/TorkConfigFile.h"
#include "plain/Rounds.h"

#include <QColor>
#include <QFont>
#include <QListWidget>
#include <QtTest>

#include <cstdio>
#include <random>

using namespace Velocor;

class tst_PlainTypedText : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void values();
    void texts();
    void fileLists();
};

namespace {

QString const Screens("ApplicationScreens");

// Qt complains of texts that are not fonts.
void IgnoreMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

class Values
{
public:
    int below(int limit) { return int(m_random() % quint32(limit)); }

    int number()
    {
        const int any = static_cast<int>(m_random());
        return below(2) ? any : any % 3000;
    }

    QFont font()
    {
        QFont font(QStringList{"Sans", "DejaVu Sans", "No Such Font"}.at(below(3)), 1 + below(90));
        font.setBold(below(2));
        font.setItalic(below(2));
        font.setUnderline(below(2));
        font.setFixedPitch(below(2));
        return font;
    }

    // Mostly like the text of a value.
    QString text()
    {
        static QStringList const words{"yes", "no",         "YES", "t",          "1",  "-1",
                                       "",    "255",        "256", "0",          "a",  " ",
                                       "+5",  "007",        "12",  "3.5",        "/a", "Sans",
                                       "50",  "2147483648", "\\",  "-2147483648"};
        static QStringList const separators{",", ",", ",", "-", "|", ""};
        static QStringList const files{"/a", "\\b", "", "c"};
        QString text("");
        QString const& separator = separators.at(below(separators.size()));
        static QStringList const numbers{"0", "1", "12", "255", "256"};
        QStringList const& some = separator == "|" ? files : numbers;
        QStringList const& fields = below(2) ? some : words;
        for (int left = below(below(2) ? 4 : 12); left >= 0; --left)
            text += fields.at(below(fields.size())) + (left > 0 ? separator : QString());
        return text;
    }

private:
    std::mt19937 m_random{Rounds::seed()};
};

class PlainValue : public TorkConfigFile
{
public:
    PlainValue() : TorkConfigFile(QString()) {}
    explicit PlainValue(QString const& text) : PlainValue()
    {
        WriteItem("s", "k", text);
        WriteItem(Screens, "k", text);
    }

    QString text(QString const& section = "s")
    {
        QString none;
        QString text;
        ReadItem(section, "k", none, text);
        return text;
    }
};

bool IsFile(QString const& entry)
{
    return entry.contains('/') || entry.contains('\\');
}

ValueKind PlainGuess(QString const& section, QString const& text)
{
    PlainValue stored(text);
    PlainValue written;
    QPoint position;
    QSize size;
    if (section == Screens && text.split(',').size() == 4 &&
        stored.ReadScreenMetrics("k", position, size))
        return ValueKind::WindowPlace;
    bool isYes = false;
    stored.ReadBool("s", "k", false, isYes);
    written.WriteBool("s", "k", isYes);
    if (written.text() == text)
        return ValueKind::YesNo;
    int number = 0;
    written.WriteItem("s", "k", stored.ReadInt("s", "k", 0, number) ? number : 0);
    if (written.text() == text)
        return ValueKind::Number;
    QColor color;
    if (stored.ReadColor("s", "k", color) && color.isValid() &&
        written.WriteColor("s", "k", color) && written.text() == text)
        return ValueKind::Color;
    if (stored.ReadSize("s", "k", size) && written.WriteSize("s", "k", size) &&
        written.text() == text)
        return ValueKind::Size;
    QFont font;
    if (stored.ReadFont("s", "k", font) && written.WriteFont("s", "k", font) &&
        written.text() == text)
        return ValueKind::Font;
    int files = 0;
    const QStringList entries = text.split('|');
    for (QString const& entry : entries) {
        if (!entry.isEmpty() && !IsFile(entry))
            return ValueKind::Text;
        files += IsFile(entry) ? 1 : 0;
    }
    return files > 0 && entries.size() > 1 ? ValueKind::FileList : ValueKind::Text;
}

} // namespace

void tst_PlainTypedText::initTestCase()
{
    qInstallMessageHandler(IgnoreMessage);
}

// What is written is what the store writes; it is read again, and its kind is guessed.
void tst_PlainTypedText::values()
{
    Values random;
    const int rounds = Rounds::count(1000, 300000);
    for (int i = 0; i < rounds; ++i) {
        PlainValue store;
        const bool isYes = random.below(2);
        store.WriteBool("s", "k", isYes);
        QCOMPARE(TypedText::FromYesNo(isYes), store.text());
        QCOMPARE(TypedText::ToYesNo(store.text()), isYes);
        QCOMPARE(TypedText::Guess("s", store.text()), ValueKind::YesNo);

        const int number = random.number();
        int readNumber = 0;
        store.WriteItem("s", "k", number);
        QCOMPARE(TypedText::FromNumber(number), store.text());
        QVERIFY(TypedText::ToNumber(store.text(), readNumber));
        QCOMPARE(readNumber, number);
        QCOMPARE(TypedText::Guess("s", store.text()), ValueKind::Number);

        QColor color(random.below(256), random.below(256), random.below(256), random.below(256));
        QColor readColor;
        store.WriteColor("s", "k", color);
        QCOMPARE(TypedText::FromColor(color), store.text());
        QVERIFY(TypedText::ToColor(store.text(), readColor));
        QCOMPARE(readColor.rgb(), color.rgb() | 0xff000000U);
        QCOMPARE(TypedText::Guess("s", store.text()), ValueKind::Color);

        QSize size(random.below(5000), random.below(5000));
        QSize readSize;
        store.WriteSize("s", "k", size);
        QCOMPARE(TypedText::FromSize(size), store.text());
        QVERIFY(TypedText::ToSize(store.text(), readSize));
        QCOMPARE(readSize, size);
        QCOMPARE(TypedText::Guess("s", store.text()), ValueKind::Size);

        QFont font = random.font();
        QFont readFont;
        store.WriteFont("s", "k", font);
        QCOMPARE(TypedText::FromFont(font), store.text());
        QVERIFY(TypedText::ToFont(store.text(), readFont));
        QCOMPARE(TypedText::FromFont(readFont), store.text());
        QCOMPARE(TypedText::Guess("s", store.text()), ValueKind::Font);

        QPoint position(random.number(), random.number());
        size = QSize(random.number(), random.number());
        store.WriteScreenMetrics("k", position, size);
        QCOMPARE(TypedText::FromWindowPlace(position, size), store.text(Screens));
        QCOMPARE(TypedText::Guess(Screens, store.text(Screens)), ValueKind::WindowPlace);
    }
    std::printf("plain typed values: %d of each kind\n", rounds);
}

void tst_PlainTypedText::texts()
{
    Values random;
    const int rounds = Rounds::count(4000, 1000000);
    int guessed[8] = {};
    for (int i = 0; i < rounds; ++i) {
        const QString text = random.text();
        PlainValue store(text);
        bool isYes = false;
        store.ReadBool("s", "k", false, isYes);
        QCOMPARE(TypedText::ToYesNo(text), isYes);

        int number = 77;
        int plainNumber = 77;
        QCOMPARE(TypedText::ToNumber(text, number), store.ReadInt("s", "k", 77, plainNumber));
        QCOMPARE(number, plainNumber);

        QColor color(1, 2, 3);
        QColor plainColor(1, 2, 3);
        const bool isColor = store.ReadColor("s", "k", plainColor) && plainColor.isValid();
        QCOMPARE(TypedText::ToColor(text, color), isColor);
        QCOMPARE(color, isColor ? plainColor : QColor(1, 2, 3));

        QSize size(7, 7);
        QSize plainSize(7, 7);
        QCOMPARE(TypedText::ToSize(text, size), store.ReadSize("s", "k", plainSize));
        QCOMPARE(size, plainSize);

        QPoint position(7, 7);
        QPoint plainPosition(7, 7);
        size = plainSize = QSize(7, 7);
        if (text.split(',').size() == 4) {
            QCOMPARE(TypedText::ToWindowPlace(text, position, size),
                     store.ReadScreenMetrics("k", plainPosition, plainSize));
        } else {
            QVERIFY(!TypedText::ToWindowPlace(text, position, size));
        }
        QCOMPARE(position, plainPosition);
        QCOMPARE(size, plainSize);

        for (QString const& section : {QString("s"), Screens}) {
            const ValueKind kind = TypedText::Guess(section, text);
            if (kind != PlainGuess(section, text))
                QFAIL(qPrintable(QString("\"%1\" is kind %2").arg(text).arg(int(kind))));
            ++guessed[int(kind)];
        }
    }
    for (ValueKind kind : {ValueKind::Text, ValueKind::YesNo, ValueKind::Number, ValueKind::Color,
                           ValueKind::Size, ValueKind::WindowPlace, ValueKind::FileList})
        QVERIFY2(guessed[int(kind)] > 0, qPrintable(QString::number(int(kind))));
    std::printf("plain typed texts: %d texts\n", rounds);
}

void tst_PlainTypedText::fileLists()
{
    Values random;
    const int rounds = Rounds::count(3000, 300000);
    QListWidget widget;
    for (int i = 0; i < rounds; ++i) {
        QString text("");
        for (int entries = random.below(5); entries > 0; --entries)
            text += QString(random.below(3), 'a') + (entries > 1 ? "|" : "");
        AppUtils::SetupMRUListWidget(&widget, text);
        QStringList entries;
        for (int row = 0; row < widget.count(); ++row)
            entries.append(widget.item(row)->text());
        QCOMPARE(TypedText::ToFileList(text), entries);

        const QString added(1 + random.below(3), 'a');
        QVERIFY(AppUtils::AddToMRUList(added, text, 100));
        entries.removeOne(added);
        entries.prepend(added);
        QCOMPARE(TypedText::FromFileList(entries), text);
    }
    QVERIFY(!TypedText::FromFileList({}).isNull());
    std::printf("plain file lists: %d lists\n", rounds);
}

QTEST_MAIN(tst_PlainTypedText)

#include "tst_PlainTypedText.moc"
