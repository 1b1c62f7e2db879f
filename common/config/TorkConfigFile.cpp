// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "common/config/TorkConfigFileDocHandler.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlGuard.h"

#include <QFile>
#include <QObject>
#include <QXmlSimpleReader>

namespace {

void TraceToLog(QString const& message)
{
    if (TorkLog* log = TorkLog::m_gLog)
        log->trace(message);
}

// Looks at all characters without stopping, several at once: names and values are short, and nearly
// none holds what is looked for.
bool Contains(QString const& text, char character)
{
    bool found = false;
    for (QChar present : text)
        found |= present.unicode() == static_cast<uchar>(character);
    return found;
}

QString WithoutSpaces(QString const& name)
{
    if (!Contains(name, ' '))
        return name;

    QString cleaned = name;
    return cleaned.remove(QLatin1Char(' '));
}

// What stands under `name` without its spaces. The name is looked for as it is first: where no key
// of the table holds a space, one that is found has none either, and is not searched for spaces.
template <class Table>
auto FindWithoutSpaces(Table& table, QString const& name)
{
    auto* const found = table.holdsSpaces() ? nullptr : table.find(name);
    return found ? found : table.find(WithoutSpaces(name));
}

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

    TorkConfigFileDocHandler contentHandler(this);
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
    TorkConfigFileSection** found = FindWithoutSpaces(m_sections, section);
    if (!found)
        return nullptr;

    m_currentSection = *found;
    return FindWithoutSpaces(m_currentSection->values(), key);
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
    // Not made anew for each element, as it would be from Latin-1.
    m_currentElement = QStringLiteral(""); // clazy:exclude=empty-qstringliteral
}

// cppcheck-suppress constParameter ; the interface stands
bool TorkConfigFile::ProcessContent(QString& content)
{
    if (m_atRoot || !m_expectingValue)
        return true;

    m_expectingValue = false;
    if (!m_currentSection)
        return true;

    // The current section stands in the table under its own name; only names with spaces in them
    // would lead elsewhere.
    if (m_sections.holdsSpaces() || Contains(m_currentElement, ' '))
        WriteItem(m_currentSection->name(), m_currentElement, content);
    else if (!content.isNull())
        m_currentSection->AddValue(m_currentElement, content);
    return true;
}
