// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileDocHandler.h"

#include "common/config/TorkConfigFile.h"

#include <algorithm>

namespace {

// Takes a text of the reader's over without sharing its memory. The reader fills the same few texts
// again and again, and where somebody shares one of them it makes a new one, with room to grow.
void TakeOver(QString& text, QString const& read)
{
    const int length = read.length();
    if (read.isNull()) {
        text = read;
    } else if (text.isDetached() && text.capacity() >= length) {
        text.resize(length);
        std::copy_n(read.constData(), length, text.data());
    } else {
        text = QString(read.constData(), length);
    }
}

} // namespace

TorkConfigFileDocHandler::TorkConfigFileDocHandler() : TorkConfigFileDocHandler(nullptr) {}

TorkConfigFileDocHandler::TorkConfigFileDocHandler(TorkConfigFile* file)
    : m_file(file), m_lastOpenedElement(QLatin1String("")), m_content(QLatin1String("")),
      m_lastClosedElement(QLatin1String(""))
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
    TakeOver(m_lastOpenedElement, localName);
    m_state = Opened;
    ++m_depth;
    if (m_file)
        m_file->StartElement(m_lastOpenedElement);
    return true;
}

bool TorkConfigFileDocHandler::endElement(QString const&, QString const& localName, QString const&)
{
    TakeOver(m_lastClosedElement, localName);
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

    TakeOver(m_content, text);
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
