// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/log/TorkLog.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include "xml/ScriptedStates.h"
#include "xml/VirtualSlot.h"

#include <QXmlAttributes>
#include <QXmlInputSource>
#include <QtTest>

#include <memory>
#include <type_traits>

using namespace ScriptedStates;

static_assert(std::is_base_of<QXmlDefaultHandler, TorkXml_ParseManager_Base>::value,
              "the manager is every kind of handler that the reader knows");

namespace {

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

// Decides about every child itself: skips those it is told to, and knows no other.
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

// Records the current element and the attributes' names and values at each call.
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

    void neutralCallbacks();
    void inheritedHandlersAcceptEverything();

    void endedStateGoes_data();
    void endedStateGoes();

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
    QVERIFY(!manager.PopElement()); // the stacks are separate
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

    // An end tag without a start: the name goes, no state is asked, and nothing breaks.
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
    QTest::newRow("child of the same name with its own state")
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
    QTest::newRow("comments and instructions are ignored")
        << "<?xml version='1.0'?><!DOCTYPE a><!--c--><a><!--c--><?go on?></a><!--c-->"
        << QStringList{} << QStringList{"first(a)", "a.end(a)", "~a"};

    QTest::newRow("in place: no state is made")
        << "<a><b/></a>" << QStringList{"a>b"}
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"};
    QTest::newRow("in place: attributes are ignored")
        << "<a><b x='1' href='2'/></a>" << QStringList{"a>b"}
        << QStringList{"first(a)", "a.can(b)", "a.end(a)", "~a"};
    QTest::newRow("in place: text comes under the child's name")
        << "<a>1<b>2</b>3</a>" << QStringList{"a>b"}
        << QStringList{"first(a)",       "a.content(a,1)", "a.can(b)", "a.content(b,2)",
                       "a.content(a,3)", "a.end(a)",       "~a"};
    QTest::newRow("in place: grandchild is asked of the same state")
        << "<a><b><c>t</c></b></a>" << QStringList{"a>b", "a>c"}
        << QStringList{"first(a)", "a.can(b)", "a.can(c)", "a.content(c,t)", "a.end(a)", "~a"};
    QTest::newRow("in place: grandchild with its own state")
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
    QTest::newRow("in place: root's child of the same name leaves the last end tag without a state")
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
    QVERIFY(manager.LastState()->IsElement("a")); // created, not pushed

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

void tst_TorkXml_ParseManager::endedStateGoes_data()
{
    QTest::addColumn<QString>("deed"); // "+" pushes a state, "-" pops one, "=" puts it back
    QTest::addColumn<QString>("left"); // on the stack, from the bottom
    QTest::addColumn<int>("owned");    // by the code that popped them
    QTest::addColumn<bool>("isDeleted");

    QTest::newRow("does nothing") << ""
                                  << "r" << 0 << true;
    QTest::newRow("pushes one") << "+"
                                << "r pushed" << 0 << true;
    QTest::newRow("pushes three") << "+++"
                                  << "r pushed pushed pushed" << 0 << true;
    QTest::newRow("pushes one and pops it") << "+-"
                                            << "r" << 1 << true;
    QTest::newRow("pops itself") << "-"
                                 << "r" << 1 << false;
    QTest::newRow("pops itself and pushes one") << "-+"
                                                << "r pushed" << 1 << false;
    QTest::newRow("pops itself and pushes itself back") << "-="
                                                        << "r" << 0 << true;
    QTest::newRow("pops itself and its parent") << "--"
                                                << "" << 2 << false;
    QTest::newRow("puts itself below its parent") << "--=="
                                                  << "r" << 0 << true;
    QTest::newRow("pops more than there is") << "---"
                                             << "" << 3 << false;
}

// It is removed and deleted whatever it pushed, but not if it removed itself from the stack.
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
        QTEST(int(MeddlingState::popped.size()), "owned");
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
