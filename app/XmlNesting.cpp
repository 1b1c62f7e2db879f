// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/XmlNesting_p.h"

#include <cstring>

namespace Velocor {

namespace {

enum class Tag { Start, Empty, Broken };

bool StartsWith(char const* text, char const* prefix)
{
    return std::strncmp(text, prefix, std::strlen(prefix)) == 0;
}

// The position after the next `end`, or the end of the text.
char const* SkipPast(char const* text, char const* end)
{
    char const* found = std::strstr(text, end);
    return found ? found + std::strlen(end) : text + std::strlen(text);
}

char const* SkipSpace(char const* text)
{
    return text + std::strspn(text, " \t\n\r");
}

// The internal subset of a document type is in brackets and may contain markup.
char const* SkipDocumentType(char const* text)
{
    int brackets = 0;
    for (; *text; ++text) {
        if (*text == '[')
            ++brackets;
        else if (*text == ']' && brackets > 0)
            --brackets;
        else if (*text == '>' && brackets == 0)
            return text + 1;
    }
    return text;
}

// Skips markup after "<" that is not an element.
char const* SkipSpecial(char const* text)
{
    if (*text == '?')
        return SkipPast(text + 1, "?>");
    if (StartsWith(text, "!--"))
        return SkipPast(text + 3, "-->");
    if (StartsWith(text, "![CDATA["))
        return SkipPast(text, "]]>");
    if (StartsWith(text, "!DOCTYPE") && SkipSpace(text + 8) != text + 8)
        return SkipDocumentType(text);
    return SkipPast(text, ">");
}

char const* SkipAttributes(char const* text)
{
    for (;;) {
        text = SkipSpace(text);
        const size_t nameLength = std::strcspn(text, " \t\n\r/<>=?!");
        if (nameLength == 0)
            return text;

        text = SkipSpace(text + nameLength);
        if (*text != '=')
            return text;

        text = SkipSpace(text + 1);
        const char quote = *text;
        if (quote != '"' && quote != '\'')
            return text;

        text = std::strchr(text + 1, quote);
        if (!text)
            return "";
        ++text;
    }
}

// Reads the tag whose name starts at `text`, and advances `text` past it.
Tag ReadTag(char const*& text)
{
    text = SkipAttributes(text + std::strcspn(text, " \t\n\r/>?"));
    if (*text == '>') {
        ++text;
        return Tag::Start;
    }
    if (StartsWith(text, "/>")) {
        text += 2;
        return Tag::Empty;
    }
    return Tag::Broken;
}

} // namespace

bool NestedDeeperThan(char const* xml, int limit)
{
    int depth = 0;
    while (char const* markup = std::strchr(xml, '<')) {
        xml = markup + 1;
        if (*xml == '/') {
            --depth;
        } else if (*xml == '!' || *xml == '?') {
            xml = SkipSpecial(xml);
        } else {
            const Tag tag = ReadTag(xml);
            if (tag == Tag::Broken)
                return false;
            if (tag == Tag::Start && ++depth > limit)
                return true;
        }
    }
    return false;
}

} // namespace Velocor
