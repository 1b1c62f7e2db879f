// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QBuffer>
#include <QByteArray>
#include <QStringList>
#include <QXmlDefaultHandler>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

/// Records everything Qt's reader reports about a document, one text per event, and the result
/// last.
class XmlEvents : public QXmlDefaultHandler
{
public:
    /// The reader's events for `document`, read through a source of type `Source`.
    template <class Source, class Prepare>
    static QStringList of(QByteArray const& document, Prepare const& prepare)
    {
        QBuffer buffer;
        buffer.setData(document);
        Source source(&buffer);
        QXmlSimpleReader reader;
        XmlEvents events;
        reader.setContentHandler(&events);
        reader.setErrorHandler(&events);
        reader.setLexicalHandler(&events);
        reader.setDeclHandler(&events);
        reader.setDTDHandler(&events);
        prepare(source, reader);
        const bool parsed = reader.parse(source);
        events.note(parsed ? "parsed" : "failed");
        return events.m_all;
    }

    bool startDocument() override { return note("start"); }
    bool endDocument() override { return note("end"); }

    bool startPrefixMapping(QString const& prefix, QString const& uri) override
    {
        return note("prefix", prefix, uri);
    }

    bool endPrefixMapping(QString const& prefix) override { return note("end prefix", prefix); }

    bool startElement(QString const& uri, QString const& name, QString const& qName,
                      QXmlAttributes const& attributes) override
    {
        note("element", uri, name, qName);
        for (int i = 0; i < attributes.count(); ++i)
            note("attribute", attributes.uri(i), attributes.qName(i), attributes.value(i));
        return true;
    }

    bool endElement(QString const& uri, QString const& name, QString const& qName) override
    {
        return note("end element", uri, name, qName);
    }

    bool characters(QString const& text) override { return note("text", text); }
    bool ignorableWhitespace(QString const& text) override { return note("space", text); }

    bool processingInstruction(QString const& target, QString const& data) override
    {
        return note("instruction", target, data);
    }

    bool skippedEntity(QString const& name) override { return note("skipped", name); }

    bool startDTD(QString const& name, QString const& publicId, QString const& systemId) override
    {
        return note("type", name, publicId, systemId);
    }

    bool endDTD() override { return note("end type"); }
    bool startCDATA() override { return note("CDATA"); }
    bool endCDATA() override { return note("end CDATA"); }
    bool comment(QString const& text) override { return note("comment", text); }

    bool attributeDecl(QString const& element, QString const& name, QString const&, QString const&,
                       QString const&) override
    {
        return note("attribute of", element, name);
    }

    bool internalEntityDecl(QString const& name, QString const& value) override
    {
        return note("entity", name, value);
    }

    bool externalEntityDecl(QString const& name, QString const& publicId,
                            QString const& systemId) override
    {
        return note("external", name, publicId, systemId);
    }

    bool notationDecl(QString const& name, QString const& publicId,
                      QString const& systemId) override
    {
        return note("notation", name, publicId, systemId);
    }

    bool unparsedEntityDecl(QString const& name, QString const& publicId, QString const& systemId,
                            QString const& notation) override
    {
        return note("unparsed", name, publicId + ' ' + systemId, notation);
    }

    bool fatalError(QXmlParseException const& exception) override
    {
        note("error", exception.message(), QString::number(exception.lineNumber()),
             QString::number(exception.columnNumber()));
        return false;
    }

private:
    bool note(char const* event, QString const& first = QString(),
              QString const& second = QString(), QString const& third = QString())
    {
        m_all << QLatin1String(event) + '|' + first + '|' + second + '|' + third;
        return true;
    }

    QStringList m_all;
};
