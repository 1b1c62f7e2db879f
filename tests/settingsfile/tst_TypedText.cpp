// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Texts at the limits of their kinds; tst_PlainTypedText compares all kinds with the store.

#include "app/settingsfile/TypedText.h"

#include <QFont>
#include <QtTest>

using namespace Velocor;

class tst_TypedText : public QObject
{
    Q_OBJECT

private slots:
    void kinds();
    void longTexts_data();
    void longTexts();
    void yesNo_data();
    void yesNo();
    void fonts_data();
    void fonts();
};

void tst_TypedText::kinds()
{
    const QList<ValueKind> kinds = TypedText::AllKinds();
    QCOMPARE(kinds.size(), 8);
    QCOMPARE(kinds[0], ValueKind::Text);
    QCOMPARE(kinds[7], ValueKind::FileList);
}

void tst_TypedText::longTexts_data()
{
    QTest::addColumn<int>("length");
    QTest::addColumn<bool>("isList");
    QTest::newRow("as long as is looked at") << 100000 << true;
    QTest::newRow("longer") << 100001 << false;
}

void tst_TypedText::longTexts()
{
    QFETCH(int, length);
    QFETCH(bool, isList);
    const QString text = "/a|/" + QString(length - 4, 'b');
    QCOMPARE(TypedText::Guess("S", text), isList ? ValueKind::FileList : ValueKind::Text);
}

void tst_TypedText::yesNo_data()
{
    QTest::addColumn<bool>("expected");
    QTest::newRow("") << false;
    QTest::newRow("maybe") << false;
    QTest::newRow("0") << false;
    QTest::newRow("1") << true;
}

void tst_TypedText::yesNo()
{
    QTEST(TypedText::ToYesNo(QTest::currentDataTag()), "expected");
}

void tst_TypedText::fonts_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isFont");
    const QString font("Sans,10,-1,5,50,0,0,0,0,0");
    QTest::newRow("complete") << font << true;
    QTest::newRow("with a style") << font + ",Bold" << true;
    QTest::newRow("a field too many") << font + ",Bold,1" << false;
    QTest::newRow("a field too few") << font.left(font.size() - 2) << false;
    QTest::newRow("only a family") << "Sans" << false;
}

void tst_TypedText::fonts()
{
    QFETCH(QString, text);
    QFont font;
    QTEST(TypedText::ToFont(text, font), "isFont");
}

QTEST_MAIN(tst_TypedText)

#include "tst_TypedText.moc"
