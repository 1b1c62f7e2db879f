// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXmlLimits.h"

#include <QBuffer>
#include <QTextCodec>
#include <QXmlDefaultHandler>
#include <QXmlSimpleReader>
#include <QtTest>

namespace {

// Collects the text of a document, and its errors.
class Text : public QXmlDefaultHandler
{
public:
    bool characters(QString const& piece) override
    {
        all += piece;
        return true;
    }

    bool fatalError(QXmlParseException const& exception) override
    {
        errors += exception.message();
        line = exception.lineNumber();
        column = exception.columnNumber();
        return false;
    }

    QString all;
    QStringList errors;
    int line = 0;
    int column = 0;
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

QByteArray Nested(int levels)
{
    return QByteArray("<a>").repeated(levels) + QByteArray("</a>").repeated(levels);
}

QByteArray Declarations(int count)
{
    QByteArray all;
    for (int i = 0; i < count; ++i)
        all += " xmlns:p" + QByteArray::number(i) + "='u'";
    return all;
}

constexpr int ElementsBelow256Prefixes = TorkXmlMaximumPrefixComparisons / (256 * 256);

// A document of so many elements, which all have so many prefixes in force.
QByteArray Below(int prefixes, int elements)
{
    return "<r" + Declarations(prefixes) + ">" + QByteArray("<a></a>").repeated(elements - 1) +
           "</r>";
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
    void namesTheLimit_data();
    void namesTheLimit();
    void tellsThePlace();
    void staysAtItsEnd();
    void tellsWithoutBeingWatched();
    void textIsUntouched();
    void givesWhatAPlainSourceGives_data();
    void givesWhatAPlainSourceGives();
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
    QTest::newRow("parameter entity with a bracket, unused")
        << Document(Entity("% p", "(a"), "") << true;
    QTest::newRow("parameter entity with a bracket, named in a comment")
        << Document(Entity("% p", "(a") + "<!--%p;-->", "") << true;
    QTest::newRow("as many groups as allowed from a parameter entity")
        << Document("<!ENTITY % p '" + Groups(TorkXmlMaximumDepth) + "'>%p;", "") << true;
    QTest::newRow("one group more from a parameter entity")
        << Document("<!ENTITY % p '" + Groups(TorkXmlMaximumDepth + 1) + "'>%p;", "") << false;
    for (QByteArray const& bracket : {QByteArray("&#40;"), QByteArray("&#x28;")}) {
        const auto groups = [&](int levels) {
            return Document("<!ENTITY % p '<!ELEMENT r " + bracket.repeated(levels) + "a" +
                                QByteArray(")").repeated(levels) + ">'>%p;",
                            "");
        };
        QTest::addRow("as many groups as allowed from references %s", bracket.constData())
            << groups(TorkXmlMaximumDepth) << true;
        QTest::addRow("one group more from references %s", bracket.constData())
            << groups(TorkXmlMaximumDepth + 1) << false;
    }
    const auto inTwoParts = [](int first, int second) {
        return Document("<!ENTITY % p '<!ELEMENT r " + QByteArray("(").repeated(first) + "'>%p;" +
                            QByteArray("(").repeated(second) + "a" +
                            QByteArray(")").repeated(first + second) + ">",
                        "");
    };
    QTest::newRow("as many groups as allowed, begun in a parameter entity")
        << inTwoParts(500, 500) << true;
    QTest::newRow("one group more, begun in a parameter entity") << inTwoParts(500, 501) << false;
    QTest::newRow("entity with brackets") << Document(Entity("e", "(a"), "&e;") << true;

    QTest::newRow("groups enough to exhaust a stack after the address of the document type")
        << "<!DOCTYPE r SYSTEM 'a><![CDATA[' [" + Groups(1000000) + "]><r/>" << false;

    const QByteArray brackets = QByteArray("(").repeated(5000);
    QTest::newRow("brackets in a comment")
        << Document("<!--" + brackets + "-->" + Groups(1), "") << true;
    QTest::newRow("brackets in a comment that seems to end")
        << Document("<!-- -> <!ELEMENT r " + brackets + "-->", "") << true;
    QTest::newRow("brackets in an instruction")
        << Document("<?a " + brackets + "?>" + Groups(1), "") << true;
    QTest::newRow("brackets in the value of an entity")
        << Document(Entity("e", brackets), "&e;") << true;
    QTest::newRow("brackets in a default value")
        << Document("<!ATTLIST r a CDATA '" + brackets + "'>", "") << true;
    QTest::newRow("brackets in an address")
        << Document("<!ENTITY e SYSTEM '" + brackets + "'>", "") << true;
    for (char const* hiding :
         {"<!-- ] > ' -->", "<?a ] > ' ?>", "<!ENTITY e \"]>'\">", "<!ATTLIST r a CDATA ']>\"'>",
          "<!ENTITY e SYSTEM \"]>'\">", "<!NOTATION n PUBLIC ']>'>"}) {
        QTest::addRow("groups enough to exhaust a stack after %s", hiding)
            << Document(hiding + Groups(1000000), "") << false;
    }

    QTest::newRow("as many entities as allowed")
        << Document(Entities(TorkXmlMaximumEntities), "&e0;") << true;
    QTest::newRow("one entity more")
        << Document(Entities(TorkXmlMaximumEntities + 1), "&e0;") << false;

    const int mostCharacters = TorkXmlMaximumEntityCharacters;
    const QByteArray halfText(mostCharacters / 2 - 1, 'x');
    const QByteArray halfName(mostCharacters / 2 - 1, 'n');
    QTest::newRow("as many characters in entities as allowed")
        << Document(Entity("e", halfText) + Entity("f", halfText), "&f;") << true;
    QTest::newRow("one character more in a text")
        << Document(Entity("e", halfText) + Entity("f", halfText + "x"), "&f;") << false;
    QTest::newRow("one character more in a name")
        << Document(Entity("e", halfText) + Entity("ff", halfText), "&ff;") << false;
    QTest::newRow("as many characters in a name and a text as allowed")
        << Document(Entity(halfName, halfText + "xx"), "") << true;
    QTest::newRow("one character more than in a name and a text")
        << Document(Entity(halfName, halfText + "xxx"), "") << false;
    QTest::newRow("one character more in a parameter entity")
        << Document("<!ENTITY % p '" + halfText + "'>" + Entity("ff", halfText), "") << false;
    QTest::newRow("the text of an entity that was declared before")
        << Document(Entity("e", halfText) + Entity("e", halfText) + Entity("f", halfText), "&f;")
        << true;

    const QByteArray half = Entity("e", QByteArray(TorkXmlMaximumExpansion / 1024, 'x'));
    QTest::newRow("as much text from entities as allowed")
        << Document(half, QByteArray("&e;").repeated(1024)) << true;
    QTest::newRow("one reference more")
        << Document(half, QByteArray("&e;").repeated(1025)) << false;
    // Long references that stand for nothing, so that only what is read again counts.
    const QByteArray nothing(1022, 'n');
    const QByteArray readAgain =
        Entity(nothing, "") + Entity("x", "x") + Entity("e", ('&' + nothing + ';').repeated(512));
    const QByteArray allReadAgain =
        QByteArray("&e;").repeated(TorkXmlMaximumReplacement / (512 * 1024));
    QTest::newRow("as much read again as allowed") << Document(readAgain, allReadAgain) << true;
    QTest::newRow("one character more read again")
        << Document(readAgain, allReadAgain + "&x;") << false;
    QTest::newRow("references without an entity")
        << QByteArray("<r>" + QByteArray("&amp;").repeated(100000) + "</r>") << true;
    const QByteArray names = Entity("e", "x") + Entity("f", "&e;");
    const QByteArray many = QByteArray("100% of R&D ").repeated(10000);
    QTest::newRow("percent signs beside an entity that names another")
        << Document(names, QByteArray("100% ").repeated(10000) + "&f;") << true;
    QTest::newRow("ampersands in CDATA") << Document(names, "<![CDATA[" + many + "]]>&f;") << true;
    QTest::newRow("references in CDATA")
        << Document(half, "<![CDATA[" + QByteArray("&e;").repeated(1025) + "]]>") << true;
    QTest::newRow("references in a comment")
        << Document(half, "<!--" + QByteArray("&e;").repeated(1025) + "-->") << true;
    QTest::newRow("references in an instruction")
        << Document(half, "<?a " + QByteArray("&e;").repeated(1025) + "?>") << true;
    QTest::newRow("predefined references beside an entity that names another")
        << Document(names, QByteArray("&amp;&#37;").repeated(10000) + "&f;") << true;
    QTest::newRow("references to what is not declared")
        << Document(names, QByteArray("&g;").repeated(10000) + "&f;") << true;

    QTest::newRow("as many elements inside each other as allowed")
        << Nested(TorkXmlMaximumDepth) << true;
    QTest::newRow("one element more") << Nested(TorkXmlMaximumDepth + 1) << false;
    QTest::newRow("one element more from entities")
        << Document(Entity("e", "<a>") + Entity("f", "</a>"),
                    QByteArray("&e;").repeated(TorkXmlMaximumDepth) +
                        QByteArray("&f;").repeated(TorkXmlMaximumDepth))
        << false;
    QTest::newRow("as many prefixes as allowed")
        << "<r" + Declarations(TorkXmlMaximumPrefixes) + "/>" << true;
    QTest::newRow("one prefix more")
        << "<r" + Declarations(TorkXmlMaximumPrefixes + 1) + "/>" << false;
    for (char const* space : {"\t", "\n", "\r\n"}) {
        QTest::addRow("one prefix more, after %s", QByteArray(space).toHex().constData())
            << "<r" + Declarations(TorkXmlMaximumPrefixes + 1).replace(" ", space) + "/>" << false;
    }
    QTest::newRow("one prefix more that nothing declares")
        << "<r" + Declarations(TorkXmlMaximumPrefixes) + "><q:a/></r>" << false;
    QTest::newRow("one prefix more in an attribute")
        << "<r" + Declarations(TorkXmlMaximumPrefixes) + "><a q:b=''/></r>" << false;
    QTest::newRow("the same prefixes again")
        << "<r" + Declarations(TorkXmlMaximumPrefixes) + "><a" +
               Declarations(TorkXmlMaximumPrefixes) + "/></r>"
        << true;
    QTest::newRow("as many prefixes as allowed, in each of two elements")
        << "<r><a" + Declarations(TorkXmlMaximumPrefixes) + "/><b" +
               Declarations(2 * TorkXmlMaximumPrefixes)
                   .mid(Declarations(TorkXmlMaximumPrefixes).size()) +
               "/></r>"
        << true;
    QTest::newRow("long prefixes")
        << "<r xmlns:" + QByteArray(16 * TorkXmlMaximumPrefixes, 'p') + "='u'/>" << false;
    QTest::newRow("as many elements below 256 prefixes as allowed")
        << Below(256, ElementsBelow256Prefixes) << true;
    QTest::newRow("one element below 256 prefixes more")
        << Below(256, ElementsBelow256Prefixes + 1) << false;
    QTest::newRow("sixteen times as many elements below a quarter of the prefixes")
        << Below(64, 16 * ElementsBelow256Prefixes) << true;
    QTest::newRow("one element below a quarter of the prefixes more")
        << Below(64, 16 * ElementsBelow256Prefixes + 1) << false;
    QTest::newRow("one element below 256 prefixes more, from an entity")
        << Document(Entity("e", "<a></a>"),
                    Below(256, ElementsBelow256Prefixes).replace("</r>", "&e;</r>"))
        << false;
    QTest::newRow("one element below long prefixes more")
        << Below(128, ElementsBelow256Prefixes + 1).replace("xmlns:p", "xmlns:ppppppppppppppp")
        << false;
    QTest::newRow("any number of elements beside prefixes")
        << "<r><a" + Declarations(256) + "></a>" +
               QByteArray("<a></a>").repeated(ElementsBelow256Prefixes) + "</r>"
        << true;
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

void tst_TorkXmlGuard::namesTheLimit_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("reason");

    QTest::newRow("elements") << Nested(1001) << "More than 1000 elements are inside each other.";
    QTest::newRow("groups") << Document(Groups(1001), "")
                            << "More than 1000 groups are inside each other in a document type.";
    for (char const* bracket : {"&#40;", "&#x28;"}) {
        QTest::addRow("groups from references %s", bracket)
            << Document("<!ENTITY % p '<!ELEMENT r " + QByteArray(bracket).repeated(1001) + "'>%p;",
                        "")
            << "More than 1000 groups are inside each other in a document type.";
    }
    QTest::newRow("entities") << Document(Entities(1001), "")
                              << "More than 1000 entities are declared.";
    QTest::newRow("long entities")
        << Document(Entity("e", QByteArray(TorkXmlMaximumEntityCharacters, 'x')), "")
        << "More than 1048576 characters of entities are declared.";
    QTest::newRow("characters of entities")
        << Document(Entity("e", QByteArray(16384, 'x')), QByteArray("&e;").repeated(1025))
        << "References to entities stand for more than 16777216 characters.";
    QTest::newRow("entities without characters")
        << Document(Entity("n", "") + Entity("e", QByteArray("&n;").repeated(10000)),
                    QByteArray("&e;").repeated(10000))
        << "References make more than 33554432 characters of entities be read again.";
    QTest::newRow("prefixes") << "<r" + Declarations(257) + "/>"
                              << "More than 256 namespace prefixes are in force.";
    QTest::newRow("elements below prefixes")
        << Below(256, ElementsBelow256Prefixes + 1)
        << "More than 268435456 comparisons of namespace prefixes are needed.";
    QTest::newRow("malformed within the limits") << QByteArray("<r>") << "unexpected end of file";
    QTest::newRow("an entity that names itself")
        << Document(Entity("e", "<a>&e;</a>"), "&e;") << "recursive entities";
    // The reader takes it for one once more texts are open than entities are declared, and one.
    QTest::newRow("an entity that names itself, with as many elements as allowed")
        << Document(Entities(997) + Entity("f", "<a>&f;</a>"), "&f;") << "recursive entities";
    QTest::newRow("an entity that names itself, with one element more")
        << Document(Entities(998) + Entity("f", "<a>&f;</a>"), "&f;")
        << "More than 1000 elements are inside each other.";
    QTest::newRow("a parameter entity that names itself")
        << Document("<!ENTITY % p '<!--c-->&#37;p;'>%p;", "") << "recursive entities";
}

// The error handler is called once, and is the reader's again afterwards.
void tst_TorkXmlGuard::namesTheLimit()
{
    QFETCH(QByteArray, document);
    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    QXmlSimpleReader reader;
    source.Watch(reader);
    Text handler;
    reader.setErrorHandler(&handler);
    QVERIFY(!reader.parse(source));
    QCOMPARE(handler.errors.size(), 1);
    QTEST(handler.errors.first(), "reason");
    QVERIFY(reader.errorHandler() == static_cast<QXmlErrorHandler*>(&handler));
}

void tst_TorkXmlGuard::tellsThePlace()
{
    QByteArray document = Nested(1000).replace("<a></a>", "<a>\n\n  <b></b></a>");
    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    QXmlSimpleReader reader;
    source.Watch(reader);
    Text handler;
    reader.setErrorHandler(&handler);
    QVERIFY(!reader.parse(source));
    QCOMPARE(handler.line, 3);
    QCOMPARE(handler.column, 5);
}

// For a reader that asks again, and for what was fetched already.
void tst_TorkXmlGuard::staysAtItsEnd()
{
    QByteArray document = Nested(1001);
    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    int count = 0;
    for (QChar next; next != QChar(QXmlInputSource::EndOfDocument); next = source.next())
        count += next == QLatin1Char('<') ? 1 : 0;
    QCOMPARE(count, 1001);
    for (int i = 0; i < 10; ++i)
        QCOMPARE(source.next(), QChar(QXmlInputSource::EndOfDocument));
}

void tst_TorkXmlGuard::tellsWithoutBeingWatched()
{
    QByteArray document = Nested(1001);
    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    QXmlSimpleReader reader;
    Text handler;
    reader.setErrorHandler(&handler);
    QVERIFY(!reader.parse(source));
    QCOMPARE(handler.errors, QStringList("unexpected end of file"));
}

// The reader fetches a kilobyte at a time, so what crosses the end of one counts too.
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

void tst_TorkXmlGuard::givesWhatAPlainSourceGives_data()
{
    QTest::addColumn<QByteArray>("document");

    QTest::newRow("nothing") << QByteArray();
    QTest::newRow("short") << QByteArray("<r>a&amp;</r>");
    QTest::newRow("fetched in pieces") << "<r>" + QByteArray(3000, 'x') + "</r>";
}

// Character by character, the ends of data between two fetches included.
void tst_TorkXmlGuard::givesWhatAPlainSourceGives()
{
    QFETCH(QByteArray, document);
    QBuffer plainBuffer(&document);
    QXmlInputSource plain(&plainBuffer);
    QBuffer buffer(&document);
    TorkXmlGuard source(&buffer);
    QChar expected;
    do {
        expected = plain.next();
        QCOMPARE(source.next(), expected);
    } while (expected != QChar(QXmlInputSource::EndOfDocument));
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
    QTest::newRow("text after the root") << QByteArray("<r>a</r>b");
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
