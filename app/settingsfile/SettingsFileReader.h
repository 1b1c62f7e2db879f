// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDocument.h"
#include "common/config/TorkConfigFileDocHandler.h"

#include <limits>

class QIODevice;
class TorkConfigFile;

namespace Velocor {

/// Reads a configuration file through the store, and notes what the store ignores.
///
/// The store decides what is a section, a key or a value; this class only observes the parser, to
/// report what saving would lose and where a file is broken. Nothing is written to the log. File
/// format: docs/config-file.md.
///
///     SettingsDocument document = SettingsFileReader::Read(path);
///     if (!document.isParsed)
///         report(document.error, document.line, document.column);
class SettingsFileReader : private TorkConfigFileDocHandler
{
public:
    /// The number of keys up to which a document is fit to be shown.
    static constexpr int ShownKeys = 1000000;

    /// The size of a file, in bytes, up to which it is read to be shown: reading takes several
    /// times as much memory, and nobody waits for it at the end of a long value.
    static constexpr qint64 ShownSize = 128 << 20;

    /// Reads a file. Only regular files and links to them are read.
    ///
    /// @param mostKeys  reading ends at the first key after these
    /// @param mostBytes  of a larger file nothing is read; at least 1 MiB
    static SettingsDocument Read(QString const& path,
                                 int mostKeys = std::numeric_limits<int>::max(),
                                 qint64 mostBytes = std::numeric_limits<qint64>::max());

    /// Reads a file if it is fit to be shown. Otherwise, the document says so in `isTooLarge`.
    static SettingsDocument ReadShown(QString const& path)
    {
        return Read(path, ShownKeys, ShownSize);
    }

    /// Reads the content of a file from memory.
    static SettingsDocument ReadBytes(QByteArray const& bytes);

    /// The maximum number of losses that are formatted; the others are only counted.
    static constexpr int MaximumLosses = 50;

private:
    SettingsFileReader(TorkConfigFile& store, SettingsDocument& document, int mostKeys);

    static void noteSize(qint64 mostBytes, SettingsDocument& document);
    static void read(QIODevice& device, SettingsDocument& document, int mostKeys);
    void noteLoss(QString const& what) { noteLossAt(depth(), what); }
    void noteLossAt(int depth, QString const& what);
    void noteLossOfValue();
    void noteNamespaces(int depth, QString const& localName, QString const& qName);

    void setDocumentLocator(QXmlLocator* locator) override { m_locator = locator; }
    bool startPrefixMapping(QString const& prefix, QString const& uri) override;
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;
    bool characters(QString const& text) override;
    bool processingInstruction(QString const& target, QString const& data) override;
    bool comment(QString const& text) override;
    bool startDTD(QString const& name, QString const& publicId, QString const& systemId) override;
    bool fatalError(QXmlParseException const& exception) override;

    TorkConfigFile& m_store;
    SettingsDocument& m_document;
    int m_mostKeys;
    int m_keyCount = 0;
    QXmlLocator* m_locator = nullptr; // set before anything is read
    QString m_section;                // the names of the last section and item that began
    QString m_item;
    QStringList m_namespaces;    // that the next element declares
    bool m_isAfterValue = false; // in the same item
};

} // namespace Velocor
