// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOption.h"
#include "app/LaunchOptionParser.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QTest>
#include <QTextCodec>

#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr int TenMegabytes = 10 * 1000 * 1000;

// The two options in the order in which the startup step adds them.
void AddBothOptions(LaunchOptionParser& parser)
{
    parser.AddOption(
        new LaunchOption("organization", "organization", "o", 1, "The product organization name"));
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "The product name"));
}

// "unset" or the value in brackets, so that an empty value differs from none.
QString Shown(LaunchOptionParser& parser, QString const& key)
{
    LaunchOption const* option = parser.FindOption(key);
    if (!option->isSet)
        return option->value.isEmpty() ? "unset" : "unset but not empty";
    return "[" + option->value + "]";
}

QString Unknown(QString const& key, QString const& value)
{
    return "Unknown key = " + key + ". Value: " + value + " failed to set. - Parsing terminated.";
}

} // namespace

class tst_LaunchOptionParser : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void record_data();
    void record();
    void recordsOfOwnMaking();
    void newParserIsEmpty();
    void addOptionKeepsOrder();
    void findOption_data();
    void findOption();
    void findOptionTakesTheFirstOfTwo();
    void findOptionWithoutOptions();
    void parseOptions_data();
    void parseOptions();
    void unknownKeys_data();
    void unknownKeys();
    void malformed_data();
    void malformed();
    void localEncoding_data();
    void localEncoding();
    void secondReadOverwrites();
    void malformedReadKeepsEarlierValues();
    void parserWithoutOptions();
    void readDataFile_data();
    void readDataFile();
    void missingFile();
    void folderInItsPlace();
    void noRegularFile_data();
    void noRegularFile();
    void linkToARegularFile();
    void longestFile_data();
    void longestFile();
    void emptyPath();
    void pathWithBlanksAndLetters();
    void hugeFile_data();
    void hugeFile();
};

void tst_LaunchOptionParser::init()
{
    // Values pass through the locale's encoding; CTest sets one that has every character.
    const QByteArray codec = QTextCodec::codecForLocale()->name();
    if (codec != "UTF-8")
        QSKIP("the locale's encoding is not UTF-8");
}

void tst_LaunchOptionParser::record_data()
{
    QTest::addColumn<int>("index");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("shortName");
    QTest::addColumn<QString>("description");

    QTest::newRow("organization") << 0 << "organization"
                                  << "o"
                                  << "The product organization name";
    QTest::newRow("product") << 1 << "product"
                             << "p"
                             << "The product name";
}

void tst_LaunchOptionParser::record()
{
    QFETCH(int, index);
    QFETCH(QString, name);
    QFETCH(QString, shortName);
    QFETCH(QString, description);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    LaunchOption const& option = *parser.options.at(index);
    QCOMPARE(option.name, name);
    QCOMPARE(option.longName, name);
    QCOMPARE(option.shortName, shortName);
    QCOMPARE(option.argCount, 1);
    QCOMPARE(option.description, description);
    QVERIFY(option.value.isEmpty());
    QVERIFY(!option.value.isNull());
    QCOMPARE(option.isSet, false);
}

void tst_LaunchOptionParser::recordsOfOwnMaking()
{
    const LaunchOption option("a", "b", "c", -2147483647 - 1, "d");
    QCOMPARE(option.name, QString("a"));
    QCOMPARE(option.longName, QString("b"));
    QCOMPARE(option.shortName, QString("c"));
    QCOMPARE(option.argCount, -2147483647 - 1);
    QCOMPARE(option.description, QString("d"));
}

void tst_LaunchOptionParser::newParserIsEmpty()
{
    const LaunchOptionParser parser;
    QCOMPARE(parser.options.size(), 0);
    QVERIFY(parser.errorText.isEmpty());
    QVERIFY(!parser.errorText.isNull());
}

void tst_LaunchOptionParser::addOptionKeepsOrder()
{
    LaunchOptionParser parser;
    auto* second = new LaunchOption("b", "b", "b", 1, "");
    auto* first = new LaunchOption("a", "a", "a", 1, "");
    parser.AddOption(second);
    parser.AddOption(first);
    QCOMPARE(parser.options.size(), 2);
    QCOMPARE(parser.options.at(0), second);
    QCOMPARE(parser.options.at(1), first);
}

void tst_LaunchOptionParser::findOption_data()
{
    QTest::addColumn<QString>("key");
    QTest::addColumn<int>("expected");

    QTest::newRow("the first") << "organization" << 0;
    QTest::newRow("the second") << "product" << 1;
    QTest::newRow("case matters") << "Product" << -1;
    QTest::newRow("upper case") << "ORGANIZATION" << -1;
    QTest::newRow("blank before is not trimmed") << " product" << -1;
    QTest::newRow("blank after is not trimmed") << "product " << -1;
    QTest::newRow("a beginning is not enough") << "prod" << -1;
    QTest::newRow("more than the name") << "products" << -1;
    QTest::newRow("the short form is no key") << "p" << -1;
    QTest::newRow("the description is no key") << "The product name" << -1;
    QTest::newRow("empty") << "" << -1;
    QTest::newRow("null") << QString() << -1;
}

void tst_LaunchOptionParser::findOption()
{
    QFETCH(QString, key);
    QFETCH(int, expected);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    LaunchOption* const found = parser.FindOption(key);
    QCOMPARE(parser.options.indexOf(found), expected);
    QCOMPARE(found == nullptr, expected == -1);
}

void tst_LaunchOptionParser::findOptionTakesTheFirstOfTwo()
{
    LaunchOptionParser parser;
    auto* first = new LaunchOption("same", "", "", 1, "first");
    parser.AddOption(first);
    parser.AddOption(new LaunchOption("same", "", "", 1, "second"));
    QCOMPARE(parser.FindOption("same"), first);
}

void tst_LaunchOptionParser::findOptionWithoutOptions()
{
    LaunchOptionParser parser;
    QVERIFY(parser.FindOption("product") == nullptr);
}

void tst_LaunchOptionParser::parseOptions_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("organization");
    QTest::addColumn<QString>("product");

    const QString none("unset");
    const QString o("<arg key=\"organization\">O</arg>");

    QTest::newRow("both") << o + "<arg key=\"product\">P</arg>"
                          << "[O]"
                          << "[P]";
    QTest::newRow("both, each on a line") << o + "\n<arg key=\"product\">P</arg>\n"
                                          << "[O]"
                                          << "[P]";
    QTest::newRow("the other order") << "<arg key=\"product\">P</arg>" + o << "[O]"
                                     << "[P]";
    QTest::newRow("only one") << o << "[O]" << none;

    // Which top-level nodes are considered.
    QTest::newRow("white space only") << " \t\n " << none << none;
    QTest::newRow("declaration only") << "<?xml version=\"1.0\"?>" << none << none;
    QTest::newRow("comment only") << "<!-- " + o + " -->" << none << none;
    QTest::newRow("declaration first") << "<?xml version=\"1.0\"?>\n" + o << "[O]" << none;
    QTest::newRow("document type first") << "<!DOCTYPE x [<!ELEMENT y ANY>]>" + o << "[O]" << none;
    QTest::newRow("comment between") << o + "<!-- x --><arg key=\"product\">P</arg>"
                                     << "[O]"
                                     << "[P]";
    QTest::newRow("instruction between") << o + "<?x y?><arg key=\"product\">P</arg>"
                                         << "[O]"
                                         << "[P]";
    QTest::newRow("wrapped in a root") << "<root>" + o + "</root>" << none << none;
    QTest::newRow("nested in the first arg")
        << "<arg><arg key=\"product\">P</arg></arg>" << none << none;
    QTest::newRow("no arg at all") << "<opt key=\"product\">P</opt>" << none << none;
    QTest::newRow("arg in capitals") << "<ARG key=\"product\">P</ARG>" << none << none;
    QTest::newRow("longer name than arg") << "<args key=\"product\">P</args>" << none << none;
    QTest::newRow("shorter name than arg") << "<ar key=\"product\">P</ar>" << none << none;
    QTest::newRow("with a name space") << "<x:arg key=\"product\">P</x:arg>" << none << none;
    QTest::newRow("another element before the first arg")
        << "<opt key=\"product\">P</opt>" + o << "[O]" << none;
    QTest::newRow("another element after the first arg") << o + "<opt key=\"product\">P</opt>"
                                                         << "[O]"
                                                         << "[P]";
    QTest::newRow("another element after an arg without attribute")
        << "<arg/><opt key=\"product\">P</opt>" << none << "[P]";

    // Which attribute counts.
    QTest::newRow("no attribute") << "<arg>P</arg>" << none << none;
    QTest::newRow("first attribute is not key")
        << "<arg id=\"1\" key=\"product\">P</arg>" << none << none;
    QTest::newRow("key and a second attribute")
        << "<arg key=\"product\" id=\"1\">P</arg>" << none << "[P]";
    QTest::newRow("attribute name in capitals") << "<arg Key=\"product\">P</arg>" << none << none;
    QTest::newRow("longer attribute name") << "<arg keys=\"product\">P</arg>" << none << none;
    QTest::newRow("shorter attribute name") << "<arg ke=\"product\">P</arg>" << none << none;
    QTest::newRow("a skipped node does not end the visit")
        << "<arg>X</arg><arg id=\"product\">X</arg>" + o << "[O]" << none;
    QTest::newRow("single quotes") << "<arg key='product'>P</arg>" << none << "[P]";
    QTest::newRow("blanks around the equals sign")
        << "<arg key = \"product\" >P</arg >" << none << "[P]";
    QTest::newRow("reference in the key") << "<arg key=\"prod&#117;ct\">P</arg>" << none << "[P]";

    // What the value is.
    QTest::newRow("twice: the later wins")
        << "<arg key=\"product\">P</arg><arg key=\"product\">Q</arg>" << none << "[Q]";
    QTest::newRow("twice: the later is empty")
        << "<arg key=\"product\">P</arg><arg key=\"product\"/>" << none << "[]";
    QTest::newRow("empty text") << "<arg key=\"product\"></arg>" << none << "[]";
    QTest::newRow("empty-element tag") << "<arg key=\"product\"/>" << none << "[]";
    QTest::newRow("white space only is empty")
        << "<arg key=\"product\"> \n\t </arg>" << none << "[]";
    QTest::newRow("CDATA only is empty")
        << "<arg key=\"product\"><![CDATA[P]]></arg>" << none << "[]";
    QTest::newRow("CDATA after text is left out")
        << "<arg key=\"product\">P<![CDATA[Q]]></arg>" << none << "[P]";
    QTest::newRow("blanks around are kept")
        << "<arg key=\"product\">  P  </arg>" << none << "[  P  ]";
    QTest::newRow("line breaks around are kept")
        << "<arg key=\"product\">\nP\n</arg>" << none << "[\nP\n]";
    QTest::newRow("runs of blanks are not folded")
        << "<arg key=\"product\">P   Q</arg>" << none << "[P   Q]";
    QTest::newRow("first run of text before an element")
        << "<arg key=\"product\">P<b/>Q</arg>" << none << "[P]";
    QTest::newRow("first run of text after an element")
        << "<arg key=\"product\"><b>X</b>Q</arg>" << none << "[Q]";
    QTest::newRow("comment ends the run")
        << "<arg key=\"product\">P<!-- x -->Q</arg>" << none << "[P]";
    QTest::newRow("ampersand") << "<arg key=\"product\">P&amp;Q</arg>" << none << "[P&Q]";
    QTest::newRow("the five named entities")
        << "<arg key=\"product\">&lt;&gt;&amp;&quot;&apos;</arg>" << none << "[<>&\"']";
    QTest::newRow("expanded once only")
        << "<arg key=\"product\">&amp;lt;</arg>" << none << "[&lt;]";
    QTest::newRow("decimal reference") << "<arg key=\"product\">&#65;</arg>" << none << "[A]";
    QTest::newRow("hexadecimal reference") << "<arg key=\"product\">&#x41;</arg>" << none << "[A]";
    QTest::newRow("reference beyond ASCII") << "<arg key=\"product\">&#xE4;&#8364;</arg>" << none
                                            << QString::fromUtf8("[\xC3\xA4\xE2\x82\xAC]");
    QTest::newRow("unknown entity stays")
        << "<arg key=\"product\">&who; & Q</arg>" << none << "[&who; & Q]";
    QTest::newRow("a zero inside is kept")
        << "<arg key=\"product\">P&#0;Q</arg>" << none << "[P" + QString(QChar(0)) + "Q]";
    QTest::newRow("CDATA end in text") << "<arg key=\"product\">P]]>Q</arg>" << none << "[P]]>Q]";
    QTest::newRow("quotes in text") << "<arg key=\"product\">\"P'</arg>" << none << "[\"P']";
    QTest::newRow("placeholder in text") << "<arg key=\"product\">%1 %2</arg>" << none << "[%1 %2]";
    QTest::newRow("mismatched end tag is no error") << "<arg key=\"product\">P</other>" + o << "[O]"
                                                    << "[P]";
    QTest::newRow("attributes without a blank between")
        << "<arg key=\"product\"id=\"1\">P</arg>" << none << "[P]";
}

void tst_LaunchOptionParser::parseOptions()
{
    QFETCH(QString, text);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ParseOptions(text), true);
    QTEST(Shown(parser, "organization"), "organization");
    QTEST(Shown(parser, "product"), "product");
    QCOMPARE(parser.errorText, QString());
}

void tst_LaunchOptionParser::unknownKeys_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("product");
    QTest::addColumn<QString>("errorText");

    const QString none("unset");
    const QString known("<arg key=\"product\">P</arg>");

    QTest::newRow("unknown") << "<arg key=\"colour\">red</arg>" << none << Unknown("colour", "red");
    QTest::newRow("letter case differs")
        << "<arg key=\"Product\">P</arg>" << none << Unknown("Product", "P");
    QTest::newRow("capitals") << "<arg key=\"PRODUCT\">P</arg>" << none << Unknown("PRODUCT", "P");
    QTest::newRow("blank in the key")
        << "<arg key=\"product \">P</arg>" << none << Unknown("product ", "P");
    QTest::newRow("empty key") << "<arg key=\"\">P</arg>" << none << Unknown("", "P");
    QTest::newRow("without text") << "<arg key=\"colour\"/>" << none << Unknown("colour", "");
    QTest::newRow("earlier values stay") << known + "<arg key=\"colour\">red</arg>"
                                         << "[P]" << Unknown("colour", "red");
    QTest::newRow("later values are applied")
        << "<arg key=\"colour\">red</arg>" + known << "[P]" << Unknown("colour", "red");
    QTest::newRow("two: nothing between the messages")
        << "<arg key=\"a\">1</arg><arg key=\"b\">2</arg>" << none
        << Unknown("a", "1") + Unknown("b", "2");
    QTest::newRow("two around a known one")
        << "<arg key=\"a\">1</arg>" + known + "<arg key=\"b\">2</arg>"
        << "[P]" << Unknown("a", "1") + Unknown("b", "2");
    QTest::newRow("on an element of another name") << known + "<opt key=\"a\">1</opt>"
                                                   << "[P]" << Unknown("a", "1");
    QTest::newRow("references are expanded")
        << "<arg key=\"a&amp;b\">1&lt;2</arg>" << none << Unknown("a&b", "1<2");
    QTest::newRow("placeholder in the key")
        << "<arg key=\"%3\">red</arg>" << none << Unknown("%3", "red");
    QTest::newRow("placeholder in the text")
        << "<arg key=\"a\">%1%2</arg>" << none << Unknown("a", "%1%2");
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("<arg key=\"gr\xC3\xB6\xC3\x9F"
                                                               "e\">\xE2\x82\xAC</arg>")
                                          << none
                                          << Unknown(QString::fromUtf8("gr\xC3\xB6\xC3\x9F"
                                                                       "e"),
                                                     QString::fromUtf8("\xE2\x82\xAC"));
}

void tst_LaunchOptionParser::unknownKeys()
{
    QFETCH(QString, text);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ParseOptions(text), false);
    QTEST(parser.errorText, "errorText");
    QTEST(Shown(parser, "product"), "product");
}

void tst_LaunchOptionParser::malformed_data()
{
    QTest::addColumn<QString>("text");

    QTest::newRow("bare text") << "Velocor";
    QTest::newRow("lone less-than sign") << "<";
    QTest::newRow("tag without a name") << "<>";
    QTest::newRow("blank before the name") << "< arg key=\"product\">Q</arg>";
    QTest::newRow("ends in the name") << "<arg";
    QTest::newRow("ends in the attribute name") << "<arg key";
    QTest::newRow("ends after the equals sign") << "<arg key=";
    QTest::newRow("value without quotes") << "<arg key=product>Q</arg>";
    QTest::newRow("ends in the attribute value") << "<arg key=\"product";
    QTest::newRow("quotes of two kinds") << "<arg key=\"product'>Q</arg>";
    QTest::newRow("ends before the tag's end") << "<arg key=\"product\"";
    QTest::newRow("ends in the empty-element tag") << "<arg key=\"product\"/";
    QTest::newRow("slash inside the tag") << "<arg / key=\"product\">Q</arg>";
    QTest::newRow("attribute without a name") << "<arg =\"product\">Q</arg>";
    QTest::newRow("attribute without a value") << "<arg key=\"product\" x>Q</arg>";
    QTest::newRow("ends in the text") << "<arg key=\"product\">Q";
    QTest::newRow("ends after a less-than sign") << "<arg key=\"product\">Q<";
    QTest::newRow("ends in the end tag") << "<arg key=\"product\">Q</arg";
    QTest::newRow("attribute in the end tag") << "<arg key=\"product\">Q</arg x>";
    QTest::newRow("end tag alone") << "</arg>";
    QTest::newRow("inner element not closed") << "<arg key=\"product\"><b></arg>";
    QTest::newRow("text after the last element") << "<arg key=\"product\">Q</arg>tail";
    QTest::newRow("comment not closed") << "<!-- Q";
    QTest::newRow("declaration not closed") << "<?xml version=\"1.0\"";
    QTest::newRow("instruction not closed") << "<?x";
    QTest::newRow("CDATA not closed") << "<arg key=\"product\"><![CDATA[Q";
    QTest::newRow("document type not closed") << "<!DOCTYPE x [";
    QTest::newRow("other markup not closed") << "<!ELEMENT";
    QTest::newRow("reference without semicolon") << "<arg key=\"product\">&#65</arg>";
    QTest::newRow("reference beyond Unicode") << "<arg key=\"product\">&#x110000;</arg>";
    QTest::newRow("negative reference") << "<arg key=\"product\">&#-5;</arg>";
    QTest::newRow("raw zero ends the document too early")
        << QString("<arg key=\"product\">Q" + QString(QChar(0)) + "</arg>");
}

// Each is preceded by a well-formed element, so that a value applied despite the error shows.
void tst_LaunchOptionParser::malformed()
{
    QFETCH(QString, text);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    text.prepend("<arg key=\"organization\">O</arg><arg key=\"unknown\">X</arg>");
    QCOMPARE(parser.ParseOptions(text), false);
    QCOMPARE(Shown(parser, "organization"), QString("unset"));
    QCOMPARE(Shown(parser, "product"), QString("unset"));
    QCOMPARE(parser.errorText, QString());
}

void tst_LaunchOptionParser::localEncoding_data()
{
    QTest::addColumn<QString>("value");

    QTest::newRow("two bytes") << QString::fromUtf8("\xC3\xA4\xC3\xB6\xC3\xBC");
    QTest::newRow("three bytes") << QString::fromUtf8("\xE2\x82\xAC\xE6\x97\xA5");
    QTest::newRow("four bytes") << QString::fromUtf8("\xF0\x9F\x9A\x80");
}

void tst_LaunchOptionParser::localEncoding()
{
    QFETCH(QString, value);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QString text = "<arg key=\"product\">" + value + "</arg>";
    QCOMPARE(parser.ParseOptions(text), true);
    QCOMPARE(parser.FindOption("product")->value, value);
}

void tst_LaunchOptionParser::secondReadOverwrites()
{
    LaunchOptionParser parser;
    AddBothOptions(parser);
    QString first("<arg key=\"product\">P</arg><arg key=\"organization\">O</arg>");
    QString second("<arg key=\"product\">Q</arg>");
    QCOMPARE(parser.ParseOptions(first), true);
    QCOMPARE(parser.ParseOptions(second), true);
    QCOMPARE(Shown(parser, "product"), QString("[Q]"));
    QCOMPARE(Shown(parser, "organization"), QString("[O]"));
}

void tst_LaunchOptionParser::malformedReadKeepsEarlierValues()
{
    LaunchOptionParser parser;
    AddBothOptions(parser);
    QString first("<arg key=\"product\">P</arg>");
    QString second("<arg key=\"product\">Q</arg><");
    QCOMPARE(parser.ParseOptions(first), true);
    QCOMPARE(parser.ParseOptions(second), false);
    QCOMPARE(Shown(parser, "product"), QString("[P]"));
}

void tst_LaunchOptionParser::parserWithoutOptions()
{
    LaunchOptionParser parser;
    QString text("<arg key=\"product\">P</arg>");
    QCOMPARE(parser.ParseOptions(text), false);
    QCOMPARE(parser.errorText, Unknown("product", "P"));
}

void tst_LaunchOptionParser::readDataFile_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("expected");
    QTest::addColumn<QString>("product");
    QTest::addColumn<QString>("errorText");

    const QByteArray known("<arg key=\"product\">P</arg>");

    QTest::newRow("a value") << known << true << "[P]"
                             << "";
    QTest::newRow("empty") << QByteArray("") << true << "unset"
                           << "";
    QTest::newRow("one line end") << QByteArray("\n") << true << "unset"
                                  << "";
    QTest::newRow("malformed") << known + "<" << false << "unset"
                               << "";
    QTest::newRow("binary") << QByteArray("\x7F\x45\x4C\x46\x01\x02\xFF\xFE\x80", 9) << false
                            << "unset"
                            << "";
    QTest::newRow("unknown key") << QByteArray("<arg key=\"a\">1</arg>") << false << "unset"
                                 << Unknown("a", "1");
    QTest::newRow("CR LF inside a value becomes LF")
        << QByteArray("<arg key=\"product\">P\r\nQ</arg>\r\n") << true << "[P\nQ]"
        << "";
    QTest::newRow("a lone CR is dropped")
        << QByteArray("<arg key=\"product\">P\rQ</arg>") << true << "[PQ]"
        << "";
    QTest::newRow("letters beyond ASCII") << QByteArray("<arg key=\"product\">Ger\xC3\xA4t</arg>")
                                          << true << QString::fromUtf8("[Ger\xC3\xA4t]") << "";
    QTest::newRow("UTF-8 byte order mark") << "\xEF\xBB\xBF" + known << true << "[P]"
                                           << "";
    QTest::newRow("a raw zero ends the document")
        << known + QByteArray("\0<arg key=\"product\">Q", 21) << true << "[P]"
        << "";
}

void tst_LaunchOptionParser::readDataFile()
{
    QFETCH(QByteArray, bytes);
    QFETCH(bool, expected);
    const QTemporaryDir folder;
    const QString path = folder.filePath("appdata.cfg");
    QVERIFY(TestFiles::write(path, bytes));
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(path), expected);
    QTEST(Shown(parser, "product"), "product");
    QTEST(parser.errorText, "errorText");
    QCOMPARE(TestFiles::read(path), bytes);
}

void tst_LaunchOptionParser::missingFile()
{
    const QTemporaryDir folder;
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(folder.filePath("appdata.cfg")), false);
    QCOMPARE(Shown(parser, "product"), QString("unset"));
    QCOMPARE(parser.errorText, QString());
    QVERIFY(!QFile::exists(folder.filePath("appdata.cfg")));
}

void tst_LaunchOptionParser::folderInItsPlace()
{
    const QTemporaryDir folder;
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(folder.path()), false);
    QCOMPARE(Shown(parser, "product"), QString("unset"));
    QCOMPARE(parser.errorText, QString());
}

void tst_LaunchOptionParser::noRegularFile_data()
{
    QTest::addColumn<QString>("target");

    QTest::newRow("pipe") << QString();
    QTest::newRow("link to a pipe") << QString("pipe");
    QTest::newRow("link to an endless device") << QString("/dev/zero");
    QTest::newRow("link to an empty device") << QString("/dev/null");
    QTest::newRow("link to nothing") << QString("/nowhere");
    QTest::newRow("link to itself") << QString("appdata.cfg");
}

void tst_LaunchOptionParser::noRegularFile()
{
    QFETCH(QString, target);
    const QTemporaryDir folder;
    const QString path = folder.filePath("appdata.cfg");
    const QString pipe = folder.filePath("pipe");
    QCOMPARE(mkfifo(qPrintable(target.isEmpty() ? path : pipe), 0600), 0);
    if (!target.isEmpty())
        QCOMPARE(symlink(qPrintable(target), qPrintable(path)), 0);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(path), false);
    QCOMPARE(Shown(parser, "product"), QString("unset"));
    QCOMPARE(parser.errorText, QString());
}

void tst_LaunchOptionParser::linkToARegularFile()
{
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("real.cfg"), "<arg key=\"product\">P</arg>"));
    QCOMPARE(symlink("real.cfg", qPrintable(folder.filePath("appdata.cfg"))), 0);
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(folder.filePath("appdata.cfg")), true);
    QCOMPARE(Shown(parser, "product"), QString("[P]"));
}

void tst_LaunchOptionParser::longestFile_data()
{
    QTest::addColumn<int>("length");
    QTest::addColumn<bool>("expected");
    QTest::addColumn<QString>("product");

    QTest::newRow("256 MiB") << 256 * 1024 * 1024 << true << "[P]";
    QTest::newRow("one more") << 256 * 1024 * 1024 + 1 << false << "unset";
}

// The rest of the file is zeros that take no space on the disk.
void tst_LaunchOptionParser::longestFile()
{
    QFETCH(int, length);
    QFETCH(bool, expected);
    const QTemporaryDir folder;
    const QString path = folder.filePath("appdata.cfg");
    QVERIFY(TestFiles::write(path, "<arg key=\"product\">P</arg>"));
    QVERIFY(QFile::resize(path, length));
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(path), expected);
    QTEST(Shown(parser, "product"), "product");
}

void tst_LaunchOptionParser::emptyPath()
{
    LaunchOptionParser parser;
    AddBothOptions(parser);
    QCOMPARE(parser.ReadDataFile(""), false);
    QCOMPARE(parser.ReadDataFile(QString()), false);
}

void tst_LaunchOptionParser::pathWithBlanksAndLetters()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath(QString::fromUtf8("my \xC3\xB6 folder/app data.cfg"));
    QVERIFY(TestFiles::write(path, "<arg key=\"product\">P</arg>"));
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(path), true);
    QCOMPARE(Shown(parser, "product"), QString("[P]"));
}

void tst_LaunchOptionParser::hugeFile_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("expected");
    QTest::addColumn<int>("length");

    const QByteArray known("<arg key=\"product\">P</arg>");
    const QByteArray filler(TenMegabytes, 'x');

    QTest::newRow("10 MB value") << "<arg key=\"product\">" + filler + "</arg>" << true
                                 << TenMegabytes;
    QTest::newRow("10 MB comment") << "<!--" + filler + "-->" + known << true << 1;
    QTest::newRow("10 MB key") << "<arg key=\"" + filler + "\">P</arg>" << false << -1;
    QTest::newRow("10 MB of elements") << known.repeated(TenMegabytes / known.size()) << true << 1;
    QTest::newRow("10 MB of unknown keys")
        << QByteArray("<arg key=\"a\"/>").repeated(TenMegabytes / 14) << false << -1;
    QTest::newRow("10 MB of references")
        << "<arg key=\"product\">" + QByteArray("&amp;").repeated(TenMegabytes / 5) + "</arg>"
        << true << TenMegabytes / 5;
    QTest::newRow("10 MB without an end") << "<arg key=\"product\">" + filler << false << -1;
    QTest::newRow("10 MB of bare text") << filler << false << -1;
}

// length: that of the value that was set, -1 for none.
void tst_LaunchOptionParser::hugeFile()
{
    QFETCH(QByteArray, bytes);
    QFETCH(bool, expected);
    QFETCH(int, length);
    const QTemporaryDir folder;
    const QString path = folder.filePath("appdata.cfg");
    QVERIFY(TestFiles::write(path, bytes));
    LaunchOptionParser parser;
    AddBothOptions(parser);

    QCOMPARE(parser.ReadDataFile(path), expected);
    LaunchOption const* option = parser.FindOption("product");
    QCOMPARE(option->isSet, length >= 0);
    QCOMPARE(option->value.size(), qMax(length, 0));
}

QTEST_GUILESS_MAIN(tst_LaunchOptionParser)
#include "tst_LaunchOptionParser.moc"
