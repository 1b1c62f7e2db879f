// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QStringList>
#include <QXmlDefaultHandler>

class TorkConfigFile;

/// Turns the toolkit's SAX events into the load steps of a TorkConfigFile.
///
/// TorkConfigFile::Load() makes one for each load, and TorkConfigFile::LoadFrom() takes one of a
/// class that derives from this one to see more of the document. It tracks the nesting depth and
/// hands on only the first text after a start tag: that text is an item's value. Attributes are
/// ignored, element names are the local names. Every event returns true: this handler never stops a
/// parse. One parse on one thread.
///
///     TorkConfigFileDocHandler handler; // no file to fill: it only keeps track
///     QXmlSimpleReader reader;
///     reader.setContentHandler(&handler);
///     if (!reader.parse(source))
///         qDebug() << "broken behind" << handler.lastOpenedElement();
class TorkConfigFileDocHandler : public QXmlDefaultHandler
{
public:
    /// A handler that only keeps track, without a file to fill.
    TorkConfigFileDocHandler();

    /// @param file  receives the load steps; not owned, must outlive the handler; may be null
    explicit TorkConfigFileDocHandler(TorkConfigFile* file);

    ~TorkConfigFileDocHandler() override;

    bool startDocument() override;
    bool endDocument() override;
    bool startPrefixMapping(QString const& prefix, QString const& uri) override;
    bool endPrefixMapping(QString const& prefix) override;
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;

    /// Takes `text` as the element's content if it is the first text after a start tag.
    bool characters(QString const& text) override;

    /// Only counts the characters.
    bool ignorableWhitespace(QString const& text) override;

    /// The local name of the last start tag; empty before the first.
    virtual QString& lastOpenedElement();

    /// How many elements are open; the root element has depth 1.
    int depth() const { return m_depth; }

    /// Whether the next text would be the first one after a start tag.
    bool isAtStartTag() const { return m_state == Opened; }

private:
    enum State : int { Initial = 0, Opened = 1, ContentTaken = 2, Closed = 3 };

    TorkConfigFile* m_file = nullptr;
    QString m_lastOpenedElement;
    QString m_content;
    QString m_lastClosedElement;
    State m_state = Initial;
    int m_ignorableWhitespaceCount = 0;
    QStringList m_texts;
    int m_depth = 0;
};
