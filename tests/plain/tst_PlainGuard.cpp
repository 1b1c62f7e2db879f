// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The guard beside a plain input source, over random documents: within the limits the reader tells
// of the same events, errors included, and each limit holds at exactly what the document comes to.

#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXmlLexer_p.h"
#include "plain/Rounds.h"
#include "xml/XmlEvents.h"

#include <QtTest>

#include <algorithm>
#include <cstdio>
#include <random>

namespace {

// A part of a document, and what it comes to by the plain rules.
struct Piece
{
    QByteArray text;
    qint64 inEntity = 0;  // the characters it expands to as a part of an entity
    qint64 inContent = 0; // those that its references expand to
    int depth = 0;        // of the elements in it
    bool hasMarkup = false;
    int elements = 0;
    int prefixed = 0; // those of them with the prefix in force
};

// Counts two, so that its square differs from its sum.
const QByteArray Prefix = "pppppppppppppppp";

Piece Literal(QByteArray const& text, bool hasMarkup = false)
{
    return {text, QString::fromUtf8(text).length(), 0, 0, hasMarkup};
}

Piece operator+(Piece const& left, Piece const& right)
{
    return {left.text + right.text,
            left.inEntity + right.inEntity,
            left.inContent + right.inContent,
            std::max(left.depth, right.depth),
            left.hasMarkup || right.hasMarkup,
            left.elements + right.elements,
            left.prefixed + right.prefixed};
}

class Author
{
public:
    explicit Author(quint32 seed) : m_engine(seed) {}

    int below(int end) { return int(m_engine() % uint(end)); }
    bool chance(int percent) { return below(100) < percent; }

    // Writes a document; what it comes to is left in the fields.
    QByteArray document()
    {
        m_entities.clear();
        expansion = 0;
        groups = 0;
        entityCount = 0;
        entityCharacters = 0;
        QByteArray type;
        if (chance(80))
            type = documentType();
        const Piece root = element(4, false);
        expansion += root.inContent;
        depth = root.depth;
        prefixComparisons = 4 * root.prefixed;
        const QByteArray before = chance(30) ? "<?xml version='1.0'?>\n" : "";
        return before + aside() + type + aside() + root.text + aside();
    }

    // The same with a few bytes changed, so that it is most likely malformed.
    QByteArray damaged(QByteArray document)
    {
        for (int left = 1 + below(3); left > 0 && !document.isEmpty(); --left) {
            const int place = below(document.size());
            switch (below(4)) {
            case 0:
                document.remove(place, 1 + below(8));
                break;
            case 1:
                document.insert(place, document.mid(below(document.size()), 1 + below(12)));
                break;
            case 2:
                document.insert(place, "<>&;%'\"[]()-!?/= \n"[below(18)]);
                break;
            default:
                document.truncate(place);
            }
        }
        return document;
    }

    qint64 expansion = 0;
    int groups = 0;
    int entityCount = 0;
    qint64 entityCharacters = 0;
    qint64 prefixComparisons = 0;
    int depth = 0;

private:
    QByteArray documentType()
    {
        QByteArray type = "<!DOCTYPE r ";
        if (chance(10))
            type += chance(50) ? "SYSTEM 'a>[\"' " : "SYSTEM \"'><![CDATA[\" ";
        type += '[';
        m_parameters.clear();
        for (int left = below(8); left > 0; --left)
            type += declaration() + (chance(50) ? "\n" : "");
        return type + "]>";
    }

    QByteArray declaration()
    {
        switch (below(9)) {
        case 0:
            return elementDeclaration();
        case 1: {
            const Piece value = valueOfAttribute();
            expansion += value.inContent;
            groups = std::max(groups, 1);
            return "<!ATTLIST r a CDATA '" + value.text + "' b (x|y) #IMPLIED>";
        }
        case 2:
            return "<!--" + trap() + "-->";
        case 3:
            return "<?t " + trap() + "?>";
        case 4:
            return "<!NOTATION n PUBLIC '" + QByteArray(chance(50) ? "](<" : "n") + "'>";
        case 5:
            return "<!ENTITY x SYSTEM \"" + trap() + "\">";
        case 6:
            return parameter();
        default:
            return entity();
        }
    }

    QByteArray elementDeclaration()
    {
        const int levels = 1 + below(6);
        groups = std::max(groups, levels);
        return "<!ELEMENT e " + QByteArray("(").repeated(levels) + "a" +
               (chance(50) && levels > 1 ? "),(b" : "") + QByteArray(")").repeated(levels) + ">";
    }

    // No more than two, which is what the reader takes. Named where it is declared: what is in it
    // counts only then.
    QByteArray parameter()
    {
        if (m_parameters.size() >= 2)
            return QByteArray();
        const QByteArray name = "p" + QByteArray::number(m_parameters.size());
        ++entityCount;
        const bool isDeclaration = chance(50);
        const int groupsBefore = groups;
        const QByteArray value = isDeclaration ? elementDeclaration() : "((text of p";
        const bool isNamed = isDeclaration && chance(60);
        if (!isNamed)
            groups = groupsBefore;
        entityCharacters += name.size() + value.size();
        m_parameters.append(isDeclaration ? QByteArray() : value);
        if (isNamed)
            expansion += value.size();
        return "<!ENTITY % " + name + " '" + value + "'>" + (isNamed ? "%" + name + ";" : "");
    }

    // The first one of a name holds.
    QByteArray entity()
    {
        const bool isAgain = !m_entities.isEmpty() && chance(10);
        Piece value = chance(50) ? valueOfAttribute(true) : content(2, true);
        qint64 fromParameters = 0;
        for (int i = 0; i < m_parameters.size(); ++i) {
            if (m_parameters[i].isEmpty() || !chance(40))
                continue;
            value = value + Literal(m_parameters[i]);
            fromParameters += m_parameters[i].size();
            value.text.chop(m_parameters[i].size());
            value.text += "%p" + QByteArray::number(i) + ";";
        }
        expansion += fromParameters;
        const int number = isAgain ? below(m_entities.size()) : m_entities.size();
        if (!isAgain) {
            m_entities.append(value);
            ++entityCount;
            entityCharacters += 1 + QByteArray::number(number).size() + stored(value.text);
        }
        return "<!ENTITY e" + QByteArray::number(number) + " \"" + value.text + "\">";
    }

    // The length of the text that an entity is declared with: only references to characters and
    // parameter entities are put in at once.
    int stored(QByteArray text) const
    {
        text.replace("&#65;", "A").replace("&#x42;", "B");
        for (int i = 0; i < m_parameters.size(); ++i)
            text.replace("%p" + QByteArray::number(i) + ";", m_parameters[i]);
        return QString::fromUtf8(text).length();
    }

    // What looks like a reference, an end or a group and is none.
    QByteArray trap()
    {
        static const char* const traps[] = {"&e0;", "((((((((", "]>", "%p0;", "R&D", "100%", "<a>",
                                            "'",    "]]",       "&",  "<!x",  "?",   "- "};
        QByteArray all;
        for (int left = below(4); left > 0; --left)
            all += traps[below(13)];
        return all;
    }

    QByteArray aside()
    {
        switch (below(8)) {
        case 0:
            return "<!--" + trap() + "-->";
        case 1:
            return "<?t " + trap() + "?>";
        case 2:
            return "\n";
        default:
            return QByteArray();
        }
    }

    Piece text(bool inEntity)
    {
        static const char* const texts[] = {"a", "text", "((", "]",  ")", "; ", "\xc3\xa4",
                                            "=", "/",    "?",  "- ", "%", "'"};
        // In an entity a percent sign begins a reference, and quotes are kept for attributes.
        return Literal(texts[below(inEntity ? 11 : 13)]);
    }

    Piece reference(bool inAttribute)
    {
        switch (below(4)) {
        case 0:
            return {"&amp;", 1, 0, 0, false};
        case 1:
            return {chance(50) ? "&#65;" : "&#x42;", 1, 0, 0, false};
        case 2:
            return {"&none;", 0, 0, 0, false};
        default:
            break;
        }
        if (m_entities.isEmpty())
            return Literal("a");
        const int number = below(m_entities.size());
        Piece const& entity = m_entities[number];
        if (inAttribute && entity.hasMarkup)
            return Literal("b");
        return {"&e" + QByteArray::number(number) + ";",
                entity.inEntity,
                entity.inEntity,
                entity.depth,
                entity.hasMarkup,
                entity.elements,
                entity.prefixed};
    }

    Piece valueOfAttribute(bool inEntity = false)
    {
        Piece all;
        for (int left = below(4); left > 0; --left)
            all = all + (chance(50) ? reference(true) : inEntity ? text(true) : Literal("(%]>"));
        return all;
    }

    Piece element(int levels, bool inEntity)
    {
        Piece all = Literal("<a", true);
        const bool isPrefixed = chance(30);
        if (isPrefixed)
            all = all + Literal(" xmlns:" + Prefix + "='u'") + Literal(' ' + Prefix + ":c='d'");
        if (chance(40))
            all = all + Literal(" b = '") + valueOfAttribute(inEntity) + Literal("'");
        if (levels == 0 || chance(20)) {
            all = all + Literal("/>");
            all.depth = 1;
            all.elements = 1;
            all.prefixed = isPrefixed ? 1 : 0;
            return all;
        }
        const Piece children = content(levels - 1, inEntity);
        all = all + Literal(chance(20) ? " >" : ">") + children + Literal("</a>");
        all.depth = children.depth + 1;
        all.elements = children.elements + 1;
        all.prefixed = isPrefixed ? all.elements : children.prefixed;
        return all;
    }

    Piece content(int levels, bool inEntity)
    {
        Piece all;
        for (int left = below(5); left > 0; --left) {
            switch (below(7)) {
            case 0:
                all = all + element(levels, inEntity);
                break;
            case 1:
                all = all + Literal("<!--" + hidden(inEntity) + "-->", true);
                break;
            case 2:
                all = all +
                      Literal("<![CDATA[" + hidden(inEntity).replace("]]>", "]] >") + "]]>", true);
                break;
            case 3:
                all = all + Literal("<?t " + hidden(inEntity) + "?>", true);
                break;
            case 4:
                all = all + reference(false);
                break;
            default:
                all = all + text(inEntity);
            }
        }
        return all;
    }

    // In an entity even these are looked through for the references of the declaration.
    QByteArray hidden(bool inEntity)
    {
        if (!inEntity)
            return trap();
        return chance(50) ? "&e0; ((" : "]] (<a";
    }

    std::mt19937 m_engine;
    QVector<Piece> m_entities;
    QVector<QByteArray> m_parameters; // the text of each, empty if it is a declaration
};

QStringList Plain(QByteArray const& document)
{
    return XmlEvents::of<QXmlInputSource>(document, [](QXmlInputSource&, QXmlSimpleReader&) {});
}

QStringList Guarded(QByteArray const& document)
{
    return XmlEvents::of<TorkXmlGuard>(
        document, [](TorkXmlGuard& source, QXmlSimpleReader& reader) { source.Watch(reader); });
}

bool IsWithin(QByteArray const& document, TorkXmlLexer::Limits const& limits)
{
    TorkXmlLexer lexer(limits);
    for (QChar character : QString::fromUtf8(document)) {
        if (!lexer.read(character))
            return false;
    }
    return true;
}

} // namespace

class tst_PlainGuard : public QObject
{
    Q_OBJECT

private slots:
    void sameEvents();
    void exactLimits();
    void cleanupTestCase();

private:
    int m_parsed = 0;
    int m_failed = 0;
    int m_limits = 0;
};

void tst_PlainGuard::sameEvents()
{
    Author author(Rounds::seed());
    const int count = Rounds::count(2000, 100000);
    for (int i = 0; i < count; ++i) {
        QByteArray document = author.document();
        if (i % 2)
            document = author.damaged(document);
        const QStringList expected = Plain(document);
        const QStringList events = Guarded(document);
        QVERIFY2(events == expected, document + "\n" + events.join('\n').toUtf8() + "\n---\n" +
                                         expected.join('\n').toUtf8());
        ++(expected.last().startsWith("parsed") ? m_parsed : m_failed);
    }
}

// Only of what the reader takes: where it stops, nothing more is counted.
void tst_PlainGuard::exactLimits()
{
    Author author(Rounds::seed() + 1);
    const int count = Rounds::count(2000, 100000);
    for (int i = 0; i < count; ++i) {
        const QByteArray document = author.document();
        if (!Plain(document).last().startsWith("parsed"))
            continue;

        TorkXmlLexer::Limits limits;
        limits.expansion = author.expansion;
        limits.groups = author.groups;
        limits.entities = author.entityCount;
        limits.entityCharacters = author.entityCharacters;
        limits.prefixComparisons = author.prefixComparisons;
        limits.depth = author.depth;
        QVERIFY2(IsWithin(document, limits), document);

        const auto failsWith = [&](auto TorkXmlLexer::Limits::*limit) {
            TorkXmlLexer::Limits less = limits;
            --(less.*limit);
            ++m_limits;
            return less.*limit < 0 || !IsWithin(document, less);
        };
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::expansion), document);
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::groups), document);
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::entities), document);
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::entityCharacters), document);
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::prefixComparisons), document);
        QVERIFY2(failsWith(&TorkXmlLexer::Limits::depth), document);
    }
}

void tst_PlainGuard::cleanupTestCase()
{
    std::printf("plain guard: %d documents parsed and %d refused with the same events, %d limits "
                "passed by exactly one\n",
                m_parsed, m_failed, m_limits);
}

QTEST_GUILESS_MAIN(tst_PlainGuard)
#include "tst_PlainGuard.moc"
