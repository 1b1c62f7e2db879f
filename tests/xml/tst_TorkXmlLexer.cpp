// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What a document comes to by each limit, exactly: with that as the limit it passes, with one less
// it does not. tst_TorkXmlGuard has the limits themselves.

#include "common/xml/TorkXmlLexer_p.h"
#include "xml/XmlEvents.h"

#include <QtTest>

namespace {

using Limits = TorkXmlLexer::Limits;

enum Count {
    Depth,
    Groups,
    Entities,
    EntityCharacters,
    Expansion,
    Replacement,
    Prefixes,
    PrefixComparisons
};

// Limits that a small document does not reach, but for one.
Limits LimitsWith(Count count, int limit)
{
    Limits limits;
    switch (count) {
    case Depth:
        limits.depth = limit;
        break;
    case Groups:
        limits.groups = limit;
        break;
    case Entities:
        limits.entities = limit;
        break;
    case EntityCharacters:
        limits.entityCharacters = limit;
        break;
    case Expansion:
        limits.expansion = limit;
        break;
    case Replacement:
        limits.replacement = limit;
        break;
    case Prefixes:
        limits.prefixes = limit;
        break;
    case PrefixComparisons:
        limits.prefixComparisons = limit;
        break;
    }
    return limits;
}

QString ReasonOf(Count count, int limit)
{
    static char const* const reasons[] = {
        "More than %1 elements are inside each other.",
        "More than %1 groups are inside each other in a document type.",
        "More than %1 entities are declared.",
        "More than %1 characters of entities are declared.",
        "References to entities stand for more than %1 characters.",
        "References make more than %1 characters of entities be read again.",
        "More than %1 namespace prefixes are in force.",
        "More than %1 comparisons of namespace prefixes are needed."};
    return QString(reasons[count]).arg(limit);
}

// Reads each character, or only those that do not pass, as the guard does.
QString ReasonAfter(QString const& document, Limits const& limits, bool skips)
{
    TorkXmlLexer lexer(limits);
    for (QChar character : document) {
        if (!(skips && lexer.passes(character)) && !lexer.read(character))
            break;
    }
    return lexer.reason();
}

QByteArray Typed(QByteArray const& subset, QByteArray const& content)
{
    return "<!DOCTYPE r [" + subset + "]><r>" + content + "</r>";
}

} // namespace

Q_DECLARE_METATYPE(Count)

class tst_TorkXmlLexer : public QObject
{
    Q_OBJECT

private slots:
    void counts_data();
    void counts();
    void refusesAtOnce();
};

void tst_TorkXmlLexer::counts_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<Count>("count");
    QTest::addColumn<int>("expected");

    const auto row = [](char const* name, QByteArray const& document, Count count, int expected) {
        QTest::newRow(name) << document << count << expected;
    };
    const QByteArray declared = "<!ENTITY e 'xyz'>";

    row("one element", "<r/>", Depth, 1);
    row("elements inside each other", "<r><a><b></b><b/></a></r>", Depth, 3);
    row("elements side by side", "<r><a></a><a/><a></a><a/></r>", Depth, 2);
    row("elements after an end tag", "<r><a></a><a><b/></a></r>", Depth, 3);
    row("end tag with a space", "<r><a></a ><a></a\n></r>", Depth, 2);
    row("empty element with a space", "<r><a /><a b='' /></r>", Depth, 2);
    row("elements in a comment", "<r><!--<a><b>--></r>", Depth, 1);
    row("comment that seems to end at once", "<r><!---><a><b> --></r>", Depth, 1);
    row("comment that seems to end later", "<r><!-- -><a><b> -> --></r>", Depth, 1);
    row("comment after another", "<r><!--a--><!--><a>--></r>", Depth, 1);
    row("elements in CDATA", "<r><![CDATA[<a><b>]]></r>", Depth, 1);
    row("CDATA that seems to end at once", "<r><![CDATA[]><a><b>]]></r>", Depth, 1);
    row("CDATA that seems to end later", "<r><![CDATA[a]><a>] ]><b>]]></r>", Depth, 1);
    row("CDATA with one bracket more", "<r><![CDATA[<a>]]]></r>", Depth, 1);
    row("empty CDATA", "<r><![CDATA[]]><a/></r>", Depth, 2);
    row("elements in an instruction", "<r><?do <a> <b>?></r>", Depth, 1);
    row("instruction that seems to end", "<r><?do ? > <a>?></r>", Depth, 1);
    row("instruction with a question mark more", "<r><?do ?\?><a/></r>", Depth, 2);
    row("instruction before the root", "<?xml version='1.0'?><r><a/></r>", Depth, 2);
    row("elements in an attribute", "<r a='>/a>' b=\">/\"/>", Depth, 1);
    row("elements after a document type", "<!DOCTYPE r><r><a/></r>", Depth, 2);
    row("elements from an entity", Typed("<!ENTITY e '<a><b/></a>'>", "&e;"), Depth, 3);
    row("elements from a reference", Typed("<!ENTITY e '&#60;a/&#62;'>", "&e;"), Depth, 2);
    row("elements from a hexadecimal reference", Typed("<!ENTITY e '&#x3c;a/&#x3E;'>", "&e;"),
        Depth, 2);
    row("elements in an entity that is not named", Typed("<!ENTITY e '<a><b/></a>'>", ""), Depth,
        1);

    row("group", Typed("<!ELEMENT r (a)>", ""), Groups, 1);
    row("groups side by side", Typed("<!ELEMENT r ((a),(b),((c)))>", ""), Groups, 3);
    row("groups of two declarations", Typed("<!ELEMENT r (a)><!ELEMENT a ((b))>", ""), Groups, 2);
    row("group of an attribute", Typed("<!ATTLIST r a (x|y) 'x'>", ""), Groups, 1);
    row("group of notations", Typed("<!NOTATION n PUBLIC 'n'><!ATTLIST r a NOTATION (n) 'n'>", ""),
        Groups, 1);
    row("group from a parameter entity", Typed("<!ENTITY % p '<!ELEMENT r ((a))>'>%p;", ""), Groups,
        2);
    row("group from a parameter entity after a comment",
        Typed("<!ENTITY % p '<!ELEMENT r ((a))>'><!--c-->%p;", ""), Groups, 2);
    row("group from a parameter entity after an instruction",
        Typed("<!ENTITY % p '<!ELEMENT r ((a))>'><?do?>%p;", ""), Groups, 2);
    row("group from references", Typed("<!ENTITY % p '<!ELEMENT r &#40;a&#x29;>'>%p;", ""), Groups,
        1);
    row("brackets in a default value", Typed("<!ATTLIST r a CDATA '((('>", ""), Groups, 0);
    row("brackets in an address", Typed("<!NOTATION n SYSTEM '((('>", ""), Groups, 0);
    row("brackets in the text", Typed("", "((("), Groups, 0);

    row("entities", Typed(declared + "<!ENTITY % p 'x'>", ""), Entities, 2);
    row("entity without a text", Typed("<!ENTITY e ''>", ""), Entities, 1);
    row("external entity", Typed("<!ENTITY e SYSTEM 'a'>", ""), Entities, 0);
    row("public entity", Typed("<!ENTITY e PUBLIC 'a' \"b>'\">", ""), Entities, 0);
    row("entity declared again", Typed(declared + declared, ""), Entities, 1);
    row("external entity declared again", Typed("<!ENTITY e SYSTEM 'a'>" + declared, ""), Entities,
        0);
    row("entity after an attribute list", Typed("<!ATTLIST r a CDATA ''>" + declared, ""), Entities,
        1);
    row("entity in a parameter entity", Typed("<!ENTITY % p \"" + declared + "\">%p;", ""),
        Entities, 2);

    for (const QByteArray space : {" ", "  ", "\t", "\n", "\r"}) {
        QTest::addRow("characters of an entity with space %s", space.toHex().constData())
            << Typed("<!ENTITY" + space + "en" + space + "'xyz'" + space + ">", "")
            << EntityCharacters << 5;
        QTest::addRow("characters of a parameter entity with space %s", space.toHex().constData())
            << Typed("<!ENTITY" + space + "%" + space + "en" + space + "'xyz'" + space + ">", "")
            << EntityCharacters << 5;
        QTest::addRow("prefixes with space %s", space.toHex().constData())
            << "<p:r" + space + "q:a" + space + "=" + space + "''" + space + "s:b=''" + space + "/>"
            << Prefixes << 3;
    }
    row("characters of an entity in the other quotes", Typed("<!ENTITY e \"'\">", ""),
        EntityCharacters, 2);
    row("characters of an external entity", Typed("<!ENTITY e SYSTEM 'abc'>", ""), EntityCharacters,
        0);
    row("reference in an entity", Typed("<!ENTITY e '&#65;&#x42;'>", ""), EntityCharacters, 3);
    row("named reference in an entity", Typed("<!ENTITY e '&lt;'>", ""), EntityCharacters, 5);
    row("parameter in an entity", Typed("<!ENTITY % p 'xyz'><!ENTITY e '%p;%p;'>", ""),
        EntityCharacters, 11);
    row("characters of an entity declared again", Typed(declared + "<!ENTITY e 'longer'>", ""),
        EntityCharacters, 4);

    row("text of an entity", Typed(declared, "&e;&e;"), Expansion, 6);
    row("text of an entity in an attribute", Typed(declared, "<a b='&e;'/>"), Expansion, 3);
    row("text of an entity in an entity", Typed(declared + "<!ENTITY f 'a&e;b'>", "&f;"), Expansion,
        5);
    for (char const* name : {"amp", "lt", "gt", "apos", "quot", "#65", "#x41"}) {
        QTest::addRow("reference %s in an entity", name)
            << Typed(QByteArray("<!ENTITY e 'a&") + name + ";'>", "&e;") << Expansion << 2;
    }
    row("references beside an entity", Typed(declared, "&amp;&#65;&e;&none;"), Expansion, 3);
    row("entity that is not declared", Typed("<!ENTITY e '&none;'>", "&e;"), Expansion, 0);
    row("parameter named like an entity", Typed("<!ENTITY % e 'xyz'>", "&e;"), Expansion, 0);
    row("external entity named", Typed("<!ENTITY e SYSTEM 'xyz'>", "&e;"), Expansion, 0);
    row("entity in a default value", Typed(declared + "<!ATTLIST r a CDATA '&e;'>", ""), Expansion,
        3);
    row("entity in an address", Typed(declared + "<!NOTATION n SYSTEM '&e;'>", ""), Expansion, 0);
    row("entity in a comment", Typed(declared, "<!--&e;-->"), Expansion, 0);
    row("entity in CDATA", Typed(declared, "<![CDATA[&e;]]>"), Expansion, 0);
    row("entity after CDATA", Typed(declared, "<![CDATA[]]>&e;"), Expansion, 3);
    row("entity in an instruction", Typed(declared, "<?do &e;?>"), Expansion, 0);
    row("parameter in the document type", Typed("<!ENTITY % p '<!--abc-->'>%p;", ""), Expansion,
        10);
    row("reference in an entity that a parameter declares",
        Typed("<!ENTITY % p \"<!ENTITY e '&#38;#65;'>\">%p;", ""), Expansion, 15);
    row("named reference in an entity that a parameter declares",
        Typed("<!ENTITY % p \"<!ENTITY e '&#38;lt;'>\">%p;", ""), Expansion, 18);
    row("quotes of an entity in an attribute",
        Typed("<!ENTITY e '\"'><!ENTITY f \"'\">", "<a b=\"&e;&f;\" c='&e;&f;'/>"), Expansion, 4);

    row("text read again", Typed(declared, "&e;&e;"), Replacement, 6);
    row("text read again in an entity", Typed(declared + "<!ENTITY f '&e;&e;'>", "&f;"),
        Replacement, 12);
    row("quotes read again in an attribute", Typed("<!ENTITY e '\"'>", "<a b='&e;'/>"), Replacement,
        6);
    row("quotes read again in the text", Typed("<!ENTITY e '\"'>", "&e;"), Replacement, 1);

    row("no prefix", "<r a='' xmlns='u'/>", Prefixes, 0);
    row("prefix of an element", "<p:r/>", Prefixes, 1);
    row("prefix of an attribute", "<r q:a='b'/>", Prefixes, 1);
    row("prefix that is declared", "<r xmlns:p='u'/>", Prefixes, 1);
    row("prefix that is declared and used", "<p:r xmlns:p='u' p:a=''/>", Prefixes, 1);
    row("prefixes of names that begin alike", "<r><ap:a><p:a/></ap:a></r>", Prefixes, 2);
    row("prefix after an element without one", "<r><p:b xmlns:p='u'/></r>", Prefixes, 1);
    row("prefix after an attribute without one", "<r a='' p:b='' xmlns:p='u'/>", Prefixes, 1);
    row("elements of the prefix xmlns", "<xmlns:a><xmlns:b/></xmlns:a>", Prefixes, 1);
    row("prefixes side by side", "<r><p:a/><q:a/><s:a></s:a></r>", Prefixes, 1);
    row("prefixes inside each other", "<r><p:a><q:a></q:a></p:a><s:a/></r>", Prefixes, 2);
    row("prefixes of an element and its attributes end together",
        "<r><p:a q:b=''/><s:a t:b=''></s:a></r>", Prefixes, 2);
    row("prefix of 15 characters", "<ppppppppppppppp:r/>", Prefixes, 1);
    row("prefix of 16 characters", "<pppppppppppppppp:r/>", Prefixes, 2);
    row("prefix of 32 characters", "<pppppppppppppppppppppppppppppppp:r/>", Prefixes, 3);
    row("prefix after quotes of an entity", Typed("<!ENTITY e '\"'>", "<a b=\"&e;\" p:c=''/>"),
        Prefixes, 1);
    row("prefix after other quotes of an entity", Typed("<!ENTITY e \"'\">", "<a b='&e;' p:c=''/>"),
        Prefixes, 1);

    row("comparisons of elements without prefixes", "<r><a/><a></a></r>", PrefixComparisons, 0);
    row("comparisons of elements below a prefix", "<p:r><a/><a></a></p:r>", PrefixComparisons, 3);
    row("comparisons below two prefixes", "<p:r q:a=''><a/></p:r>", PrefixComparisons, 8);
    row("comparisons after a prefix ended", "<r><p:a/><a/></r>", PrefixComparisons, 1);
    row("comparisons below a prefix of 16 characters",
        "<pppppppppppppppp:r><a/></pppppppppppppppp:r>", PrefixComparisons, 8);
}

void tst_TorkXmlLexer::counts()
{
    QFETCH(QByteArray, document);
    QFETCH(Count, count);
    QFETCH(int, expected);
    const QStringList events =
        XmlEvents::of<QXmlInputSource>(document, [](QXmlInputSource&, QXmlSimpleReader&) {});
    QVERIFY2(events.last().startsWith("parsed"), events.join('\n').toUtf8());

    for (bool skips : {false, true}) {
        const auto reason = [&](int limit) {
            return ReasonAfter(document, LimitsWith(count, limit), skips);
        };
        QCOMPARE(reason(expected), QString());
        if (expected > 0)
            QCOMPARE(reason(expected - 1), ReasonOf(count, expected - 1));
    }
}

// Nobody would live to see all of this document.
void tst_TorkXmlLexer::refusesAtOnce()
{
    QByteArray entities = "<!ENTITY e0 'x'>";
    for (int i = 1; i < 100; ++i) {
        const QByteArray half = "&e" + QByteArray::number(i - 1) + ";";
        entities += "<!ENTITY e" + QByteArray::number(i) + " '" + half + half + "'>";
    }
    const QString document = Typed(entities, "&e99;");
    QCOMPARE(ReasonAfter(document, LimitsWith(Expansion, 1000), false), ReasonOf(Expansion, 1000));
}

QTEST_APPLESS_MAIN(tst_TorkXmlLexer)
#include "tst_TorkXmlLexer.moc"
