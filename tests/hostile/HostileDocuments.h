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
inline void writeValue(QIODevice& file, QByteArray const& documentType, QByteArray const& content)
{
    file.write(documentType + "<r><s><k>" + content + "</k></s></r>");
}

inline void repeat(QIODevice& file, QByteArray const& piece, int count)
{
    const int atOnce = 4096;
    for (int left = count; left > 0; left -= atOnce)
        file.write(piece.repeated(qMin(left, atOnce)));
}

/// Elements inside elements.
inline void nestedElements(QIODevice& file, int levels)
{
    repeat(file, "<a>", levels);
    file.write("x");
    repeat(file, "</a>", levels);
}

/// Elements inside elements that never end, as in a file that was cut off.
inline void openElements(QIODevice& file, int levels)
{
    repeat(file, "<a>", levels);
}

/// Groups inside groups, in the declaration of an element.
inline void nestedGroups(QIODevice& file, int levels)
{
    file.write("<!DOCTYPE r [<!ELEMENT r ");
    repeat(file, "(", levels);
    file.write("s");
    repeat(file, ")", levels);
    writeValue(file, ">]>", "v");
}

/// Groups inside groups that come from a parameter entity named again and again.
inline void groupsFromEntity(QIODevice& file, int levels)
{
    file.write("<!DOCTYPE r [<!ENTITY % p \"" + QByteArray("(").repeated(900) + "\"><!ELEMENT r ");
    repeat(file, "%p;", levels / 900);
    writeValue(file, "s>]>", "v");
}

/// Ten of an entity in each next one, `generations` times over.
inline QByteArray generations(QByteArray const& first, int count)
{
    QByteArray type = "<!DOCTYPE r [<!ENTITY e0 \"" + first + "\">";
    for (int i = 1; i <= count; ++i) {
        const QByteArray before = "&e" + QByteArray::number(i - 1) + ';';
        type += "<!ENTITY e" + QByteArray::number(i) + " \"" + before.repeated(10) + "\">";
    }
    return type + "]>";
}

inline void textBomb(QIODevice& file, int count)
{
    writeValue(file, generations("text", count), "&e" + QByteArray::number(count) + ';');
}

inline void elementBomb(QIODevice& file, int count)
{
    writeValue(file, generations("<a></a>", count), "&e" + QByteArray::number(count) + ';');
}

inline void attributeBomb(QIODevice& file, int count)
{
    file.write(generations("text", count));
    file.write("<r><s><k a=\"&e" + QByteArray::number(count) + ";\">v</k></s></r>");
}

/// One long entity, named as often as it is long.
inline void longEntity(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [<!ENTITY e \"");
    repeat(file, "x", length);
    file.write("\">]><r><s><k>");
    repeat(file, "&e;", length);
    file.write("</k></s></r>");
}

/// An entity that references itself.
inline void endlessEntity(QIODevice& file, int)
{
    writeValue(file, "<!DOCTYPE r [<!ENTITY e \"<a>&e;</a>\">]>", "&e;");
}

/// Entities that each reference the next one.
inline void entityChain(QIODevice& file, int count)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < count; ++i) {
        const QByteArray next = QByteArray::number(i + 1);
        file.write("<!ENTITY e" + QByteArray::number(i) + " \"&e" + next + ";\">");
    }
    writeValue(file, "<!ENTITY e" + QByteArray::number(count) + " \"x\">]>", "&e0;");
}

/// One value of so many bytes.
inline void longValue(QIODevice& file, int bytes)
{
    file.write("<r><s><k>");
    repeat(file, "x", bytes);
    file.write("</k></s></r>");
}

/// So many keys, each with a value.
inline void manyKeys(QIODevice& file, int count)
{
    file.write("<r><s>");
    for (int i = 0; i < count; ++i) {
        const QByteArray key = 'k' + QByteArray::number(i);
        file.write('<' + key + ">1</" + key + '>');
    }
    file.write("</s></r>");
}

/// A section and a key whose names have so many bytes.
inline void longNames(QIODevice& file, int bytes)
{
    const QByteArray name(bytes, 'n');
    file.write("<r><" + name + "><k" + name + ">1</k" + name + "></" + name + "></r>");
}

/// So many attributes in one tag.
inline void manyAttributes(QIODevice& file, int count)
{
    file.write("<r><s");
    for (int i = 0; i < count; ++i)
        file.write(" a" + QByteArray::number(i) + "=\"1\"");
    file.write("><k>v</k></s></r>");
}

/// An attribute that declares the prefix pN.
inline QByteArray declaration(int number)
{
    return " xmlns:p" + QByteArray::number(number) + "=\"u\"";
}

/// A start tag with so many declarations, not yet closed.
inline void declarations(QIODevice& file, int count)
{
    file.write("<r");
    for (int i = 0; i < count; ++i)
        file.write(declaration(i));
}

/// Many declarations in the only element.
inline void declarationsInOneTag(QIODevice& file, int count)
{
    declarations(file, count);
    file.write("/>");
}

/// Many declarations on the root and twice as many empty children.
inline void declarationsAndChildren(QIODevice& file, int count)
{
    declarations(file, count);
    file.write(">");
    repeat(file, "<a/>", 2 * count);
    file.write("</r>");
}

/// Many declarations on the root and as many children that declare one each.
inline void declarationsAndDeclaringChildren(QIODevice& file, int count)
{
    declarations(file, count);
    file.write(">");
    for (int i = 0; i < count; ++i)
        file.write("<a" + declaration(count + i) + "/>");
    file.write("</r>");
}

/// Many declarations on the root and 900 elements inside each other that declare one each.
inline void declarationsAndDepth(QIODevice& file, int count)
{
    declarations(file, count);
    file.write(">");
    for (int i = 0; i < 900; ++i)
        file.write("<a" + declaration(count + i) + ">");
    repeat(file, "</a>", 900);
    file.write("</r>");
}

/// The same with prefixes that are used and never declared, which the reader keeps as well.
inline void usedPrefixes(QIODevice& file, int count)
{
    file.write("<r");
    for (int i = 0; i < count; ++i)
        file.write(" p" + QByteArray::number(i) + ":a=\"\"");
    file.write(">");
    repeat(file, "<a/>", 2 * count);
    file.write("</r>");
}

/// Elements with as many prefixes in force as there may be, many of them.
inline void mostPrefixes(QIODevice& file, int count)
{
    declarations(file, 256);
    file.write(">");
    repeat(file, "<a/>", count);
    file.write("</r>");
}

/// Elements below so many declarations, in numbers that only a large file has.
inline void elementsBelowPrefixes(QIODevice& file, int count)
{
    declarations(file, count);
    file.write(">");
    repeat(file, "<a/>", 250000);
    file.write("</r>");
}

/// The same in numbers that only entities make in a small file.
inline void entitiesBelowPrefixes(QIODevice& file, int count)
{
    file.write("<!DOCTYPE r [<!ENTITY e \"" + QByteArray("<a/>").repeated(1000) + "\">]>");
    declarations(file, count);
    file.write(">");
    repeat(file, "&e;", 4000);
    file.write("</r>");
}

/// As many entities as allowed, with names of so many characters.
inline void longEntityNames(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < 999; ++i) {
        const QByteArray name = QByteArray(length - 4, 'e') + QByteArray::number(1000 + i);
        file.write("<!ENTITY " + name + " \"x\">");
    }
    writeValue(file, "]>", "v");
}

/// As many entities as allowed, with texts of so many characters.
inline void longEntityTexts(QIODevice& file, int length)
{
    file.write("<!DOCTYPE r [");
    for (int i = 0; i < 999; ++i)
        file.write("<!ENTITY e" + QByteArray::number(i) + " \"" + QByteArray(length, 'x') + "\">");
    writeValue(file, "]>", "v");
}

/// A document as office programs write it: forty declarations, and many elements that use them.
inline void officeDocument(QIODevice& file, int count)
{
    declarations(file, 40);
    file.write(">");
    for (int i = 0; i < count; ++i) {
        const QByteArray name = 'p' + QByteArray::number(i % 40) + ":a";
        file.write('<' + name + " p1:b=\"c\">1</" + name + '>');
    }
    file.write("</r>");
}

} // namespace HostileDocuments
