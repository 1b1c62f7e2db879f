// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlGuard.h"

#include "common/xml/TorkXmlDepth.h"

#include <QXmlSimpleReader>

#include <algorithm>

namespace {

// What the reader lets an entity grow to that is made of others.
constexpr int NestedEntity = 65536;

} // namespace

TorkXmlGuard::TorkXmlGuard(QIODevice* device) : QXmlInputSource(device) {}

TorkXmlGuard::~TorkXmlGuard() = default;

void TorkXmlGuard::Watch(QXmlSimpleReader& reader)
{
    reader.setLexicalHandler(this);
    reader.setDeclHandler(this);
}

QChar TorkXmlGuard::next()
{
    if (m_next == m_end)
        return fetchNext();

    const QChar character = *m_next++;
    if (m_inDocumentType || m_longestEntity > 0)
        return checked(character);
    // As a character of the text it would be taken for a sign of the source's.
    return character == QChar(EndOfData) ? QChar(EndOfDocument) : character;
}

// Tells once that what was fetched is used up, for a reader that wants to come back later, and
// fetches more when it is asked again.
QChar TorkXmlGuard::fetchNext()
{
    m_toldEndOfData = !m_toldEndOfData;
    if (m_toldEndOfData)
        return QChar(EndOfData);

    fetchData();
    m_fetched = data();
    m_next = m_fetched.constData();
    m_end = m_next + m_fetched.length();
    return m_next == m_end ? QChar(EndOfDocument) : next();
}

QChar TorkXmlGuard::checked(QChar character)
{
    m_refused = m_refused || nestsTooDeep(character) || expandsTooFar(character);
    return m_refused || character == QChar(EndOfData) ? QChar(EndOfDocument) : character;
}

// Groups do not reach from one declaration into another, and text is full of harmless brackets.
bool TorkXmlGuard::nestsTooDeep(QChar character)
{
    if (!m_inDocumentType)
        return false;
    if (character == QLatin1Char('('))
        ++m_openGroups;
    else if (character == QLatin1Char(')'))
        --m_openGroups;
    else if (character == QLatin1Char('<') || character == QLatin1Char('>'))
        m_openGroups = 0;
    return m_openGroups > TorkXmlMaximumDepth;
}

// Counts each reference as if it were one to the longest entity: far from exact, but no real file
// comes near.
bool TorkXmlGuard::expandsTooFar(QChar character)
{
    if (character == QLatin1Char('&') || character == QLatin1Char('%'))
        m_expansion += m_longestEntity;
    return m_expansion > TorkXmlMaximumExpansion;
}

bool TorkXmlGuard::startDTD(QString const&, QString const&, QString const&)
{
    m_inDocumentType = true;
    return true;
}

bool TorkXmlGuard::endDTD()
{
    m_inDocumentType = false;
    return true;
}

bool TorkXmlGuard::internalEntityDecl(QString const& name, QString const& value)
{
    // One that names others stands for as much as the reader lets it grow to.
    const bool namesOthers = value.contains(QLatin1Char('&'));
    m_longestEntity =
        std::max<qint64>({m_longestEntity, value.length(), namesOthers ? NestedEntity : 0});

    // What a parameter entity stands for reaches the reader past next(), as often as it is named.
    const bool mayNest = name.startsWith(QLatin1Char('%')) && value.contains(QLatin1Char('('));
    return !mayNest && ++m_entities <= TorkXmlMaximumEntities;
}
