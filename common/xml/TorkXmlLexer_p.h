// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLimits.h"

#include <QHash>
#include <QSet>
#include <QString>
#include <QVarLengthArray>
#include <QVector>

/// Follows a document character by character and reports when it exceeds a limit. For TorkXmlGuard.
///
/// It sees what Qt's QXmlSimpleReader sees, the texts of entities included, which the reader takes
/// from a stack of its own and not from the input source. It checks no syntax: where a document is
/// malformed the reader stops, and what is counted from there on does not matter.
class TorkXmlLexer
{
public:
    struct Limits
    {
        int depth = TorkXmlMaximumDepth;
        int groups = TorkXmlMaximumDepth;
        int entities = TorkXmlMaximumEntities;
        qint64 entityCharacters = TorkXmlMaximumEntityCharacters;
        qint64 expansion = TorkXmlMaximumExpansion;
        qint64 replacement = TorkXmlMaximumReplacement;
        int prefixes = TorkXmlMaximumPrefixes;
        qint64 prefixComparisons = TorkXmlMaximumPrefixComparisons;
    };

    TorkXmlLexer() = default;
    explicit TorkXmlLexer(Limits const& limits) : m_limits(limits) {}

    /// Whether reading this character next would change nothing, as for most of a document; then
    /// read() need not be called. For the goal "load, against QSettings" in docs/performance.md;
    /// tests/plain/tst_PlainGuard.cpp compares with a guard that reads every character.
    bool passes(QChar character) const
    {
        const ushort unit = character.unicode();
        return m_state == State::Content ? unit != '<' && unit != '&'
                                         : m_state == State::EndTag && unit != '>';
    }

    /// Takes the next character of the document.
    ///
    /// @return false if the document goes beyond a limit with it
    bool read(QChar character);

    /// A text that names the exceeded limit; empty if none was.
    QString const& reason() const { return m_reason; }

private:
    enum class State {
        Content, // and the prolog
        Less,    // "<" was read
        Bang,    // "<!" was read
        BangE,   // "<!E" was read
        CommentStart,
        Comment,
        CData,
        Instruction,
        TagName,
        InTag,
        AttributeName,
        BeforeValue,
        AttributeValue,
        EndTag,
        Reference,
        DoctypeHead,
        DoctypeTail,
        Subset,
        Declaration,
        AttributeList,
        DefaultValue,
        Literal, // without references
        EntityKeyword,
        BeforeEntityName,
        EntityName,
        BeforeEntityValue,
        EntityValue,
        ExternalEntity
    };

    enum class Kind { General, Parameter, External };

    struct Entity
    {
        Kind kind;
        QString value;
    };

    // Built for each tag, so usually without allocating.
    using Name = QVarLengthArray<QChar, 64>;

    struct Text
    {
        QString text;
        int position;
    };

    struct Element
    {
        int prefixCount; // before its own
        int prefixWeight;
    };

    void take(QChar character);
    void takeMarkup(QChar character);
    void takeTag(QChar character);
    void takeDocumentType(QChar character);
    void takeEntity(QChar character);

    void afterLess(QChar character);
    void afterBang(QChar character);
    State outside() const { return m_inSubset ? State::Subset : State::Content; }

    void openTag(QChar character);
    void addPrefix(Name const& name, bool isAttribute);
    void startElement();
    void endElement();

    void openQuotes(QChar character, State state, State after);
    void nest(QChar character);
    void declare(Kind kind);

    void openReference(QChar character, State after);
    void closeReference();
    void replace(Kind kind);
    void standsFor(int characters);
    void refuse(QString const& reason);

    Limits m_limits;
    QString m_reason;

    State m_state = State::Content;
    State m_afterQuotes = State::Content;
    State m_afterReference = State::Content;
    QChar m_quote;
    int m_run = 0; // of the characters that come before the ">" which ends a comment or the like
    bool m_inSubset = false;

    Name m_name; // of the attribute or entity
    QString m_reference;
    bool m_isParameterReference = false;
    bool m_isParameter = false; // whether the entity that is being declared is one

    int m_groups = 0;
    QString m_value;
    QHash<QString, Entity> m_entities;
    int m_generalCount = 0;
    int m_parameterCount = 0;
    qint64 m_entityCharacters = 0;

    QVector<Text> m_texts; // of the entities that are being read
    qint64 m_expansion = 0;
    qint64 m_replacement = 0;

    Name m_tag;
    QVector<Element> m_elements;
    QVector<QString> m_prefixes; // in force, in the order in which they came
    QSet<QString> m_prefixSet;
    int m_prefixWeight = 0;
    Element m_beforeTag = {0, 0};
    qint64 m_prefixComparisons = 0;
};
