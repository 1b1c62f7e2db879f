// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlLimits.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include "xml/ScriptedStates.h"
#include "xml/VirtualSlot.h"

#include <QXmlAttributes>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

using namespace ScriptedStates;

namespace {

// Skips the whole document.
class FlushingManager : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, this);
    }
};

QString Nested(int levels)
{
    return QString("<e>").repeated(levels) + QString("</e>").repeated(levels);
}

} // namespace

class tst_TorkXml_ParseStops : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void noInitialState_data();
    void noInitialState();
    void unknownElement_data();
    void unknownElement();
    void unknownElementIsNamedAfterTheStateOnTop();
    void placeholdersInNames();
    void stoppedByContent_data();
    void stoppedByContent();
    void wrongNames_data();
    void wrongNames();
    void endBeyondTheLastState();
    void nullStateOnTop();
    void truncatedAnywhere();
    void stopIsAHandlerErrorToTheReader();

    void charactersWithoutAState();

    void tooManyPrefixes_data();
    void tooManyPrefixes();
    void prefixesThatAreOverDoNotCount();
    void usedPrefixesEndWithTheirElement();
    void usedPrefixesCountInTheirElement();
    void elementsOfThePrefixXmlns();
    void declarationsByHand();
    void deepDocuments_data();
    void deepDocuments();
    void largeDocument_data();
    void largeDocument();
};

void tst_TorkXml_ParseStops::init()
{
    ScriptedState::alive = 0;
    QVERIFY(!TorkLog::m_gLog);
}

void tst_TorkXml_ParseStops::cleanup()
{
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseStops::noInitialState_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QString>("name");

    QTest::newRow("empty element") << "<root/>"
                                   << "root";
    QTest::newRow("with attributes") << "<root a='1'/>"
                                     << "root";
    QTest::newRow("with content") << "<root>text<a/></root>"
                                  << "root";
    QTest::newRow("local name without its prefix") << "<p:root xmlns:p='urn:p'/>"
                                                   << "root";
    QTest::newRow("outside Latin-1") << QString::fromUtf8("<größe/>") << QString::fromUtf8("größe");
    QTest::newRow("1 MB of name") << "<" + QString(1 << 20, 'n') + "/>" << QString(1 << 20, 'n');
}

void tst_TorkXml_ParseStops::noInitialState()
{
    QFETCH(QString, document);
    QFETCH(QString, name);

    TorkXml_ParseManager_Base manager;
    QVERIFY(!Parse(manager, document));

    QCOMPARE(Report(manager),
             ReportHeader + "Error: 1016 No initial parse state for element \"" + name + "\".\n");
    QVERIFY(manager.LastState() == nullptr);
    QCOMPARE(OpenElements(manager), QStringList{name}); // pushed before it was looked for
}

void tst_TorkXml_ParseStops::unknownElement_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QStringList>("unknown");
    QTest::addColumn<QStringList>("inPlace");
    QTest::addColumn<QString>("error");
    QTest::addColumn<QStringList>("openElements");
    QTest::addColumn<int>("alive");

    QTest::newRow("root") << "<a/>" << QStringList{">a"} << QStringList{}
                          << "No initial parse state for element \"a\"." << QStringList{"a"} << 0;
    QTest::newRow("child") << "<a><b/></a>" << QStringList{"a>b"} << QStringList{}
                           << "Unknown element \"b\". Parse state element \"a\"."
                           << QStringList{"b", "a"} << 1;
    QTest::newRow("child with attributes")
        << "<a><b x='1'/></a>" << QStringList{"a>b"} << QStringList{}
        << "Unknown element \"b\". Parse state element \"a\"." << QStringList{"b", "a"} << 1;
    QTest::newRow("second child") << "<a><b/><c/></a>" << QStringList{"a>c"} << QStringList{}
                                  << "Unknown element \"c\". Parse state element \"a\"."
                                  << QStringList{"c", "a"} << 1;
    QTest::newRow("grandchild") << "<a><b><c/></b></a>" << QStringList{"b>c"} << QStringList{}
                                << "Unknown element \"c\". Parse state element \"b\"."
                                << QStringList{"c", "b", "a"} << 2;
    QTest::newRow("child of a child handled in place")
        << "<a><b><c/></b></a>" << QStringList{"a>c"} << QStringList{"a>b"}
        << "Unknown element \"c\". Parse state element \"a\"." << QStringList{"c", "b", "a"} << 1;
    QTest::newRow("child of the same name")
        << "<a><a/></a>" << QStringList{"a>a"} << QStringList{}
        << "Unknown element \"a\". Parse state element \"a\"." << QStringList{"a", "a"} << 1;
    QTest::newRow("nothing after it is looked at")
        << "<a><b/><c/></a>" << QStringList{"a>b", "a>c"} << QStringList{}
        << "Unknown element \"b\". Parse state element \"a\"." << QStringList{"b", "a"} << 1;
    QTest::newRow("element after the root's early end")
        << "<a><a/><b/></a>" << QStringList{">b"} << QStringList{"a>a"}
        << "No initial parse state for element \"b\"." << QStringList{"b", "a"} << 0;
}

void tst_TorkXml_ParseStops::unknownElement()
{
    QFETCH(QString, document);
    QFETCH(QStringList, unknown);
    QFETCH(QStringList, inPlace);
    QFETCH(QString, error);
    QFETCH(QStringList, openElements);
    QFETCH(int, alive);

    Script script;
    script.unknown = unknown;
    script.inPlace = inPlace;
    ScriptedManager manager(script);

    QVERIFY(!Parse(manager, document));
    QCOMPARE(Report(manager), ReportHeader + "Error: 1016 " + error + "\n");
    QCOMPARE(OpenElements(manager), openElements);
    QCOMPARE(ScriptedState::alive, alive); // kept as long as the manager; cleanup() counts again
}

void tst_TorkXml_ParseStops::unknownElementIsNamedAfterTheStateOnTop()
{
    Script script;
    script.renamed << "a=another";
    script.unknown << "a>b";
    ScriptedManager manager(script);

    QVERIFY(!Parse(manager, "<a><b/></a>"));
    QCOMPARE(Report(manager), ReportHeader + "Error: 1016 Unknown element \"b\". Parse state "
                                             "element \"another\".\n");
}

void tst_TorkXml_ParseStops::placeholdersInNames()
{
    // No reader accepts such names, but code that calls the handler directly may use them.
    TorkXml_ParseManager_Base first;
    QVERIFY(!first.startElement(QString(), "%1%2", "%1%2", QXmlAttributes()));
    QCOMPARE(Report(first), ReportHeader + "Error: 1016 No initial parse state for element "
                                           "\"%1%2\".\n");

    Script script;
    script.unknown << "a>%2";
    ScriptedManager next(script);
    QVERIFY(next.startElement(QString(), "a", "a", QXmlAttributes()));
    QVERIFY(!next.startElement(QString(), "%2", "%2", QXmlAttributes()));
    QCOMPARE(Report(next), ReportHeader + "Error: 1016 Unknown element \"%2\". Parse state "
                                          "element \"a\".\n");
}

void tst_TorkXml_ParseStops::stoppedByContent_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QString>("refused");
    QTest::addColumn<bool>("passes");
    QTest::addColumn<QStringList>("openElements");
    QTest::addColumn<int>("alive");

    QTest::newRow("root's text") << "<a>x</a>"
                                 << "a=x" << false << QStringList{"a"} << 1;
    QTest::newRow("root's text before a child") << "<a>x<b/></a>"
                                                << "a=x" << false << QStringList{"a"} << 1;
    QTest::newRow("child's text") << "<a><b>x</b></a>"
                                  << "b=x" << false << QStringList{"b", "a"} << 2;
    QTest::newRow("grandchild's text") << "<a><b><c>x</c></b></a>"
                                       << "c=x" << false << QStringList{"c", "b", "a"} << 3;
    QTest::newRow("text after a child") << "<a><b/>x</a>"
                                        << "a=x" << false << QStringList{"a"} << 1;
    QTest::newRow("white space") << "<a>\n<b/></a>"
                                 << "a=\n"
                                 << false << QStringList{"a"} << 1;
    QTest::newRow("white space before the end") << "<a><b/>\n</a>"
                                                << "a=\n"
                                                << false << QStringList{"a"} << 1;
    QTest::newRow("section") << "<a><b><![CDATA[x]]></b></a>"
                             << "b=x" << false << QStringList{"b", "a"} << 2;
    QTest::newRow("second piece of text") << "<a>x<b/>y</a>"
                                          << "a=y" << false << QStringList{"a"} << 1;
    QTest::newRow("attribute of the root is ignored") << "<a k='x'/>"
                                                      << "k=x" << true << QStringList{} << 0;
    QTest::newRow("attribute of a child is ignored") << "<a><b k='x'/></a>"
                                                     << "k=x" << true << QStringList{} << 0;
    QTest::newRow("content that never comes is no reason") << "<a>x</a>"
                                                           << "a=y" << true << QStringList{} << 0;
}

void tst_TorkXml_ParseStops::stoppedByContent()
{
    QFETCH(QString, document);
    QFETCH(QString, refused);
    QFETCH(bool, passes);
    QFETCH(QStringList, openElements);
    QFETCH(int, alive);

    Script script;
    script.refused << refused;
    {
        ScriptedManager manager(script);
        QCOMPARE(Parse(manager, document), passes);
        QCOMPARE(Report(manager), ReportHeader); // refused content is no error of the manager's
        QCOMPARE(OpenElements(manager), openElements);
        QCOMPARE(ScriptedState::alive, alive);
    }
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseStops::wrongNames_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QStringList>("renamed");
    QTest::addColumn<QStringList>("events");
    QTest::addColumn<int>("alive");

    QTest::newRow("root's state stays")
        << "<a/>" << QStringList{"a=z"} << QStringList{"first(a)"} << 1;
    QTest::newRow("child's state stays, and hides its parent's")
        << "<a><b/>t</a>" << QStringList{"b=z"}
        << QStringList{"first(a)", "a.can(b)", "next(b)", "a.next(b)", "b.content(a,t)"} << 2;
    QTest::newRow("child's state with its parent's name ends at the parent's end tag")
        << "<a><b/></a>" << QStringList{"b=a"}
        << QStringList{"first(a)", "a.can(b)", "next(b)", "a.next(b)", "b.end(a)", "~b"} << 1;
    QTest::newRow("state of another name without case")
        << "<a/>" << QStringList{"a=A"} << QStringList{"first(a)"} << 1;
    QTest::newRow("state without a name")
        << "<a/>" << QStringList{"a="} << QStringList{"first(a)"} << 1;
}

void tst_TorkXml_ParseStops::wrongNames()
{
    QFETCH(QString, document);
    QFETCH(QStringList, renamed);
    QFETCH(QStringList, events);
    QFETCH(int, alive);

    Script script;
    script.renamed = renamed;
    {
        ScriptedManager manager(script);
        QVERIFY(Parse(manager, document));
        QCOMPARE(script.events, events);
        QCOMPARE(ScriptedState::alive, alive);
        QCOMPARE(OpenElements(manager), QStringList());
        QCOMPARE(Report(manager), ReportHeader);
    }
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseStops::endBeyondTheLastState()
{
    TorkXml_ParseManager_Base manager;
    manager.PushElement("a");

    QVERIFY(manager.endElement(QString(), "a", "a"));
    QVERIFY(!manager.PopElement());
    QVERIFY(manager.endElement(QString(), "a", "a")); // not even an element left
}

void tst_TorkXml_ParseStops::nullStateOnTop()
{
    // Not what a well-behaved reader pushes, but it must not bring the program down.
    TorkXml_ParseManager_Base manager;
    manager.PushState(nullptr);

    QVERIFY(manager.GetNextState("a") == nullptr);
    QVERIFY(!manager.startElement(QString(), "a", "a", QXmlAttributes()));
    QVERIFY(!manager.characters("text"));
    QVERIFY(manager.endElement(QString(), "a", "a"));
    QVERIFY(!manager.PopElement());
}

void tst_TorkXml_ParseStops::truncatedAnywhere()
{
    const QString document("<a x='1'>t<b y='2'><c>u</c>t</b>&amp;<!--c--><a/><![CDATA[x]]></a>");
    Script script;
    int mostAlive = 0;
    for (int length = 0; length < document.size(); ++length) {
        ScriptedManager manager(script);
        QVERIFY2(!Parse(manager, document.left(length)), qPrintable(QString::number(length)));
        mostAlive = qMax(mostAlive, ScriptedState::alive);
        QCOMPARE(OpenElements(manager).size(), ScriptedState::alive);
        QCOMPARE(Report(manager), ReportHeader); // the reader's own errors are not the manager's
    }
    QCOMPARE(mostAlive, 3); // some did stop with every element open
    QCOMPARE(ScriptedState::alive, 0);

    ScriptedManager manager(script);
    QVERIFY(Parse(manager, document));
}

void tst_TorkXml_ParseStops::stopIsAHandlerErrorToTheReader()
{
    struct LastError : QXmlDefaultHandler
    {
        QString text;

        bool fatalError(QXmlParseException const& problem) override
        {
            text = problem.message();
            return false;
        }
    };

    QXmlInputSource source;
    source.setData(QString("<root/>"));
    TorkXml_ParseManager_Base manager;
    LastError errors;
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    reader.setErrorHandler(&errors);

    QVERIFY(!reader.parse(source));
    QVERIFY(!errors.text.isEmpty());
    QCOMPARE(errors.text, QXmlDefaultHandler().errorString());
    QCOMPARE(manager.errorString(), QXmlDefaultHandler().errorString());
}

void tst_TorkXml_ParseStops::charactersWithoutAState()
{
    TorkXml_ParseManager_Base manager;
    QVERIFY(!manager.characters("text"));
    QVERIFY(!manager.characters(""));
    manager.PushElement("a");
    QVERIFY(!manager.characters("text"));
    QCOMPARE(Report(manager), ReportHeader);

    // The same in a document: the root's state has ended early, so its text has no state.
    Script script;
    script.inPlace << "a>a";
    ScriptedManager stopped(script);
    QVERIFY(!Parse(stopped, "<a><a/>text</a>"));
    QCOMPARE(script.events, QStringList({"first(a)", "a.can(a)", "a.end(a)", "~a"}));
    QCOMPARE(Report(stopped), ReportHeader);
}

void tst_TorkXml_ParseStops::tooManyPrefixes_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QString>("error");

    const auto declarations = [](int first, int count) {
        QString all;
        for (int i = first; i < first + count; ++i)
            all += QString(" xmlns:p%1='u'").arg(i);
        return all;
    };
    const QString most = "<r" + declarations(0, TorkXmlMaximumPrefixes) + ">";
    const int elementsBelowMost =
        TorkXmlMaximumPrefixComparisons / (TorkXmlMaximumPrefixes * TorkXmlMaximumPrefixes);
    const QString quarter = "<r" + declarations(0, TorkXmlMaximumPrefixes / 4) + ">";
    const QString tooMany = "More than 256 namespace prefixes are in force.\n";
    const QString tooManyComparisons =
        "More than 268435456 comparisons of namespace prefixes are needed.\n";

    QTest::newRow("as many as allowed") << most + "</r>"
                                        << "";
    QTest::newRow("one more") << most + "<a xmlns:q='u'/></r>" << tooMany;
    QTest::newRow("one more that nothing declares") << most + "<q:a/></r>" << tooMany;
    QTest::newRow("one more in an attribute") << most + "<a q:b=''/></r>" << tooMany;
    QTest::newRow("a default namespace more") << most + "<a xmlns='u'/></r>"
                                              << "";
    QTest::newRow("one again") << most + "<a xmlns:p0='v'><p0:b/></a><a xmlns:p0='w'/></r>"
                               << "";
    QTest::newRow("one of 16 characters more")
        << "<r" + declarations(0, TorkXmlMaximumPrefixes - 1) + " xmlns:q123456789012345='u'/>"
        << tooMany;
    const QString element = "<a></a>";
    QTest::newRow("as many elements below 256 as allowed")
        << most + element.repeated(elementsBelowMost - 1) + "</r>"
        << "";
    QTest::newRow("one element more")
        << most + element.repeated(elementsBelowMost) + "</r>" << tooManyComparisons;
    QTest::newRow("one comparison more")
        << "<r xmlns:q='u'><a" + declarations(0, TorkXmlMaximumPrefixes - 1) + ">" +
               element.repeated(elementsBelowMost - 1) + "</a></r>"
        << tooManyComparisons;
    QTest::newRow("sixteen times as many elements below a quarter of them")
        << quarter + element.repeated(16 * elementsBelowMost - 1) + "</r>"
        << "";
    QTest::newRow("one element below a quarter of them more")
        << quarter + element.repeated(16 * elementsBelowMost) + "</r>" << tooManyComparisons;
    QTest::newRow("one level too many")
        << Nested(1001) << "More than 1000 elements are inside each other.\n";
}

void tst_TorkXml_ParseStops::tooManyPrefixes()
{
    QFETCH(QString, document);
    QFETCH(QString, error);

    FlushingManager manager;
    QCOMPARE(Parse(manager, document), error.isEmpty());
    QString report;
    manager.FormatErrors(report);
    QCOMPARE(report, ReportHeader + error);
}

// What an element declares or uses ends with it.
void tst_TorkXml_ParseStops::prefixesThatAreOverDoNotCount()
{
    QString document = "<r>";
    for (int i = 0; i < 10 * TorkXmlMaximumPrefixes; ++i)
        document += QString("<a xmlns:p%1='u'/><q%1:a/><a r%1:b=''>t</a>").arg(i);
    FlushingManager manager;
    QVERIFY(Parse(manager, document + "</r>"));
}

// Who drives a manager by hand need not tell the end of what was never declared.
void tst_TorkXml_ParseStops::usedPrefixesEndWithTheirElement()
{
    FlushingManager manager;
    QVERIFY(manager.startElement("", "r", "r", QXmlAttributes()));
    for (int i = 0; i < 2 * TorkXmlMaximumPrefixes; ++i) {
        QXmlAttributes attributes;
        attributes.append(QString("q%1:b").arg(i), "", "b", "");
        QVERIFY(manager.startElement("", "a", QString("p%1:a").arg(i), attributes));
        QVERIFY(manager.endElement("", "a", QString("p%1:a").arg(i)));
    }
}

void tst_TorkXml_ParseStops::usedPrefixesCountInTheirElement()
{
    FlushingManager manager;
    for (int i = 0; i < TorkXmlMaximumPrefixes; ++i) {
        QVERIFY(manager.startElement("", "a", QString("p%1:a").arg(i), QXmlAttributes()));
        QVERIFY(manager.startElement("", "b", QString("p%1:b").arg(i), QXmlAttributes()));
        QVERIFY(manager.endElement("", "b", QString("p%1:b").arg(i)));
    }
    QVERIFY(!manager.startElement("", "a", "q:a", QXmlAttributes()));
}

// An attribute "xmlns:p" declares a prefix, an element of that name uses the prefix "xmlns".
void tst_TorkXml_ParseStops::elementsOfThePrefixXmlns()
{
    FlushingManager manager;
    for (int i = 0; i < 2 * TorkXmlMaximumPrefixes; ++i) {
        const QString name = QString("p%1").arg(i);
        QVERIFY(manager.startElement("", name, "xmlns:" + name, QXmlAttributes()));
    }
}

// Who drives a manager by hand need not tell of declarations that are among the attributes.
void tst_TorkXml_ParseStops::declarationsByHand()
{
    QXmlAttributes attributes;
    for (int i = 0; i < TorkXmlMaximumPrefixes; ++i)
        attributes.append(QString("xmlns:p%1").arg(i), "", QString("p%1").arg(i), "u");
    FlushingManager most;
    QVERIFY(most.startElement("", "r", "r", attributes));
    attributes.append("xmlns:q", "", "q", "u");
    FlushingManager more;
    QVERIFY(!more.startElement("", "r", "r", attributes));
}

void tst_TorkXml_ParseStops::deepDocuments_data()
{
    QTest::addColumn<int>("levels");
    QTest::addColumn<bool>("expected");

    QTest::newRow("one level") << 1 << true;
    QTest::newRow("a thousand levels") << 1000 << true;
    QTest::newRow("one level too many") << 1001 << false;
    QTest::newRow("a million levels") << 1000000 << false;
}

void tst_TorkXml_ParseStops::deepDocuments()
{
    QFETCH(int, levels);
    QFETCH(bool, expected);

    FlushingManager manager;
    QCOMPARE(Parse(manager, Nested(levels)), expected);
    // The element that stops a parse is on the stack, as it is for every other reason.
    QCOMPARE(OpenElements(manager).size(), expected ? 0 : 1001);
}

void tst_TorkXml_ParseStops::largeDocument_data()
{
    QTest::addColumn<QString>("document");

    const QString megabyte(1 << 20, 'x');
    QTest::newRow("text of 1 MB") << "<a>" + megabyte + "</a>";
    QTest::newRow("attribute of 1 MB") << "<a b='" + megabyte + "'/>";
    QTest::newRow("name of 1 MB") << "<" + megabyte + "></" + megabyte + ">";
    QTest::newRow("100,000 children") << "<a>" + QString("<b/>").repeated(100000) + "</a>";
}

void tst_TorkXml_ParseStops::largeDocument()
{
    QFETCH(QString, document);

    FlushingManager manager;
    QVERIFY(Parse(manager, document));
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(!manager.PopElement());
}

QTEST_GUILESS_MAIN(tst_TorkXml_ParseStops)

#include "tst_TorkXml_ParseStops.moc"
