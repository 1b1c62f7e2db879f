// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/xml/TorkXml_ParseState_Base.h"

#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

/// States and managers that follow the script of a test.
namespace ScriptedStates {

const QString ReportHeader("Failed to parse the XML content:\n");

/// The behavior of a document's states; each rule names the place where it applies.
struct Script
{
    QStringList inPlace;  // "parent>child": the parent's state handles the child itself
    QStringList unknown;  // "parent>child", or ">root": there is no state for it
    QStringList refused;  // "name=content": the content is refused
    QStringList renamed;  // "element=name": the element's state has another name
    QStringList reported; // "name=content": the content is accepted, with an error appended
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

inline int ScriptedState::alive = 0;

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

inline bool Parse(TorkXml_ParseManager_Base& manager, QString const& document)
{
    QXmlInputSource source;
    source.setData(document);
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    return reader.parse(source);
}

inline QString Report(TorkXml_ParseManager_Base& manager)
{
    QString report("left over");
    manager.FormatErrors(report);
    return report;
}

/// Pops all names left on the element stack, innermost first, and returns them.
inline QStringList OpenElements(TorkXml_ParseManager_Base& manager)
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

} // namespace ScriptedStates
