// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsFileReader.h"

#include "common/xml/TorkXmlGuard.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>
#include <QObject>
#include <QXmlSimpleReader>

namespace Velocor {

SettingsDocument SettingsFileReader::Read(QString const& path)
{
    SettingsFileReader reader;
    QFile file(path);
    const QFileInfo info(path);
    if (info.isDir())
        reader.m_document.error = QObject::tr("Is a folder");
    else if (info.exists() && !info.isFile()) // opening a pipe waits, and a device may have no end
        reader.m_document.error = QObject::tr("Not a regular file");
    else if (!file.open(QIODevice::ReadOnly))
        reader.m_document.error = file.errorString();
    else
        reader.read(file);
    return reader.m_document;
}

SettingsDocument SettingsFileReader::ReadBytes(QByteArray const& bytes)
{
    SettingsFileReader reader;
    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    reader.read(buffer);
    return reader.m_document;
}

void SettingsFileReader::read(QIODevice& device)
{
    m_document.isReadable = true;
    if (device.peek(5) == "<?xml")
        m_document.losses.append(QObject::tr("Line 1: the XML declaration"));
    m_document.lossCount = m_document.losses.size();

    TorkXmlGuard source(&device);
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(this);
    reader.setErrorHandler(this);
    reader.setLexicalHandler(this);
    m_document.isParsed = reader.parse(source);
    if (!m_document.isParsed && m_document.error.isEmpty())
        m_document.error = QObject::tr("The file is no configuration file");
}

void SettingsFileReader::lose(QString const& what)
{
    ++m_document.lossCount;
    if (m_document.losses.size() >= MostLosses)
        return;
    const int line = m_locator ? m_locator->lineNumber() : 0;
    m_document.losses.append(QObject::tr("Line %1: %2").arg(line).arg(what));
}

void SettingsFileReader::openSection(QString const& name)
{
    const auto found = m_sectionPlaces.constFind(name);
    if (found != m_sectionPlaces.constEnd()) {
        m_section = *found;
        lose(QObject::tr("a second section \"%1\", merged with the first").arg(name));
        return;
    }
    m_section = m_document.sections.size();
    m_sectionPlaces.insert(name, m_section);
    m_itemPlaces.append(QHash<QString, int>());
    m_document.sections.append({name, {}});
}

void SettingsFileReader::store(QString const& key, QString const& value)
{
    if (m_section < 0) {
        lose(QObject::tr("\"%1\", which is in no section").arg(key));
        return;
    }
    QVector<SettingsDocument::Item>& items = m_document.sections[m_section].items;
    QHash<QString, int>& places = m_itemPlaces[m_section];
    const auto found = places.constFind(key);
    if (found != places.constEnd()) {
        lose(QObject::tr("a second value of \"%1\", in the place of the first").arg(key));
        items[*found].value = value;
        return;
    }
    places.insert(key, items.size());
    items.append({key, value});
}

bool SettingsFileReader::startElement(QString const&, QString const& localName, QString const&,
                                      QXmlAttributes const& attributes)
{
    ++m_depth;
    m_element = localName;
    m_justOpened = true;
    if (m_depth == 1)
        m_document.rootName = localName;
    for (int i = 0; i < attributes.count(); ++i)
        lose(QObject::tr("the attribute \"%1\" of \"%2\"").arg(attributes.qName(i), localName));

    if (m_depth <= 2)
        m_expectingValue = false;
    m_atRoot = localName == m_document.rootName;
    if (m_atRoot && m_depth > 1)
        lose(QObject::tr("the element \"%1\", which is called like the root").arg(localName));
    if (m_atRoot)
        return true;
    if (m_depth == 2)
        openSection(localName);
    else if (m_depth == 3)
        m_expectingValue = true;
    else if (m_depth > 3)
        lose(QObject::tr("the nesting of the element \"%1\"").arg(localName));
    m_hasValue = false;
    return true;
}

bool SettingsFileReader::endElement(QString const&, QString const& localName, QString const&)
{
    if (m_depth == 3 && m_expectingValue && localName == m_element)
        lose(QObject::tr("\"%1\", which has no text").arg(localName));
    --m_depth;
    m_element.clear();
    m_justOpened = false;
    return true;
}

// Only the first piece of text after a start tag is a value.
bool SettingsFileReader::characters(QString const& text)
{
    const bool isFirst = m_justOpened;
    m_justOpened = false;
    if (isFirst && !m_atRoot && m_expectingValue) {
        m_expectingValue = false;
        m_hasValue = true;
        store(m_element, text);
        return true;
    }
    const bool isRestOfValue = !isFirst && m_hasValue && m_depth == 3 && !m_element.isEmpty();
    if (isRestOfValue)
        lose(QObject::tr("the value of \"%1\" from \"%2\" on").arg(m_element, text.left(20)));
    else if (!text.trimmed().isEmpty())
        lose(QObject::tr("the text \"%1\" outside of values").arg(text.trimmed().left(20)));
    return true;
}

bool SettingsFileReader::processingInstruction(QString const& target, QString const&)
{
    if (target != QLatin1String("xml"))
        lose(QObject::tr("the instruction \"%1\"").arg(target));
    return true;
}

bool SettingsFileReader::comment(QString const& text)
{
    lose(QObject::tr("the comment \"%1\"").arg(text.simplified().left(40)));
    return true;
}

bool SettingsFileReader::startDTD(QString const& name, QString const&, QString const&)
{
    lose(QObject::tr("the document type \"%1\"").arg(name));
    return true;
}

bool SettingsFileReader::fatalError(QXmlParseException const& exception)
{
    m_document.error = exception.message();
    m_document.line = exception.lineNumber();
    m_document.column = exception.columnNumber();
    return false;
}

} // namespace Velocor
