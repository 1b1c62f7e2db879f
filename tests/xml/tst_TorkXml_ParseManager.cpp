// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlLimits.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include "support/MessageCapture.h"
#include "support/TestFiles.h"
#include "xml/VirtualSlot.h"

#include <QTemporaryDir>
#include <QXmlAttributes>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <limits>
#include <memory>
#include <type_traits>

static_assert(std::is_base_of<QXmlDefaultHandler, TorkXml_ParseManager_Base>::value,
              "the manager is every kind of handler that the reader knows");

namespace {

const QString ReportHeader("Failed to parse the XML content:\n");

// What the states of a document do, each rule naming the place where it holds.
struct Script
{
    QStringList inPlace;  // "parent>child": the parent's state handles the child itself
    QStringList unknown;  // "parent>child", or ">root": there is no state for it
    QStringList refused;  // "name=content": the content is refused
    QStringList renamed;  // "element=name": the element's state bears another name
    QStringList reported; // "name=content": the content is taken, with an error appended
    QStringList events;   // what happened, in order

    QString NameOfStateOf(QString const& element) const
    {
        for (QString const& rule : renamed)
            if (rule.section('=', 0, 0) == element)
                return rule.section('=', 1);
        return element;
    }
};

class ScriptedState : public TorkXml_ParseState_Base
{
public:
    static int alive;

    ScriptedState(QString const& element, TorkXml_ParseManager_Base* manager, Script& script)
        : TorkXml_ParseState_Base(script.NameOfStateOf(element), manager), m_name(element),
          m_script(script)
    {
        ++alive;
    }

    ~ScriptedState() override
    {
        --alive;
        m_script.events << "~" + m_name;
    }

    bool CanHandleElement(QString const& name) override
    {
        m_script.events << m_name + ".can(" + name + ")";
        return m_script.inPlace.contains(m_name + ">" + name);
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        m_script.events << m_name + ".next(" + name + ")";
        if (m_script.unknown.contains(m_name + ">" + name))
            return nullptr;
        return new ScriptedState(name, ParseManager(), m_script);
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        m_script.events << m_name + ".content(" + name + "," + content + ")";
        if (m_script.reported.contains(name + "=" + content))
            ParseManager()->AppendError(name, content, 2000);
        return !m_script.refused.contains(name + "=" + content);
    }

    bool EndElement(QString const& name) override
    {
        m_script.events << m_name + ".end(" + name + ")";
        return false; // ignored, as every row shows
    }

private:
    QString m_name;
    Script& m_script;
};

int ScriptedState::alive = 0;

// Changes the stack of states when its element ends.
class MeddlingState : public ScriptedState
{
public:
    MeddlingState(QString const& element, TorkXml_ParseManager_Base* manager, Script& script,
                  QString const& deed)
        : ScriptedState(element, manager, script), m_deed(deed), m_script(script)
    {}

    bool EndElement(QString const& name) override
    {
        TorkXml_ParseManager_Base* manager = ParseManager();
        ScriptedState::EndElement(name);
        for (QChar what : m_deed) {
            if (what == '+')
                manager->PushState(new ScriptedState("pushed", manager, m_script));
            else if (what == '-')
                popped.append(manager->PopState());
            else if (what == '=')
                manager->PushState(popped.takeFirst());
        }
        return true;
    }

    static QVector<TorkXml_ParseState_Base*> popped;

private:
    QString m_deed;
    Script& m_script;
};

QVector<TorkXml_ParseState_Base*> MeddlingState::popped;

class ScriptedManager : public TorkXml_ParseManager_Base
{
public:
    explicit ScriptedManager(Script& script) : m_script(script) {}

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        m_script.events << "first(" + name + ")";
        if (m_script.unknown.contains(">" + name))
            return nullptr;
        return new ScriptedState(name, this, m_script);
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        m_script.events << "next(" + name + ")";
        return TorkXml_ParseManager_Base::GetNextState(name);
    }

private:
    Script& m_script;
};

// Skips the whole document.
class FlushingManager : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, this);
    }
};

// Decides on every child by itself: skips those it is told of, and knows no other.
class DecidingManager : public ScriptedManager
{
public:
    DecidingManager(Script& script, QStringList const& known)
        : ScriptedManager(script), m_known(known)
    {}

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (!m_known.contains(name))
            return nullptr;
        return new TorkXml_FlushUnknownElement(name, this);
    }

private:
    QStringList m_known;
};

// Remembers the current element and the attributes' names and values at each call.
class WatchingState : public TorkXml_ParseState_Base
{
public:
    WatchingState(QString const& name, TorkXml_ParseManager_Base* manager, QStringList* seen)
        : TorkXml_ParseState_Base(name, manager), m_seen(seen)
    {
        *m_seen << "made in " + CurrentElement();
    }

    bool CanHandleElement(QString const& name) override
    {
        *m_seen << "asked for " + name + " in " + CurrentElement();
        return name == "inplace";
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return new WatchingState(name, ParseManager(), m_seen);
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        *m_seen << name + "=" + content + " in " + CurrentElement();
        return true;
    }

    bool EndElement(QString const& name) override
    {
        *m_seen << "end of " + name + " in " + CurrentElement();
        return true;
    }

private:
    QStringList* m_seen;
};

class WatchingManager : public TorkXml_ParseManager_Base
{
public:
    QStringList seen;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new WatchingState(name, this, &seen);
    }
};

bool Parse(TorkXml_ParseManager_Base& manager, QString const& document)
{
    QXmlInputSource source;
    source.setData(document);
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    return reader.parse(source);
}

QString Report(TorkXml_ParseManager_Base& manager)
{
    QString report("left over");
    manager.FormatErrors(report);
    return report;
}

// The names still on the element stack, innermost first; takes them off.
QStringList OpenElements(TorkXml_ParseManager_Base& manager)
{
    TorkXml_ParseState_Base probe("probe", &manager);
    QStringList names;
    QString name = probe.CurrentElement();
    while (manager.PopElement()) {
        names << name;
        name = probe.CurrentElement();
    }
    return names;
}

QString Nested(int levels)
{
    return QString("<e>").repeated(levels) + QString("</e>").repeated(levels);
}

// The process-wide log in a folder of its own, and the message handler of before once it is gone.
class ProcessWideLog
{
public:
    ProcessWideLog() : m_handler(qInstallMessageHandler(nullptr))
    {
        TorkLog::initialize(m_dir.path() + "/", "xml", QString(), true);
    }

    ~ProcessWideLog()
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_handler);
    }

    ProcessWideLog(ProcessWideLog const&) = delete;
    ProcessWideLog& operator=(ProcessWideLog const&) = delete;

    QByteArray Content() const { return TestFiles::read(m_dir.filePath("xml.log")); }

private:
    QTemporaryDir m_dir;
    QtMessageHandler m_handler;
};

} // namespace

class tst_TorkXml_ParseManager : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void elementStack();
    void popElementOfAnEmptyStack();
    void stateStack();
    void destructorDeletesFromTheTop();
    void destructorDeletesBelowANullState();
    void poppedStateBelongsToTheCaller();
    void endedStateOffTheStackIsNotTouched();

    void routing_data();
    void routing();
    void currentElement();
    void attributeNames_data();
    void attributeNames();
    void attributesOfInPlaceChild();
    void onlyLocalNamesCount();
    void textInPieces();

    void defaultFirstState();
    void defaultNextState();
    void nextStateOfADerivedManager_data();
    void nextStateOfADerivedManager();
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
    void neutralCallbacks();
    void inheritedHandlersAcceptEverything();

    void appendError_data();
    void appendError();
    void appendErrorWithCode_data();
    void appendErrorWithCode();
    void appendErrorOfElement_data();
    void appendErrorOfElement();
    void formatErrors_data();
    void formatErrors();
    void errorsOfStatesDoNotStop();
    void errorsOutliveADocument();
    void stacksAreEmptyForTheNextDocument();

    void noWarningWithoutTheLog();
    void warningWithTheLog_data();
    void warningWithTheLog();
    void warningReachesTheLogFile();
    void refusedContentWarnsOfNothing();

    void endedStateGoes_data();
    void endedStateGoes();
    void tooManyPrefixes_data();
    void tooManyPrefixes();
    void prefixesThatAreOverDoNotCount();
    void deepDocuments_data();
    void deepDocuments();
    void largeDocument_data();
    void largeDocument();

    void slotsStandInOrder();
};

void tst_TorkXml_ParseManager::init()
{
    ScriptedState::alive = 0;
    QVERIFY(!TorkLog::m_gLog);
}

void tst_TorkXml_ParseManager::cleanup()
{
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseManager::elementStack()
{
    TorkXml_ParseManager_Base manager;
    TorkXml_ParseState_Base probe("probe", &manager);
    QCOMPARE(probe.CurrentElement(), QString());

    QString name("a");
    QVERIFY(manager.PushElement(name));
    name = "changed";
    QCOMPARE(probe.CurrentElement(), QString("a"));
    QVERIFY(manager.PushElement("b"));
    QVERIFY(manager.PushElement("b"));
    QCOMPARE(probe.CurrentElement(), QString("b"));

    QVERIFY(manager.PopElement());
    QCOMPARE(probe.CurrentElement(), QString("b"));
    QVERIFY(manager.PopElement());
    QCOMPARE(probe.CurrentElement(), QString("a"));
    QVERIFY(manager.PushElement(""));
    QCOMPARE(probe.CurrentElement(), QString());
    QVERIFY(manager.PopElement());
    QCOMPARE(probe.CurrentElement(), QString("a"));
    QVERIFY(manager.PopElement());
    QCOMPARE(probe.CurrentElement(), QString());
    QVERIFY(!manager.PopElement());
}

void tst_TorkXml_ParseManager::popElementOfAnEmptyStack()
{
    TorkXml_ParseManager_Base manager;
    TorkXml_ParseState_Base probe("probe", &manager);

    QVERIFY(!manager.PopElement());
    QVERIFY(!manager.PopElement());
    QCOMPARE(probe.CurrentElement(), QString());
}

void tst_TorkXml_ParseManager::stateStack()
{
    TorkXml_ParseManager_Base manager;
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(manager.PopState() == nullptr);

    std::unique_ptr<TorkXml_ParseState_Base> first(new TorkXml_ParseState_Base("a", &manager));
    std::unique_ptr<TorkXml_ParseState_Base> second(new TorkXml_ParseState_Base("b", &manager));
    QVERIFY(manager.PushState(first.get()));
    QCOMPARE(manager.LastState(), first.get());
    QVERIFY(manager.PushState(second.get()));
    QCOMPARE(manager.LastState(), second.get());
    QCOMPARE(manager.LastState(), second.get()); // looked at, not taken

    QCOMPARE(manager.PopState(), second.get());
    QCOMPARE(manager.LastState(), first.get());
    QCOMPARE(manager.PopState(), first.get());
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(manager.PopState() == nullptr);
    QVERIFY(!manager.PopElement()); // the stacks are apart
}

void tst_TorkXml_ParseManager::destructorDeletesFromTheTop()
{
    Script script;
    {
        TorkXml_ParseManager_Base manager;
        for (char const* name : {"a", "b", "c"})
            manager.PushState(new ScriptedState(name, &manager, script));
        QCOMPARE(ScriptedState::alive, 3);
        manager.PushElement("never popped");
    }
    QCOMPARE(ScriptedState::alive, 0);
    QCOMPARE(script.events, QStringList({"~c", "~b", "~a"}));
}

void tst_TorkXml_ParseManager::destructorDeletesBelowANullState()
{
    Script script;
    {
        TorkXml_ParseManager_Base manager;
        manager.PushState(new ScriptedState("a", &manager, script));
        QVERIFY(manager.PushState(nullptr));
        QVERIFY(manager.LastState() == nullptr);
    }
    QCOMPARE(script.events, QStringList({"~a"}));
}

void tst_TorkXml_ParseManager::poppedStateBelongsToTheCaller()
{
    Script script;
    std::unique_ptr<TorkXml_ParseState_Base> popped;
    {
        TorkXml_ParseManager_Base manager;
        manager.PushState(new ScriptedState("a", &manager, script));
        manager.PushState(new ScriptedState("b", &manager, script));
        popped.reset(manager.PopState());
        QVERIFY(popped->IsElement("b"));
        QCOMPARE(ScriptedState::alive, 2);
    }
    QCOMPARE(ScriptedState::alive, 1);
    QVERIFY(popped->IsElement("b"));
}

void tst_TorkXml_ParseManager::endedStateOffTheStackIsNotTouched()
{
    Script script;
    ScriptedManager manager(script);
    manager.startElement(QString(), "a", "a", QXmlAttributes());
    std::unique_ptr<TorkXml_ParseState_Base> taken(manager.PopState());

    // Nobody's end tag, then: the name goes, no state is asked, and nothing breaks.
    QVERIFY(manager.endElement(QString(), "a", "a"));

    QCOMPARE(script.events, QStringList({"first(a)"}));
    QVERIFY(!manager.PopElement());
    QCOMPARE(ScriptedState::alive, 1);
}

void tst_TorkXml_ParseManager::routing_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QStringList>("inPlace");
    QTest::addColumn<QStringList>("events");

    QTest::newRow("root alone") << "<a/>" << QStringList{}
                                << QStringList{"first(a)", "a.end(a)", "~a"};
    QTest::newRow("text goes to the root under its name")
        << "<a>t</a>" << QStringList{}
        << QStringList{"first(a)", "a.content(a,t)", "a.end(a)", "~a"};
    QTest::newRow("attributes come first, in order")
        << "<a z='1' b='2' c='3'>t</a>" << QStringList{} << QStringList{"first(a)",
                                                                        "a.content(z,1)",
                                                                        "a.content(b,2)",
                                                                        "a.content(c,3)",
                                                                        "a.content(a,t)",
                                                                        "a.end(a)",
                                                                        "~a"};
    QTest::newRow("empty attribute value")
        << "<a b=''/>" << QStringList{}
        << QStringList{"first(a)", "a.content(b,)", "a.end(a)", "~a"};
    QTest::newRow("child: asked in place, then for a state")
        << "<a><b/></a>" << QStringList{}
        << QStringList{"first(a)", "a.can(b)", "next(b)",  "a.next(b)",
                       "b.end(b)", "~b",       "a.end(a)", "~a"};
    QTest::newRow("child's attributes and text go to the child")
        << "<a x='1'><b y='2'>t</b></a>" << QStringList{} << QStringList{"first(a)",
                                                                         "a.content(x,1)",
                                                                         "a.can(b)",
                                                                         "next(b)",
                                                                         "a.next(b)",
                                                                         "b.content(y,2)",
                                                                         "b.content(b,t)",
                                                                         "b.end(b)",
                                                                         "~b",
                                                                         "a.end(a)",
                                                                         "~a"};
    QTest::newRow("text after a child goes to the parent again")
        << "<a>1<b>2</b>3</a>" << QStringList{}
        << QStringList{"first(a)",       "a.content(a,1)", "a.can(b)", "next(b)",
                       "a.next(b)",      "b.content(b,2)", "b.end(b)", "~b",
                       "a.content(a,3)", "a.end(a)",       "~a"};
    QTest::newRow("grandchild is asked of the child")
        << "<a><b><c/></b></a>" << QStringList{}
        << QStringList{"first(a)", "a.can(b)",  "next(b)",  "a.next(b)", "b.can(c)",
                       "next(c)",  "b.next(c)", "c.end(c)", "~c",        "b.end(b)",
                       "~b",       "a.end(a)",  "~a"};
    QTest::newRow("siblings have a state each")
        << "<a><b/><b/></a>" << QStringList{}
        << QStringList{"first(a)", "a.can(b)", "next(b)", "a.next(b)", "b.end(b)",
                       "~b",       "a.can(b)", "next(b)", "a.next(b)", "b.end(b)",
                       "~b",       "a.end(a)", "~a"};
    QTest::newRow("child of the same name with a state of its own")
        << "<a><a/>t</a>" << QStringList{}
        << QStringList{"first(a)", "a.can(a)",       "next(a)",  "a.next(a)", "a.end(a)",
                       "~a",       "a.content(a,t)", "a.end(a)", "~a"};
    QTest::newRow("section is text")
        << "<a><![CDATA[<b>]]></a>" << QStringList{}
        << QStringList{"first(a)", "a.content(a,<b>)", "a.end(a)", "~a"};
    QTest::newRow("white space between elements is text")
        << "<a>\n <b/></a>" << QStringList{}
        << QStringList{"first(a)", "a.content(a,\n )", "a.can(b)",
                       "next(b)",  "a.next(b)",        "b.end(b)",
                       "~b",       "a.end(a)",         "~a"};
    QTest::newRow("comments and instructions go to nobody")
        << "<?xml version='1.0'?><!DOCTYPE a><!--c--><a><!--c--><?go on?></a><!--c-->"
        << QStringList{} << QStringList{"first(a)", "a.end(a)", "~a"};

    QTest::newRow("in place: no state is made")
        << "<a><b/></a>" << QStringList{"a>b"}
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"};
    QTest::newRow("in place: attributes go to nobody")
        << "<a><b x='1' href='2'/></a>" << QStringList{"a>b"}
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"};
    QTest::newRow("in place: text comes under the child's name")
        << "<a>1<b>2</b>3</a>" << QStringList{"a>b"}
        << QStringList{"first(a)",       "a.content(a,1)", "a.can(b)", "a.content(b,2)",
                       "a.content(a,3)", "a.end(a)",       "~a"};
    QTest::newRow("in place: grandchild is asked of the same state")
        << "<a><b><c>t</c></b></a>" << QStringList{"a>b", "a>c"}
        << QStringList{"first(a)", "a.can(b)", "a.can(c)", "a.content(c,t)", "a.end(a)", "~a"};
    QTest::newRow("in place: grandchild with a state of its own")
        << "<a><b>1<c>2</c>3</b></a>" << QStringList{"a>b"}
        << QStringList{"first(a)", "a.can(b)",       "a.content(b,1)", "a.can(c)",
                       "next(c)",  "a.next(c)",      "c.content(c,2)", "c.end(c)",
                       "~c",       "a.content(b,3)", "a.end(a)",       "~a"};
    QTest::newRow("in place: child of the same name ends the state one level early")
        << "<r><a>1<a>2</a></a>3</r>" << QStringList{"a>a"}
        << QStringList{"first(r)", "r.can(a)", "next(a)", "r.next(a)", "a.content(a,1)", "a.can(a)",
                       "a.content(a,2)", "a.end(a)", "~a",
                       // The outer end tag finds the root's state, which is not its own.
                       "r.content(r,3)", "r.end(r)", "~r"};
    QTest::newRow("in place: text after the early end goes to the state below")
        << "<r><a><a/>t</a></r>" << QStringList{"a>a"}
        << QStringList{"first(r)", "r.can(a)", "next(a)",        "r.next(a)", "a.can(a)",
                       "a.end(a)", "~a",       "r.content(a,t)", "r.end(r)",  "~r"};
    QTest::newRow("in place: children after the early end are asked of the state below")
        << "<r><a><a/><b/></a></r>" << QStringList{"a>a"}
        << QStringList{"first(r)", "r.can(a)", "next(a)",  "r.next(a)", "a.can(a)",
                       "a.end(a)", "~a",       "r.can(b)", "next(b)",   "r.next(b)",
                       "b.end(b)", "~b",       "r.end(r)", "~r"};
    QTest::newRow("in place: root's child of the same name leaves the last end tag to nobody")
        << "<a><a/></a>" << QStringList{"a>a"}
        << QStringList{"first(a)", "a.can(a)", "a.end(a)", "~a"};
    QTest::newRow("element after the root's early end is a first one")
        << "<a><a/><b/></a>" << QStringList{"a>a"}
        << QStringList{"first(a)", "a.can(a)", "a.end(a)", "~a", "first(b)", "b.end(b)", "~b"};
}

void tst_TorkXml_ParseManager::routing()
{
    QFETCH(QString, document);
    QFETCH(QStringList, inPlace);
    QFETCH(QStringList, events);

    Script script;
    script.inPlace = inPlace;
    ScriptedManager manager(script);

    QVERIFY(Parse(manager, document));
    QCOMPARE(script.events, events);
    QCOMPARE(ScriptedState::alive, 0);
    QVERIFY(manager.LastState() == nullptr);
    QCOMPARE(OpenElements(manager), QStringList());
    QCOMPARE(Report(manager), ReportHeader);
}

void tst_TorkXml_ParseManager::currentElement()
{
    WatchingManager manager;
    QVERIFY(Parse(manager, "<a x='1'>2<b>3</b><inplace>4</inplace>5</a>"));
    QCOMPARE(manager.seen,
             QStringList({"made in a", "x=1 in a", "a=2 in a", "asked for b in b", "made in b",
                          "b=3 in b", "end of b in b", "asked for inplace in inplace",
                          "inplace=4 in inplace", "a=5 in a", "end of a in a"}));
}

void tst_TorkXml_ParseManager::attributeNames_data()
{
    QTest::addColumn<QString>("attributes");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("plain href") << "href='u'" << QStringList{"xlink:href=u"};
    QTest::newRow("href of the links' namespace")
        << "xlink:href='u'" << QStringList{"xlink:href=u"};
    QTest::newRow("href of any prefix") << "other:href='u'" << QStringList{"xlink:href=u"};
    QTest::newRow("empty href") << "href=''" << QStringList{"xlink:href="};
    QTest::newRow("hrefs keeps its name") << "hrefs='u'" << QStringList{"hrefs=u"};
    QTest::newRow("hre keeps its name") << "hre='u'" << QStringList{"hre=u"};
    QTest::newRow("case matters") << "HREF='u' Href='v'" << QStringList{"HREF=u", "Href=v"};
    QTest::newRow("prefix of another name goes") << "xlink:type='u'" << QStringList{"type=u"};
    QTest::newRow("prefix named href is no href") << "href:a='u'" << QStringList{"a=u"};
    QTest::newRow("plain and prefixed href, in the reader's order")
        << "href='u' xlink:href='v'" << QStringList{"xlink:href=u", "xlink:href=v"};
    QTest::newRow("among others, in order")
        << "b='1' href='u' a='2'" << QStringList{"b=1", "xlink:href=u", "a=2"};
    QTest::newRow("value is unescaped by the reader")
        << "a='&lt;&amp;&#65;'" << QStringList{"a=<&A"};
    QTest::newRow("placeholder in the value") << "a='%1'" << QStringList{"a=%1"};
    QTest::newRow("none") << "" << QStringList{};
}

void tst_TorkXml_ParseManager::attributeNames()
{
    QFETCH(QString, attributes);
    QFETCH(QStringList, expected);
    QStringList watched{"made in e"};
    for (QString const& attribute : expected)
        watched << attribute + " in e";
    watched << "end of e in e";

    const QString namespaces(
        " xmlns:xlink='http://www.w3.org/1999/xlink' xmlns:other='urn:o' xmlns:href='urn:h' ");

    WatchingManager ofRoot;
    QVERIFY(Parse(ofRoot, "<e" + namespaces + attributes + "/>"));
    QCOMPARE(ofRoot.seen, watched);

    WatchingManager ofChild;
    QVERIFY(Parse(ofChild, "<r" + namespaces + "><e " + attributes + "/></r>"));
    QCOMPARE(ofChild.seen, QStringList({"made in r", "asked for e in e"}) + watched +
                               QStringList{"end of r in r"});
}

void tst_TorkXml_ParseManager::attributesOfInPlaceChild()
{
    WatchingManager manager;
    QVERIFY(Parse(manager, "<a><inplace x='1' href='2'/></a>"));
    QCOMPARE(manager.seen,
             QStringList({"made in a", "asked for inplace in inplace", "end of a in a"}));
}

void tst_TorkXml_ParseManager::onlyLocalNamesCount()
{
    Script script;
    {
        ScriptedManager manager(script);
        QXmlAttributes attributes;
        attributes.append("p:x", "urn:p", "x", "1");
        attributes.append("p:href", "urn:p", "href", "2");

        QVERIFY(manager.startElement("urn:a", "a", "p:other", attributes));
        QVERIFY(manager.characters("t"));
        QVERIFY(manager.endElement("urn:b", "a", "q:another"));
    }
    QCOMPARE(script.events, QStringList({"first(a)", "a.content(x,1)", "a.content(xlink:href,2)",
                                         "a.content(a,t)", "a.end(a)", "~a"}));
}

void tst_TorkXml_ParseManager::textInPieces()
{
    Script script;
    ScriptedManager manager(script);
    manager.startElement(QString(), "a", "a", QXmlAttributes());

    QVERIFY(manager.characters("1"));
    QVERIFY(manager.characters(""));
    QVERIFY(manager.characters("2"));

    QCOMPARE(script.events,
             QStringList({"first(a)", "a.content(a,1)", "a.content(a,)", "a.content(a,2)"}));
    manager.endElement(QString(), "a", "a");
}

void tst_TorkXml_ParseManager::defaultFirstState()
{
    TorkXml_ParseManager_Base manager;

    QVERIFY(manager.GetFirstState("a") == nullptr);
    QVERIFY(manager.GetFirstState("") == nullptr);
    QCOMPARE(Report(manager), ReportHeader);
}

void tst_TorkXml_ParseManager::defaultNextState()
{
    Script script;
    script.unknown << "a>unknown";
    TorkXml_ParseManager_Base manager;
    QVERIFY(manager.GetNextState("b") == nullptr); // no state to ask

    manager.PushState(new ScriptedState("a", &manager, script));
    const std::unique_ptr<TorkXml_ParseState_Base> next(manager.GetNextState("b"));
    QVERIFY(next && next->IsElement("b"));
    QVERIFY(manager.GetNextState("unknown") == nullptr);
    QVERIFY(manager.LastState()->IsElement("a")); // made, not pushed

    QCOMPARE(script.events, QStringList({"a.next(b)", "a.next(unknown)"}));
    QCOMPARE(Report(manager), ReportHeader);
}

void tst_TorkXml_ParseManager::nextStateOfADerivedManager_data()
{
    QTest::addColumn<QStringList>("known");
    QTest::addColumn<QStringList>("inPlace");
    QTest::addColumn<bool>("passes");
    QTest::addColumn<QStringList>("events");
    QTest::addColumn<QString>("errors");

    QTest::newRow("decides without the state")
        << QStringList{"b"} << QStringList{} << true
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"} << QString();
    QTest::newRow("refuses what the state knows")
        << QStringList{"c"} << QStringList{} << false << QStringList{"first(a)", "a.can(b)"}
        << "Error: 1016 Unknown element \"b\". Parse state element \"a\".\n";
    QTest::newRow("is not asked for a child handled in place")
        << QStringList{} << QStringList{"a>b"} << true
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"} << QString();
}

void tst_TorkXml_ParseManager::nextStateOfADerivedManager()
{
    QFETCH(QStringList, known);
    QFETCH(QStringList, inPlace);
    QFETCH(bool, passes);
    QFETCH(QStringList, events);
    QFETCH(QString, errors);

    Script script;
    script.inPlace = inPlace;
    DecidingManager manager(script, known);

    QCOMPARE(Parse(manager, "<a><b/></a>"), passes);
    QCOMPARE(script.events, events);
    QCOMPARE(Report(manager), ReportHeader + errors);
}

void tst_TorkXml_ParseManager::noInitialState_data()
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

void tst_TorkXml_ParseManager::noInitialState()
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

void tst_TorkXml_ParseManager::unknownElement_data()
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

void tst_TorkXml_ParseManager::unknownElement()
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
    QCOMPARE(ScriptedState::alive, alive); // kept until the manager goes; cleanup() counts again
}

void tst_TorkXml_ParseManager::unknownElementIsNamedAfterTheStateOnTop()
{
    Script script;
    script.renamed << "a=another";
    script.unknown << "a>b";
    ScriptedManager manager(script);

    QVERIFY(!Parse(manager, "<a><b/></a>"));
    QCOMPARE(Report(manager), ReportHeader + "Error: 1016 Unknown element \"b\". Parse state "
                                             "element \"another\".\n");
}

void tst_TorkXml_ParseManager::placeholdersInNames()
{
    // No reader lets such names pass, but whoever calls the handler himself may use them.
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

void tst_TorkXml_ParseManager::stoppedByContent_data()
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

void tst_TorkXml_ParseManager::stoppedByContent()
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

void tst_TorkXml_ParseManager::wrongNames_data()
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

void tst_TorkXml_ParseManager::wrongNames()
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

void tst_TorkXml_ParseManager::endBeyondTheLastState()
{
    TorkXml_ParseManager_Base manager;
    manager.PushElement("a");

    QVERIFY(manager.endElement(QString(), "a", "a"));
    QVERIFY(!manager.PopElement());
    QVERIFY(manager.endElement(QString(), "a", "a")); // not even an element left
}

void tst_TorkXml_ParseManager::nullStateOnTop()
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

void tst_TorkXml_ParseManager::truncatedAnywhere()
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

void tst_TorkXml_ParseManager::stopIsAHandlerErrorToTheReader()
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

void tst_TorkXml_ParseManager::charactersWithoutAState()
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

void tst_TorkXml_ParseManager::neutralCallbacks()
{
    TorkXml_ParseManager_Base manager;

    QVERIFY(manager.startDocument());
    QVERIFY(manager.endDocument());
    QVERIFY(manager.startPrefixMapping("p", "urn:p"));
    QVERIFY(manager.endPrefixMapping("p"));
    QVERIFY(manager.ignorableWhitespace(" \n"));

    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(!manager.PopElement());
    QCOMPARE(Report(manager), ReportHeader);
}

void tst_TorkXml_ParseManager::inheritedHandlersAcceptEverything()
{
    TorkXml_ParseManager_Base manager;
    const QXmlParseException problem("problem");
    QXmlInputSource* entity = nullptr;

    QVERIFY(manager.processingInstruction("go", "on"));
    QVERIFY(manager.skippedEntity("e"));
    QVERIFY(manager.warning(problem));
    QVERIFY(manager.error(problem));
    QVERIFY(manager.fatalError(problem));
    QVERIFY(manager.notationDecl("n", "p", "s"));
    QVERIFY(manager.unparsedEntityDecl("n", "p", "s", "t"));
    QVERIFY(manager.resolveEntity("p", "s", entity));
    QVERIFY(entity == nullptr);
    QVERIFY(manager.startDTD("n", "p", "s"));
    QVERIFY(manager.endDTD());
    QVERIFY(manager.startEntity("e"));
    QVERIFY(manager.endEntity("e"));
    QVERIFY(manager.startCDATA());
    QVERIFY(manager.endCDATA());
    QVERIFY(manager.comment("c"));
    QVERIFY(manager.attributeDecl("e", "a", "t", "d", "v"));
    QVERIFY(manager.internalEntityDecl("n", "v"));
    QVERIFY(manager.externalEntityDecl("n", "p", "s"));

    QCOMPARE(Report(manager), ReportHeader);
}

void tst_TorkXml_ParseManager::appendError_data()
{
    QTest::addColumn<QString>("text");

    QTest::newRow("plain") << "something is wrong";
    QTest::newRow("empty") << "";
    QTest::newRow("placeholder") << "%1 and %2";
    QTest::newRow("several lines") << "first\nsecond";
    QTest::newRow("quotes and backslashes") << "say \"a\\b\"";
    QTest::newRow("outside Latin-1") << QString::fromUtf8("größe 長");
    QTest::newRow("1 MB") << QString(1 << 20, 'x');
}

void tst_TorkXml_ParseManager::appendError()
{
    QFETCH(QString, text);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(text);
    QCOMPARE(Report(manager), ReportHeader + text + "\n");
}

void tst_TorkXml_ParseManager::appendErrorWithCode_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain") << "no title" << 2001 << "Error: 2001 no title";
    QTest::newRow("code 0") << "no title" << 0 << "Error: 0 no title";
    QTest::newRow("negative code") << "no title" << -7 << "Error: -7 no title";
    QTest::newRow("largest code") << "t" << std::numeric_limits<int>::max()
                                  << "Error: 2147483647 t";
    QTest::newRow("smallest code")
        << "t" << std::numeric_limits<int>::min() << "Error: -2147483648 t";
    QTest::newRow("no text") << "" << 5 << "Error: 5 ";
    QTest::newRow("placeholders in the text") << "%1 %2 %3" << 5 << "Error: 5 %1 %2 %3";
}

void tst_TorkXml_ParseManager::appendErrorWithCode()
{
    QFETCH(QString, text);
    QFETCH(int, code);
    QFETCH(QString, expected);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(text, code);
    QCOMPARE(Report(manager), ReportHeader + expected + "\n");
}

void tst_TorkXml_ParseManager::appendErrorOfElement_data()
{
    QTest::addColumn<QString>("element");
    QTest::addColumn<QString>("content");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain") << "title"
                           << "?" << 2001 << "Error: 2001 on Element: title\nContent: ?";
    QTest::newRow("negative code") << "title"
                                   << "?" << -1 << "Error: -1 on Element: title\nContent: ?";
    QTest::newRow("no element") << ""
                                << "?" << 5 << "Error: 5 on Element: \nContent: ?";
    QTest::newRow("no content") << "title"
                                << "" << 5 << "Error: 5 on Element: title\nContent: ";
    QTest::newRow("placeholders in the element")
        << "%1%2%3"
        << "?" << 5 << "Error: 5 on Element: %1%2%3\nContent: ?";
    QTest::newRow("placeholders in the content")
        << "title"
        << "%1%2%3" << 5 << "Error: 5 on Element: title\nContent: %1%2%3";
    QTest::newRow("content of several lines")
        << "title"
        << "a\nb" << 5 << "Error: 5 on Element: title\nContent: a\nb";
}

void tst_TorkXml_ParseManager::appendErrorOfElement()
{
    QFETCH(QString, element);
    QFETCH(QString, content);
    QFETCH(int, code);
    QFETCH(QString, expected);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(element, content, code);
    QCOMPARE(Report(manager), ReportHeader + expected + "\n");
}

void tst_TorkXml_ParseManager::formatErrors_data()
{
    QTest::addColumn<QStringList>("errors");
    QTest::addColumn<QString>("expected");

    QTest::newRow("none gives the header") << QStringList{} << ReportHeader;
    QTest::newRow("one") << QStringList{"a"} << ReportHeader + "a\n";
    QTest::newRow("several in order") << QStringList{"b", "a", "c"} << ReportHeader + "b\na\nc\n";
    QTest::newRow("same twice") << QStringList{"a", "a"} << ReportHeader + "a\na\n";
    QTest::newRow("empty one") << QStringList{"", "a"} << ReportHeader + "\na\n";
    QTest::newRow("placeholder") << QStringList{"%1", "%2"} << ReportHeader + "%1\n%2\n";
}

void tst_TorkXml_ParseManager::formatErrors()
{
    QFETCH(QStringList, errors);
    QFETCH(QString, expected);
    TorkXml_ParseManager_Base manager;
    for (QString const& error : errors)
        manager.AppendError(error);

    QString report("left over from before");
    manager.FormatErrors(report);
    QCOMPARE(report, expected);
    manager.FormatErrors(report);
    QCOMPARE(report, expected); // nothing was cleared, and nothing added to
}

void tst_TorkXml_ParseManager::errorsOfStatesDoNotStop()
{
    Script script;
    script.reported << "b=bad"
                    << "x=1";
    ScriptedManager manager(script);

    QVERIFY(Parse(manager, "<a><b x='1'>bad</b><b>good</b></a>"));
    QCOMPARE(Report(manager), ReportHeader + "Error: 2000 on Element: x\nContent: 1\n"
                                             "Error: 2000 on Element: b\nContent: bad\n");
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseManager::errorsOutliveADocument()
{
    TorkXml_ParseManager_Base manager;
    QVERIFY(!Parse(manager, "<a/>"));
    const QString first = Report(manager);
    QCOMPARE(OpenElements(manager), QStringList{"a"});
    QVERIFY(!Parse(manager, "<b/>"));

    QCOMPARE(Report(manager), first + "Error: 1016 No initial parse state for element \"b\".\n");
}

void tst_TorkXml_ParseManager::stacksAreEmptyForTheNextDocument()
{
    Script script;
    ScriptedManager manager(script);

    QVERIFY(Parse(manager, "<a/>"));
    QVERIFY(Parse(manager, "<b/>"));

    QCOMPARE(script.events,
             QStringList({"first(a)", "a.end(a)", "~a", "first(b)", "b.end(b)", "~b"}));
}

void tst_TorkXml_ParseManager::noWarningWithoutTheLog()
{
    TorkXml_ParseManager_Base manager;
    MessageCapture captured;

    manager.AppendError("text");
    manager.AppendError("text", 5);
    manager.AppendError("element", "content", 5);
    Parse(manager, "<a/>");

    QCOMPARE(captured.messages().size(), 0);
}

void tst_TorkXml_ParseManager::warningWithTheLog_data()
{
    QTest::addColumn<QString>("element");
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    // The text is streamed as a string: in quotes, with what is not printable escaped.
    QTest::newRow("text") << QString() << "text" << 0 << "\"text\"";
    QTest::newRow("empty text") << QString() << "" << 0 << "\"\"";
    QTest::newRow("text with quotes")
        << QString() << "say \"a\\b\"" << 0 << "\"say \\\"a\\\\b\\\"\"";
    QTest::newRow("text of several lines") << QString() << "a\nb" << 0 << "\"a\\nb\"";
    QTest::newRow("text with a placeholder") << QString() << "%1" << 0 << "\"%1\"";
    QTest::newRow("code and text") << QString() << "text" << 7 << "\"Error: 7 text\"";
    QTest::newRow("element, content and code")
        << "title"
        << "?" << 7 << "\"Error: 7 on Element: title\\nContent: ?\"";
}

void tst_TorkXml_ParseManager::warningWithTheLog()
{
    QFETCH(QString, element);
    QFETCH(QString, text);
    QFETCH(int, code);
    QFETCH(QString, expected);

    ProcessWideLog log;
    TorkXml_ParseManager_Base manager;
    MessageCapture captured;
    if (!element.isNull())
        manager.AppendError(element, text, code);
    else if (code)
        manager.AppendError(text, code);
    else
        manager.AppendError(text);

    QCOMPARE(captured.messages().size(), 1);
    QCOMPARE(captured.messages()[0].type, QtWarningMsg);
    QCOMPARE(captured.messages()[0].category, QString("default"));
    QCOMPARE(captured.messages()[0].text, expected);
}

void tst_TorkXml_ParseManager::warningReachesTheLogFile()
{
    ProcessWideLog log;
    TorkXml_ParseManager_Base first;
    QVERIFY(!Parse(first, "<root/>"));
    Script script;
    script.unknown << "a>b";
    ScriptedManager next(script);
    QVERIFY(!Parse(next, "<a><b/></a>"));

    const QList<QByteArray> lines = log.Content().split('\n');
    QCOMPARE(lines.size(), 3);
    const QByteArray firstEnd(" Warning \"Error: 1016 No initial parse state for element "
                              "\\\"root\\\".\"");
    QVERIFY2(lines[0].endsWith(firstEnd), lines[0].constData());
    const QByteArray nextEnd(" Warning \"Error: 1016 Unknown element \\\"b\\\". Parse state "
                             "element \\\"a\\\".\"");
    QVERIFY2(lines[1].endsWith(nextEnd), lines[1].constData());
    QCOMPARE(lines[2], QByteArray());
}

void tst_TorkXml_ParseManager::refusedContentWarnsOfNothing()
{
    ProcessWideLog log;
    Script script;
    script.refused << "a=x";
    ScriptedManager manager(script);
    MessageCapture captured;

    QVERIFY(!Parse(manager, "<a>x</a>"));
    QCOMPARE(captured.messages().size(), 0);
}

void tst_TorkXml_ParseManager::endedStateGoes_data()
{
    QTest::addColumn<QString>("deed"); // "+" pushes a state, "-" takes one off, "=" puts it back
    QTest::addColumn<QString>("left"); // on the stack, from the bottom
    QTest::addColumn<int>("owned");    // by who took them off
    QTest::addColumn<bool>("isDeleted");

    QTest::newRow("does nothing") << ""
                                  << "r" << 0 << true;
    QTest::newRow("pushes one") << "+"
                                << "r pushed" << 0 << true;
    QTest::newRow("pushes three") << "+++"
                                  << "r pushed pushed pushed" << 0 << true;
    QTest::newRow("pushes one and takes it off") << "+-"
                                                 << "r" << 1 << true;
    QTest::newRow("takes itself off") << "-"
                                      << "r" << 1 << false;
    QTest::newRow("takes itself off and pushes one") << "-+"
                                                     << "r pushed" << 1 << false;
    QTest::newRow("takes itself off and back") << "-="
                                               << "r" << 0 << true;
    QTest::newRow("takes itself and its parent off") << "--"
                                                     << "" << 2 << false;
    QTest::newRow("puts itself below its parent") << "--=="
                                                  << "r" << 0 << true;
    QTest::newRow("takes more off than there is") << "---"
                                                  << "" << 3 << false;
}

// It is removed and deleted whatever it pushed, and not if it took itself off the stack.
void tst_TorkXml_ParseManager::endedStateGoes()
{
    QFETCH(QString, deed);
    QFETCH(bool, isDeleted);
    MeddlingState::popped.clear();
    Script script;
    {
        ScriptedManager manager(script);
        manager.PushElement("r");
        manager.PushElement("a");
        manager.PushState(new ScriptedState("r", &manager, script));
        TorkXml_ParseState_Base* state = new MeddlingState("a", &manager, script, deed);
        manager.PushState(state);

        QVERIFY(manager.endElement(QString(), "a", "a"));
        QCOMPARE(manager.CurrentElement(), QString("r"));
        QCOMPARE(script.events.count("~a"), isDeleted ? 1 : 0);
        QTEST(MeddlingState::popped.size(), "owned");
        QVERIFY(isDeleted || MeddlingState::popped.contains(state));

        QStringList left;
        QVector<TorkXml_ParseState_Base*> states;
        while (TorkXml_ParseState_Base* top = manager.PopState()) {
            left.prepend(top->ElementName());
            states.append(top);
        }
        qDeleteAll(states);
        QTEST(left.join(' '), "left");
    }
    qDeleteAll(MeddlingState::popped);
    MeddlingState::popped.clear();
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseManager::tooManyPrefixes_data()
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
    const QString many = "<r" + declarations(0, TorkXmlManyPrefixes + 1) + ">";
    const QString tooMany = "More than 256 namespace prefixes are in force.\n";
    const QString tooOften =
        "More than 1000 elements have more than 64 namespace prefixes in force.\n";

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
    QTest::newRow("as many elements below many as allowed")
        << many + QString("<a/>").repeated(TorkXmlMaximumElementsOfManyPrefixes - 1) + "</r>"
        << "";
    QTest::newRow("one element more")
        << many + QString("<a/>").repeated(TorkXmlMaximumElementsOfManyPrefixes) + "</r>"
        << tooOften;
    QTest::newRow("one level too many")
        << Nested(1001) << "More than 1000 elements are inside each other.\n";
}

void tst_TorkXml_ParseManager::tooManyPrefixes()
{
    QFETCH(QString, document);
    QFETCH(QString, error);

    FlushingManager manager;
    QCOMPARE(Parse(manager, document), error.isEmpty());
    QString report;
    manager.FormatErrors(report);
    QCOMPARE(report, ReportHeader + error);
}

// What an element declares or uses is over with it.
void tst_TorkXml_ParseManager::prefixesThatAreOverDoNotCount()
{
    QString document = "<r>";
    for (int i = 0; i < 10 * TorkXmlMaximumPrefixes; ++i)
        document += QString("<a xmlns:p%1='u'/><q%1:a/><a r%1:b=''>t</a>").arg(i);
    FlushingManager manager;
    QVERIFY(Parse(manager, document + "</r>"));
}

void tst_TorkXml_ParseManager::deepDocuments_data()
{
    QTest::addColumn<int>("levels");
    QTest::addColumn<bool>("expected");

    QTest::newRow("one level") << 1 << true;
    QTest::newRow("a thousand levels") << 1000 << true;
    QTest::newRow("one level too many") << 1001 << false;
    QTest::newRow("a million levels") << 1000000 << false;
}

void tst_TorkXml_ParseManager::deepDocuments()
{
    QFETCH(int, levels);
    QFETCH(bool, expected);

    FlushingManager manager;
    QCOMPARE(Parse(manager, Nested(levels)), expected);
    // The element that stops a parse is on the stack, as it is for every other reason.
    QCOMPARE(OpenElements(manager).size(), expected ? 0 : 1001);
}

void tst_TorkXml_ParseManager::largeDocument_data()
{
    QTest::addColumn<QString>("document");

    const QString megabyte(1 << 20, 'x');
    QTest::newRow("text of 1 MB") << "<a>" + megabyte + "</a>";
    QTest::newRow("attribute of 1 MB") << "<a b='" + megabyte + "'/>";
    QTest::newRow("name of 1 MB") << "<" + megabyte + "></" + megabyte + ">";
    QTest::newRow("100,000 children") << "<a>" + QString("<b/>").repeated(100000) + "</a>";
}

void tst_TorkXml_ParseManager::largeDocument()
{
    QFETCH(QString, document);

    FlushingManager manager;
    QVERIFY(Parse(manager, document));
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(!manager.PopElement());
}

void tst_TorkXml_ParseManager::slotsStandInOrder()
{
    // The reader's content handler comes first, with its destructor in the first two slots.
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::setDocumentLocator)), 2);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::startDocument)), 3);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::endDocument)), 4);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::startPrefixMapping)), 5);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::endPrefixMapping)), 6);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::startElement)), 7);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::endElement)), 8);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::characters)), 9);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::ignorableWhitespace)), 10);

    // The manager's own two follow the last of the inherited ones.
    const int last = int(VirtualSlot(&QXmlDefaultHandler::externalEntityDecl));
    QVERIFY(last > 10);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::GetFirstState)), last + 1);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseManager_Base::GetNextState)), last + 2);
}

QTEST_GUILESS_MAIN(tst_TorkXml_ParseManager)
#include "tst_TorkXml_ParseManager.moc"
