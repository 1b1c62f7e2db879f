// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/log/TorkEmptyText_p.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlLimits.h"
#include "common/xml/TorkXmlPrefixes_p.h"
#include "common/xml/TorkXmlResult.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QDebug>

TorkXml_ParseManager_Base::TorkXml_ParseManager_Base() : m_currentElement(TorkEmptyText()) {}

TorkXml_ParseManager_Base::~TorkXml_ParseManager_Base()
{
    while (!m_states.isEmpty())
        delete PopState();
}

bool TorkXml_ParseManager_Base::startDocument()
{
    return true;
}

bool TorkXml_ParseManager_Base::endDocument()
{
    return true;
}

bool TorkXml_ParseManager_Base::startPrefixMapping(QString const& prefix, QString const&)
{
    addPrefix(prefix);
    return true;
}

// The reader reports each prefix that is no longer in force, declared or not, but not one that an
// outer element still declares.
bool TorkXml_ParseManager_Base::endPrefixMapping(QString const& prefix)
{
    removePrefix(prefix);
    return true;
}

bool TorkXml_ParseManager_Base::addPrefix(QString const& prefix)
{
    if (prefix.isEmpty() || m_prefixes.contains(prefix))
        return false;
    m_prefixes.insert(prefix);
    m_prefixWeight += TorkXmlPrefixes::Weight(prefix);
    return true;
}

void TorkXml_ParseManager_Base::removePrefix(QString const& prefix)
{
    if (m_prefixes.remove(prefix))
        m_prefixWeight -= TorkXmlPrefixes::Weight(prefix);
}

// The reader need not report the end of a prefix that was not declared, so endElement() ends it.
void TorkXml_ParseManager_Base::usePrefix(QString const& prefix)
{
    if (addPrefix(prefix))
        m_usedPrefixes.append({prefix, int(m_elements.size())});
}

// A parse through a TorkXmlGuard ends before it comes to this.
bool TorkXml_ParseManager_Base::isWithinLimits(QString const& qName,
                                               QXmlAttributes const& attributes)
{
    usePrefix(TorkXmlPrefixes::OfName(qName, false));
    for (int i = 0; i < attributes.count(); ++i)
        usePrefix(TorkXmlPrefixes::OfName(attributes.qName(i), true));

    m_prefixComparisons += TorkXmlPrefixes::Comparisons(m_prefixWeight);
    if (m_elements.size() > TorkXmlMaximumDepth)
        AppendError(TorkXmlPrefixes::TooDeep(TorkXmlMaximumDepth));
    else if (m_prefixWeight > TorkXmlMaximumPrefixes)
        AppendError(TorkXmlPrefixes::TooMany(TorkXmlMaximumPrefixes));
    else if (m_prefixComparisons > TorkXmlMaximumPrefixComparisons)
        AppendError(TorkXmlPrefixes::TooManyComparisons(TorkXmlMaximumPrefixComparisons));
    else
        return true;
    return false;
}

bool TorkXml_ParseManager_Base::startElement(QString const&, QString const& localName,
                                             QString const& qName, QXmlAttributes const& attributes)
{
    PushElement(localName);
    if (!isWithinLimits(qName, attributes))
        return false;

    if (m_states.isEmpty()) {
        TorkXml_ParseState_Base* first = GetFirstState(localName);
        if (first)
            return enter(first, attributes);
        AppendError(QStringLiteral("No initial parse state for element \"%1\".").arg(localName),
                    TorkXmlResult::NoParseState);
        return false;
    }

    TorkXml_ParseState_Base* parent = LastState();
    if (parent && parent->CanHandleElement(localName))
        return true;

    TorkXml_ParseState_Base* next = GetNextState(localName);
    if (next)
        return enter(next, attributes);
    AppendError(QStringLiteral("Unknown element \"%1\". Parse state element \"%2\".")
                    .arg(localName, parent ? parent->ElementName() : QString()),
                TorkXmlResult::NoParseState);
    return false;
}

bool TorkXml_ParseManager_Base::enter(TorkXml_ParseState_Base* state,
                                      QXmlAttributes const& attributes)
{
    PushState(state);
    for (int i = 0; i < attributes.count(); ++i) {
        const QString name = attributes.localName(i);
        const bool isLink = name == QLatin1String("href");
        state->ProcessContent(isLink ? QStringLiteral("xlink:href") : name, attributes.value(i));
    }
    return true;
}

bool TorkXml_ParseManager_Base::endElement(QString const&, QString const& localName, QString const&)
{
    TorkXml_ParseState_Base* state = LastState();
    if (state && state->IsElement(localName)) {
        state->EndElement(localName);
        // It may have pushed others above itself. If it took itself off, it has another owner.
        const int place = m_states.lastIndexOf(state);
        if (place >= 0)
            delete m_states.takeAt(place);
    }
    while (!m_usedPrefixes.isEmpty() && m_usedPrefixes.last().depth >= m_elements.size())
        removePrefix(m_usedPrefixes.takeLast().prefix);
    PopElement();
    return true;
}

bool TorkXml_ParseManager_Base::characters(QString const& text)
{
    TorkXml_ParseState_Base* state = LastState();
    return state && state->ProcessContent(m_currentElement, text);
}

bool TorkXml_ParseManager_Base::ignorableWhitespace(QString const&)
{
    return true;
}

TorkXml_ParseState_Base* TorkXml_ParseManager_Base::GetFirstState(QString const&)
{
    return nullptr;
}

TorkXml_ParseState_Base* TorkXml_ParseManager_Base::GetNextState(QString const& name)
{
    TorkXml_ParseState_Base* state = LastState();
    return state ? state->GetNextState(name) : nullptr;
}

bool TorkXml_ParseManager_Base::PushElement(QString const& name)
{
    m_elements.append(name);
    m_currentElement = name;
    return true;
}

bool TorkXml_ParseManager_Base::PopElement()
{
    if (m_elements.isEmpty())
        return false;

    m_elements.removeLast();
    m_currentElement = m_elements.isEmpty() ? TorkEmptyText() : m_elements.last();
    return true;
}

bool TorkXml_ParseManager_Base::PushState(TorkXml_ParseState_Base* state)
{
    m_states.append(state);
    return true;
}

TorkXml_ParseState_Base* TorkXml_ParseManager_Base::PopState()
{
    return m_states.isEmpty() ? nullptr : m_states.takeLast();
}

TorkXml_ParseState_Base* TorkXml_ParseManager_Base::LastState() const
{
    return m_states.isEmpty() ? nullptr : m_states.last();
}

void TorkXml_ParseManager_Base::AppendError(QString const& text)
{
    m_errors.append(text);
    if (TorkLog::m_gLog)
        qWarning() << text;
}

void TorkXml_ParseManager_Base::AppendError(QString const& text, int code)
{
    AppendError(QStringLiteral("Error: %1 %2").arg(QString::number(code), text));
}

void TorkXml_ParseManager_Base::AppendError(QString const& element, QString const& content,
                                            int code)
{
    AppendError(QStringLiteral("Error: %1 on Element: %2\nContent: %3")
                    .arg(QString::number(code), element, content));
}

void TorkXml_ParseManager_Base::FormatErrors(QString& report) const
{
    report = QStringLiteral("Failed to parse the XML content:\n");
    for (QString const& error : m_errors)
        report += error + QLatin1Char('\n');
}
