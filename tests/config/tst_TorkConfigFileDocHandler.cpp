// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileDocHandler.h"

#include "common/config/TorkConfigFile.h"
#include "support/PrivateField.h"

#include <QBuffer>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <functional>
#include <type_traits>

static_assert(std::is_convertible<TorkConfigFileDocHandler*, QXmlDefaultHandler*>::value,
              "the reader takes it for all its handlers");

PRIVATE_FIELD(IgnorableWhitespace, TorkConfigFileDocHandler, int, m_ignorableWhitespaceCount);

namespace {

using Event = std::function<bool(TorkConfigFileDocHandler&)>;

Event Start(QString const& localName, QString const& qName = QStringLiteral("p:other"))
{
    return [=](TorkConfigFileDocHandler& handler) {
        return handler.startElement("urn:x", localName, qName, QXmlAttributes());
    };
}

Event End(QString const& localName)
{
    return [=](TorkConfigFileDocHandler& handler) {
        return handler.endElement("urn:x", localName, "p:other");
    };
}

Event Characters(QString const& text)
{
    return [=](TorkConfigFileDocHandler& handler) {
        return handler.characters(text);
    };
}

Event Ignorable(QString const& text)
{
    return [=](TorkConfigFileDocHandler& handler) {
        return handler.ignorableWhitespace(text);
    };
}

} // namespace

Q_DECLARE_METATYPE(QList<Event>)
Q_DECLARE_METATYPE(Event)

class tst_TorkConfigFileDocHandler : public QObject
{
    Q_OBJECT

private slots:
    void startsEmpty_data();
    void startsEmpty();
    void neverStopsAParse_data();
    void neverStopsAParse();
    void lastOpenedElement_data();
    void lastOpenedElement();
    void lastOpenedElementIsAReference();
    void lastOpenedElementIsVirtual();
    void depth_data();
    void depth();
    void readerWithoutFile_data();
    void readerWithoutFile();
    void fileOutsideItsLoadStaysAsItIs();
    void watchesALoad_data();
    void watchesALoad();
    void nullTextIsNoValue();
    void countsIgnorableWhitespace();
    void rootElementLeftOut();
    void valueAfterTheEnd();
    void hearsOfEverything_data();
    void hearsOfEverything();
    void stepsAfterALoad();
    void stepsAfterALoadThatEndsInAnItem();
};

void tst_TorkConfigFileDocHandler::startsEmpty_data()
{
    QTest::addColumn<int>("kind");
    QTest::newRow("without file") << 0;
    QTest::newRow("null file") << 1;
    QTest::newRow("with file") << 2;
}

void tst_TorkConfigFileDocHandler::startsEmpty()
{
    QFETCH(int, kind);
    TorkConfigFile file{QString()};
    TorkConfigFileDocHandler withoutFile;
    TorkConfigFileDocHandler withNull(static_cast<TorkConfigFile*>(nullptr));
    TorkConfigFileDocHandler withFile(&file);
    TorkConfigFileDocHandler* const handlers[] = {&withoutFile, &withNull, &withFile};

    TorkConfigFileDocHandler& handler = *handlers[kind];
    QVERIFY(handler.lastOpenedElement().isEmpty());
    QVERIFY(!handler.lastOpenedElement().isNull());
    QCOMPARE(handler.depth(), 0);
}

void tst_TorkConfigFileDocHandler::neverStopsAParse_data()
{
    QTest::addColumn<Event>("event");

    QTest::newRow("startDocument")
        << Event([](TorkConfigFileDocHandler& handler) { return handler.startDocument(); });
    QTest::newRow("endDocument") << Event(
        [](TorkConfigFileDocHandler& handler) { return handler.endDocument(); });
    QTest::newRow("startPrefixMapping") << Event(
        [](TorkConfigFileDocHandler& handler) { return handler.startPrefixMapping("p", "urn:x"); });
    QTest::newRow("endPrefixMapping")
        << Event([](TorkConfigFileDocHandler& handler) { return handler.endPrefixMapping("p"); });
    QTest::newRow("startElement") << Start("s");
    QTest::newRow("startElement without name") << Start(QString(), QString());
    QTest::newRow("endElement") << End("s");
    QTest::newRow("characters") << Characters("text");
    QTest::newRow("characters, none") << Characters(QString());
    QTest::newRow("ignorableWhitespace") << Ignorable(" \n");
    QTest::newRow("ignorableWhitespace, none") << Ignorable(QString());
}

void tst_TorkConfigFileDocHandler::neverStopsAParse()
{
    QFETCH(Event, event);
    TorkConfigFile file{QString()};
    TorkConfigFileDocHandler withoutFile;
    TorkConfigFileDocHandler withFile(&file);

    QVERIFY(event(withoutFile));
    QVERIFY(event(withFile));
    QVERIFY(event(withFile)); // and again
}

void tst_TorkConfigFileDocHandler::lastOpenedElement_data()
{
    QTest::addColumn<QList<Event>>("events");
    QTest::addColumn<QString>("expected");

    QTest::newRow("no event") << QList<Event>() << "";
    QTest::newRow("the local name counts")
        << QList<Event>{Start("local", "p:qualified")} << "local";
    QTest::newRow("the later of two") << QList<Event>{Start("a"), Start("b")} << "b";
    QTest::newRow("an end leaves it")
        << QList<Event>{Start("a"), Start("b"), End("b"), End("a")} << "b";
    QTest::newRow("after an end") << QList<Event>{Start("a"), Start("b"), End("b"), Start("c")}
                                  << "c";
    QTest::newRow("text leaves it") << QList<Event>{Start("a"), Characters("b")} << "a";
    QTest::newRow("ignorable white space leaves it")
        << QList<Event>{Start("a"), Ignorable(" ")} << "a";
    QTest::newRow("an end before any start") << QList<Event>{End("a")} << "";
}

void tst_TorkConfigFileDocHandler::lastOpenedElement()
{
    QFETCH(QList<Event>, events);
    TorkConfigFileDocHandler handler;
    for (Event const& event : std::as_const(events))
        QVERIFY(event(handler));
    QTEST(handler.lastOpenedElement(), "expected");
}

void tst_TorkConfigFileDocHandler::lastOpenedElementIsAReference()
{
    TorkConfigFileDocHandler handler;
    QString& element = handler.lastOpenedElement();
    Start("a")(handler);
    QCOMPARE(element, QString("a"));
    element = "changed";
    QCOMPARE(handler.lastOpenedElement(), QString("changed"));
}

void tst_TorkConfigFileDocHandler::lastOpenedElementIsVirtual()
{
    class Derived : public TorkConfigFileDocHandler
    {
    public:
        QString& lastOpenedElement() override { return m_own; }

    private:
        QString m_own{"own"};
    };

    Derived derived;
    TorkConfigFileDocHandler& handler = derived;
    Start("a")(handler);
    QCOMPARE(handler.lastOpenedElement(), QString("own"));
}

void tst_TorkConfigFileDocHandler::depth_data()
{
    QTest::addColumn<QList<Event>>("events");
    QTest::addColumn<int>("expected");

    QTest::newRow("no event") << QList<Event>() << 0;
    QTest::newRow("root element") << QList<Event>{Start("r")} << 1;
    QTest::newRow("item") << QList<Event>{Start("r"), Start("s"), Start("k")} << 3;
    QTest::newRow("text adds none")
        << QList<Event>{Start("r"), Characters("x"), Ignorable(" ")} << 1;
    QTest::newRow("sibling") << QList<Event>{Start("r"), Start("s"), End("s"), Start("t")} << 2;
    QTest::newRow("all ended") << QList<Event>{Start("r"), Start("s"), End("s"), End("r")} << 0;
}

void tst_TorkConfigFileDocHandler::depth()
{
    QFETCH(QList<Event>, events);
    TorkConfigFileDocHandler handler;
    for (Event const& event : std::as_const(events))
        event(handler);
    QTEST(handler.depth(), "expected");
}

void tst_TorkConfigFileDocHandler::readerWithoutFile_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<QString>("lastOpened");

    QTest::newRow("three levels") << "<r>\n<s>\n<k>v</k>\n</s>\n</r>" << true << "k";
    QTest::newRow("prefixes") << "<p:r xmlns:p='urn:p'><p:s/></p:r>" << true << "s";
    QTest::newRow("malformed") << "<r><s></r>" << false << "s";
}

void tst_TorkConfigFileDocHandler::readerWithoutFile()
{
    QFETCH(QString, document);
    QXmlInputSource source;
    source.setData(document);
    TorkConfigFileDocHandler handler;
    QXmlSimpleReader reader;
    reader.setContentHandler(&handler);

    QTEST(reader.parse(source), "parses");
    QTEST(handler.lastOpenedElement(), "lastOpened");
}

// Only the handler of the load in progress creates sections and items.
void tst_TorkConfigFileDocHandler::fileOutsideItsLoadStaysAsItIs()
{
    TorkConfigFile file{QString()};
    file.WriteItem("current", "a", "1");
    QXmlInputSource source;
    source.setData(QStringLiteral("<r><s><k>v</k></s></r>"));
    TorkConfigFileDocHandler handler(&file);
    QXmlSimpleReader reader;
    reader.setContentHandler(&handler);

    QVERIFY(reader.parse(source));
    QCOMPARE(handler.lastOpenedElement(), QString("k"));
    QVERIFY(!file.HasSection("s"));
    QVERIFY(!file.HasSection("r"));
    QCOMPARE(file.keyList("current"), QStringList{"a"});
}

void tst_TorkConfigFileDocHandler::watchesALoad_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QStringList>("expected");

    // After each event: what came, the depth, "S" after a start tag, "V" if a value is expected.
    QTest::newRow("value") << QByteArray("<r><s><k>v</k></s></r>")
                           << QStringList{"document 0", "r 1 S", "s 2 S", "k 3 SV",
                                          "text 3",     "/k 2",  "/s 1",  "/r 0"};
    QTest::newRow("item without text")
        << QByteArray("<r><s><k/></s><t/></r>")
        << QStringList{"document 0", "r 1 S", "s 2 S", "k 3 SV", "/k 2 V",
                       "/s 1 V",     "t 2 S", "/t 1",  "/r 0"};
    QTest::newRow("deeper in an item without text")
        << QByteArray("<r><s><k><d>v</d></k></s></r>")
        << QStringList{"document 0", "r 1 S", "s 2 S", "k 3 SV", "d 4 SV",
                       "text 4",     "/d 3",  "/k 2",  "/s 1",   "/r 0"};
    QTest::newRow("two texts") << QByteArray("<r><s><k>v<!-- -->w</k></s></r>")
                               << QStringList{"document 0", "r 1 S", "s 2 S", "k 3 SV", "text 3",
                                              "text 3",     "/k 2",  "/s 1",  "/r 0"};
    QTest::newRow("named like the root element")
        << QByteArray("<r><s><VelocorSettings>v</VelocorSettings></s></r>")
        << QStringList{"document 0",         "r 1 S", "s 2 S", "VelocorSettings 3 S", "text 3",
                       "/VelocorSettings 2", "/s 1",  "/r 0"};
    QTest::newRow("broken") << QByteArray("<r><s><k>")
                            << QStringList{"document 0", "r 1 S", "s 2 S", "k 3 SV"};
}

// The second load starts like the first, wherever that ended.
void tst_TorkConfigFileDocHandler::watchesALoad()
{
    class Watching : public TorkConfigFileDocHandler
    {
    public:
        explicit Watching(TorkConfigFile& file) : TorkConfigFileDocHandler(&file), m_file(file) {}

        bool startDocument() override
        {
            note("document");
            return TorkConfigFileDocHandler::startDocument();
        }

        bool startElement(QString const& uri, QString const& name, QString const& qName,
                          QXmlAttributes const& attributes) override
        {
            const bool goesOn =
                TorkConfigFileDocHandler::startElement(uri, name, qName, attributes);
            note(name);
            return goesOn;
        }

        bool endElement(QString const& uri, QString const& name, QString const& qName) override
        {
            const bool goesOn = TorkConfigFileDocHandler::endElement(uri, name, qName);
            note('/' + name);
            return goesOn;
        }

        bool characters(QString const& text) override
        {
            const bool goesOn = TorkConfigFileDocHandler::characters(text);
            note("text");
            return goesOn;
        }

        QStringList seen;

    private:
        void note(QString const& what)
        {
            const QString flags =
                QString(isAtStartTag() ? "S" : "") + (m_file.IsExpectingValue() ? "V" : "");
            seen.append(QString("%1 %2 %3").arg(what).arg(depth()).arg(flags).trimmed());
        }

        TorkConfigFile& m_file;
    };

    QFETCH(QByteArray, document);
    TorkConfigFile file{QString()};
    for (int i = 0; i < 2; ++i) {
        QBuffer buffer(&document);
        Watching handler(file);
        file.LoadFrom(&buffer, handler);
        QTEST(handler.seen, "expected");
    }
}

// A text that is null is no value, and empties nothing.
void tst_TorkConfigFileDocHandler::nullTextIsNoValue()
{
    class NullTexts : public TorkConfigFileDocHandler
    {
    public:
        using TorkConfigFileDocHandler::TorkConfigFileDocHandler;
        bool characters(QString const&) override
        {
            return TorkConfigFileDocHandler::characters(QString());
        }
    };

    TorkConfigFile file{QString()};
    QByteArray document("<r><s><k>v</k></s></r>");
    QBuffer buffer(&document);
    NullTexts handler(&file);
    QVERIFY(file.LoadFrom(&buffer, handler));
    QVERIFY(file.HasSection("s"));
    QCOMPARE(file.keyList("s"), QStringList());
}

void tst_TorkConfigFileDocHandler::countsIgnorableWhitespace()
{
    TorkConfigFileDocHandler handler;
    handler.ignorableWhitespace(" \n");
    handler.ignorableWhitespace("\t");
    QCOMPARE(handler.*privateField(IgnorableWhitespace()), 3);
}

// A handler that leaves the root element out has sections at depth 1 and items at depth 2; a start
// at each of them ends the wait of an element without text below them.
void tst_TorkConfigFileDocHandler::rootElementLeftOut()
{
    class WithoutRoot : public TorkConfigFileDocHandler
    {
    public:
        using TorkConfigFileDocHandler::TorkConfigFileDocHandler;
        bool startElement(QString const& uri, QString const& name, QString const& qName,
                          QXmlAttributes const& attributes) override
        {
            return name == "r" ||
                   TorkConfigFileDocHandler::startElement(uri, name, qName, attributes);
        }
        bool endElement(QString const& uri, QString const& name, QString const& qName) override
        {
            return name == "r" || TorkConfigFileDocHandler::endElement(uri, name, qName);
        }
    };

    TorkConfigFile file{QString()};
    QByteArray document("<r><s><k><d/></k></s><t>text</t></r>");
    QBuffer buffer(&document);
    WithoutRoot handler(&file);
    QVERIFY(file.LoadFrom(&buffer, handler));
    QCOMPARE(file.sectionList(), QStringList("k"));
    QCOMPARE(file.keyList("k"), QStringList());
}

// An element that has ended has no name any more, so its late value has an empty key.
void tst_TorkConfigFileDocHandler::valueAfterTheEnd()
{
    class Late : public TorkConfigFileDocHandler
    {
    public:
        explicit Late(TorkConfigFile& file) : TorkConfigFileDocHandler(&file), m_file(file) {}
        bool endElement(QString const& uri, QString const& name, QString const& qName) override
        {
            const bool goesOn = TorkConfigFileDocHandler::endElement(uri, name, qName);
            QString late("late");
            return m_file.ProcessContent(late) && goesOn;
        }

    private:
        TorkConfigFile& m_file;
    };

    TorkConfigFile file{QString()};
    QByteArray document("<r><s><k/></s></r>");
    QBuffer buffer(&document);
    Late handler(file);
    QVERIFY(file.LoadFrom(&buffer, handler));
    QCOMPARE(file.keyList("s"), QStringList(""));
}

// What is no element or text, and why a load failed, also if it was not the reader that gave up.
void tst_TorkConfigFileDocHandler::hearsOfEverything_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("comment") << QByteArray("<r><!--c--></r>") << QStringList("comment c");
    QTest::newRow("CDATA section") << QByteArray("<r><s><k><![CDATA[v]]></k></s></r>")
                                   << QStringList({"CDATA starts", "CDATA ends"});
    QTest::newRow("document type")
        << QByteArray("<!DOCTYPE r><r/>") << QStringList({"type r starts", "type ends"});
    QTest::newRow("error of the document")
        << QByteArray("<r></s>") << QStringList("error: tag mismatch");
    QTest::newRow("too deep") << QByteArray("<e>").repeated(1100)
                              << QStringList(
                                     "error: More than 1000 elements are inside each other.");
}

void tst_TorkConfigFileDocHandler::hearsOfEverything()
{
    class Listening : public TorkConfigFileDocHandler
    {
    public:
        using TorkConfigFileDocHandler::TorkConfigFileDocHandler;
        bool comment(QString const& text) override { return hear("comment " + text); }
        bool startCDATA() override { return hear("CDATA starts"); }
        bool endCDATA() override { return hear("CDATA ends"); }
        bool startDTD(QString const& name, QString const&, QString const&) override
        {
            return hear("type " + name + " starts");
        }
        bool endDTD() override { return hear("type ends"); }
        bool fatalError(QXmlParseException const& exception) override
        {
            return hear("error: " + exception.message());
        }

        QStringList heard;

    private:
        bool hear(QString const& what)
        {
            heard.append(what);
            return true;
        }
    };

    QFETCH(QByteArray, document);
    TorkConfigFile file{QString()};
    QBuffer buffer(&document);
    Listening handler(&file);
    file.LoadFrom(&buffer, handler);
    QTEST(handler.heard, "expected");
}

// Also if its handler is still there and would say where the load stopped.
void tst_TorkConfigFileDocHandler::stepsAfterALoad()
{
    TorkConfigFile file{QString()};
    TorkConfigFileDocHandler handler(&file);
    QByteArray document("<r><s>");
    QBuffer buffer(&document);
    QVERIFY(!file.LoadFrom(&buffer, handler));
    QCOMPARE(handler.depth(), 2);

    QString name("New");
    QVERIFY(file.StartElement(name));
    QVERIFY(!file.HasSection("New"));
    QCOMPARE(file.sectionList(), QStringList("s"));
}

// Outside a load an element has no depth, so the item still waits for its value.
void tst_TorkConfigFileDocHandler::stepsAfterALoadThatEndsInAnItem()
{
    TorkConfigFile file{QString()};
    TorkConfigFileDocHandler handler(&file);
    QByteArray document("<r><s><k>");
    QBuffer buffer(&document);
    QVERIFY(!file.LoadFrom(&buffer, handler));
    QVERIFY(file.IsExpectingValue());

    QString name("new");
    QVERIFY(file.StartElement(name));
    QVERIFY(file.IsExpectingValue());
}

QTEST_APPLESS_MAIN(tst_TorkConfigFileDocHandler)
#include "tst_TorkConfigFileDocHandler.moc"
