// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "common/config/TorkConfigFileDocHandler.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlDepth.h"
#include "common/xml/TorkXmlGuard.h"

#include <QFile>
#include <QObject>
#include <QXmlSimpleReader>

#include <algorithm>

namespace {

void TraceToLog(QString const& message)
{
    if (TorkLog* log = TorkLog::m_gLog)
        log->trace(message);
}

bool Contains(QString const& text, char character)
{
    const QChar wanted = QLatin1Char(character);
    return std::find(text.constBegin(), text.constEnd(), wanted) != text.constEnd();
}

QString WithoutSpaces(QString const& name)
{
    if (!Contains(name, ' '))
        return name;

    QString cleaned = name;
    return cleaned.remove(QLatin1Char(' '));
}

bool IsMarkup(QChar character)
{
    switch (character.unicode()) {
    case '&':
    case '\'':
    case '<':
    case '>':
    case '"':
        return true;
    default:
        return false;
    }
}

bool HoldsMarkup(QString const& text)
{
    return std::any_of(text.constBegin(), text.constEnd(), IsMarkup);
}

// As QString::toLatin1() converts, without a byte array of its own for each piece: half the time
// of a save.
void AppendLatin1(QByteArray& xml, QString const& text)
{
    const int end = xml.size();
    xml.resize(end + text.size());
    std::transform(text.constBegin(), text.constEnd(), xml.data() + end, [](QChar character) {
        return character.unicode() > 0xff ? '?' : static_cast<char>(character.unicode());
    });
}

void AppendTag(QByteArray& xml, char const* opening, QString const& name)
{
    xml += opening;
    AppendLatin1(xml, name);
    xml += ">\n";
}

// Filled one after another, as ever: a key or value that holds a placeholder of its own comes out
// changed, and files that hold such lines exist. Without a '%' joining gives the same text.
void AppendItem(QByteArray& xml, QString const& key, QString const& value)
{
    if (Contains(key, '%') || Contains(value, '%')) {
        const QString line = QStringLiteral("<%1>%2</%3>\n");
        AppendLatin1(xml, line.arg(key).arg(value).arg(key)); // clazy:exclude=qstring-arg
        return;
    }

    xml += '<';
    AppendLatin1(xml, key);
    xml += '>';
    AppendLatin1(xml, value);
    AppendTag(xml, "</", key);
}

// Ends the parse of a document that is nested too deep for the reader's stack.
class DepthLimitedDocHandler : public TorkConfigFileDocHandler
{
public:
    using TorkConfigFileDocHandler::TorkConfigFileDocHandler;

    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override
    {
        return depth() < TorkXmlMaximumDepth &&
               TorkConfigFileDocHandler::startElement(namespaceURI, localName, qName, attributes);
    }
};

} // namespace

TorkConfigFile::TorkConfigFile(QString const& fileName)
    : TorkConfigFile(fileName, QStringLiteral("VelocorSettings"))
{}

TorkConfigFile::TorkConfigFile(QString const& fileName, QString const& rootElementName)
    : m_fileName(fileName), m_rootElementName(rootElementName), m_currentElement(QLatin1String("")),
      m_lastError(QLatin1String("")), m_screensSectionName(QStringLiteral("ApplicationScreens"))
{}

TorkConfigFile::~TorkConfigFile()
{
    Clear();
}

void TorkConfigFile::SetFileName(QString const& fileName)
{
    m_fileName = fileName;
}

void TorkConfigFile::Clear()
{
    for (auto const& entry : m_sections)
        delete entry.value;
    m_sections.clear();
    m_replacedSections.clear();
    m_currentSection = nullptr;
}

bool TorkConfigFile::Load()
{
    TraceToLog(QObject::tr("Loading configuration from %1").arg(m_fileName));

    if (m_fileName.length() < 1) {
        fail(QObject::tr("ConfigFile - Load failed - No file name specified."));
        return false;
    }
    if (!QFile::exists(m_fileName)) {
        fail(QObject::tr("ConfigFile - File not found."));
        return false;
    }

    m_lastError = QLatin1String("");
    Clear();
    const bool parsed = parse();
    if (!parsed)
        fail(QObject::tr("ConfigFile - Could not parse the input file."));
    return parsed;
}

bool TorkConfigFile::parse()
{
    m_atRoot = false;
    m_expectingValue = false;
    m_currentElement = QLatin1String("");

    DepthLimitedDocHandler contentHandler(this);
    TorkErrorHandler errorHandler(TorkLog::m_gLog);
    QFile file(m_fileName);
    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(&contentHandler);
    reader.setErrorHandler(&errorHandler);

    m_activeHandler = &contentHandler;
    const bool parsed = reader.parse(source);
    m_activeHandler = nullptr;
    return parsed;
}

void TorkConfigFile::fail(QString const& message)
{
    m_lastError = message;
    TraceToLog(message);
}

bool TorkConfigFile::Save()
{
    // Two characters here but one in Load(): existing callers rely on both.
    if (m_fileName.length() < 2)
        return true;

    // Worded before the file is emptied, so that as little as possible can come between.
    const QByteArray xml = toXml();
    QFile file(m_fileName);
    if (!file.open(QIODevice::WriteOnly)) {
        m_lastError = QStringLiteral("Unable to open file: %1").arg(m_fileName);
        return true;
    }
    file.write(xml);
    file.close();
    return true;
}

QByteArray TorkConfigFile::toXml()
{
    QByteArray xml;
    AppendTag(xml, "<", m_rootElementName);
    QString filtered;
    for (auto const& section : m_sections) {
        AppendTag(xml, "<", section.value->name());
        for (auto const& item : section.value->values()) {
            QString value = item.value;
            FilterContent(value, filtered);
            AppendItem(xml, item.key, filtered);
        }
        AppendTag(xml, "</", section.value->name());
    }
    AppendTag(xml, "</", m_rootElementName);
    return xml;
}

bool TorkConfigFile::HasSection(QString const& name)
{
    return lookUp(name) != nullptr;
}

// cppcheck-suppress constParameter ; the interface stands
bool TorkConfigFile::HasSection(QString& name)
{
    return lookUp(name) != nullptr;
}

TorkConfigFileSection* TorkConfigFile::FindSection(QString const& name)
{
    return lookUp(name);
}

// cppcheck-suppress constParameter ; the interface stands
TorkConfigFileSection* TorkConfigFile::FindSection(QString& name)
{
    return lookUp(name);
}

TorkConfigFileSection* TorkConfigFile::lookUp(QString const& name)
{
    TorkConfigFileSection** found = m_sections.find(name);
    if (!found)
        return nullptr;

    m_currentSection = *found;
    return *found;
}

bool TorkConfigFile::AppendSection(TorkConfigFileSection* section)
{
    if (!section)
        return true;

    TorkConfigFileSection** replaced = m_sections.find(section->name());
    if (replaced && *replaced == m_currentSection)
        m_currentSection = section; // the replaced one may be deleted by whoever holds it
    m_sections.insert(section->name(), section);
    return true;
}

TorkConfigFileSection* TorkConfigFile::createSection(QString const& name)
{
    auto* section = new TorkConfigFileSection(name.toLatin1().constData());
    TorkConfigFileSection** replaced = m_sections.find(section->name());
    if (replaced)
        m_replacedSections.emplace_back(*replaced);
    AppendSection(section);
    m_currentSection = section;
    return section;
}

void TorkConfigFile::ClearSection(QString const& name)
{
    if (TorkConfigFileSection* section = lookUp(name))
        section->Clear();
}

QStringList TorkConfigFile::keyList(QString const& section)
{
    TorkConfigFileSection* found = lookUp(section);
    return found ? found->keyList() : QStringList();
}

QString const* TorkConfigFile::findValue(QString const& section, QString const& key)
{
    TorkConfigFileSection* found = lookUp(WithoutSpaces(section));
    return found ? found->values().find(WithoutSpaces(key)) : nullptr;
}

// cppcheck-suppress constParameter ; the interface stands
bool TorkConfigFile::ReadItem(QString const& section, QString const& key, QString& defaultValue,
                              QString& value)
{
    if (QString const* stored = findValue(section, key)) {
        value = *stored;
        return true;
    }
    value = defaultValue.isEmpty() ? QString(QLatin1String("")) : defaultValue;
    return false;
}

bool TorkConfigFile::WriteItem(QString const& section, QString const& key, QString const& value)
{
    if (key.isNull() || value.isNull())
        return false;

    const QString sectionName = WithoutSpaces(section);
    TorkConfigFileSection* target = lookUp(sectionName);
    if (!target)
        target = createSection(sectionName);
    return target->AddValue(WithoutSpaces(key), value);
}

// cppcheck-suppress constParameter ; the interface stands
void TorkConfigFile::StartElement(QString& name)
{
    m_currentElement = name;

    // White space inside a new section is no value, even where the item before had no text.
    const int depth = m_activeHandler ? m_activeHandler->depth() : 0;
    if (depth == 1 || depth == 2)
        m_expectingValue = false;

    m_atRoot = name == m_rootElementName;
    if (m_atRoot)
        return;

    if (depth == 2 && !lookUp(name))
        createSection(name);
    else if (depth == 3)
        m_expectingValue = true;
    // Deeper elements leave the flag: one inside an item without text is stored as if it were the
    // item.
}

void TorkConfigFile::EndElement(QString&)
{
    m_currentElement = QLatin1String("");
}

// cppcheck-suppress constParameter ; the interface stands
bool TorkConfigFile::ProcessContent(QString& content)
{
    if (m_atRoot || !m_expectingValue)
        return true;

    m_expectingValue = false;
    if (!m_currentSection)
        return true;

    // The current section stands in the table under its own name; only a name with spaces in it
    // would lead elsewhere.
    QString const& section = m_currentSection->name();
    if (Contains(section, ' '))
        WriteItem(section, m_currentElement, content);
    else if (!content.isNull())
        m_currentSection->AddValue(WithoutSpaces(m_currentElement), content);
    return true;
}

// cppcheck-suppress constParameter ; the interface stands
void TorkConfigFile::FilterContent(QString& in, QString& out)
{
    if (HoldsMarkup(in))
        out = QLatin1String("<![CDATA[") + in + QLatin1String("]]>");
    else
        out = in;
}
