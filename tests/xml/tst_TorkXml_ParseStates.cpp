// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include "xml/VirtualSlot.h"

#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <memory>
#include <type_traits>
#include <typeinfo>
#include <utility>

static_assert(std::has_virtual_destructor<TorkXml_ParseState_Base>::value,
              "the manager deletes states through their base");
static_assert(std::is_base_of<TorkXml_ParseState_Base, TorkXml_FlushUnknownElement>::value, "");
static_assert(std::is_same<decltype(std::declval<TorkXml_ParseState_Base&>().CurrentElement()),
                           QString const&>::value,
              "the current element is read, not copied");
static_assert(sizeof(TorkXml_FlushUnknownElement) == sizeof(TorkXml_ParseState_Base),
              "the flush state adds no fields");

namespace {

using StatePointer = std::unique_ptr<TorkXml_ParseState_Base>;

// The root of the documents below: skips every child but "known", whose text it keeps.
class SkippingState : public TorkXml_ParseState_Base
{
public:
    SkippingState(QString const& name, TorkXml_ParseManager_Base* manager, QStringList* content)
        : TorkXml_ParseState_Base(name, manager), m_content(content)
    {}

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (name == "known")
            return new SkippingState(name, ParseManager(), m_content);
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        *m_content << name + "=" + content;
        return true;
    }

private:
    QStringList* m_content;
};

class SkippingReader : public TorkXml_ParseManager_Base
{
public:
    QStringList content;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new SkippingState(name, this, &content);
    }
};

// Handles one kind of element in an additional way, to show what the defaults do.
class ReaderOfOneState : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new TorkXml_ParseState_Base(name, this);
    }
};

// The auxiliary text is there for derived states alone.
class StateWithText : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;

    QString& Text() { return m_auxiliaryText; }
};

bool Parse(TorkXml_ParseManager_Base& manager, QString const& document)
{
    QXmlInputSource source;
    source.setData(document);
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    return reader.parse(source);
}

StatePointer NewState(bool flush, QString const& name, TorkXml_ParseManager_Base* manager)
{
    if (flush)
        return StatePointer(new TorkXml_FlushUnknownElement(name, manager));
    return StatePointer(new TorkXml_ParseState_Base(name, manager));
}

} // namespace

class tst_TorkXml_ParseStates : public QObject
{
    Q_OBJECT

private slots:
    void defaultConstruction();
    void construction_data();
    void construction();
    void auxiliaryTextIsLeftToDerivedStates();
    void isElement_data();
    void isElement();
    void baseDefaults_data();
    void baseDefaults();
    void flushAcceptsContent_data();
    void flushAcceptsContent();
    void flushHandlesNothingInPlace();
    void flushMakesFlushStates_data();
    void flushMakesFlushStates();
    void flushKeepsTheBasesEnd();
    void currentElementFollowsTheManager();
    void skipping_data();
    void skipping();
    void baseStateOnItsOwn_data();
    void baseStateOnItsOwn();
    void slotsStandInOrder();
};

void tst_TorkXml_ParseStates::defaultConstruction()
{
    TorkXml_ParseState_Base state;
    QVERIFY(state.ParseManager() == nullptr);
    QVERIFY(state.IsElement(QString()));
    QVERIFY(state.IsElement(""));
    QVERIFY(!state.IsElement("a"));

    TorkXml_FlushUnknownElement flush;
    QVERIFY(flush.ParseManager() == nullptr);
    QVERIFY(flush.IsElement(""));
    QVERIFY(!flush.IsElement("a"));
}

void tst_TorkXml_ParseStates::construction_data()
{
    QTest::addColumn<bool>("flush");
    QTest::addColumn<bool>("managed");

    QTest::newRow("base") << false << true;
    QTest::newRow("base without a manager") << false << false;
    QTest::newRow("flush") << true << true;
    QTest::newRow("flush without a manager") << true << false;
}

void tst_TorkXml_ParseStates::construction()
{
    QFETCH(bool, flush);
    QFETCH(bool, managed);
    TorkXml_ParseManager_Base manager;
    TorkXml_ParseManager_Base* const given = managed ? &manager : nullptr;

    QString name("item");
    const StatePointer state = NewState(flush, name, given);
    name = "changed";

    QVERIFY(state->IsElement("item"));
    QVERIFY(!state->IsElement("changed"));
    QCOMPARE(state->ParseManager(), given);
    QVERIFY(manager.LastState() == nullptr);
}

void tst_TorkXml_ParseStates::auxiliaryTextIsLeftToDerivedStates()
{
    TorkXml_ParseManager_Base manager;
    QCOMPARE(StateWithText().Text(), QString());
    StateWithText state("item", &manager);
    QCOMPARE(state.Text(), QString());

    state.Text() = "kept";
    state.IsElement("item");
    state.CanHandleElement("child");
    state.GetNextState("child");
    state.ProcessContent("item", "text");
    state.EndElement("item");
    QCOMPARE(state.Text(), QString("kept"));
}

void tst_TorkXml_ParseStates::isElement_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("asked");
    QTest::addColumn<bool>("expected");

    QTest::newRow("same") << "item"
                          << "item" << true;
    QTest::newRow("other") << "item"
                           << "other" << false;
    QTest::newRow("case matters") << "item"
                                  << "Item" << false;
    QTest::newRow("prefix of it") << "item"
                                  << "ite" << false;
    QTest::newRow("longer than it") << "item"
                                    << "items" << false;
    QTest::newRow("blanks matter") << "item"
                                   << " item" << false;
    QTest::newRow("prefixed name") << "item"
                                   << "x:item" << false;
    QTest::newRow("empty name, empty asked") << ""
                                             << "" << true;
    QTest::newRow("empty name, other asked") << ""
                                             << "item" << false;
    QTest::newRow("empty asked") << "item"
                                 << "" << false;
    QTest::newRow("outside Latin-1")
        << QString::fromUtf8("größe-長") << QString::fromUtf8("größe-長") << true;
    QTest::newRow("composed is not decomposed")
        << QString(QChar(0xe9)) << QString("e") + QChar(0x301) << false;
}

void tst_TorkXml_ParseStates::isElement()
{
    QFETCH(QString, name);
    QFETCH(QString, asked);
    QFETCH(bool, expected);

    QCOMPARE(NewState(false, name, nullptr)->IsElement(asked), expected);
    QCOMPARE(NewState(true, name, nullptr)->IsElement(asked), expected);
}

void tst_TorkXml_ParseStates::baseDefaults_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("own element") << "item";
    QTest::newRow("another element") << "other";
    QTest::newRow("no element") << "";
}

void tst_TorkXml_ParseStates::baseDefaults()
{
    QFETCH(QString, name);
    TorkXml_ParseManager_Base manager;
    TorkXml_ParseState_Base state("item", &manager);

    QVERIFY(!state.CanHandleElement(name));
    QVERIFY(state.GetNextState(name) == nullptr);
    QVERIFY(!state.ProcessContent(name, "text"));
    QVERIFY(!state.ProcessContent(name, ""));
    QVERIFY(!state.EndElement(name));
}

void tst_TorkXml_ParseStates::flushAcceptsContent_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("content");

    QTest::newRow("text") << "item"
                          << "text";
    QTest::newRow("attribute") << "xlink:href"
                               << "http://localhost/";
    QTest::newRow("white space") << "item"
                                 << " \n\t";
    QTest::newRow("nothing") << ""
                             << "";
    QTest::newRow("1 MB") << "item" << QString(1 << 20, 'x');
}

void tst_TorkXml_ParseStates::flushAcceptsContent()
{
    QFETCH(QString, name);
    QFETCH(QString, content);
    TorkXml_ParseManager_Base manager;
    TorkXml_FlushUnknownElement state("item", &manager);

    QVERIFY(state.ProcessContent(name, content));
}

void tst_TorkXml_ParseStates::flushHandlesNothingInPlace()
{
    TorkXml_FlushUnknownElement state("item", nullptr);

    QVERIFY(!state.CanHandleElement("other"));
    QVERIFY(!state.CanHandleElement("item"));
    QVERIFY(!state.CanHandleElement(""));
}

void tst_TorkXml_ParseStates::flushMakesFlushStates_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("another element") << "child";
    QTest::newRow("element of the same name") << "item";
    QTest::newRow("no name") << "";
}

void tst_TorkXml_ParseStates::flushMakesFlushStates()
{
    QFETCH(QString, name);
    TorkXml_ParseManager_Base manager;
    TorkXml_FlushUnknownElement state("item", &manager);

    const StatePointer next(state.GetNextState(name));
    const StatePointer further(state.GetNextState(name));

    QVERIFY(next && further);
    QVERIFY(next != further);
    TorkXml_ParseState_Base& made = *next;
    QVERIFY(typeid(made) == typeid(TorkXml_FlushUnknownElement));
    QVERIFY(made.IsElement(name));
    QCOMPARE(made.ParseManager(), &manager);
    QVERIFY(manager.LastState() == nullptr); // created, not pushed
}

void tst_TorkXml_ParseStates::flushKeepsTheBasesEnd()
{
    TorkXml_FlushUnknownElement state("item", nullptr);

    QVERIFY(!state.EndElement("item"));
}

void tst_TorkXml_ParseStates::currentElementFollowsTheManager()
{
    TorkXml_ParseManager_Base manager;
    TorkXml_ParseState_Base state("item", &manager);
    QString const& current = state.CurrentElement();
    QCOMPARE(current, QString());

    manager.PushElement("a");
    QCOMPARE(state.CurrentElement(), QString("a"));
    manager.PushElement("b");
    QCOMPARE(state.CurrentElement(), QString("b"));
    QCOMPARE(current, QString("b")); // the reference handed out at first
    manager.PopElement();
    QCOMPARE(state.CurrentElement(), QString("a"));
    manager.PopElement();
    QCOMPARE(state.CurrentElement(), QString());
}

void tst_TorkXml_ParseStates::skipping_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QStringList>("content");

    QTest::newRow("empty element") << "<root><skip/></root>" << QStringList{};
    QTest::newRow("text") << "<root><skip>text</skip></root>" << QStringList{};
    QTest::newRow("attributes") << "<root><skip a='1' href='2'/></root>" << QStringList{};
    QTest::newRow("section") << "<root><skip><![CDATA[<known>]]></skip></root>" << QStringList{};
    QTest::newRow("entities") << "<root><skip>&amp;&#65;</skip></root>" << QStringList{};
    QTest::newRow("comments and instructions")
        << "<root><skip><!-- c --><?go on?></skip></root>" << QStringList{};
    QTest::newRow("nested elements")
        << "<root><skip>a<x>b<y z='1'>c</y>d</x>e</skip></root>" << QStringList{};
    QTest::newRow("known element inside is skipped too")
        << "<root><skip><known>no</known></skip></root>" << QStringList{};
    QTest::newRow("element of the same name inside")
        << "<root><skip>a<skip>b</skip>c</skip><known>yes</known></root>"
        << QStringList{"known=yes"};
    QTest::newRow("same name at every level")
        << "<root><skip><x><skip><x><skip/></x></skip></x></skip>text</root>"
        << QStringList{"root=text"};
    QTest::newRow("skipped element of the root's name")
        << "<root><r2><root>no</root></r2>text</root>" << QStringList{"root=text"};
    QTest::newRow("ends exactly with its element")
        << "<root>a<skip>b</skip>c</root>" << QStringList{"root=a", "root=c"};
    QTest::newRow("several side by side")
        << "<root><s1/>a<s2>b</s2>c<s1>d</s1>e</root>" << QStringList{"root=a", "root=c", "root=e"};
    QTest::newRow("inside a known element")
        << "<root><known>a<skip>b<known>c</known></skip>d</known>e</root>"
        << QStringList{"known=a", "known=d", "root=e"};
}

void tst_TorkXml_ParseStates::skipping()
{
    QFETCH(QString, document);
    QFETCH(QStringList, content);

    SkippingReader manager;
    QVERIFY(Parse(manager, document));
    QCOMPARE(manager.content, content);
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(!manager.PopElement());

    QString report;
    manager.FormatErrors(report);
    QCOMPARE(report, QString("Failed to parse the XML content:\n"));
}

void tst_TorkXml_ParseStates::baseStateOnItsOwn_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<bool>("expected");

    QTest::newRow("empty element passes") << "<root/>" << true;
    QTest::newRow("attributes pass, though refused") << "<root a='1' b='2'/>" << true;
    QTest::newRow("text stops") << "<root>text</root>" << false;
    QTest::newRow("white space stops") << "<root>\n</root>" << false;
    QTest::newRow("child stops") << "<root><a/></root>" << false;
}

void tst_TorkXml_ParseStates::baseStateOnItsOwn()
{
    QFETCH(QString, document);
    QFETCH(bool, expected);

    ReaderOfOneState manager;
    QCOMPARE(Parse(manager, document), expected);
}

void tst_TorkXml_ParseStates::slotsStandInOrder()
{
    // The virtual destructor takes the first two slots.
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseState_Base::IsElement)), 2);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseState_Base::CanHandleElement)), 3);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseState_Base::GetNextState)), 4);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseState_Base::ProcessContent)), 5);
    QCOMPARE(int(VirtualSlot(&TorkXml_ParseState_Base::EndElement)), 6);

    QCOMPARE(int(VirtualSlot(&TorkXml_FlushUnknownElement::CanHandleElement)), 3);
    QCOMPARE(int(VirtualSlot(&TorkXml_FlushUnknownElement::GetNextState)), 4);
    QCOMPARE(int(VirtualSlot(&TorkXml_FlushUnknownElement::ProcessContent)), 5);
}

QTEST_GUILESS_MAIN(tst_TorkXml_ParseStates)
#include "tst_TorkXml_ParseStates.moc"
