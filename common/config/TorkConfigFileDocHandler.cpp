// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileDocHandler.h"

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkEmptyText_p.h"

namespace {

// The reader fills the same text again for the next element. Sharing it would make the reader
// allocate a new one, with room to grow, for each key and value. For the goal "load, against
// QSettings" in docs/performance.md; tests/plain/tst_PlainLoad.cpp compares the loaded values.
QString Unshared(QString const& text)
{
    return text.isNull() ? text : QString(text.constData(), text.length());
}

} // namespace

TorkConfigFileDocHandler::TorkConfigFileDocHandler() : TorkConfigFileDocHandler(nullptr) {}

TorkConfigFileDocHandler::TorkConfigFileDocHandler(TorkConfigFile* file)
    : m_file(file), m_lastOpenedElement(TorkEmptyText()), m_content(TorkEmptyText()),
      m_lastClosedElement(TorkEmptyText())
{}

TorkConfigFileDocHandler::~TorkConfigFileDocHandler() = default;

bool TorkConfigFileDocHandler::startDocument()
{
    return true;
}

bool TorkConfigFileDocHandler::endDocument()
{
    return true;
}

bool TorkConfigFileDocHandler::startPrefixMapping(QString const&, QString const&)
{
    return true;
}

bool TorkConfigFileDocHandler::endPrefixMapping(QString const&)
{
    return true;
}

bool TorkConfigFileDocHandler::startElement(QString const&, QString const& localName,
                                            QString const&, QXmlAttributes const&)
{
    m_lastOpenedElement = Unshared(localName);
    m_state = Opened;
    ++m_depth;
    if (m_file)
        m_file->StartElement(m_lastOpenedElement);
    return true;
}

bool TorkConfigFileDocHandler::endElement(QString const&, QString const& localName, QString const&)
{
    m_lastClosedElement = Unshared(localName);
    m_state = Closed;
    --m_depth;
    if (m_file)
        m_file->EndElement(m_lastClosedElement);
    return true;
}

bool TorkConfigFileDocHandler::characters(QString const& text)
{
    if (m_state != Opened)
        return true;

    m_content = Unshared(text);
    m_state = ContentTaken;
    if (m_file)
        m_file->ProcessContent(m_content);
    return true;
}

bool TorkConfigFileDocHandler::ignorableWhitespace(QString const& text)
{
    m_ignorableWhitespaceCount += text.length();
    return true;
}

QString& TorkConfigFileDocHandler::lastOpenedElement()
{
    return m_lastOpenedElement;
}
