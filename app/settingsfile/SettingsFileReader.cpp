// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsFileReader.h"

#include "common/config/TorkConfigFile.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>
#include <QObject>
#include <QRegularExpression>

namespace Velocor {

namespace {

constexpr int MaximumDeclaration = 200; // bytes

// Whether a file that starts with an XML declaration means the same without it.
bool IsDefaultDeclaration(QByteArray const& start)
{
    static const QRegularExpression pattern(
        QStringLiteral("^<\\?xml\\s+version\\s*=\\s*(\"1\\.0\"|'1\\.0')"
                       "(\\s+encoding\\s*=\\s*(\"utf-8\"|'utf-8'))?\\s*\\?>"),
        QRegularExpression::CaseInsensitiveOption);
    return pattern.match(QString::fromLatin1(start)).hasMatch();
}

} // namespace

SettingsFileReader::SettingsFileReader(TorkConfigFile& store, SettingsDocument& document,
                                       int mostKeys)
    : TorkConfigFileDocHandler(&store), m_store(store), m_document(document), m_mostKeys(mostKeys)
{}

SettingsDocument SettingsFileReader::Read(QString const& path, int mostKeys, qint64 mostBytes)
{
    SettingsDocument document;
    QFile file(path);
    const QFileInfo info(path);
    if (info.isDir())
        document.error = QObject::tr("Is a folder");
    else if (info.exists() &&
             !info.isFile()) // opening a pipe would block, and a device may have no end
        document.error = QObject::tr("Not a regular file");
    else if (!file.open(QIODevice::ReadOnly))
        document.error = file.errorString();
    else if (file.size() > mostBytes)
        noteSize(mostBytes, document);
    else
        read(file, document, mostKeys);
    return document;
}

void SettingsFileReader::noteSize(qint64 mostBytes, SettingsDocument& document)
{
    document.isReadable = true;
    document.isTooLarge = true;
    document.error = QObject::tr("It is larger than %L1 MiB").arg(mostBytes >> 20);
}

SettingsDocument SettingsFileReader::ReadBytes(QByteArray const& bytes)
{
    SettingsDocument document;
    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    read(buffer, document, std::numeric_limits<int>::max());
    return document;
}

void SettingsFileReader::read(QIODevice& device, SettingsDocument& document, int mostKeys)
{
    document.isReadable = true;
    if (device.peek(5) == "<?xml" && !IsDefaultDeclaration(device.peek(MaximumDeclaration)))
        document.losses.append({QString(), QString(), QObject::tr("Line 1: the XML declaration")});
    document.lossCount = document.losses.size();

    TorkConfigFile store((QString()));
    SettingsFileReader reader(store, document, mostKeys);
    document.isParsed = store.LoadFrom(&device, reader);

    const QStringList names = store.sectionList();
    for (QString const& name : names) {
        SettingsDocument::Section section{name, {}};
        const auto items = store.FindSection(name)->values();
        section.items.reserve(items.size());
        for (auto const& item : items)
            section.items.append({item.key, item.value});
        document.sections.append(section);
    }
}

// In the last element that began at a depth: the section is at 2, the item at 3.
void SettingsFileReader::noteLossAt(int depth, QString const& what)
{
    ++m_document.lossCount;
    if (m_document.losses.size() >= MaximumLosses)
        return;
    m_document.losses.append({depth >= 2 ? m_section : QString(), depth >= 3 ? m_item : QString(),
                              QObject::tr("Line %1: %2").arg(m_locator->lineNumber()).arg(what)});
}

bool SettingsFileReader::startPrefixMapping(QString const&, QString const& uri)
{
    m_namespaces.append(uri);
    return true;
}

// To the store, a name is what follows its prefix.
void SettingsFileReader::noteNamespaces(int depth, QString const& localName, QString const& qName)
{
    for (QString const& uri : qAsConst(m_namespaces))
        noteLossAt(depth, QObject::tr("the namespace \"%1\" of \"%2\"").arg(uri, localName));
    m_namespaces.clear();
    if (qName != localName)
        noteLossAt(depth, QObject::tr("the prefix of \"%1\"").arg(qName));
}

bool SettingsFileReader::startElement(QString const& namespaceURI, QString const& localName,
                                      QString const& qName, QXmlAttributes const& attributes)
{
    m_isAfterValue = false;
    const int newDepth = depth() + 1;
    if (newDepth == 3 && ++m_keyCount > m_mostKeys) {
        m_document.isTooLarge = true;
        return false;
    }
    if (newDepth == 1) {
        m_document.rootName = localName;
        m_store.SetRootElementName(localName);
    }
    if (newDepth == 2)
        m_section = localName;
    else if (newDepth == 3)
        m_item = localName;
    noteNamespaces(newDepth, localName, qName);
    for (int i = 0; i < attributes.count(); ++i)
        noteLossAt(
            newDepth,
            QObject::tr("the attribute \"%1\" of \"%2\"").arg(attributes.qName(i), localName));

    const bool hasRootName = newDepth > 1 && localName == m_document.rootName;
    const bool isSection = newDepth == 2 && !hasRootName;
    if (hasRootName)
        noteLossAt(newDepth,
                   QObject::tr("the element \"%1\", which has the same name as the root element")
                       .arg(localName));
    else if (isSection && m_store.HasSection(localName))
        noteLossAt(newDepth,
                   QObject::tr("a second section \"%1\", merged with the first").arg(localName));
    else if (newDepth > 3)
        noteLossAt(newDepth, QObject::tr("the nesting of the element \"%1\"").arg(localName));

    TorkConfigFileDocHandler::startElement(namespaceURI, localName, qName, attributes);
    if (isSection && !m_store.HasSection(localName))
        noteLossAt(newDepth, QObject::tr("the name of the section \"%1\"").arg(localName));
    return true;
}

bool SettingsFileReader::endElement(QString const& namespaceURI, QString const& localName,
                                    QString const& qName)
{
    m_isAfterValue = false;
    if (depth() == 3 && isAtStartTag() && m_store.IsExpectingValue())
        noteLoss(QObject::tr("the empty item \"%1\"").arg(localName));
    return TorkConfigFileDocHandler::endElement(namespaceURI, localName, qName);
}

// Called before the store accepts a value: checks that it has a section and is not a duplicate.
void SettingsFileReader::noteLossOfValue()
{
    TorkConfigFileSection const* section = m_store.CurrentSection();
    const QString key = lastOpenedElement();
    QString none;
    QString earlier;
    if (!section)
        noteLoss(QObject::tr("\"%1\", which is outside any section").arg(key));
    else if (m_store.ReadItem(section->name(), key, none, earlier))
        noteLoss(QObject::tr("the first value of \"%1\", replaced by a second one").arg(key));
}

bool SettingsFileReader::characters(QString const& text)
{
    if (isAtStartTag() && m_store.IsExpectingValue()) {
        noteLossOfValue();
        m_isAfterValue = depth() == 3;
    } else if (m_isAfterValue) {
        noteLoss(QObject::tr("the value of \"%1\", starting at \"%2\"")
                     .arg(lastOpenedElement(), text.left(20)));
    } else if (!text.trimmed().isEmpty()) {
        noteLoss(QObject::tr("the text \"%1\" outside any value").arg(text.trimmed().left(20)));
    }
    return TorkConfigFileDocHandler::characters(text);
}

bool SettingsFileReader::processingInstruction(QString const& target, QString const&)
{
    if (target != QLatin1String("xml"))
        noteLoss(QObject::tr("the processing instruction \"%1\"").arg(target));
    return true;
}

bool SettingsFileReader::comment(QString const& text)
{
    noteLoss(QObject::tr("the comment \"%1\"").arg(text.simplified().left(40)));
    return true;
}

bool SettingsFileReader::startDTD(QString const& name, QString const&, QString const&)
{
    noteLoss(QObject::tr("the document type \"%1\"").arg(name));
    return true;
}

bool SettingsFileReader::fatalError(QXmlParseException const& exception)
{
    m_document.error = m_document.isTooLarge
                           ? QObject::tr("It has more than %L1 keys").arg(m_mostKeys)
                           : exception.message();
    m_document.line = exception.lineNumber();
    m_document.column = exception.columnNumber();
    return false;
}

} // namespace Velocor
