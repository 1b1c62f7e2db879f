// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QIODevice>

/// Writes documents that are made to harm who reads them, piece by piece: some are far larger than
/// the memory that is to be measured.
namespace HostileDocuments {

using Writer = void (*)(QIODevice& file, int size);

/// The settings in a document whose one value is `content`.
inline void WriteValue(QIODevice& file, QByteArray const& documentType, QByteArray const& content)
{
    file.write(documentType + "<r><s><k>" + content + "</k></s></r>");
}

inline void Repeat(QIODevice& file, QByteArray const& piece, int count)
{
    const int atOnce = 4096;
    for (int left = count; left > 0; left -= atOnce)
        file.write(piece.repeated(qMin(left, atOnce)));
}

/// Elements inside elements.
inline void NestedElements(QIODevice& file, int levels)
{
    Repeat(file, "<a>", levels);
    file.write("x");
    Repeat(file, "</a>", levels);
}

/// Elements inside elements that never end, as in a file that was cut off.
inline void OpenElements(QIODevice& file, int levels)
{
    Repeat(file, "<a>", levels);
}

/// Groups inside groups, in the declaration of an element.
inline void NestedGroups(QIODevice& file, int levels)
{
    file.write("<!DOCTYPE r [<!ELEMENT r ");
    Repeat(file, "(", levels);
    file.write("s");
    Repeat(file, ")", levels);
    WriteValue(file, ">]>", "v");
}

/// Groups inside groups that come from a parameter entity named again and again.
inline void GroupsFromEntity(QIODevice& file, int levels)
{
    file.write("<!DOCTYPE r [<!ENTITY % p \"" + QByteArray("(").repeated(900) + "\"><!ELEMENT r ");
    Repeat(file, "%p;", levels / 900);
    WriteValue(file, "s>]>", "v");
}

/// Ten of an entity in each next one, `count` times over.
inline QByteArray Generations(QByteArray const& first, int count)
{
    QByteArray type = "<!DOCTYPE r [<!ENTITY e0 \"" + first + "\">";
    for (int i = 1; i <= count; ++i) {
        const QByteArray before = "&e" + QByteArray::number(i - 1) + ';';
        type += "<!ENTITY e" + QByteArray::number(i) + " \"" + before.repeated(10) + "\">";
    }
    return type + "]>";
}

inline void TextBomb(QIODevice& file, int count)
{
    WriteValue(file, Generations("text", count), "&e" + QByteArray::number(count) + ';');
}

inline void ElementBomb(QIODevice& file, int count)
{
    WriteValue(file, Generations("<a></a>", count), "&e" + QByteArray::number(count) + ';');
}

inline void AttributeBomb(QIODevice& file, int count)
{
    file.write(Generations("text", count));
    file.write("<r><s><k a=\"&e" + QByteArray::number(count) + ";\">v</k></s></r>");
}

/// One long entity, named as often as it is long.
inline void LongEntity(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [<!ENTITY e \"");
    Repeat(file, "x", length);
    file.write("\">]><r><s><k>");
    Repeat(file, "&e;", length);
    file.write("</k></s></r>");
}

/// An entity that references itself.
inline void EndlessEntity(QIODevice& file, int)
{
    WriteValue(file, "<!DOCTYPE r [<!ENTITY e \"<a>&e;</a>\">]>", "&e;");
}

/// Entities that each reference the next one.
inline void EntityChain(QIODevice& file, int count)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < count; ++i) {
        const QByteArray next = QByteArray::number(i + 1);
        file.write("<!ENTITY e" + QByteArray::number(i) + " \"&e" + next + ";\">");
    }
    WriteValue(file, "<!ENTITY e" + QByteArray::number(count) + " \"x\">]>", "&e0;");
}

/// One value of so many bytes.
inline void LongValue(QIODevice& file, int bytes)
{
    file.write("<r><s><k>");
    Repeat(file, "x", bytes);
    file.write("</k></s></r>");
}

/// So many keys, each with a value.
inline void ManyKeys(QIODevice& file, int count)
{
    file.write("<r><s>");
    for (int i = 0; i < count; ++i) {
        const QByteArray key = 'k' + QByteArray::number(i);
        file.write('<' + key + ">1</" + key + '>');
    }
    file.write("</s></r>");
}

/// A section and a key whose names have so many bytes.
inline void LongNames(QIODevice& file, int bytes)
{
    const QByteArray name(bytes, 'n');
    file.write("<r><" + name + "><k" + name + ">1</k" + name + "></" + name + "></r>");
}

/// So many attributes in one tag.
inline void ManyAttributes(QIODevice& file, int count)
{
    file.write("<r><s");
    for (int i = 0; i < count; ++i)
        file.write(" a" + QByteArray::number(i) + "=\"1\"");
    file.write("><k>v</k></s></r>");
}

/// An attribute that declares the prefix pN.
inline QByteArray Declaration(int number)
{
    return " xmlns:p" + QByteArray::number(number) + "=\"u\"";
}

/// A start tag with so many declarations, not yet closed.
inline void Declarations(QIODevice& file, int count)
{
    file.write("<r");
    for (int i = 0; i < count; ++i)
        file.write(Declaration(i));
}

/// Many declarations in the only element.
inline void DeclarationsInOneTag(QIODevice& file, int count)
{
    Declarations(file, count);
    file.write("/>");
}

/// Many declarations on the root and twice as many empty children.
inline void DeclarationsAndChildren(QIODevice& file, int count)
{
    Declarations(file, count);
    file.write(">");
    Repeat(file, "<a/>", 2 * count);
    file.write("</r>");
}

/// Many declarations on the root and as many children that declare one each.
inline void DeclarationsAndDeclaringChildren(QIODevice& file, int count)
{
    Declarations(file, count);
    file.write(">");
    for (int i = 0; i < count; ++i)
        file.write("<a" + Declaration(count + i) + "/>");
    file.write("</r>");
}

/// Many declarations on the root and 900 elements inside each other that declare one each.
inline void DeclarationsAndDepth(QIODevice& file, int count)
{
    Declarations(file, count);
    file.write(">");
    for (int i = 0; i < 900; ++i)
        file.write("<a" + Declaration(count + i) + ">");
    Repeat(file, "</a>", 900);
    file.write("</r>");
}

/// The same with prefixes that are used and never declared, which the reader keeps as well.
inline void UsedPrefixes(QIODevice& file, int count)
{
    file.write("<r");
    for (int i = 0; i < count; ++i)
        file.write(" p" + QByteArray::number(i) + ":a=\"\"");
    file.write(">");
    Repeat(file, "<a/>", 2 * count);
    file.write("</r>");
}

/// Elements with as many prefixes in force as there may be, many of them.
inline void MostPrefixes(QIODevice& file, int count)
{
    Declarations(file, 256);
    file.write(">");
    Repeat(file, "<a/>", count);
    file.write("</r>");
}

/// Elements below so many declarations, in numbers that only a large file has.
inline void ElementsBelowPrefixes(QIODevice& file, int count)
{
    Declarations(file, count);
    file.write(">");
    Repeat(file, "<a/>", 250000);
    file.write("</r>");
}

/// The same in numbers that only entities make in a small file.
inline void EntitiesBelowPrefixes(QIODevice& file, int count)
{
    file.write("<!DOCTYPE r [<!ENTITY e \"" + QByteArray("<a/>").repeated(1000) + "\">]>");
    Declarations(file, count);
    file.write(">");
    Repeat(file, "&e;", 4000);
    file.write("</r>");
}

/// As many entities as allowed, with names of so many characters.
inline void LongEntityNames(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < 999; ++i) {
        const QByteArray name = QByteArray(length - 4, 'e') + QByteArray::number(1000 + i);
        file.write("<!ENTITY " + name + " \"x\">");
    }
    WriteValue(file, "]>", "v");
}

/// As many entities as allowed, with texts of so many characters.
inline void LongEntityTexts(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < 999; ++i)
        file.write("<!ENTITY e" + QByteArray::number(i) + " \"" + QByteArray(length, 'x') + "\">");
    WriteValue(file, "]>", "v");
}

/// A document as office programs write it: forty declarations, and many elements that use them.
inline void OfficeDocument(QIODevice& file, int count)
{
    Declarations(file, 40);
    file.write(">");
    for (int i = 0; i < count; ++i) {
        const QByteArray name = 'p' + QByteArray::number(i % 40) + ":a";
        file.write('<' + name + " p1:b=\"c\">1</" + name + '>');
    }
    file.write("</r>");
}

} // namespace HostileDocuments
