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

// The toolkit's own calls this one again where it has to fetch more: that is still one character.
QChar TorkXmlGuard::next()
{
    const bool isWatching = m_inDocumentType || m_longestEntity > 0;
    if (!isWatching || m_fetching)
        return QXmlInputSource::next();

    m_fetching = true;
    const QChar character = QXmlInputSource::next();
    m_fetching = false;
    m_refused = m_refused || nestsTooDeep(character) || expandsTooFar(character);
    return m_refused ? QChar(QXmlInputSource::EndOfDocument) : character;
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
