// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QString>
#include <QStringList>
#include <QXmlDefaultHandler>

class TorkConfigFile;

/// Turns Qt's SAX events into the load steps of a TorkConfigFile.
///
/// TorkConfigFile::Load() creates one for each load; TorkConfigFile::LoadFrom() also takes an
/// instance of a derived class, which sees the whole document. The handler tracks the nesting depth
/// and passes on only the first text after a start tag: that text is an item's value. Attributes
/// are ignored, and element names are local names.
///
/// Every event returns true: this handler never stops a parse. One
/// parse on one thread; use a new handler for the next document.
///
/// Override the events to observe a document, and call the base class from each, or the file is
/// not filled:
///
/// - startElement() and endElement() change depth() in the base class.
/// - characters() can use isAtStartTag() before the call to find out whether the text is passed on.
///
///     TorkConfigFileDocHandler handler; // no file to fill: it only keeps track
///     QXmlSimpleReader reader;
///     reader.setContentHandler(&handler);
///     if (!reader.parse(source))
///         qDebug() << "broken after" << handler.lastOpenedElement();
class TORK_EXPORT TorkConfigFileDocHandler : public QXmlDefaultHandler
{
public:
    /// A handler that only tracks the document, without a file to fill.
    TorkConfigFileDocHandler();

    /// A handler that fills `file` with the sections and values of a document. It does not clear
    /// the file first: TorkConfigFile::Load() and TorkConfigFile::LoadFrom() do.
    ///
    /// @param file  receives the load steps; not owned, must outlive the handler; may be null
    explicit TorkConfigFileDocHandler(TorkConfigFile* file);

    /// Leaves the file and what was loaded into it alone.
    ~TorkConfigFileDocHandler() override;

    /// Does nothing.
    bool startDocument() override;

    /// Does nothing. Not called if the document does not parse.
    bool endDocument() override;

    /// Does nothing: prefixes have no meaning in a configuration file.
    bool startPrefixMapping(QString const& prefix, QString const& uri) override;

    /// Does nothing.
    bool endPrefixMapping(QString const& prefix) override;

    /// Increases depth(), then passes the start to TorkConfigFile::StartElement().
    ///
    /// @param localName  the only parameter that is used
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;

    /// Decreases depth(), then passes the end to TorkConfigFile::EndElement().
    ///
    /// @param localName  the only parameter that is used
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;

    /// Passes `text` to TorkConfigFile::ProcessContent() if it is the first one after a start tag;
    /// otherwise drops it. So of a text that the reader delivers in several pieces, only the first
    /// counts.
    bool characters(QString const& text) override;

    /// Only counts the characters; the file never sees them.
    bool ignorableWhitespace(QString const& text) override;

    /// The local name of the last start tag; empty before the first. Still available after a parse
    /// that failed.
    ///
    /// @return a buffer that the next start tag overwrites
    virtual QString& lastOpenedElement();

    /// How many elements are open: 0 outside the root element, 1 in it, 2 in a section, 3 in an
    /// item. An element already counts when TorkConfigFile::StartElement() is called for it.
    int depth() const { return m_depth; }

    /// Whether the next text would be the first one after a start tag, and so be passed on.
    bool isAtStartTag() const { return m_state == Opened; }

private:
    // What came last. A text counts only in state Opened.
    enum State : int { Initial = 0, Opened = 1, ContentTaken = 2, Closed = 3 };

    TorkConfigFile* m_file = nullptr; // not owned

    // The load steps take their texts by non-const reference, so they are kept here.
    QString m_lastOpenedElement;
    QString m_content;
    QString m_lastClosedElement;
    State m_state = Initial;
    int m_ignorableWhitespaceCount = 0; // in characters

    // Unused. Removing it would change the size of derived classes in programs already built.
    QStringList m_texts;
    int m_depth = 0;
};
