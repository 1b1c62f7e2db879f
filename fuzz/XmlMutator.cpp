// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "XmlMutator.h"

#include <algorithm>
#include <utility>

namespace {

bool IsNameCharacter(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == ':' ||
           c == '_';
}

// The end of the name that begins at `start`.
size_t NameEnd(std::string const& document, size_t start)
{
    while (start < document.size() && IsNameCharacter(document[start]))
        ++start;
    return start;
}

} // namespace

XmlMutator::XmlMutator(unsigned int seed, std::vector<std::string> words)
    : m_random(seed), m_words(std::move(words))
{
    m_words.insert(m_words.end(), {"r", "a", "b", "p:c", "p:a", "q:b"});
}

std::string XmlMutator::Mutate(std::string document, size_t maximum)
{
    if (Below(2) == 0) {
        const size_t size = std::min(document.size(), maximum);
        document.resize(maximum);
        document.resize(LLVMFuzzerMutate(reinterpret_cast<uint8_t*>(&document[0]), size, maximum));
        return document;
    }
    using Operation = void (XmlMutator::*)(std::string&);
    const Operation operations[] = {
        &XmlMutator::insertPiece, &XmlMutator::insertPiece,  &XmlMutator::duplicate,
        &XmlMutator::remove,      &XmlMutator::wrap,         &XmlMutator::rename,
        &XmlMutator::declare,     &XmlMutator::addAttribute, &XmlMutator::refer};
    for (size_t left = 1 + Below(3); left > 0; --left)
        (this->*operations[Below(std::size(operations))])(document);
    if (document.size() > maximum)
        document.resize(maximum);
    return document;
}

std::string XmlMutator::name()
{
    return pick(m_words);
}

std::string XmlMutator::text(int depth)
{
    switch (Below(8)) {
    case 0:
        return "&e" + std::to_string(Below(4)) + ";";
    case 1:
        return pick({"&amp;", "&#65;", "&#x20AC;", "&lt;", "&#0;", "&undeclared;"});
    case 2:
        return "<![CDATA[" + pick({"", "x", "]]", "<a>", "&e0;"}) + "]]>";
    case 3:
        return pick({" ", "\n", "\r\n", "\t"});
    case 4:
        return pick({"%1", "%L2", "]]&gt;", "\xC3\x96", "yes", "12", "-1", "4294967296"});
    default:
        return depth > 0 ? piece(depth - 1) : std::string("t");
    }
}

std::string XmlMutator::attribute()
{
    const std::string value = Below(2) == 0 ? name() : text(0);
    switch (Below(4)) {
    case 0:
        return " xmlns:" + pick({"p", "q", "a", "xml"}) + "=\"" + pick({"u", "v", "", "&e0;"}) +
               "\"";
    case 1:
        return " xmlns=\"" + pick({"u", "v", ""}) + "\"";
    case 2:
        return ' ' + name() + "='" + value + "'";
    default:
        return " key=\"" + value + "\"";
    }
}

std::string XmlMutator::entityValue()
{
    std::string value;
    for (size_t left = Below(4); left > 0; --left)
        value += Below(3) == 0 ? "%p" + std::to_string(Below(3)) + ";" : text(1);
    std::replace(value.begin(), value.end(), '"', '\'');
    return '"' + value + '"';
}

std::string XmlMutator::piece(int depth)
{
    switch (Below(8)) {
    case 0:
        return "<!--" + pick({"", "c", "&e0;", "<a>", "-"}) + "-->";
    case 1:
        return "<?" + name() + ' ' + pick({"", "d", "&e0;"}) + "?>";
    case 2:
        return '<' + name() + attribute() + "/>";
    default: {
        const std::string tag = name();
        std::string element = '<' + tag + (Below(3) == 0 ? attribute() : std::string()) + '>';
        for (size_t left = Below(3); left > 0; --left)
            element += text(depth);
        return element + "</" + tag + '>';
    }
    }
}

std::string XmlMutator::declaration()
{
    const std::string general = "e" + std::to_string(Below(4));
    const std::string parameter = "p" + std::to_string(Below(3));
    switch (Below(12)) {
    case 0:
        return "<!ENTITY " + general + " SYSTEM \"s\">";
    case 1:
        return "<!ENTITY " + general + " PUBLIC \"i\" \"s\" NDATA n>";
    case 2:
        return "<!ENTITY % " + parameter + " SYSTEM 's'>";
    case 3:
        return "<!ENTITY % " + parameter + ' ' +
               (Below(2) == 0 ? '"' + declaration() + '"' : entityValue()) + '>';
    case 4:
        return '%' + parameter + ';';
    case 5:
        return "<!ELEMENT " + name() + ' ' +
               pick({"EMPTY", "ANY", "(#PCDATA)", "(a|b)*", "((a,b)|(%p0;))+", "(#PCDATA|a)*"}) +
               '>';
    case 6:
        return "<!ATTLIST " + name() + ' ' + name() + ' ' +
               pick({"CDATA", "ID", "NMTOKENS", "(x|y)", "NOTATION (n)", "%p1;"}) + ' ' +
               pick({"#REQUIRED", "#IMPLIED", "#FIXED 'f'", "'&e0;'"}) + '>';
    case 7:
        return "<!NOTATION n " + pick({"SYSTEM 's'", "PUBLIC 'i'", "PUBLIC 'i' 's'"}) + '>';
    case 8:
        return pick({"<!--]>-->", "<?d ]>?>", " ", "<![INCLUDE[]]>"});
    default:
        return "<!ENTITY " + general + ' ' + entityValue() + '>';
    }
}

// A place before or after markup.
size_t XmlMutator::boundary(std::string const& document)
{
    std::vector<size_t> places = {0, document.size()};
    for (size_t i = 0; i < document.size(); ++i) {
        if (document[i] == '<')
            places.push_back(i);
        else if (document[i] == '>')
            places.push_back(i + 1);
    }
    return places[Below(places.size())];
}

// From a start tag to the end tag of the same name; empty if there is none.
XmlMutator::Range XmlMutator::element(std::string const& document)
{
    const size_t start = document.find('<', document.empty() ? 0 : Below(document.size()));
    if (start == std::string::npos)
        return {0, 0};
    const size_t end = NameEnd(document, start + 1);
    const std::string tag = "</" + document.substr(start + 1, end - start - 1) + '>';
    const size_t close = document.find(tag, end);
    return close == std::string::npos ? Range{start, start} : Range{start, close + tag.size()};
}

void XmlMutator::insertPiece(std::string& document)
{
    document.insert(boundary(document), Below(2) == 0 ? piece(2) : text(1));
}

void XmlMutator::duplicate(std::string& document)
{
    const Range range = element(document);
    const std::string copy = document.substr(range.start, range.end - range.start);
    document.insert(boundary(document), copy);
}

void XmlMutator::remove(std::string& document)
{
    const Range range = element(document);
    document.erase(range.start, range.end - range.start);
}

void XmlMutator::wrap(std::string& document)
{
    const Range range = element(document);
    const std::string tag = name();
    document.insert(range.end, "</" + tag + '>');
    document.insert(range.start, '<' + tag + '>');
}

// In the end tag, too.
void XmlMutator::rename(std::string& document)
{
    const Range range = element(document);
    if (range.end == range.start)
        return;
    const size_t length = NameEnd(document, range.start + 1) - range.start - 1;
    const std::string tag = name();
    document.replace(range.end - 1 - length, length, tag);
    document.replace(range.start + 1, length, tag);
}

void XmlMutator::declare(std::string& document)
{
    size_t place = document.find("<!DOCTYPE");
    if (place == std::string::npos) {
        place = document.rfind("<?xml", 0) == 0 ? document.find("?>") : std::string::npos;
        place = place == std::string::npos ? 0 : place + 2;
        document.insert(place, "<!DOCTYPE r []>");
    }
    place = document.find('[', place);
    if (place == std::string::npos)
        return;
    // At the start of the declarations or after one of them.
    ++place;
    for (size_t left = Below(4); left > 0; --left) {
        const size_t next = document.find('>', place);
        const size_t end = document.find(']', place);
        if (next == std::string::npos || end < next)
            break;
        place = next + 1;
    }
    document.insert(place, declaration());
}

void XmlMutator::addAttribute(std::string& document)
{
    const size_t start = element(document).start;
    if (start < document.size() && document[start] == '<')
        document.insert(NameEnd(document, start + 1), attribute());
}

// Also inside quotes: in values of attributes and entities.
void XmlMutator::refer(std::string& document)
{
    const size_t quote = document.find(Below(2) == 0 ? '"' : '>', boundary(document));
    const size_t place = quote == std::string::npos ? boundary(document) : quote + 1;
    document.insert(place, "&e" + std::to_string(Below(4)) + ';');
}
