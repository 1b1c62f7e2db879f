// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QXmlDefaultHandler>
#include <QXmlInputSource>

class QXmlSimpleReader;

/// An input source that keeps hostile document types away from the XML reader.
///
/// The reader calls itself once per open group of a content model, compares each entity that is
/// declared with all others, and puts each in as often as it is named: a hundred kilobytes of any
/// of these could exhaust the stack, take minutes or fill the memory. No content handler is told of
/// document types, so one that limits the nesting of elements does not see them. The limits are
/// those of TorkXmlDepth.h; besides, no parameter entity may hold a group. What is beyond them ends
/// the parse as malformed input ends. One parse, one thread.
///
///     QFile file(path);
///     TorkXmlGuard source(&file);
///     QXmlSimpleReader reader;
///     source.Watch(reader);
///     reader.setContentHandler(&manager);
///     reader.parse(source);
class TorkXmlGuard : public QXmlInputSource, public QXmlDefaultHandler
{
public:
    /// Reads from a device, which stays the caller's.
    explicit TorkXmlGuard(QIODevice* device);
    ~TorkXmlGuard() override;

    /// Makes the guard the reader's lexical and declaration handler.
    void Watch(QXmlSimpleReader& reader);

    /// The next character; where it is one too many of its kind, the end of the document.
    QChar next() override;

    bool startDTD(QString const& name, QString const& publicId, QString const& systemId) override;
    bool endDTD() override;

    /// @return false, which stops the reader, for an entity that is one too many or might nest
    bool internalEntityDecl(QString const& name, QString const& value) override;

private:
    bool nestsTooDeep(QChar character);
    bool expandsTooFar(QChar character);

    QChar fetchNext();
    QChar checked(QChar character);

    // What the device gave last, walked through here instead of by the toolkit's own next(), which
    // takes twice as long.
    QString m_fetched;
    QChar const* m_next = nullptr;
    QChar const* m_end = nullptr;
    bool m_toldEndOfData = true;

    bool m_inDocumentType = false;
    bool m_refused = false;
    int m_openGroups = 0;
    int m_entities = 0;
    qint64 m_longestEntity = 0; ///< the most characters that one reference can stand for
    qint64 m_expansion = 0;     ///< the most that all references so far can stand for
};
