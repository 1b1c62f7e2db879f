// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigText.h"

#include <QLocale>
#include <QtTest>

#include <clocale>

class tst_TorkConfigText : public QObject
{
    Q_OBJECT

private slots:
    void value_data();
    void value();
    void name_data();
    void name();
    void nullIsEmpty();
    void otherTextStaysAsItIs_data();
    void otherTextStaysAsItIs();
    void okMayBeNull();
    void isPlainName_data();
    void isPlainName();
    void isPlainValue_data();
    void isPlainValue();
    void anyLocale_data();
    void anyLocale();
};

void tst_TorkConfigText::value_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("encoded");

    QTest::newRow("letters and digits") << "azAZ09"
                                        << "azAZ09";
    QTest::newRow("signs that stay") << " !#$()*+,-./:;=?@[^_`{|}~"
                                     << " !#$()*+,-./:;=?@[^_`{|}~";
    QTest::newRow("path") << "/home/ada/My file_1.txt|a"
                          << "/home/ada/My file_1.txt|a";
    QTest::newRow("empty") << ""
                           << "\\";
    QTest::newRow("percent sign") << "50%"
                                  << "50\\u0025";
    QTest::newRow("markup") << "&'<>\""
                            << "\\u0026\\u0027\\u003c\\u003e\\u0022";
    QTest::newRow("end of a CDATA section") << "]]>"
                                            << "\\u005d\\u005d\\u003e";
    QTest::newRow("backslash") << "\\"
                               << "\\u005c";
    QTest::newRow("what looks encoded") << "\\u0041"
                                        << "\\u005cu0041";
    QTest::newRow("control characters") << "\t\n\r\x7f"
                                        << "\\u0009\\u000a\\u000d\\u007f";
    QTest::newRow("NUL") << QString(QChar(0)) << "\\u0000";
    QTest::newRow("Latin-1") << QString::fromUtf8("ï") << "\\u00ef";
    QTest::newRow("beyond Latin-1") << QString::fromUtf8("€") << "\\u20ac";
    QTest::newRow("two units") << QString::fromUtf8("\xF0\x9F\x98\x80") << "\\ud83d\\ude00";
    QTest::newRow("unpaired surrogate") << QString(QChar(0xdc00)) << "\\udc00";
    QTest::newRow("digits of other languages") << QString::fromUtf8("٣") << "\\u0663";
}

void tst_TorkConfigText::value()
{
    QFETCH(QString, text);
    QFETCH(QString, encoded);
    QCOMPARE(TorkConfigText::EncodeValue(text), encoded);
    bool ok = false;
    QCOMPARE(TorkConfigText::DecodeValue(encoded, &ok), text);
    QVERIFY(ok);
}

void tst_TorkConfigText::name_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("encoded");

    QTest::newRow("letters, digits and signs") << "azAZ-09."
                                               << "azAZ-09.";
    QTest::newRow("signs beside letters and digits") << "a@[`{/:"
                                                     << "a_u0040_u005b_u0060_u007b_u002f_u003a";
    QTest::newRow("empty") << ""
                           << "_";
    QTest::newRow("space") << "My file"
                           << "My_u0020file";
    QTest::newRow("underscore") << "my_key"
                                << "my_u005fkey";
    QTest::newRow("what looks encoded") << "a_u0041"
                                        << "a_u005fu0041";
    QTest::newRow("digit first") << "1st"
                                 << "_u0031st";
    QTest::newRow("dot first") << ".a."
                               << "_u002ea.";
    QTest::newRow("hyphen first") << "-a-"
                                  << "_u002da-";
    QTest::newRow("C++") << "C++"
                         << "C_u002b_u002b";
    QTest::newRow("a/b") << "a/b"
                         << "a_u002fb";
    QTest::newRow("colon") << "a:b"
                           << "a_u003ab";
    QTest::newRow("backslash") << "a\\b"
                               << "a_u005cb";
    QTest::newRow("Latin-1") << QString::fromUtf8("naïve") << "na_u00efve";
    QTest::newRow("name of the root element") << "VelocorSettings"
                                              << "_u0056elocorSettings";
    QTest::newRow("begins like the root element") << "VelocorSettings2"
                                                  << "VelocorSettings2";
}

void tst_TorkConfigText::name()
{
    QFETCH(QString, text);
    QFETCH(QString, encoded);
    QCOMPARE(TorkConfigText::EncodeName(text), encoded);
    bool ok = false;
    QCOMPARE(TorkConfigText::DecodeName(encoded, &ok), text);
    QVERIFY(ok);
}

void tst_TorkConfigText::nullIsEmpty()
{
    QCOMPARE(TorkConfigText::EncodeValue(QString()), QString("\\"));
    QCOMPARE(TorkConfigText::EncodeName(QString()), QString("_"));
    QVERIFY(!TorkConfigText::DecodeValue("\\").isNull());
    QVERIFY(!TorkConfigText::DecodeName("_").isNull());
}

void tst_TorkConfigText::otherTextStaysAsItIs_data()
{
    QTest::addColumn<QString>("encoded");
    QTest::addColumn<bool>("isValue"); // which decoder refuses it
    QTest::addColumn<bool>("isName");

    QTest::newRow("empty") << "" << false << false;
    QTest::newRow("plain word") << "word" << true << true;
    QTest::newRow("plain text") << "two words" << true << false;
    QTest::newRow("markup") << "R&D" << false << false;
    QTest::newRow("escape at the end") << "a\\" << false << false;
    QTest::newRow("name's escape at the end") << "a_" << true << false;
    QTest::newRow("folders") << "C:\\users\\ada" << false << false;
    QTest::newRow("too few digits") << "\\u00e" << false << false;
    QTest::newRow("too few digits in a name") << "a_u00e" << true << false;
    QTest::newRow("no digits") << "\\u00zz" << false << false;
    QTest::newRow("a sign for a digit") << "\\u+0e9" << false << false;
    QTest::newRow("upper case") << "\\u00EF" << false << false;
    QTest::newRow("letter that needs no escape") << "\\u0041" << false << false;
    QTest::newRow("letter that needs no escape in a name") << "a_u0041" << true << false;
    QTest::newRow("digit first") << "1st" << true << false;
    QTest::newRow("name with underscores") << "my_own_key" << true << false;
    QTest::newRow("root element") << "VelocorSettings" << true << false;
    QTest::newRow("Latin-1") << QString::fromUtf8("naïve") << false << false;
}

void tst_TorkConfigText::otherTextStaysAsItIs()
{
    QFETCH(QString, encoded);
    bool isValue = false;
    bool isName = false;
    QCOMPARE(TorkConfigText::DecodeValue(encoded, &isValue), encoded);
    QCOMPARE(TorkConfigText::DecodeName(encoded, &isName), encoded);
    QTEST(isValue, "isValue");
    QTEST(isName, "isName");
}

void tst_TorkConfigText::okMayBeNull()
{
    QCOMPARE(TorkConfigText::DecodeValue("\\u00ef", nullptr), QString(QChar(0xef)));
    QCOMPARE(TorkConfigText::DecodeName("a_u00EF"), QString("a_u00EF"));
}

void tst_TorkConfigText::isPlainName_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("expected");
    QTest::newRow("letters") << "abc" << true;
    QTest::newRow("underscore first") << "_a" << true;
    QTest::newRow("trailing digits") << "a1.b-c" << true;
    QTest::newRow("digit first") << "1a" << false;
    QTest::newRow("blank") << "a b" << false;
    QTest::newRow("markup") << "a<" << false;
    QTest::newRow("empty") << "" << false;
    QTest::newRow("umlaut") << QString::fromUtf8("\xC3\xA4") << false;
    QTest::newRow("trailing line feed") << "a\n" << false;
}

void tst_TorkConfigText::isPlainName()
{
    QFETCH(QString, name);
    QTEST(TorkConfigText::IsPlainName(name), "expected");
}

void tst_TorkConfigText::isPlainValue_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("expected");
    QTest::newRow("letters") << "abc" << true;
    QTest::newRow("blank") << " " << true;
    QTest::newRow("markup") << "<&>" << true;
    QTest::newRow("line feed") << "a\nb" << true;
    QTest::newRow("percent sign") << "50 %" << true;
    QTest::newRow("number above 3") << "%4" << true;
    QTest::newRow("number of two digits") << "%10" << true;
    QTest::newRow("placeholder") << "%1" << false;
    QTest::newRow("placeholder of two digits") << "%03" << false;
    QTest::newRow("placeholder before a digit") << "%031" << false;
    QTest::newRow("localized placeholder") << "%L2" << false;
    QTest::newRow("last character of ASCII") << QString(QChar(0x7f)) << true;
    QTest::newRow("first character beyond ASCII") << QString(QChar(0x80)) << false;
    QTest::newRow("end of a CDATA section") << "a]]>" << false;
    QTest::newRow("umlaut") << QString::fromUtf8("\xC3\xA4") << false;
    QTest::newRow("empty") << "" << false;
}

void tst_TorkConfigText::isPlainValue()
{
    QFETCH(QString, value);
    QTEST(TorkConfigText::IsPlainValue(value), "expected");
}

void tst_TorkConfigText::anyLocale_data()
{
    QTest::addColumn<QString>("locale");
    for (char const* locale : {"C", "de_DE", "tr_TR", "ar_EG", "fa_IR", "hi_IN"})
        QTest::newRow(locale) << QString(locale);
}

void tst_TorkConfigText::anyLocale()
{
    QFETCH(QString, locale);
    const QLocale before;
    QLocale::setDefault(QLocale(locale));
    std::setlocale(LC_ALL, qPrintable(locale + ".UTF-8"));
    const QString text = QString::fromUtf8("Iıİi 0129 ٠١ é%1");
    const QString value = TorkConfigText::EncodeValue(text);
    const QString name = TorkConfigText::EncodeName(text);
    const bool back =
        TorkConfigText::DecodeValue(value) == text && TorkConfigText::DecodeName(name) == text;
    QLocale::setDefault(before);
    std::setlocale(LC_ALL, "C");

    QVERIFY(back);
    QCOMPARE(value, QString("I\\u0131\\u0130i 0129 \\u0660\\u0661 \\u00e9\\u00251"));
    QCOMPARE(name, QString("I_u0131_u0130i_u00200129_u0020_u0660_u0661_u0020_u00e9_u00251"));
}

QTEST_GUILESS_MAIN(tst_TorkConfigText)

#include "tst_TorkConfigText.moc"
