// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the parse manager with a plain model, two lists of names, through random programs: the
// reader's callbacks in any order, states that push and pop, errors, and whole documents.

#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"
#include "plain/Program.h"

#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <memory>

class tst_PlainParse : public QObject
{
    Q_OBJECT

private slots:
    void programs();
    void documents();
};

namespace {

// What a state does depends on names alone: a state "unknowing" knows no child, every state handles
// a child "inplace" itself, gives "other" to a state with another name, and skips a child
// "skipped". At its end, "pushes" pushes another state, and "leaves" takes itself off the stack.
class State : public TorkXml_ParseState_Base
{
public:
    State(QString const& name, TorkXml_ParseManager_Base* manager, QStringList& events)
        : TorkXml_ParseState_Base(name, manager), m_events(events)
    {}
    ~State() override { m_events << "~" + ElementName(); }
    Q_DISABLE_COPY(State)

    bool CanHandleElement(QString const& name) override
    {
        m_events << ElementName() + " can " + name;
        return name == "inplace";
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        m_events << ElementName() + " next " + name;
        if (ElementName() == "unknowing")
            return nullptr;
        if (name == "skipped")
            return new TorkXml_FlushUnknownElement(name, ParseManager());
        return new State(name == "other" ? "renamed" : name, ParseManager(), m_events);
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        m_events << ElementName() + " gets " + name + "=" + content + " in " + CurrentElement();
        return content != "refused";
    }

    bool EndElement(QString const& name) override
    {
        m_events << ElementName() + " ends " + name;
        if (name == "pushes")
            ParseManager()->PushState(new State("pushed", ParseManager(), m_events));
        else if (name == "leaves")
            ParseManager()->PopState();
        return false;
    }

private:
    QStringList& m_events;
};

class Manager : public TorkXml_ParseManager_Base
{
public:
    explicit Manager(QStringList& events) : m_events(events) {}

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        m_events << "first " + name;
        return name == "unknowing" ? nullptr : new State(name, this, m_events);
    }

private:
    QStringList& m_events;
};

using Attributes = QVector<QPair<QString, QString>>;

class PlainManager
{
public:
    struct PlainState
    {
        QString name;
        bool skips;
    };

    QStringList elements;
    QVector<PlainState> states;
    QStringList errors;
    QStringList events;

    QString current() const { return elements.isEmpty() ? QString("") : elements.last(); }

    bool start(QString const& name, Attributes const& attributes)
    {
        elements.append(name);
        if (states.isEmpty()) {
            events << "first " + name;
            if (name != "unknowing")
                return enter({name, false}, attributes);
            errors << "Error: 1016 No initial parse state for element \"" + name + "\".";
            return false;
        }
        const PlainState parent = states.last();
        if (parent.skips)
            return enter({name, true}, attributes);
        events << parent.name + " can " + name;
        if (name == "inplace")
            return true;
        events << parent.name + " next " + name;
        if (parent.name == "unknowing") {
            errors << "Error: 1016 Unknown element \"" + name + "\". Parse state element \"" +
                          parent.name + "\".";
            return false;
        }
        return enter({name == "other" ? "renamed" : name, name == "skipped"}, attributes);
    }

    bool text(QString const& content)
    {
        return !states.isEmpty() && give(states.last(), current(), content);
    }

    void end(QString const& name)
    {
        if (!states.isEmpty() && states.last().name == name) {
            const int place = states.size() - 1;
            const PlainState state = states.last();
            if (!state.skips)
                events << name + " ends " + name;
            if (!state.skips && name == "leaves") {
                states.removeLast(); // without a destructor
            } else {
                if (!state.skips && name == "pushes")
                    states.append({"pushed", false});
                remove(place);
            }
        }
        pop();
    }

    bool pop()
    {
        if (elements.isEmpty())
            return false;
        elements.removeLast();
        return true;
    }

    void remove(int place)
    {
        if (!states[place].skips)
            events << "~" + states[place].name;
        states.remove(place);
    }

    QString report() const
    {
        QString result = "Failed to parse the XML content:\n";
        for (QString const& error : errors)
            result += error + "\n";
        return result;
    }

private:
    bool enter(PlainState const& state, Attributes const& attributes)
    {
        states.append(state);
        for (auto const& attribute : attributes)
            give(state, attribute.first == "href" ? "xlink:href" : attribute.first,
                 attribute.second);
        return true;
    }

    bool give(PlainState const& state, QString const& name, QString const& content)
    {
        if (!state.skips)
            events << state.name + " gets " + name + "=" + content + " in " + current();
        return state.skips || content != "refused";
    }
};

class Managers : public Program::Pair
{
public:
    ~Managers() { qDeleteAll(m_popped); }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(24);
        if (kind < 8)
            start();
        else if (kind < 13)
            end();
        else if (kind < 17)
            text();
        else if (kind < 19)
            element();
        else if (kind < 22)
            state();
        else
            error();
        same("events", m_events, m_plain.events);
        m_events.clear();
        m_plain.events.clear();
        same("CurrentElement()", m_manager->CurrentElement(), m_plain.current());
        TorkXml_ParseState_Base const* last = m_manager->LastState();
        same("has a state", last != nullptr, !m_plain.states.isEmpty());
        if (last && !m_plain.states.isEmpty())
            same("LastState()", last->ElementName(), m_plain.states.last().name);
    }

    void finish()
    {
        QString report("before");
        m_manager->FormatErrors(report);
        same("FormatErrors()", report, m_plain.report());
        m_manager.reset();
        while (!m_plain.states.isEmpty())
            m_plain.remove(m_plain.states.size() - 1);
        same("deleted", m_events, m_plain.events);
    }

protected:
    QString name()
    {
        static char const* const names[] = {"a",       "b",         "a",       "b",
                                            "inplace", "unknowing", "skipped", "other",
                                            "pushes",  "leaves",    "renamed"};
        return m_draws->oneOf(names);
    }

    QString content()
    {
        static char const* const contents[] = {"x", "", " ", "refused", "%1 %2"};
        return m_draws->once(3) ? m_draws->oneOf(contents) : "y";
    }

    Attributes attributes()
    {
        static char const* const names[] = {"id", "href", "hrefs", "a"};
        Attributes result;
        const int count = m_draws->once(3) ? m_draws->below(4) : 0;
        const int first = m_draws->below(4);
        for (int i = 0; i < count; ++i)
            result.append({names[(first + i) % 4], content()});
        return result;
    }

    QStringList m_events;
    PlainManager m_plain;

private:
    void start()
    {
        const QString element = name();
        const Attributes chosen = attributes();
        QXmlAttributes given;
        QStringList told;
        for (auto const& attribute : chosen) {
            given.append("p:" + attribute.first, "urn:p", attribute.first, attribute.second);
            told.append(attribute.first + "=" + attribute.second);
        }
        tell("startElement(#, #)", element, told);
        same("startElement()", m_manager->startElement("uri", element, "q:" + element, given),
             m_plain.start(element, chosen));
    }

    void end()
    {
        const QString element = m_draws->once(4) ? name() : m_plain.current();
        tell("endElement(#)", element);
        // A state that leaves belongs to the program.
        TorkXml_ParseState_Base* last = m_manager->LastState();
        const bool leaves = last && element == "leaves" && last->ElementName() == element &&
                            !m_plain.states.isEmpty() && !m_plain.states.last().skips;
        if (leaves)
            m_popped.append(last);
        same("endElement()", m_manager->endElement("uri", element, element), true);
        m_plain.end(element);
    }

    void text()
    {
        const QString characters = content();
        tell("characters(#)", characters);
        same("characters()", m_manager->characters(characters), m_plain.text(characters));
        same("ignorableWhitespace()", m_manager->ignorableWhitespace(characters), true);
    }

    void element()
    {
        const QString element = name();
        if (m_draws->once(2)) {
            tell("PopElement()");
            same("PopElement()", m_manager->PopElement(), m_plain.pop());
        } else {
            tell("PushElement(#)", element);
            same("PushElement()", m_manager->PushElement(element), true);
            m_plain.elements.append(element);
        }
    }

    void state()
    {
        const QString element = name();
        if (m_draws->once(2)) {
            tell("delete PopState()");
            TorkXml_ParseState_Base* popped = m_manager->PopState();
            same("PopState()", popped != nullptr, !m_plain.states.isEmpty());
            delete popped;
            if (!m_plain.states.isEmpty())
                m_plain.remove(m_plain.states.size() - 1);
        } else {
            tell("PushState(new State(#))", element);
            same("PushState()", m_manager->PushState(new State(element, m_manager.get(), m_events)),
                 true);
            m_plain.states.append({element, false});
        }
    }

    void error()
    {
        static char const* const texts[] = {"no", "", "%1", "a\nb"};
        const QString text = m_draws->oneOf(texts);
        const QString second = m_draws->oneOf(texts);
        const int code = m_draws->below(3) * 1000 - 1;
        switch (m_draws->below(4)) {
        case 0:
            tell("AppendError(#)", text);
            m_manager->AppendError(text);
            m_plain.errors << text;
            break;
        case 1:
            tell("AppendError(#, #)", text, code);
            m_manager->AppendError(text, code);
            m_plain.errors << "Error: " + QString::number(code) + " " + text;
            break;
        case 2:
            tell("AppendError(#, #, #)", text, second, code);
            m_manager->AppendError(text, second, code);
            m_plain.errors << "Error: " + QString::number(code) + " on Element: " + text +
                                  "\nContent: " + second;
            break;
        default: {
            tell("FormatErrors(report)");
            QString report("before");
            m_manager->FormatErrors(report);
            same("report", report, m_plain.report());
        }
        }
    }

    std::unique_ptr<Manager> m_manager = std::make_unique<Manager>(m_events);
    QVector<TorkXml_ParseState_Base*> m_popped;
};

// A document as a tree, which the plain model walks down.
class Documents : public Managers
{
public:
    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(8);
        if (kind < 3 && m_open.size() < 30) {
            auto child = std::make_shared<Node>();
            do
                child->name = name();
            while (child->name == "leaves"); // nobody would own it then
            child->attributes = attributes();
            tell("open #", child->name);
            m_open.last()->children.append(child);
            m_open.append(child);
        } else if (kind < 5 && m_open.size() > 1) {
            tell("close");
            m_open.removeLast();
        } else if (m_open.size() > 1) {
            auto child = std::make_shared<Node>();
            child->text = draws.once(12) ? "refused" : draws.once(2) ? " \n" : "text";
            const bool isAfterText = !m_open.last()->children.isEmpty() &&
                                     m_open.last()->children.last()->name.isEmpty();
            if (isAfterText)
                return;
            tell("text #", child->text);
            m_open.last()->children.append(child);
        }
    }

    void finish()
    {
        if (m_open.first()->children.isEmpty())
            return;
        const Node& root = *m_open.first()->children.first();
        QXmlInputSource source;
        source.setData(document(root));
        {
            Manager manager(m_events);
            QXmlSimpleReader reader;
            reader.setContentHandler(&manager);
            same("parsed", reader.parse(source), walk(root));
            QString report;
            manager.FormatErrors(report);
            same("report", report, m_plain.report());
        }
        while (!m_plain.states.isEmpty())
            m_plain.remove(m_plain.states.size() - 1);
        same("events", m_events, m_plain.events);
    }

private:
    struct Node
    {
        QString name; // empty: a text
        QString text;
        Attributes attributes;
        QVector<std::shared_ptr<Node>> children;
    };

    static QString document(Node const& node)
    {
        if (node.name.isEmpty())
            return node.text;
        QString result = "<" + node.name;
        for (auto const& attribute : node.attributes)
            result += " " + attribute.first + "='" + attribute.second + "'";
        result += ">";
        for (auto const& child : node.children)
            result += document(*child);
        return result + "</" + node.name + ">";
    }

    bool walk(Node const& node)
    {
        if (node.name.isEmpty())
            return m_plain.text(node.text);
        if (!m_plain.start(node.name, node.attributes))
            return false;
        for (auto const& child : node.children) {
            if (!walk(*child))
                return false;
        }
        m_plain.end(node.name);
        return true;
    }

    QVector<std::shared_ptr<Node>> m_open{std::make_shared<Node>()};
};

} // namespace

void tst_PlainParse::programs()
{
    Program::compare<Managers>("parse manager", Rounds::count(100000, 1000000, 10000000), 50);
}

void tst_PlainParse::documents()
{
    Program::compare<Documents>("parsed documents", Rounds::count(100000, 1000000, 10000000), 100);
}

QTEST_APPLESS_MAIN(tst_PlainParse)
#include "tst_PlainParse.moc"
