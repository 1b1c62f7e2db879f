// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlLexer_p.h"

#include "common/xml/TorkXmlPrefixes_p.h"

#include <algorithm>

namespace {

bool IsSpace(QChar character)
{
    const ushort unit = character.unicode();
    return unit == ' ' || unit == '\n' || unit == '\t' || unit == '\r';
}

bool IsQuote(QChar character)
{
    return character == QLatin1Char('"') || character == QLatin1Char('\'');
}

bool IsPredefined(QString const& name)
{
    return name == QLatin1String("amp") || name == QLatin1String("lt") ||
           name == QLatin1String("gt") || name == QLatin1String("apos") ||
           name == QLatin1String("quot");
}

// The character of a reference "#65" or "#x41": the lower 16 bits, as in the reader.
QChar CharacterOf(QString const& reference)
{
    const bool isHex = reference.startsWith(QLatin1String("#x"));
    const uint code = isHex ? reference.mid(2).toUInt(nullptr, 16) : reference.mid(1).toUInt();
    return QChar(static_cast<ushort>(code));
}

// A text in quotes must not end at a quote in the text of an entity.
QString WithoutQuotes(QString text)
{
    return text.replace(QLatin1Char('"'), QLatin1String("&quot;"))
        .replace(QLatin1Char('\''), QLatin1String("&apos;"));
}

} // namespace

bool TorkXmlLexer::read(QChar character)
{
    take(character);
    while (!m_texts.isEmpty()) {
        Text& top = m_texts.last();
        if (top.position == top.text.length()) {
            m_texts.removeLast();
            continue;
        }
        const QChar next = top.text.at(top.position++);
        const bool inReference = m_state == State::Reference;
        take(next);
        if (!inReference && m_state != State::Reference)
            standsFor(1);
    }
    return m_reason.isEmpty();
}

// Nearly every character of a document is of one of the first kinds.
void TorkXmlLexer::take(QChar character)
{
    switch (m_state) {
    case State::Content:
        if (character == QLatin1Char('<'))
            m_state = State::Less;
        else if (character == QLatin1Char('&'))
            openReference(character, State::Content);
        break;
    case State::EndTag:
        if (character == QLatin1Char('>'))
            endElement();
        break;
    case State::TagName:
    case State::InTag:
    case State::AttributeName:
    case State::BeforeValue:
    case State::AttributeValue:
        takeTag(character);
        break;
    case State::EntityKeyword:
    case State::BeforeEntityName:
    case State::EntityName:
    case State::BeforeEntityValue:
    case State::EntityValue:
    case State::ExternalEntity:
        takeEntity(character);
        break;
    case State::DoctypeHead:
    case State::DoctypeTail:
    case State::Subset:
    case State::Declaration:
    case State::AttributeList:
    case State::DefaultValue:
    case State::Literal:
        takeDocumentType(character);
        break;
    case State::Reference:
        if (character == QLatin1Char(';'))
            closeReference();
        else
            m_reference += character;
        break;
    default:
        takeMarkup(character);
    }
}

void TorkXmlLexer::takeMarkup(QChar character)
{
    const bool isEnd = character == QLatin1Char('>');
    switch (m_state) {
    case State::Less:
        afterLess(character);
        break;
    case State::Bang:
        afterBang(character);
        break;
    case State::BangE:
        m_state = character == QLatin1Char('N') ? State::EntityKeyword : State::Declaration;
        break;
    case State::CommentStart: // at its second dash
        m_state = State::Comment;
        break;
    case State::Comment:
        if (isEnd && m_run >= 2)
            m_state = outside();
        m_run = character == QLatin1Char('-') ? m_run + 1 : 0;
        break;
    case State::CData:
        if (isEnd && m_run >= 2)
            m_state = State::Content;
        m_run = character == QLatin1Char(']') ? m_run + 1 : 0;
        break;
    case State::Instruction:
        if (isEnd && m_run >= 1)
            m_state = outside();
        m_run = int(character == QLatin1Char('?'));
        break;
    default:
        break;
    }
}

void TorkXmlLexer::afterLess(QChar character)
{
    if (character == QLatin1Char('/')) {
        m_state = State::EndTag;
    } else if (character == QLatin1Char('!')) {
        m_state = State::Bang;
    } else if (character == QLatin1Char('?')) {
        m_state = State::Instruction;
    } else {
        m_tag.clear();
        m_tag.append(character);
        m_beforeTag = {int(m_prefixes.size()), m_prefixWeight};
        m_state = State::TagName;
    }
}

void TorkXmlLexer::afterBang(QChar character)
{
    m_groups = 0;
    switch (character.unicode()) {
    case '-':
        m_state = State::CommentStart;
        break;
    case '[':
        m_state = State::CData; // "CDATA[" can be read as a part of it
        break;
    case 'D':
        m_state = State::DoctypeHead;
        break;
    case 'E':
        m_state = State::BangE;
        break;
    case 'A':
        m_state = State::AttributeList;
        break;
    default:
        m_state = State::Declaration;
    }
}

void TorkXmlLexer::takeTag(QChar character)
{
    switch (m_state) {
    case State::TagName:
        if (IsSpace(character))
            m_state = State::InTag;
        else if (character == QLatin1Char('>') || character == QLatin1Char('/'))
            openTag(character);
        else
            m_tag.append(character);
        break;
    case State::InTag:
        if (character == QLatin1Char('>') || character == QLatin1Char('/')) {
            openTag(character);
        } else if (!IsSpace(character)) {
            m_name.clear();
            m_name.append(character);
            m_state = State::AttributeName;
        }
        break;
    case State::AttributeName:
        if (character == QLatin1Char('=') || IsSpace(character))
            m_state = State::BeforeValue;
        else
            m_name.append(character);
        break;
    case State::BeforeValue:
        if (IsQuote(character))
            openQuotes(character, State::AttributeValue, State::InTag);
        break;
    default: // in the value of an attribute
        if (character == m_quote) {
            m_state = State::InTag;
            addPrefix(m_name, true);
        } else if (character == QLatin1Char('&')) {
            openReference(character, m_state);
        }
    }
}

// The reader starts an element, and ends one that is empty, before it reads on.
void TorkXmlLexer::openTag(QChar character)
{
    addPrefix(m_tag, false);
    startElement();
    m_state = State::Content;
    if (character == QLatin1Char('/'))
        endElement();
}

void TorkXmlLexer::addPrefix(Name const& name, bool isAttribute)
{
    if (!name.contains(QLatin1Char(':')))
        return;

    const QString prefix =
        TorkXmlPrefixes::OfName(QString(name.constData(), name.size()), isAttribute);
    if (prefix.isEmpty() || m_prefixSet.contains(prefix))
        return;
    m_prefixSet.insert(prefix);
    m_prefixes.append(prefix);
    m_prefixWeight += TorkXmlPrefixes::Weight(prefix);
    if (m_prefixWeight > m_limits.prefixes)
        refuse(TorkXmlPrefixes::TooMany(m_limits.prefixes));
}

void TorkXmlLexer::startElement()
{
    m_elements.append(m_beforeTag);
    if (m_elements.size() > m_limits.depth)
        refuse(TorkXmlPrefixes::TooDeep(m_limits.depth));
    m_prefixComparisons += TorkXmlPrefixes::Comparisons(m_prefixWeight);
    if (m_prefixComparisons > m_limits.prefixComparisons)
        refuse(TorkXmlPrefixes::TooManyComparisons(m_limits.prefixComparisons));
}

void TorkXmlLexer::endElement()
{
    m_state = State::Content;
    if (m_elements.isEmpty())
        return;

    const Element before = m_elements.takeLast();
    while (m_prefixes.size() > before.prefixCount)
        m_prefixSet.remove(m_prefixes.takeLast());
    m_prefixWeight = before.prefixWeight;
}

void TorkXmlLexer::takeDocumentType(QChar character)
{
    switch (m_state) {
    case State::DoctypeHead:
        if (IsQuote(character))
            openQuotes(character, State::Literal, m_state);
        else if (character == QLatin1Char('>'))
            m_state = State::Content;
        else if (character == QLatin1Char('[')) {
            m_inSubset = true;
            m_state = State::Subset;
        }
        break;
    case State::DoctypeTail:
        if (character == QLatin1Char('>')) {
            m_inSubset = false;
            m_state = State::Content;
        }
        break;
    case State::Subset:
        if (character == QLatin1Char('<'))
            m_state = State::Less;
        else if (character == QLatin1Char('%'))
            openReference(character, m_state);
        else if (character == QLatin1Char(']'))
            m_state = State::DoctypeTail;
        break;
    case State::Declaration:
    case State::AttributeList:
        if (IsQuote(character))
            openQuotes(character,
                       m_state == State::AttributeList ? State::DefaultValue : State::Literal,
                       m_state);
        else if (character == QLatin1Char('>'))
            m_state = State::Subset;
        else
            nest(character);
        break;
    default: // in quotes
        if (character == m_quote)
            m_state = m_afterQuotes;
        else if (character == QLatin1Char('&') && m_state == State::DefaultValue)
            openReference(character, m_state);
    }
}

void TorkXmlLexer::openQuotes(QChar character, State state, State after)
{
    m_quote = character;
    m_state = state;
    m_afterQuotes = after;
}

void TorkXmlLexer::nest(QChar character)
{
    if (character == QLatin1Char('('))
        ++m_groups;
    else if (character == QLatin1Char(')'))
        --m_groups;
    if (m_groups > m_limits.groups)
        refuse(QStringLiteral("More than %1 groups are inside each other in a document type.")
                   .arg(m_limits.groups));
}

void TorkXmlLexer::takeEntity(QChar character)
{
    switch (m_state) {
    case State::EntityKeyword:
        if (IsSpace(character)) {
            m_isParameter = false;
            m_state = State::BeforeEntityName;
        }
        break;
    case State::BeforeEntityName:
        if (character == QLatin1Char('%')) {
            m_isParameter = true;
        } else if (!IsSpace(character)) {
            m_name.clear();
            m_name.append(character);
            m_state = State::EntityName;
        }
        break;
    case State::EntityName:
        if (IsSpace(character))
            m_state = State::BeforeEntityValue;
        else
            m_name.append(character);
        break;
    case State::BeforeEntityValue:
        if (IsQuote(character)) {
            m_value.clear();
            openQuotes(character, State::EntityValue, State::Declaration);
        } else if (!IsSpace(character)) {
            m_state = State::ExternalEntity;
        }
        break;
    case State::EntityValue:
        if (character == m_quote) {
            declare(m_isParameter ? Kind::Parameter : Kind::General);
            m_state = State::Declaration;
        } else if (character == QLatin1Char('&') || character == QLatin1Char('%')) {
            openReference(character, m_state);
        } else {
            m_value += character;
        }
        break;
    default: // the address of an external one
        if (IsQuote(character)) {
            openQuotes(character, State::Literal, m_state);
        } else if (character == QLatin1Char('>')) {
            declare(Kind::External);
            m_state = State::Subset;
        }
    }
}

// The first declaration of a name holds, whatever it declares.
void TorkXmlLexer::declare(Kind kind)
{
    const QString name(m_name.constData(), m_name.size());
    if (m_entities.contains(name))
        return;
    m_entities.insert(name, {kind, kind == Kind::External ? QString() : m_value});
    m_generalCount += kind == Kind::General ? 1 : 0;
    m_parameterCount += kind == Kind::Parameter ? 1 : 0;
    if (m_generalCount + m_parameterCount > m_limits.entities)
        refuse(QStringLiteral("More than %1 entities are declared.").arg(m_limits.entities));

    m_entityCharacters += kind == Kind::External ? 0 : name.length() + m_value.length();
    if (m_entityCharacters > m_limits.entityCharacters)
        refuse(QStringLiteral("More than %1 characters of entities are declared.")
                   .arg(m_limits.entityCharacters));
}

void TorkXmlLexer::openReference(QChar character, State after)
{
    m_reference.clear();
    m_isParameterReference = character == QLatin1Char('%');
    m_afterReference = after;
    m_state = State::Reference;
}

// In the value of an entity only characters and parameter entities are put in at once; the other
// references stay as they are until the entity itself is named.
void TorkXmlLexer::closeReference()
{
    m_state = m_afterReference;
    const bool inEntity = m_state == State::EntityValue;
    const bool isCharacter = m_reference.startsWith(QLatin1Char('#'));
    if (m_isParameterReference) {
        replace(Kind::Parameter);
    } else if (inEntity) {
        const QString text = isCharacter
                                 ? QString(CharacterOf(m_reference))
                                 : QString(QLatin1Char('&') + m_reference + QLatin1Char(';'));
        m_value += text;
        if (!m_texts.isEmpty())
            standsFor(text.length());
    } else if (isCharacter || IsPredefined(m_reference)) {
        if (!m_texts.isEmpty())
            standsFor(1);
    } else {
        replace(Kind::General);
    }
}

// Reads the text of the named entity next, if there is one of this kind.
void TorkXmlLexer::replace(Kind kind)
{
    const auto found = m_entities.constFind(m_reference);
    if (found == m_entities.constEnd() || found->kind != kind)
        return;

    QString text = found->value;
    if (m_state == State::Subset) {
        text = QLatin1Char(' ') + text + QLatin1Char(' ');
        m_expansion -= 2;
    } else if (m_state != State::Content) {
        text = WithoutQuotes(text);
    }
    m_texts.append({text, 0});
    m_replacement += m_texts.last().text.length();
    if (m_replacement > m_limits.replacement)
        refuse(QStringLiteral("References make more than %1 characters of entities be read again.")
                   .arg(m_limits.replacement));

    // The reader takes them for entities that name themselves, and stops here.
    if (m_texts.size() > std::max(m_generalCount, m_parameterCount) + 1)
        m_texts.clear();
}

// Counts what is read from entities, but for the references in it that are put in themselves.
void TorkXmlLexer::standsFor(int characters)
{
    m_expansion += characters;
    if (m_expansion > m_limits.expansion)
        refuse(QStringLiteral("References to entities stand for more than %1 characters.")
                   .arg(m_limits.expansion));
}

void TorkXmlLexer::refuse(QString const& reason)
{
    if (m_reason.isEmpty())
        m_reason = reason;
    m_texts.clear();
}
