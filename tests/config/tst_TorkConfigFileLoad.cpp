// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "ConfigContents.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QtTest>

#include <functional>
#include <memory>
#include <utility>

namespace {

using Step = std::function<void(TorkConfigFile&)>;

const QString NotParsedText = QStringLiteral("ConfigFile - Could not parse the input file.");

// What loading a file truncated at any byte must never mix up.
const QByteArray Sample = "<VelocorSettings>\n"
                          "<Main>\n"
                          "<first>one</first>\n"
                          "<second><![CDATA[a&b]]></second>\n"
                          "</Main>\n"
                          "<Empty>\n"
                          "</Empty>\n"
                          "<Other>\n"
                          "<third>3 &amp; 4</third>\n"
                          "</Other>\n"
                          "</VelocorSettings>\n";

// Runs a function whenever Qt issues a critical message, and suppresses all messages.
class OnCriticalMessage
{
public:
    explicit OnCriticalMessage(std::function<void()> react)
    {
        s_react = std::move(react);
        m_previous = qInstallMessageHandler(take);
    }
    ~OnCriticalMessage()
    {
        qInstallMessageHandler(m_previous);
        s_react = nullptr;
    }
    Q_DISABLE_COPY(OnCriticalMessage)

private:
    static void take(QtMsgType type, QMessageLogContext const&, QString const&)
    {
        if (type == QtCriticalMsg)
            s_react();
    }

    static inline std::function<void()> s_react;
    QtMessageHandler m_previous;
};

} // namespace

Q_DECLARE_METATYPE(Step)

class tst_TorkConfigFileLoad : public QObject
{
    Q_OBJECT

private slots:
    void init();

    void shape_data();
    void shape();
    void values_data();
    void values();
    void rootElementName_data();
    void rootElementName();
    void whiteSpace_data();
    void whiteSpace();
    void depthFour_data();
    void depthFour();
    void encodings_data();
    void encodings();
    void entities_data();
    void entities();

    void malformed_data();
    void malformed();
    void binary_data();
    void binary();
    void cutOff_data();
    void cutOff();
    void damagedByte_data();
    void damagedByte();
    void nested_data();
    void nested();
    void manyItems();

    void secondLoad_data();
    void secondLoad();
    void loadDeletesEarlierSections();
    void loadedFileCanBeSaved();

    void steps_data();
    void steps();
    void currentSection_data();
    void currentSection();
    void stepsOutsideALoad();
    void stepsAfterALoad_data();
    void stepsAfterALoad();
    void fromADevice();
    void fromADeviceBroken();
    void bytesThatSaveWrites();

private:
    void checkLoad(QByteArray const& document, QString const& expected);
    QString path() const { return m_folder->filePath("x.cfg"); }

    std::unique_ptr<QTemporaryDir> m_folder;
};

void tst_TorkConfigFileLoad::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
}

void tst_TorkConfigFileLoad::checkLoad(QByteArray const& document, QString const& expected)
{
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());

    const MessageCapture messages;
    QVERIFY2(file.Load(), qPrintable(messages.texts().join('\n')));
    QCOMPARE(ConfigContents::of(file, ConfigContents::possibleSections(document)), expected);
    QVERIFY(file.m_lastError.isEmpty());
    QVERIFY(!file.m_lastError.isNull());
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkConfigFileLoad::shape_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("expected");

    QTest::newRow("root element only") << QByteArray("<r/>") << "";
    QTest::newRow("root element with text") << QByteArray("<r>text</r>") << "";
    QTest::newRow("one item") << QByteArray("<r><s><k>v</k></s></r>") << "s{k=[v]}";
    QTest::newRow("two items") << QByteArray("<r><s><k>v</k><l>w</l></s></r>") << "s{k=[v];l=[w]}";
    QTest::newRow("two sections") << QByteArray("<r><s><k>v</k></s><t><k>w</k></t></r>")
                                  << "s{k=[v]}t{k=[w]}";
    QTest::newRow("empty section, two tags") << QByteArray("<r><s></s></r>") << "s{}";
    QTest::newRow("empty section, one tag") << QByteArray("<r><s/></r>") << "s{}";
    QTest::newRow("section with text only") << QByteArray("<r><s>text</s></r>") << "s{}";
    QTest::newRow("text beside an item")
        << QByteArray("<r><s>text<k>v</k>more</s></r>") << "s{k=[v]}";
    QTest::newRow("section names are case-sensitive")
        << QByteArray("<r><s><k>v</k></s><S><k>w</k></S></r>") << "S{k=[w]}s{k=[v]}";
    QTest::newRow("keys are case-sensitive")
        << QByteArray("<r><s><k>v</k><K>w</K></s></r>") << "s{K=[w];k=[v]}";
    QTest::newRow("item named like its section")
        << QByteArray("<r><s><s>v</s></s></r>") << "s{s=[v]}";

    QTest::newRow("sections of one name merge")
        << QByteArray("<r><s><k>v</k></s><s><l>w</l></s></r>") << "s{k=[v];l=[w]}";
    QTest::newRow("merge over another section")
        << QByteArray("<r><s><k>v</k></s><t><m>x</m></t><s><l>w</l></s></r>")
        << "s{k=[v];l=[w]}t{m=[x]}";
    QTest::newRow("merge with an empty section")
        << QByteArray("<r><s><k>v</k></s><s/></r>") << "s{k=[v]}";
    QTest::newRow("a later item replaces")
        << QByteArray("<r><s><k>v</k><k>w</k></s></r>") << "s{k=[w]}";
    QTest::newRow("a later item replaces in a merged section")
        << QByteArray("<r><s><k>v</k></s><s><k>w</k></s></r>") << "s{k=[w]}";
    QTest::newRow("a later item without text replaces nothing")
        << QByteArray("<r><s><k>v</k><k></k></s></r>") << "s{k=[v]}";

    QTest::newRow("attributes are ignored")
        << QByteArray("<r a='1'><s b='2' k='3'><k c=\"4\">v</k></s></r>") << "s{k=[v]}";
    QTest::newRow("prefixes are dropped")
        << QByteArray("<p:r xmlns:p='urn:p'><p:s><p:k>v</p:k></p:s></p:r>") << "s{k=[v]}";
    QTest::newRow("undeclared prefixes are dropped too")
        << QByteArray("<r><p:s><q:k>v</q:k></p:s></r>") << "s{k=[v]}";
    QTest::newRow("prefixes do not keep sections apart")
        << QByteArray("<r xmlns:p='u' xmlns:q='w'><p:s><k>v</k></p:s><q:s><l>w</l></q:s></r>")
        << "s{k=[v];l=[w]}";
    QTest::newRow("comments and instructions between elements")
        << QByteArray("<!-- a --><?b c?><r><!-- d --><s><?e f?><k>v</k></s></r><!-- g -->")
        << "s{k=[v]}";
    QTest::newRow("declaration and document type")
        << QByteArray("<?xml version=\"1.0\"?><!DOCTYPE r><r><s><k>v</k></s></r>") << "s{k=[v]}";
}

void tst_TorkConfigFileLoad::shape()
{
    QFETCH(QByteArray, document);
    QFETCH(QString, expected);
    checkLoad(document, expected);
}

void tst_TorkConfigFileLoad::values_data()
{
    QTest::addColumn<QByteArray>("item");
    QTest::addColumn<QString>("expected");

    QTest::newRow("no text, two tags") << QByteArray("<k></k>") << "";
    QTest::newRow("no text, one tag") << QByteArray("<k/>") << "";
    QTest::newRow("one blank") << QByteArray("<k> </k>") << "k=[ ]";
    QTest::newRow("white space only") << QByteArray("<k>\n\t</k>") << "k=[\n\t]";
    QTest::newRow("blanks around are kept") << QByteArray("<k>  a b  </k>") << "k=[  a b  ]";
    QTest::newRow("number") << QByteArray("<k>-12</k>") << "k=[-12]";
    QTest::newRow("CDATA") << QByteArray("<k><![CDATA[a&b<c>]]></k>") << "k=[a&b<c>]";
    QTest::newRow("empty CDATA is a text, an empty one")
        << QByteArray("<k><![CDATA[]]></k>") << "k=[]";
    QTest::newRow("placeholder in CDATA") << QByteArray("<k><![CDATA[%1]]></k>") << "k=[%1]";
    QTest::newRow("built-in entities")
        << QByteArray("<k>&lt;&amp;&gt;&quot;&apos;</k>") << "k=[<&>\"']";
    QTest::newRow("entity within text") << QByteArray("<k>a&amp;b</k>") << "k=[a&b]";
    QTest::newRow("character references") << QByteArray("<k>&#65;&#x42;</k>") << "k=[AB]";

    // Only the first text that the reader reports is used.
    QTest::newRow("text before CDATA") << QByteArray("<k>a<![CDATA[b]]></k>") << "k=[a]";
    QTest::newRow("CDATA before text") << QByteArray("<k><![CDATA[a]]>b</k>") << "k=[a]";
    QTest::newRow("empty CDATA before text") << QByteArray("<k><![CDATA[]]>b</k>") << "k=[]";
    QTest::newRow("blank before CDATA") << QByteArray("<k> <![CDATA[b]]></k>") << "k=[ ]";
    QTest::newRow("comment within text") << QByteArray("<k>a<!-- c -->b</k>") << "k=[a]";
    QTest::newRow("comment before text") << QByteArray("<k><!-- c -->b</k>") << "k=[b]";
    QTest::newRow("comment only") << QByteArray("<k><!-- c --></k>") << "";
    QTest::newRow("instruction within text") << QByteArray("<k>a<?p q?>b</k>") << "k=[a]";
    QTest::newRow("undeclared entity within text") << QByteArray("<k>a&none;b</k>") << "k=[a]";
    QTest::newRow("undeclared entity") << QByteArray("<k>&none;</k>") << "";
    QTest::newRow("element within text") << QByteArray("<k>a<d/>b</k>") << "k=[a]";

    QTest::newRow("empty item leaves the next alone") << QByteArray("<j></j><k>v</k>") << "k=[v]";
    QTest::newRow("text after an empty item") << QByteArray("<j/>text<k>v</k>") << "k=[v]";
    QTest::newRow("line break after an empty item") << QByteArray("<j/>\n<k>v</k>\n") << "k=[v]";
}

void tst_TorkConfigFileLoad::values()
{
    QFETCH(QByteArray, item);
    QFETCH(QString, expected);
    checkLoad("<r><s>" + item + "</s></r>", "s{" + expected + "}");
}

void tst_TorkConfigFileLoad::rootElementName_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("expected");

    // The configured root element is VelocorSettings.
    QTest::newRow("as configured")
        << QByteArray("<VelocorSettings><s><k>v</k></s></VelocorSettings>") << "s{k=[v]}";
    QTest::newRow("another") << QByteArray("<Whatever><s><k>v</k></s></Whatever>") << "s{k=[v]}";
    QTest::newRow("other letter case")
        << QByteArray("<velocorsettings><s><k>v</k></s></velocorsettings>") << "s{k=[v]}";
    QTest::newRow("section in another letter case")
        << QByteArray("<VelocorSettings><velocorsettings><k>v</k></velocorsettings>"
                      "</VelocorSettings>")
        << "velocorsettings{k=[v]}";
    QTest::newRow("section named like the document's own root element")
        << QByteArray("<r><r><k>v</k></r></r>") << "r{k=[v]}";

    // An element of that name is neither section nor item, wherever it appears.
    QTest::newRow("as a section, none before")
        << QByteArray("<VelocorSettings><VelocorSettings><k>v</k></VelocorSettings>"
                      "</VelocorSettings>")
        << "";
    QTest::newRow("as a section under another root element")
        << QByteArray("<r><VelocorSettings><k>v</k></VelocorSettings></r>") << "";
    QTest::newRow("as a section after another, which stays current")
        << QByteArray("<r><s><k>v</k></s><VelocorSettings><l>w</l></VelocorSettings></r>")
        << "s{k=[v];l=[w]}";
    QTest::newRow("as a section before another")
        << QByteArray("<r><VelocorSettings><k>v</k></VelocorSettings><s><l>w</l></s></r>")
        << "s{l=[w]}";
    QTest::newRow("as an item") << QByteArray(
                                       "<r><s><VelocorSettings>v</VelocorSettings><k>w</k></s></r>")
                                << "s{k=[w]}";
    QTest::newRow("as an item without text")
        << QByteArray("<r><s><VelocorSettings/><k>w</k></s></r>") << "s{k=[w]}";
    // The item before it keeps waiting for its text.
    QTest::newRow("as a section after an item without text")
        << QByteArray("<r><s><k/></s><VelocorSettings><VelocorSettings><d>x</d></VelocorSettings>"
                      "</VelocorSettings></r>")
        << "s{d=[x]}";
    QTest::newRow("as an item with an element inside")
        << QByteArray("<r><s><VelocorSettings><d>x</d></VelocorSettings></s></r>") << "s{}";
    QTest::newRow("as an item with an element inside, after an item without text")
        << QByteArray("<r><s><k/><VelocorSettings><d>x</d></VelocorSettings></s></r>")
        << "s{d=[x]}";
    QTest::newRow("within an item")
        << QByteArray("<r><s><k><VelocorSettings>v</VelocorSettings></k><l>w</l></s></r>")
        << "s{l=[w]}";
    QTest::newRow("as a section with a prefix")
        << QByteArray("<r><p:VelocorSettings><k>v</k></p:VelocorSettings></r>") << "";
}

void tst_TorkConfigFileLoad::rootElementName()
{
    QFETCH(QByteArray, document);
    QFETCH(QString, expected);
    checkLoad(document, expected);
}

void tst_TorkConfigFileLoad::whiteSpace_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("expected");

    QTest::newRow("between all elements")
        << QByteArray("\n<r>\n  <s>\n    <k>v</k>\n    <l>w</l>\n  </s>\n\n  <t>\n  </t>\n</r>\n\n")
        << "s{k=[v];l=[w]}t{}";
    QTest::newRow("carriage returns")
        << QByteArray("<r>\r\n<s>\r\n<k>v</k>\r\n</s>\r\n</r>\r\n") << "s{k=[v]}";
    QTest::newRow("after a section whose last item had no text")
        << QByteArray("<r>\n<s>\n<k></k>\n</s>\n<t>\n<l>w</l>\n</t>\n</r>\n") << "s{}t{l=[w]}";
    QTest::newRow("after a section whose last item was one tag")
        << QByteArray("<r>\n<s>\n<k/>\n</s>\n<t>\n</t>\n</r>\n") << "s{}t{}";
    QTest::newRow("in a merged section after an item without text")
        << QByteArray("<r>\n<s>\n<k/>\n</s>\n<s>\n</s>\n</r>\n") << "s{}";
    QTest::newRow("in a section of the root element's name after an item without text")
        << QByteArray("<r>\n<s>\n<k/>\n</s>\n<VelocorSettings>\n</VelocorSettings>\n</r>\n")
        << "s{}";
    QTest::newRow("text after a section whose last item had no text")
        << QByteArray("<r><s><k/></s>text<t>more<l>w</l></t></r>") << "s{}t{l=[w]}";
    QTest::newRow("within tags") << QByteArray("<r\n><s\t><k  >v</k\n></s ></r >") << "s{k=[v]}";
    QTest::newRow("within an item before an element")
        << QByteArray("<r><s><k>\n<d>x</d>\n</k></s></r>") << "s{k=[\n]}";
}

void tst_TorkConfigFileLoad::whiteSpace()
{
    QFETCH(QByteArray, document);
    QFETCH(QString, expected);
    checkLoad(document, expected);
}

void tst_TorkConfigFileLoad::depthFour_data()
{
    QTest::addColumn<QByteArray>("items");
    QTest::addColumn<QString>("expected");

    QTest::newRow("in an item without text: stored as if it were the item")
        << QByteArray("<k><d>x</d></k>") << "d=[x]";
    QTest::newRow("in an item with text") << QByteArray("<k>v<d>x</d></k>") << "k=[v]";
    QTest::newRow("before the item's text, which is lost")
        << QByteArray("<k><d>x</d>v</k>") << "d=[x]";
    QTest::newRow("two in one item: the first") << QByteArray("<k><d>x</d><e>y</e></k>") << "d=[x]";
    QTest::newRow("two in one item, the first without text")
        << QByteArray("<k><d/><e>y</e></k>") << "e=[y]";
    QTest::newRow("without text, then the item's text") << QByteArray("<k><d/>v</k>") << "";
    QTest::newRow("depth five") << QByteArray("<k><d><e>y</e></d></k>") << "e=[y]";
    QTest::newRow("depth nine") << QByteArray("<k><d><e><f><g><h><i>y</i></h></g></f></e></d></k>")
                                << "i=[y]";
    QTest::newRow("an item after it") << QByteArray("<k><d>x</d></k><l>w</l>") << "d=[x];l=[w]";
    QTest::newRow("replaces an earlier item of its name")
        << QByteArray("<d>v</d><k><d>x</d></k>") << "d=[x]";
    QTest::newRow("item within an item of the same name")
        << QByteArray("<k><k>x</k></k>") << "k=[x]";
    QTest::newRow("in CDATA") << QByteArray("<k><d><![CDATA[<x>]]></d></k>") << "d=[<x>]";
}

void tst_TorkConfigFileLoad::depthFour()
{
    QFETCH(QByteArray, items);
    QFETCH(QString, expected);
    checkLoad("<r><s>" + items + "</s></r>", "s{" + expected + "}");
}

void tst_TorkConfigFileLoad::encodings_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("expected");

    const QString replacement = QChar(QChar::ReplacementCharacter);
    QTest::newRow("UTF-8 without declaration")
        << QByteArray("<r><s><k>\xC3\xA9</k></s></r>") << QString("s{k=[\u00E9]}");
    QTest::newRow("UTF-8 with byte order mark")
        << QByteArray("\xEF\xBB\xBF<r><s><k>\xC3\xA9</k></s></r>") << QString("s{k=[\u00E9]}");
    QTest::newRow("Latin-1 as declared")
        << QByteArray("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>"
                      "<r><s><k>\xE9</k></s></r>")
        << QString("s{k=[\u00E9]}");
    QTest::newRow("UTF-16 with byte order mark")
        << QByteArray("\xFF\xFE<\0r\0>\0<\0s\0>\0<\0k\0>\0\xAC\x20<\0/\0k\0>\0<\0/\0s\0>\0<\0/\0r\0"
                      ">\0",
                      46)
        << QString("s{k=[\u20AC]}");
    QTest::newRow("key beyond ASCII")
        << QByteArray("<r><s><\xC3\xA9>v</\xC3\xA9></s></r>") << QString("s{\u00E9=[v]}");

    // A section's name is converted to Latin-1 bytes that are then decoded as UTF-8.
    QTest::newRow("section name in Latin-1")
        << QByteArray("<r><\xC3\xA9><k>v</k><l>w</l></\xC3\xA9></r>")
        << replacement + "{k=[v];l=[w]}";
    QTest::newRow("section name beyond Latin-1")
        << QByteArray("<r><\xD0\xBA><k>v</k></\xD0\xBA></r>") << "?{k=[v]}";
}

void tst_TorkConfigFileLoad::encodings()
{
    QFETCH(QByteArray, document);
    QFETCH(QString, expected);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());
    QVERIFY(file.Load());
    QStringList candidates = ConfigContents::possibleSections(document);
    candidates << "s"
               << "?";
    QCOMPARE(ConfigContents::of(file, candidates), expected);
}

void tst_TorkConfigFileLoad::entities_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<QString>("expected");

    QByteArray doubling = "<!DOCTYPE r [<!ENTITY a0 'ha'>";
    for (int i = 1; i < 40; ++i) {
        const QByteArray before = "&a" + QByteArray::number(i - 1) + ';';
        doubling += "<!ENTITY a" + QByteArray::number(i) + " '" + before + before + "'>";
    }
    doubling += "]><r><s><j>1</j><k>&a39;</k></s></r>";

    QTest::newRow("declared in the document")
        << QByteArray("<!DOCTYPE r [<!ENTITY e 'ee'>]><r><s><k>a&e;b</k></s></r>") << true
        << "s{k=[aeeb]}";
    QTest::newRow("holding an element")
        << QByteArray("<!DOCTYPE r [<!ENTITY e '<d>x</d>'>]><r><s><k>&e;</k></s></r>") << true
        << "s{d=[x]}";
    QTest::newRow("doubling forty times") << doubling << false << "";
    QTest::newRow("referring to each other")
        << QByteArray("<!DOCTYPE r [<!ENTITY a '&b;'><!ENTITY b '&a;'>]>"
                      "<r><s><j>1</j><k>&a;</k></s></r>")
        << false << "s{j=[1]}";
    QTest::newRow("another file is not read")
        << QByteArray("<!DOCTYPE r [<!ENTITY e SYSTEM '/etc/passwd'>]><r><s><k>a&e;b</k></s></r>")
        << true << "s{k=[ab]}";
    QTest::newRow("another file is not read, alone")
        << QByteArray("<!DOCTYPE r SYSTEM 'file:///etc/passwd' "
                      "[<!ENTITY e SYSTEM 'file:///etc/passwd'>]><r><s><k>&e;</k></s></r>")
        << true << "s{}";
}

void tst_TorkConfigFileLoad::entities()
{
    QFETCH(QByteArray, document);
    QFETCH(bool, parses);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());

    const MessageCapture messages;
    QCOMPARE(file.Load(), parses);
    QCOMPARE(file.m_lastError, parses ? QString() : NotParsedText);
    QCOMPARE(messages.texts().size(), parses ? 0 : 1);
    QTEST(ConfigContents::of(file, {"r", "s", "d", "e"}), "expected");
}

void tst_TorkConfigFileLoad::malformed_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QString>("expected");

    QTest::newRow("empty") << QByteArray() << "";
    QTest::newRow("white space only") << QByteArray(" \n\t\n") << "";
    QTest::newRow("no markup") << QByteArray("key=value\n") << "";
    QTest::newRow("declaration only") << QByteArray("<?xml version=\"1.0\"?>\n") << "";
    QTest::newRow("comment only") << QByteArray("<!-- nothing -->") << "";
    QTest::newRow("root element left open") << QByteArray("<r><s><k>v</k></s>") << "s{k=[v]}";
    QTest::newRow("section left open") << QByteArray("<r><s><k>v</k>") << "s{k=[v]}";
    QTest::newRow("item left open") << QByteArray("<r><s><k>v</k></s><t><l>") << "s{k=[v]}t{}";
    QTest::newRow("mismatched end of a section")
        << QByteArray("<r><s><k>v</k></t><u><m>x</m></u></r>") << "s{k=[v]}";
    QTest::newRow("mismatched end of the root element")
        << QByteArray("<r><s><k>v</k></s></q>") << "s{k=[v]}";
    QTest::newRow("end tag in other letter case") << QByteArray("<r><s></s></R>") << "s{}";
    QTest::newRow("end tag too many") << QByteArray("<r><s><k>v</k></s></r></r>") << "s{k=[v]}";
    QTest::newRow("second root element")
        << QByteArray("<r><s><k>v</k></s></r><q><t><l>w</l></t></q>") << "s{k=[v]}";
    QTest::newRow("text after the root element")
        << QByteArray("<r><s><k>v</k></s></r>text") << "s{k=[v]}";
    QTest::newRow("bare ampersand")
        << QByteArray("<r><s><j>u</j><k>a & b</k><l>w</l></s></r>") << "s{j=[u]}";
    QTest::newRow("end of a CDATA section in text")
        << QByteArray("<r><s><j>u</j><k>a]]>b</k><l>w</l></s></r>") << "s{j=[u]}";
    QTest::newRow("end of a CDATA section within one: the first text is kept")
        << QByteArray("<r><s><k><![CDATA[a]]>b]]></k><l>w</l></s></r>") << "s{k=[a]}";
    QTest::newRow("CDATA section left open")
        << QByteArray("<r><s><j>u</j><k><![CDATA[a</k></s></r>") << "s{j=[u]}";
    QTest::newRow("comment left open") << QByteArray("<r><s><k>v</k><!-- </s></r>") << "s{k=[v]}";
    QTest::newRow("attribute without quotation marks")
        << QByteArray("<r><s><j>u</j><k a=1>v</k></s></r>") << "s{j=[u]}";
    QTest::newRow("name that starts with a digit")
        << QByteArray("<r><s><j>u</j><1>v</1></s></r>") << "s{j=[u]}";
    QTest::newRow("name without letters")
        << QByteArray("<r><s><j>u</j><>v</></s></r>") << "s{j=[u]}";
    QTest::newRow("declaration after a line break")
        << QByteArray("\n<?xml version=\"1.0\"?><r><s><k>v</k></s></r>") << "";
}

void tst_TorkConfigFileLoad::malformed()
{
    QFETCH(QByteArray, document);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());
    file.WriteItem("old", "k", "v");

    const MessageCapture messages;
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotParsedText);
    QStringList candidates = ConfigContents::possibleSections(document);
    candidates << "old";
    QTEST(ConfigContents::of(file, candidates), "expected");

    // The reader's own message, and nothing else.
    const QStringList texts = messages.texts();
    QCOMPARE(texts.size(), 1);
    QVERIFY2(texts[0].startsWith("critical: TorkErrorHandler::fatalError:  \"Xml Parse Failure."),
             qPrintable(texts[0]));
}

void tst_TorkConfigFileLoad::binary_data()
{
    QTest::addColumn<QByteArray>("document");

    QByteArray allBytes;
    for (int i = 0; i < 256; ++i)
        allBytes += static_cast<char>(i);
    QByteArray noise;
    quint32 state = 1;
    for (int i = 0; i < 100000; ++i) {
        state = state * 1664525U + 1013904223U;
        noise += static_cast<char>(state >> 24);
    }

    QTest::newRow("one zero byte") << QByteArray(1, '\0');
    QTest::newRow("zero bytes") << QByteArray(5000, '\0');
    QTest::newRow("every byte once") << allBytes;
    QTest::newRow("noise") << noise;
    QTest::newRow("noise in a value") << "<r><s><k>" + noise + "</k></s></r>";
    QTest::newRow("half a byte order mark") << QByteArray("\xFF");
    QTest::newRow("byte order mark only") << QByteArray("\xFE\xFF");
    QTest::newRow("UTF-16 with half a character") << QByteArray("\xFF\xFE<\0r", 5);
    QTest::newRow("compressed file") << QByteArray("\x1F\x8B\x08\0\0\0\0\0\0\x03\x4B\x04\0", 13);
    QTest::newRow("opening brackets") << QByteArray(10000, '<');
}

void tst_TorkConfigFileLoad::binary()
{
    QFETCH(QByteArray, document);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());
    file.WriteItem("old", "k", "v");

    const MessageCapture messages;
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotParsedText);
    QVERIFY(!file.HasSection("old"));
    QCOMPARE(messages.texts().size(), 1);
}

void tst_TorkConfigFileLoad::cutOff_data()
{
    QTest::addColumn<int>("length");
    for (int length = 0; length <= Sample.size(); ++length)
        QTest::addRow("after %d bytes", length) << length;
}

void tst_TorkConfigFileLoad::cutOff()
{
    QFETCH(int, length);
    const QByteArray document = Sample.left(length);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());

    const MessageCapture messages;
    const bool complete = document.trimmed().endsWith("</VelocorSettings>");
    QCOMPARE(file.Load(), complete);
    QCOMPARE(file.m_lastError, complete ? QString() : NotParsedText);

    // A section exists once its start tag is complete; half a name is no section.
    for (char const* name : {"Main", "Empty", "Other"}) {
        const bool started = document.contains('<' + QByteArray(name) + '>');
        QCOMPARE(file.HasSection(QString(name)), started);
    }
    QVERIFY(!file.HasSection("Mai") && !file.HasSection("Empt") && !file.HasSection("Othe"));

    // An item is complete or missing: always there once it has ended, never before it started.
    const struct
    {
        char const* section;
        char const* key;
        char const* value;
    } items[] = {{"Main", "first", "one"}, {"Main", "second", "a&b"}, {"Other", "third", "3 & 4"}};
    for (auto const& item : items) {
        QString none;
        QString value;
        const bool found = file.ReadItem(item.section, item.key, none, value);
        QCOMPARE(value, found ? QString(item.value) : QString());
        const bool ended = document.contains("</" + QByteArray(item.key) + '>');
        const bool started = document.contains('<' + QByteArray(item.key) + '>');
        QVERIFY2(found || !ended, item.key);
        QVERIFY2(started || !found, item.key);
    }
}

void tst_TorkConfigFileLoad::damagedByte_data()
{
    QTest::addColumn<int>("place");
    QTest::addColumn<char>("byte");
    for (int place = 0; place < Sample.size(); ++place) {
        for (char byte : {'<', '>', '&', '\0', '\xFF'})
            QTest::addRow("byte %d becomes %d", place, static_cast<unsigned char>(byte))
                << place << byte;
    }
}

void tst_TorkConfigFileLoad::damagedByte()
{
    QFETCH(int, place);
    QFETCH(char, byte);
    QByteArray document = Sample;
    document[place] = byte;
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());
    file.WriteItem("old", "k", "v");

    const MessageCapture messages;
    const bool loaded = file.Load();
    QCOMPARE(file.m_lastError, loaded ? QString() : NotParsedText);
    QCOMPARE(messages.texts().size(), loaded ? 0 : 1);
    QVERIFY(!file.HasSection("old"));

    // Everything before the damage is read as usual.
    if (document.left(place).contains("</first>")) {
        QString none;
        QString value;
        QVERIFY(file.ReadItem("Main", "first", none, value));
        QCOMPARE(value, QString("one"));
    }
}

void tst_TorkConfigFileLoad::nested_data()
{
    QTest::addColumn<int>("levels");
    QTest::addColumn<bool>("closed");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<QString>("expected");

    QTest::newRow("900 levels") << 900 << true << true << "s{d=[x];j=[1]}";
    QTest::newRow("900 levels left open") << 900 << false << false << "s{d=[x];j=[1]}";
    QTest::newRow("5000 levels") << 5000 << true << false << "s{j=[1]}";
    QTest::newRow("5000 levels left open") << 5000 << false << false << "s{j=[1]}";
    QTest::newRow("500000 levels") << 500000 << true << false << "s{j=[1]}";
    QTest::newRow("500000 levels left open") << 500000 << false << false << "s{j=[1]}";
}

// The reader recurses once per level, and the stack is limited.
void tst_TorkConfigFileLoad::nested()
{
    QFETCH(int, levels);
    QFETCH(bool, closed);
    QFETCH(bool, parses);
    QByteArray document = "<r><s><j>1</j><k>";
    document += QByteArray("<d>").repeated(levels) + "x</d>";
    if (closed)
        document += QByteArray("</d>").repeated(levels - 1) + "</k></s></r>";
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());

    const MessageCapture messages;
    QCOMPARE(file.Load(), parses);
    QCOMPARE(file.m_lastError, parses ? QString() : NotParsedText);
    QTEST(ConfigContents::of(file, {"r", "s", "d"}), "expected");
}

void tst_TorkConfigFileLoad::manyItems()
{
    QByteArray document = "<r>\n";
    for (int section = 0; section < 100; ++section) {
        const QByteArray name = "section" + QByteArray::number(section);
        document += '<' + name + ">\n";
        for (int key = 0; key < 1000; ++key) {
            const QByteArray keyName = "key" + QByteArray::number(key);
            document +=
                '<' + keyName + '>' + QByteArray(80, 'a' + key % 26) + "</" + keyName + ">\n";
        }
        document += "</" + name + ">\n";
    }
    document += "</r>\n";
    QVERIFY(document.size() > 9000000);
    QVERIFY(TestFiles::write(path(), document));

    TorkConfigFile file(path());
    QVERIFY(file.Load());
    for (int section = 0; section < 100; ++section)
        QCOMPARE(file.keyList(QStringLiteral("section%1").arg(section)).size(), 1000);
    QString none;
    QString value;
    QVERIFY(file.ReadItem("section99", "key999", none, value));
    QCOMPARE(value, QString(80, QChar('a' + 999 % 26)));
}

void tst_TorkConfigFileLoad::secondLoad_data()
{
    QTest::addColumn<QByteArray>("first");
    QTest::addColumn<QByteArray>("second");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<QString>("expected");

    QTest::newRow("replaces everything")
        << QByteArray("<r><s><k>v</k></s></r>") << QByteArray("<r><t><l>w</l></t></r>") << true
        << "t{l=[w]}";
    QTest::newRow("does not merge with the first")
        << QByteArray("<r><s><k>v</k></s></r>") << QByteArray("<r><s><l>w</l></s></r>") << true
        << "s{l=[w]}";
    QTest::newRow("malformed after good")
        << QByteArray("<r><s><k>v</k></s></r>") << QByteArray("<r><t><l>w</l></r>") << false
        << "t{l=[w]}";
    QTest::newRow("good after malformed")
        << QByteArray("<r><s><k>v</k></r>") << QByteArray("<r><t><l>w</l></t></r>") << true
        << "t{l=[w]}";
    QTest::newRow("white space in the root element after an item left open")
        << QByteArray("<r><s><k>") << QByteArray("<r>\n<t>\n</t>\n</r>\n") << true << "t{}";
    QTest::newRow("white space in the root element after an item without text")
        << QByteArray("<r><s><k></k></s></r>") << QByteArray("<r>\n<t>\n</t>\n</r>\n") << true
        << "t{}";
    QTest::newRow("configured root element after an item left open")
        << QByteArray("<r><s><k>")
        << QByteArray("<VelocorSettings>\n<t>\n</t>\n</VelocorSettings>\n") << true << "t{}";
    QTest::newRow("text in the root element after an item left open")
        << QByteArray("<r><s><k>") << QByteArray("<r>text</r>") << true << "";
    QTest::newRow("section of the root element's name: no section is current any more")
        << QByteArray("<r><s><k>v</k></s></r>")
        << QByteArray("<r><VelocorSettings><l>w</l></VelocorSettings></r>") << true << "";
    QTest::newRow("depth starts again after an item left open")
        << QByteArray("<r><s><k>") << QByteArray("<r><t><l>w</l></t></r>") << true << "t{l=[w]}";
}

void tst_TorkConfigFileLoad::secondLoad()
{
    QFETCH(QByteArray, first);
    QFETCH(QByteArray, second);
    QFETCH(bool, parses);
    TorkConfigFile file(path());

    const MessageCapture messages;
    QVERIFY(TestFiles::write(path(), first));
    file.Load();
    QVERIFY(TestFiles::write(path(), second));
    QCOMPARE(file.Load(), parses);
    QCOMPARE(file.m_lastError, parses ? QString() : NotParsedText);
    QTEST(ConfigContents::of(file, ConfigContents::possibleSections(first + ' ' + second)),
          "expected");
}

void tst_TorkConfigFileLoad::loadDeletesEarlierSections()
{
    class WatchedSection : public TorkConfigFileSection
    {
    public:
        explicit WatchedSection(int& deleted) : TorkConfigFileSection("s"), m_deleted(deleted) {}
        ~WatchedSection() override { ++m_deleted; }

    private:
        int& m_deleted;
    };

    int deleted = 0;
    TorkConfigFile file(path());
    file.AppendSection(new WatchedSection(deleted));
    QVERIFY(!file.Load()); // the file does not exist yet
    QCOMPARE(deleted, 0);
    QVERIFY(TestFiles::write(path(), "<r><s><k>v</k></s></r>"));
    QVERIFY(file.Load());
    QCOMPARE(deleted, 1);
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));
}

void tst_TorkConfigFileLoad::loadedFileCanBeSaved()
{
    QVERIFY(TestFiles::write(path(), "<Whatever a='1'>\n  <Main>\n    <first> one </first>\n"
                                     "  </Main>\n</Whatever>\n"));
    TorkConfigFile file(path());
    QVERIFY(file.Load());
    QVERIFY(file.Save());
    QCOMPARE(TestFiles::read(path()),
             QByteArray("<VelocorSettings>\n<Main>\n<first> one </first>\n</Main>\n"
                        "</VelocorSettings>\n"));
}

// The steps that the handler calls work only while a load is in progress. A document that breaks
// off leaves the load in progress while its error is being reported, so the steps work then too.
void tst_TorkConfigFileLoad::steps_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<Step>("step");
    QTest::addColumn<QString>("expected");

    const auto start = [](TorkConfigFile& file, char const* element) {
        QString name(element);
        QVERIFY(file.StartElement(name));
        QCOMPARE(name, QString(element));
    };
    const auto end = [](TorkConfigFile& file, char const* element) {
        QString name(element);
        QVERIFY(file.EndElement(name));
        QCOMPARE(name, QString(element));
    };
    const auto content = [](TorkConfigFile& file, char const* text) {
        QString taken(text);
        QVERIFY(file.ProcessContent(taken));
        QCOMPARE(taken, QString(text));
    };

    const QByteArray atItem("<r><s><k>");
    const QByteArray atSection("<r><s>");
    const QByteArray atRoot("<r>");
    QTest::newRow("content of the open item")
        << atItem << Step([=](TorkConfigFile& file) { content(file, "v"); }) << "s{k=[v]}";
    QTest::newRow("content is taken once") << atItem << Step([=](TorkConfigFile& file) {
        content(file, "v");
        content(file, "w");
    }) << "s{k=[v]}";
    QTest::newRow("empty content counts") << atItem << Step([=](TorkConfigFile& file) {
        content(file, "");
        content(file, "w");
    }) << "s{k=[]}";
    QTest::newRow("another item starts") << atItem << Step([=](TorkConfigFile& file) {
        start(file, "l");
        content(file, "w");
    }) << "s{l=[w]}";
    QTest::newRow("item after item") << atItem << Step([=](TorkConfigFile& file) {
        content(file, "v");
        start(file, "l");
        content(file, "w");
    }) << "s{k=[v];l=[w]}";
    QTest::newRow("a null text is refused, and counts")
        << atItem << Step([=](TorkConfigFile& file) {
               QString null;
               QVERIFY(file.ProcessContent(null));
               content(file, "w");
           })
        << "s{}";
    QTest::newRow("a null key is refused") << atItem << Step([=](TorkConfigFile& file) {
        QString null;
        QVERIFY(file.StartElement(null));
        content(file, "w");
    }) << "s{}";
    QTest::newRow("blanks in a key are removed") << atItem << Step([=](TorkConfigFile& file) {
        start(file, " l l ");
        content(file, "w");
    }) << "s{ll=[w]}";
    QTest::newRow("an ended element has the empty name") << atItem << Step([=](TorkConfigFile& f) {
        end(f, "k");
        content(f, "v");
    }) << "s{=[v]}";
    QTest::newRow("an end leaves the current section") << atItem << Step([=](TorkConfigFile& f) {
        end(f, "k");
        end(f, "s");
        start(f, "l");
        content(f, "w");
    }) << "s{l=[w]}";
    QTest::newRow("the root element's name expects no content")
        << atItem << Step([=](TorkConfigFile& file) {
               start(file, "VelocorSettings");
               content(file, "v");
           })
        << "s{}";
    QTest::newRow("at section depth a section starts")
        << atSection << Step([=](TorkConfigFile& file) { start(file, "t"); }) << "s{}t{}";
    QTest::newRow("at section depth no content is taken")
        << atSection << Step([=](TorkConfigFile& file) { content(file, "v"); }) << "s{}";
    QTest::newRow("at root depth nothing starts") << atRoot << Step([=](TorkConfigFile& file) {
        start(file, "t");
        content(file, "v");
    }) << "";
}

void tst_TorkConfigFileLoad::steps()
{
    QFETCH(QByteArray, document);
    QFETCH(Step, step);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());

    int calls = 0;
    {
        const OnCriticalMessage inTheLoad([&] {
            ++calls;
            step(file);
        });
        QVERIFY(!file.Load());
    }
    QCOMPARE(calls, 1);
    QTEST(ConfigContents::of(file, {"", "r", "s", "t", "k", "l", "VelocorSettings"}), "expected");
}

void tst_TorkConfigFileLoad::currentSection_data()
{
    QTest::addColumn<Step>("lookup");
    QTest::addColumn<QString>("expected");

    const QString inOther("current{}other{k=[v];there=[1]}");
    const QString inCurrent("current{k=[v]}other{there=[1]}");
    QTest::newRow("no lookup") << Step([](TorkConfigFile&) {}) << inCurrent;
    QTest::newRow("HasSection") << Step([](TorkConfigFile& f) { f.HasSection("other"); })
                                << inOther;
    QTest::newRow("HasSection, modifiable name") << Step([](TorkConfigFile& f) {
        QString name("other");
        f.HasSection(name);
    }) << inOther;
    QTest::newRow("FindSection") << Step([](TorkConfigFile& f) { f.FindSection("other"); })
                                 << inOther;
    QTest::newRow("FindSection, modifiable name") << Step([](TorkConfigFile& f) {
        QString name("other");
        f.FindSection(name);
    }) << inOther;
    QTest::newRow("keyList") << Step([](TorkConfigFile& f) { f.keyList("other"); }) << inOther;
    QTest::newRow("ReadItem") << Step([](TorkConfigFile& f) {
        QString text;
        f.ReadItem("other", "there", text, text);
    }) << inOther;
    QTest::newRow("ReadItem of a missing key") << Step([](TorkConfigFile& f) {
        QString text;
        f.ReadItem("other", "missing", text, text);
    }) << inOther;
    QTest::newRow("ReadInt") << Step([](TorkConfigFile& f) {
        int number = 0;
        f.ReadInt("other", "there", 0, number);
    }) << inOther;
    QTest::newRow("WriteItem") << Step([](TorkConfigFile& f) { f.WriteItem("other", "there", 1); })
                               << inOther;
    QTest::newRow("WriteItem of a null value")
        << Step([](TorkConfigFile& f) { f.WriteItem("other", "there", QString()); }) << inCurrent;
    QTest::newRow("failed HasSection")
        << Step([](TorkConfigFile& f) { f.HasSection("none"); }) << inCurrent;
    QTest::newRow("failed FindSection")
        << Step([](TorkConfigFile& f) { f.FindSection("none"); }) << inCurrent;
    QTest::newRow("failed keyList")
        << Step([](TorkConfigFile& f) { f.keyList("none"); }) << inCurrent;
    QTest::newRow("failed ClearSection")
        << Step([](TorkConfigFile& f) { f.ClearSection("none"); }) << inCurrent;
    QTest::newRow("failed ReadItem") << Step([](TorkConfigFile& f) {
        QString text;
        f.ReadItem("none", "there", text, text);
    }) << inCurrent;
    QTest::newRow("ClearSection") << Step([](TorkConfigFile& f) { f.ClearSection("other"); })
                                  << "current{}other{k=[v]}";
    QTest::newRow("Clear") << Step([](TorkConfigFile& f) { f.Clear(); }) << "";
}

// Content goes to the section that was looked up last.
void tst_TorkConfigFileLoad::currentSection()
{
    QFETCH(Step, lookup);
    QVERIFY(TestFiles::write(path(), "<r><other><there>1</there></other><current><k>"));
    TorkConfigFile file(path());
    {
        const OnCriticalMessage inTheLoad([&] {
            lookup(file);
            QString content("v");
            file.ProcessContent(content);
        });
        QVERIFY(!file.Load());
    }
    QTEST(ConfigContents::of(file, {"current", "other", "none"}), "expected");
}

void tst_TorkConfigFileLoad::stepsOutsideALoad()
{
    TorkConfigFile file(path());
    QString name("s");
    QString content("v");
    QVERIFY(file.StartElement(name));
    QVERIFY(file.ProcessContent(content));
    QVERIFY(file.EndElement(name));
    QVERIFY(!file.HasSection("s"));

    file.WriteItem("t", "k", "v");
    file.StartElement(name);
    QVERIFY(file.ProcessContent(content));
    QCOMPARE(ConfigContents::of(file, {"s", "t"}), QString("t{k=[v]}"));
}

void tst_TorkConfigFileLoad::stepsAfterALoad_data()
{
    QTest::addColumn<QByteArray>("document");

    QTest::newRow("that succeeded") << QByteArray("<r><t/></r>");
    QTest::newRow("that broke off where sections start") << QByteArray("<r><t>");
}

void tst_TorkConfigFileLoad::stepsAfterALoad()
{
    QFETCH(QByteArray, document);
    QVERIFY(TestFiles::write(path(), document));
    TorkConfigFile file(path());
    const MessageCapture messages;
    file.Load();

    QString name("s");
    file.StartElement(name);
    QCOMPARE(ConfigContents::of(file, {"s", "t"}), QString("t{}"));
}

void tst_TorkConfigFileLoad::fromADevice()
{
    QByteArray sample = Sample;
    QBuffer buffer(&sample);
    TorkConfigFile file(path(), "R");
    file.m_lastError = "as before";
    file.WriteItem("Earlier", "k", "v");
    QVERIFY(file.LoadFrom(&buffer));
    QCOMPARE(file.sectionList(), QStringList({"Main", "Empty", "Other"}));
    QVERIFY(file.CurrentSection()->IsCalled("Other"));
    QCOMPARE(file.m_lastError, QString("as before"));
    QVERIFY(!QFile::exists(path()));
}

void tst_TorkConfigFileLoad::fromADeviceBroken()
{
    QByteArray broken = "<r><s><k>v</k></s><t>";
    QBuffer buffer(&broken);
    TorkConfigFile file(path());
    const MessageCapture messages;
    QVERIFY(!file.LoadFrom(&buffer));
    QCOMPARE(messages.texts(), QStringList());
    QCOMPARE(file.m_lastError, QString(""));
    QCOMPARE(ConfigContents::of(file, {"s", "t"}), QString("s{k=[v]}t{}"));
}

void tst_TorkConfigFileLoad::bytesThatSaveWrites()
{
    TorkConfigFile file(path());
    file.WriteItem("S", "k", "<\xE9");
    file.SetRootElementName("R");
    QVERIFY(file.Save());
    QCOMPARE(file.ToXml(), TestFiles::read(path()));
    QVERIFY(file.ToXml().startsWith("<R>\n<S>\n"));
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileLoad)
#include "tst_TorkConfigFileLoad.moc"
