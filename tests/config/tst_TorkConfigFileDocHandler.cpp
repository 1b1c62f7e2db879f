// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileDocHandler.h"

#include "common/config/TorkConfigFile.h"

#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <functional>
#include <type_traits>

static_assert(std::is_convertible<TorkConfigFileDocHandler*, QXmlDefaultHandler*>::value,
              "the reader takes it for all its handlers");

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

QTEST_APPLESS_MAIN(tst_TorkConfigFileDocHandler)
#include "tst_TorkConfigFileDocHandler.moc"
