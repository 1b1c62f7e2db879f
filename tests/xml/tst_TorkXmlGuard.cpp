// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlDepth.h"
#include "common/xml/TorkXmlGuard.h"

#include <QBuffer>
#include <QTextCodec>
#include <QXmlDefaultHandler>
#include <QXmlSimpleReader>
#include <QtTest>

namespace {

// Collects the text of a document.
class Text : public QXmlDefaultHandler
{
public:
    bool characters(QString const& piece) override
    {
        all += piece;
        return true;
    }

    QString all;
};

// A document with this internal subset and this text.
QByteArray Document(QByteArray const& subset, QByteArray const& text)
{
    return "<!DOCTYPE r [" + subset + "]><r>" + text + "</r>";
}

QByteArray Groups(int levels)
{
    return "<!ELEMENT r " + QByteArray("(").repeated(levels) + "a" +
           QByteArray(")").repeated(levels) + ">";
}

QByteArray Entity(QByteArray const& name, QByteArray const& value)
{
    return "<!ENTITY " + name + " \"" + value + "\">";
}

QByteArray Entities(int count)
{
    QByteArray all;
    for (int i = 0; i < count; ++i)
        all += Entity('e' + QByteArray::number(i), "x");
    return all;
}

} // namespace

class tst_TorkXmlGuard : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void textIsUntouched();
    void readsWhatAPlainSourceReads_data();
    void readsWhatAPlainSourceReads();
};

void tst_TorkXmlGuard::parse_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<bool>("parses");

    QTest::newRow("no document type") << QByteArray("<r>a</r>") << true;
    QTest::newRow("empty document type") << QByteArray("<!DOCTYPE r><r>a</r>") << true;

    QTest::newRow("as many groups as allowed") << Document(Groups(TorkXmlMaximumDepth), "") << true;
    QTest::newRow("one group more") << Document(Groups(TorkXmlMaximumDepth + 1), "") << false;
    QTest::newRow("groups enough to exhaust a stack") << Document(Groups(1000000), "") << false;
    QTest::newRow("groups in two declarations") << Document(Groups(600) + Groups(600), "") << true;
    QTest::newRow("groups side by side")
        << Document("<!ELEMENT r (" + QByteArray("(a),").repeated(2000) + "(a))>", "") << true;
    QTest::newRow("brackets in the text")
        << Document(Groups(1), QByteArray("(").repeated(5000)) << true;
    QTest::newRow("brackets in a text without a document type")
        << QByteArray("<r>" + QByteArray("(").repeated(5000) + "</r>") << true;

    QTest::newRow("parameter entity") << Document(Entity("% p", "x"), "") << true;
    QTest::newRow("parameter entity with a group") << Document(Entity("% p", "(a"), "") << false;
    QTest::newRow("parameter entity with a group as a reference")
        << Document(Entity("% p", "&#40;a"), "") << false;
    QTest::newRow("entity with brackets") << Document(Entity("e", "(a"), "&e;") << true;

    QTest::newRow("as many entities as allowed")
        << Document(Entities(TorkXmlMaximumEntities), "&e0;") << true;
    QTest::newRow("one entity more")
        << Document(Entities(TorkXmlMaximumEntities + 1), "&e0;") << false;

    const QByteArray half = Entity("e", QByteArray(TorkXmlMaximumExpansion / 1024, 'x'));
    QTest::newRow("as much text from entities as allowed")
        << Document(half, QByteArray("&e;").repeated(1024)) << true;
    QTest::newRow("one reference more")
        << Document(half, QByteArray("&e;").repeated(1025)) << false;
    QTest::newRow("references without an entity")
        << QByteArray("<r>" + QByteArray("&amp;").repeated(100000) + "</r>") << true;
}

void tst_TorkXmlGuard::parse()
{
    QFETCH(QByteArray, document);
    QBuffer buffer(&document);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    TorkXmlGuard source(&buffer);
    QXmlSimpleReader reader;
    source.Watch(reader);
    QTEST(reader.parse(source), "parses");
}

// The reader asks for more in portions of a kilobyte, so what lies across their ends counts too.
void tst_TorkXmlGuard::textIsUntouched()
{
    QString expected;
    for (int i = 0; i < 5000; ++i)
        expected += QString::number(i) + "()%";
    QByteArray document = Document(Groups(3) + Entity("e", "x"), expected.toLatin1() + "&e;");
    QBuffer buffer(&document);
    QVERIFY(buffer.open(QIODevice::ReadOnly));

    TorkXmlGuard source(&buffer);
    QXmlSimpleReader reader;
    source.Watch(reader);
    Text text;
    reader.setContentHandler(&text);
    QVERIFY(reader.parse(source));
    QCOMPARE(text.all, expected + "x");
}

void tst_TorkXmlGuard::readsWhatAPlainSourceReads_data()
{
    QTest::addColumn<QByteArray>("document");

    const QString text = QString("<r>%1</r>").arg(QString(3000, QChar(0xe4)));
    QTest::newRow("nothing") << QByteArray();
    QTest::newRow("two bytes a character") << text.toUtf8();
    QTest::newRow("declared as Latin-1")
        << "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>" + text.toLatin1();
    for (char const* name : {"UTF-16LE", "UTF-16BE", "UTF-32"}) {
        QTextCodec const* codec = QTextCodec::codecForName(name);
        QTest::newRow(name) << codec->fromUnicode(QChar(QChar::ByteOrderMark) + text);
    }
    QTest::newRow("an end of data in the text") << QByteArray("<r>a\xef\xbf\xbe"
                                                              "b</r>");
    QTest::newRow("an end of document in the text") << QByteArray("<r>a\xef\xbf\xbf"
                                                                  "b</r>");
    QTest::newRow("an end of data in the document type")
        << QByteArray("<!DOCTYPE r [<!--\xef\xbf\xbe-->]><r>a</r>");
    QTest::newRow("a zero in the text") << QByteArray("<r>a\0b</r>", 10);
    QTest::newRow("cut short") << text.toUtf8().left(2001);
    QTest::newRow("text behind the root") << QByteArray("<r>a</r>b");
    QTest::newRow("line ends of all kinds") << QByteArray("<r>a\r\nb\rc\n\n\rd</r>");
}

void tst_TorkXmlGuard::readsWhatAPlainSourceReads()
{
    QFETCH(QByteArray, document);
    QBuffer plainBuffer(&document);
    QXmlInputSource plain(&plainBuffer);
    Text expected;
    QXmlSimpleReader plainReader;
    plainReader.setContentHandler(&expected);
    const bool parses = plainReader.parse(plain);

    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    Text text;
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(&text);
    QCOMPARE(reader.parse(source), parses);
    QCOMPARE(text.all, expected.all);
}

QTEST_GUILESS_MAIN(tst_TorkXmlGuard)
#include "tst_TorkXmlGuard.moc"
