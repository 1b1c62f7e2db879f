// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOptionParser.h"

#include "app/EmptyText_p.h"
#include "app/XmlNesting_p.h"
#include "common/xml/TorkXmlLimits.h"

#include <QByteArray>
#include <QFile>
#include <QFileInfo>
#include <QTextStream>

// A program that links this may include its own rapidxml, in another version or configuration.
#define rapidxml VelocorRapidXml
#include <rapidxml.hpp>

#include <cstring>
#include <exception>
#include <memory>

namespace {

// Far larger than any real file, but small enough not to exhaust memory at startup.
constexpr int MaximumLength = 256 * 1024 * 1024;

using XmlAttribute = rapidxml::xml_attribute<char>;
using XmlNode = rapidxml::xml_node<char>;

template <class XmlItem>
QString Name(XmlItem const& item)
{
    return QString::fromLocal8Bit(item.name(), static_cast<int>(item.name_size()));
}

// Uses the size, because a character reference can put a zero byte into the value.
template <class XmlItem>
QString Value(XmlItem const& item)
{
    return QString::fromLocal8Bit(item.value(), static_cast<int>(item.value_size()));
}

bool IsKey(XmlAttribute const* attribute)
{
    constexpr char key[] = "key";
    const size_t length = sizeof(key) - 1;
    return attribute && attribute->name_size() == length &&
           std::memcmp(attribute->name(), key, length) == 0;
}

bool Apply(LaunchOptionParser& parser, XmlNode const& node)
{
    XmlAttribute const* attribute = node.first_attribute();
    if (!IsKey(attribute))
        return true;

    LaunchOption* option = parser.FindOption(Value(*attribute));
    if (!option) {
        // Parsing continues in spite of the message.
        parser.errorText +=
            QStringLiteral("Unknown %1 = %2. Value: %3 failed to set. - Parsing terminated.")
                .arg(Name(*attribute), Value(*attribute), Value(node));
        return false;
    }
    option->value = Value(node);
    option->isSet = true;
    return true;
}

// Only the first node is selected by name; later siblings are applied whatever their name.
bool ApplyAll(LaunchOptionParser& parser, rapidxml::xml_document<char> const& document)
{
    bool allKnown = true;
    for (XmlNode const* node = document.first_node("arg"); node; node = node->next_sibling())
        allKnown = Apply(parser, *node) && allKnown;
    return allKnown;
}

} // namespace

LaunchOptionParser::LaunchOptionParser() : errorText(Velocor::EmptyText()) {}

LaunchOptionParser::~LaunchOptionParser()
{
    while (!options.isEmpty())
        delete options.takeFirst();
}

void LaunchOptionParser::AddOption(LaunchOption* option)
{
    options.append(option);
}

LaunchOption* LaunchOptionParser::FindOption(QString const& key) const
{
    for (LaunchOption* option : options) {
        if (option && option->name == key)
            return option;
    }
    return nullptr;
}

bool LaunchOptionParser::ReadDataFile(QString const& path)
{
    // Opening a pipe would block until there is a writer, and a device may have no end.
    if (!QFileInfo(path).isFile())
        return false;

    QFile file(path);
    if (!file.open(QIODevice::ReadOnly | QIODevice::Text))
        return false;

    QString content = QTextStream(&file).read(MaximumLength + 1);
    if (content.length() > MaximumLength)
        return false;
    return content.isEmpty() || ParseOptions(content);
}

// cppcheck-suppress constParameter ; the public signature is fixed
bool LaunchOptionParser::ParseOptions(QString& text)
{
    QByteArray xml = text.toLocal8Bit();
    if (Velocor::NestedDeeperThan(xml.constData(), TorkXmlMaximumDepth))
        return false;

    try {
        // On the heap, because the document contains a large memory pool.
        const auto document = std::make_unique<rapidxml::xml_document<char>>();
        document->parse<rapidxml::parse_default>(xml.data());
        return ApplyAll(*this, *document);
    } catch (rapidxml::parse_error const&) {
        return false; // memory that runs out is no failure of the file: it ends the program
    }
}
