// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "common/config/TorkConfigFileDocHandler.h"
#include "common/config/TorkOrderedHash_p.h"
#include "common/log/TorkEmptyText_p.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlGuard.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>
#include <QObject>
#include <QXmlSimpleReader>

#include <algorithm>

namespace {

void TraceToLog(QString const& message)
{
    if (TorkLog* log = TorkLog::m_gLog)
        log->trace(message);
}

// Checked first: almost no name has a space, and QString::remove() copies even if there is none.
// For the goal "typed reads" in docs/performance.md; tests/plain/tst_PlainNumbers.cpp compares.
bool HasSpace(QString const& name)
{
    return std::find(name.begin(), name.end(), QLatin1Char(' ')) != name.end();
}

QString WithoutSpaces(QString name)
{
    return HasSpace(name) ? name.remove(QLatin1Char(' ')) : name;
}

} // namespace

TorkConfigFile::TorkConfigFile(QString const& fileName)
    : TorkConfigFile(fileName, QStringLiteral("VelocorSettings"))
{}

TorkConfigFile::TorkConfigFile(QString const& fileName, QString const& rootElementName)
    : m_fileName(fileName), m_rootElementName(rootElementName),
      m_sections(new TorkOrderedHash<TorkConfigFileSection*>), m_currentElement(TorkEmptyText()),
      m_lastError(TorkEmptyText()), m_screensSectionName(QStringLiteral("ApplicationScreens"))
{}

TorkConfigFile::~TorkConfigFile()
{
    Clear();
}

void TorkConfigFile::SetFileName(QString const& fileName)
{
    m_fileName = fileName;
}

void TorkConfigFile::SetRootElementName(QString const& rootElementName)
{
    m_rootElementName = rootElementName;
}

void TorkConfigFile::Clear()
{
    for (auto const& entry : *m_sections)
        delete entry.value;
    m_sections->clear();
    m_knownOutside.clear();
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

    m_lastError = TorkEmptyText();
    Clear();
    const bool parsed = parseFile();
    if (!parsed)
        fail(QObject::tr("ConfigFile - Could not parse the input file."));
    return parsed;
}

bool TorkConfigFile::LoadFrom(QIODevice* device)
{
    TorkConfigFileDocHandler handler(this);
    return LoadFrom(device, handler);
}

bool TorkConfigFile::LoadFrom(QIODevice* device, TorkConfigFileDocHandler& handler)
{
    Clear();
    return parse(device, handler, handler, &handler);
}

bool TorkConfigFile::parseFile()
{
    TorkConfigFileDocHandler contentHandler(this);
    TorkErrorHandler errorHandler(TorkLog::m_gLog);
    QFile file(m_fileName);
    QBuffer nothing;
    // Anything but a regular file, such as a pipe or a device, could block the load or never end.
    const bool isFile = QFileInfo(m_fileName).isFile();
    return parse(isFile ? static_cast<QIODevice*>(&file) : &nothing, contentHandler, errorHandler,
                 nullptr);
}

bool TorkConfigFile::parse(QIODevice* device, TorkConfigFileDocHandler& handler,
                           QXmlErrorHandler& errorHandler, QXmlLexicalHandler* lexicalHandler)
{
    m_atRoot = false;
    m_expectingValue = false;
    m_currentElement = TorkEmptyText();

    TorkXmlGuard source(device);
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(&handler);
    reader.setErrorHandler(&errorHandler);
    reader.setLexicalHandler(lexicalHandler);

    m_activeHandler = &handler;
    const bool parsed = reader.parse(source);
    m_activeHandler = nullptr;
    return parsed;
}

void TorkConfigFile::fail(QString const& message)
{
    m_lastError = message;
    TraceToLog(message);
}

QStringList TorkConfigFile::sectionList() const
{
    QStringList names;
    names.reserve(static_cast<int>(m_sections->size()));
    for (auto const& entry : *m_sections)
        names.append(entry.key);
    return names;
}

bool TorkConfigFile::HasSection(QString const& name)
{
    return lookUp(name) != nullptr;
}

// cppcheck-suppress constParameter ; part of the public interface
bool TorkConfigFile::HasSection(QString& name)
{
    return lookUp(name) != nullptr;
}

TorkConfigFileSection* TorkConfigFile::FindSection(QString const& name)
{
    return handOut(name);
}

// cppcheck-suppress constParameter ; part of the public interface
TorkConfigFileSection* TorkConfigFile::FindSection(QString& name)
{
    return handOut(name);
}

TorkConfigFileSection* TorkConfigFile::lookUp(QString const& name)
{
    TorkConfigFileSection** found = m_sections->find(name);
    if (!found)
        return nullptr;

    m_currentSection = *found;
    return *found;
}

TorkConfigFileSection* TorkConfigFile::handOut(QString const& name)
{
    TorkConfigFileSection* section = lookUp(name);
    if (section)
        m_knownOutside.insert(section);
    return section;
}

bool TorkConfigFile::AppendSection(TorkConfigFileSection* section)
{
    if (section) {
        put(section);
        m_knownOutside.insert(section);
    }
    return true;
}

// A section that already has the name now belongs to its holder; one that was never handed out has
// no holder, so it is deleted here.
void TorkConfigFile::put(TorkConfigFileSection* section)
{
    TorkConfigFileSection** found = m_sections->find(section->name());
    TorkConfigFileSection* const before = found ? *found : nullptr;
    m_sections->insert(section->name(), section);
    if (!before || before == section)
        return;

    if (before == m_currentSection)
        m_currentSection = section;
    if (!m_knownOutside.remove(before))
        delete before;
}

TorkConfigFileSection* TorkConfigFile::createSection(QString const& name)
{
    auto* section = new TorkConfigFileSection(name.toLatin1().constData());
    put(section);
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
    // Names without spaces are not copied, see HasSpace().
    if (HasSpace(section) || HasSpace(key))
        return findCleaned(WithoutSpaces(section), WithoutSpaces(key));
    return findCleaned(section, key);
}

QString const* TorkConfigFile::findCleaned(QString const& section, QString const& key)
{
    TorkConfigFileSection* found = lookUp(section);
    return found ? found->m_values->find(key) : nullptr;
}

// cppcheck-suppress constParameter ; part of the public interface
bool TorkConfigFile::ReadItem(QString const& section, QString const& key, QString& defaultValue,
                              QString& value)
{
    if (QString const* stored = findValue(section, key)) {
        value = *stored;
        return true;
    }
    value = defaultValue.isEmpty() ? TorkEmptyText() : defaultValue;
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

// cppcheck-suppress constParameter ; part of the public interface
bool TorkConfigFile::StartElement(QString& name)
{
    m_currentElement = name;
    m_atRoot = name == m_rootElementName;
    if (m_atRoot)
        return true;

    // White space inside a new section is not a value, even if the previous item had no text.
    const int depth = m_activeHandler ? m_activeHandler->depth() : 0;
    if (depth == 1 || depth == 2)
        m_expectingValue = false;

    if (depth == 2 && !lookUp(name))
        createSection(name);
    else if (depth == 3)
        m_expectingValue = true;
    // Deeper elements do not touch the flag: one inside an item without text is stored as if it
    // were the item.
    return true;
}

bool TorkConfigFile::EndElement(QString&)
{
    m_currentElement = TorkEmptyText();
    return true;
}

// cppcheck-suppress constParameter ; part of the public interface
bool TorkConfigFile::ProcessContent(QString& content)
{
    if (m_atRoot || !m_expectingValue)
        return true;

    m_expectingValue = false;
    if (m_currentSection)
        WriteItem(m_currentSection->name(), m_currentElement, content);
    return true;
}
