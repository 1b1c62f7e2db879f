// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Every UTF-16 unit, and random texts of all of them, through the encodings and through a file that
// is really saved and loaded: as a value, as a key and as a section name.

#include "Rounds.h"

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QBuffer>
#include <QLocale>
#include <QSet>
#include <QTemporaryDir>
#include <QtTest>

class tst_PlainConfigText : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void everyUnit_data();
    void everyUnit();
    void randomTexts();
    void randomEncodings();
    void plainValues();
    void plainNames();
    void cleanupTestCase();

private:
    QTemporaryDir m_folder;
    std::mt19937 m_random;
    int m_units = 0;
    int m_texts = 0;
    int m_encodings = 0;
    int m_plain = 0;
};

namespace {

// The plain version: safe characters are kept, all others become four digits.
QString PlainEncoding(QString const& text, bool isName)
{
    const QString letters = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ";
    const QString stay =
        letters + (isName ? "0123456789.-" : "0123456789 !#$()*+,-./:;=?@[^_`{|}~");
    const QString escape = isName ? "_" : "\\";
    QString encoded;
    for (int i = 0; i < text.length(); ++i) {
        const bool stays = (isName && i == 0 ? letters : stay).contains(text[i]) &&
                           !(isName && i == 0 && text == "VelocorSettings");
        char digits[5] = {};
        std::snprintf(digits, sizeof digits, "%04x", static_cast<unsigned>(text[i].unicode()));
        encoded += stays ? QString(text[i]) : escape + "u" + digits;
    }
    return text.isEmpty() ? escape : encoded;
}

QString Value(QString const& text)
{
    return TorkConfigText::EncodeValue(text);
}

QString Name(QString const& text)
{
    return TorkConfigText::EncodeName(text);
}

bool ComesBack(QString const& text)
{
    bool isValue = false;
    bool isName = false;
    return TorkConfigText::DecodeValue(Value(text), &isValue) == text &&
           TorkConfigText::DecodeName(Name(text), &isName) == text && isValue && isName &&
           Value(text) == PlainEncoding(text, false) && Name(text) == PlainEncoding(text, true);
}

// Whether all of these (distinct) texts come back from one file in every place.
bool AllComeBack(QString const& path, QStringList const& texts)
{
    TorkConfigFile saved(path);
    for (int i = 0; i < texts.size(); ++i) {
        QString const& text = texts[i];
        saved.WriteItem("Values", "K" + QString::number(i), Value(text));
        saved.WriteItem("Keys", Name(text), Value(text));
        saved.WriteItem(Name(text), Name(text), Name(text));
    }
    if (!saved.SaveAtomically())
        return false;

    TorkConfigFile loaded(path);
    if (!loaded.Load() || loaded.keyList("Keys").size() != texts.size())
        return false;
    QString none;
    QString value;
    for (int i = 0; i < texts.size(); ++i) {
        QString const& text = texts[i];
        const bool isThere = loaded.ReadItem("Values", "K" + QString::number(i), none, value) &&
                             TorkConfigText::DecodeValue(value) == text &&
                             loaded.ReadItem("Keys", Name(text), none, value) &&
                             TorkConfigText::DecodeValue(value) == text &&
                             loaded.ReadItem(Name(text), Name(text), none, value) &&
                             TorkConfigText::DecodeName(value) == text;
        if (!isThere) {
            qWarning("%s", qPrintable("lost: " + Value(text)));
            return false;
        }
    }
    const QStringList keys = loaded.keyList("Keys");
    return std::all_of(keys.begin(), keys.end(), [&texts](QString const& key) {
        bool ok = false;
        const QString text = TorkConfigText::DecodeName(key, &ok);
        return ok && (texts.size() > 100 || texts.contains(text));
    });
}

// What a file with one value gives back after saving.
TorkConfigFile& Reloaded(TorkConfigFile& file, QString const& section, QString const& key,
                         QString const& value)
{
    file.Clear();
    file.WriteItem(section, key, value);
    QByteArray xml = file.ToXml();
    QBuffer buffer(&xml);
    file.LoadFrom(&buffer);
    return file;
}

bool IsKeptAsValue(QString const& text)
{
    TorkConfigFile file("x.cfg");
    QString none;
    QString value;
    return Reloaded(file, "S", "k", text).ReadItem("S", "k", none, value) && value == text;
}

bool IsKeptAsName(QString const& text)
{
    TorkConfigFile file("x.cfg");
    const bool asKey = Reloaded(file, "S", text, "v").keyList("S") == QStringList(text);
    const bool asSection = Reloaded(file, text, "k", "v").sectionList() == QStringList(text);
    return asKey && asSection;
}

// All non-empty texts of up to this many pieces.
QStringList Combinations(QStringList const& pieces, int most)
{
    QStringList all;
    QStringList last = {""};
    for (int length = 1; length <= most; ++length) {
        QStringList next;
        for (QString const& start : qAsConst(last)) {
            for (QString const& piece : pieces)
                next.append(start + piece);
        }
        all += next;
        last = next;
    }
    return all;
}

} // namespace

void tst_PlainConfigText::initTestCase()
{
    m_random.seed(Rounds::seed());
}

void tst_PlainConfigText::everyUnit_data()
{
    QTest::addColumn<QString>("locale");
    for (char const* locale : {"C", "tr_TR", "ar_EG"})
        QTest::newRow(locale) << QString(locale);
}

void tst_PlainConfigText::everyUnit()
{
    QFETCH(QString, locale);
    const QLocale before;
    QLocale::setDefault(QLocale(locale));
    QStringList texts;
    QSet<QString> values;
    QSet<QString> names;
    bool same = true;
    const int step = locale == "C" ? 1 : Rounds::count(31, 1);
    for (int unit = 0; unit <= 0xffff; unit += step) {
        const QString text = QChar(static_cast<ushort>(unit));
        texts.append(text);
        values.insert(Value(text));
        names.insert(Name(text));
        same = same && ComesBack(text) && ComesBack("a" + text + "1");
    }
    const bool back = AllComeBack(m_folder.filePath("units.cfg"), texts);
    QLocale::setDefault(before);

    QVERIFY(same);
    QVERIFY(back);
    QCOMPARE(values.size(), texts.size());
    QCOMPARE(names.size(), texts.size());
    m_units += texts.size();
}

// Units of all kinds in a row, mostly the dangerous ones.
void tst_PlainConfigText::randomTexts()
{
    const QString dangerous = "%123L]>&'<\"\\_u0041-.:/ \t\r\nVe";
    const QStringList pieces = {"%1",  "%L2", "]]>", "\\u0041",  "_u0041", "VelocorSettings",
                                "xml", "\\",  "_",   "<![CDATA["};
    const int files = Rounds::count(40, 2000);
    for (int file = 0; file < files; ++file) {
        QSet<QString> texts = {QString("")};
        while (texts.size() < 100) {
            QString text = "";
            const unsigned length = m_random() % 12;
            for (unsigned i = 0; i < length; ++i) {
                const unsigned choice = m_random() % 4;
                if (choice == 0)
                    text += QChar(static_cast<ushort>(m_random()));
                else if (choice == 1)
                    text += pieces[static_cast<int>(m_random() % unsigned(pieces.size()))];
                else
                    text += dangerous[static_cast<int>(m_random() % unsigned(dangerous.size()))];
            }
            texts.insert(text);
        }
        const QStringList list = texts.values();
        QVERIFY(std::all_of(list.begin(), list.end(), ComesBack));
        QVERIFY(AllComeBack(m_folder.filePath("texts.cfg"), list));
        m_texts += list.size();
    }
}

// Whatever a decoder accepts as an encoding is the encoding of its result; it leaves everything
// else unchanged.
void tst_PlainConfigText::randomEncodings()
{
    const QString alphabet = "\\_u0041ef%a ";
    const int count = Rounds::count(100000, 3000000);
    for (int i = 0; i < count; ++i) {
        QString text;
        for (unsigned left = m_random() % 14; left > 0; --left)
            text += alphabet[static_cast<int>(m_random() % unsigned(alphabet.size()))];

        bool isValue = false;
        const QString value = TorkConfigText::DecodeValue(text, &isValue);
        bool isName = false;
        const QString name = TorkConfigText::DecodeName(text, &isName);
        QVERIFY2(isValue ? PlainEncoding(value, false) == text : value == text, qPrintable(text));
        QVERIFY2(isName ? PlainEncoding(name, true) == text : name == text, qPrintable(text));
        ++m_encodings;
    }
}

// A plain value, and nothing else, comes back from a file without encoding.
void tst_PlainConfigText::plainValues()
{
    QStringList texts =
        Combinations({"%", "L", "0", "1", "3", "4", "]]>", "<", "x"}, 4) + QStringList("");
    for (int unit = 0; unit <= 0xffff; unit += unit < 0x200 ? 1 : Rounds::count(31, 1))
        texts += {QChar(static_cast<ushort>(unit)), "a" + QString(QChar(static_cast<ushort>(unit))),
                  "%" + QString(QChar(static_cast<ushort>(unit)))};
    for (QString const& text : qAsConst(texts)) {
        QVERIFY2(TorkConfigText::IsPlainValue(text) == IsKeptAsValue(text),
                 qPrintable(Value(text)));
        QVERIFY(TorkConfigText::IsPlainValue(Value(text)));
    }
    m_plain += texts.size();
}

void tst_PlainConfigText::plainNames()
{
    QStringList texts =
        Combinations({"a", "Z", "_", "-", ".", "0", "9", ":", " ", ">", "/"}, 3) + QStringList("");
    for (int unit = 0; unit <= 0xffff; unit += unit < 0x200 ? 1 : Rounds::count(31, 1))
        texts +=
            {QChar(static_cast<ushort>(unit)), "a" + QString(QChar(static_cast<ushort>(unit)))};
    for (QString const& text : qAsConst(texts)) {
        QVERIFY2(TorkConfigText::IsPlainName(text) == IsKeptAsName(text), qPrintable(Name(text)));
        QVERIFY(TorkConfigText::IsPlainName(Name(text)));
    }
    m_plain += texts.size();
}

void tst_PlainConfigText::cleanupTestCase()
{
    std::printf(
        "plain config text: %d single units and %d random texts came back as value, key and "
        "section; %d random encodings decoded as they should; %d texts told plain or not\n",
        m_units, m_texts, m_encodings, m_plain);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainConfigText)

#include "tst_PlainConfigText.moc"
