// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"

#include <QHash>
#include <QVector>
#include <QXmlDefaultHandler>

class QIODevice;

namespace Velocor {

/// Reads a configuration-store file as the store does, and notes what the store passes over.
///
/// Unlike TorkConfigFile::Load() it enumerates sections, tells where a file is broken, and writes
/// nothing to the log. File format: docs/config-file.md.
///
///     SettingsDocument document = SettingsFileReader::Read(path);
///     if (!document.isParsed)
///         tell(document.error, document.line, document.column);
class SettingsFileReader : private QXmlDefaultHandler
{
public:
    /// Reads a file.
    static SettingsDocument Read(QString const& path);

    /// Reads a text as if it were the content of a file.
    static SettingsDocument ReadBytes(QByteArray const& bytes);

    /// The most losses that are worded.
    static constexpr int MostLosses = 50;

private:
    void read(QIODevice& device);
    void lose(QString const& what);
    void store(QString const& key, QString const& value);
    void openSection(QString const& name);

    void setDocumentLocator(QXmlLocator* locator) override { m_locator = locator; }
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;
    bool characters(QString const& text) override;
    bool processingInstruction(QString const& target, QString const& data) override;
    bool comment(QString const& text) override;
    bool startDTD(QString const& name, QString const& publicId, QString const& systemId) override;
    bool fatalError(QXmlParseException const& exception) override;

    SettingsDocument m_document;
    QXmlLocator* m_locator = nullptr;
    int m_depth = 0;
    int m_section = -1;
    QHash<QString, int> m_sectionPlaces;
    QVector<QHash<QString, int>> m_itemPlaces; // of each section
    bool m_atRoot = false;
    bool m_expectingValue = false;
    bool m_justOpened = false;
    bool m_hasValue = false;
    QString m_element;
};

} // namespace Velocor
