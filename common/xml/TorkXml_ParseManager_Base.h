// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QSet>
#include <QString>
#include <QStringList>
#include <QVector>
#include <QXmlDefaultHandler>

class TorkXml_ParseState_Base;

/// Drives a stack of parse states through a document that the toolkit's SAX reader reads.
///
/// A reader derives from it and supplies the first state. The manager owns every state on its
/// stack. It serves one document: nothing resets the stacks or the errors in between. Elements
/// nested deeper than TorkXmlMaximumDepth stop the parse with an error, and so do more namespace
/// prefixes than TorkXmlLimits.h allows; it cannot see document types, so read files of strangers
/// through a TorkXmlGuard. One thread. See docs/xml.md.
///
///     class BookmarkReader : public TorkXml_ParseManager_Base
///     {
///         TorkXml_ParseState_Base* GetFirstState(QString const& name) override
///         {
///             return name == "xbel" ? new FolderState(name, this) : nullptr;
///         }
///     };
///
///     BookmarkReader bookmarks;
///     reader.setContentHandler(&bookmarks);
///     if (!reader.parse(source))
///         bookmarks.FormatErrors(report);
class TorkXml_ParseManager_Base : public QXmlDefaultHandler
{
public:
    TorkXml_ParseManager_Base();

    /// Deletes the states that a parse which stopped early left on the stack, from the top down.
    ~TorkXml_ParseManager_Base() override;

    TorkXml_ParseManager_Base(TorkXml_ParseManager_Base const&) = delete;
    TorkXml_ParseManager_Base& operator=(TorkXml_ParseManager_Base const&) = delete;

    bool startDocument() override;
    bool endDocument() override;

    /// Notes the prefix for the limits. Returns true; past a limit, the next element fails.
    bool startPrefixMapping(QString const& prefix, QString const& uri) override;

    bool endPrefixMapping(QString const& prefix) override;

    /// Finds or makes the state of an element and gives it the attributes, "href" of any prefix
    /// under the name "xlink:href".
    ///
    /// @return false, with an error of code 1016, if no state knows the element; false, with an
    ///         error that names it, beyond a limit
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;

    /// Ends the state on top if the element is its own, then removes and deletes it, even if its
    /// EndElement() pushed others above it; those stay. A state that took itself off the stack is
    /// not deleted. Returns true.
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;

    /// Gives the text to the state on top.
    ///
    /// @return that state's answer; false without a state
    bool characters(QString const& text) override;

    bool ignorableWhitespace(QString const& text) override;

    /// Makes the state of the document's root element, owned by the manager from then on.
    ///
    /// @return null, which fails the parse, if the root is not known; here always null
    virtual TorkXml_ParseState_Base* GetFirstState(QString const& name);

    /// Makes the state of a child element that the state on top does not handle in place.
    ///
    /// @return null, which fails the parse, if the child is not known; here what the state on top
    ///         makes of it
    virtual TorkXml_ParseState_Base* GetNextState(QString const& name);

    /// Appends an element name and makes it the current one. Returns true.
    bool PushElement(QString const& name);

    /// Removes the innermost element name. Returns false if there is none.
    bool PopElement();

    /// Appends a state, which the manager owns from then on. Returns true.
    bool PushState(TorkXml_ParseState_Base* state);

    /// Removes the top state, which the caller owns from then on; null if there is none.
    TorkXml_ParseState_Base* PopState();

    /// The top state, still owned by the manager; null if there is none.
    TorkXml_ParseState_Base* LastState() const;

    /// The innermost open element's name; empty if there is none.
    QString const& CurrentElement() const { return m_currentElement; }

    /// Keeps an error text, and issues it as a toolkit warning if the process-wide log exists.
    /// Does not stop the parse.
    void AppendError(QString const& text);

    /// The same for "Error: CODE TEXT".
    void AppendError(QString const& text, int code);

    /// The same for "Error: CODE on Element: ELEMENT", a line feed and "Content: CONTENT".
    void AppendError(QString const& element, QString const& content, int code);

    /// Formats all errors so far as one report: a heading, then each error and a line feed. The
    /// heading is there even if there are no errors, so call this only after a parse that failed.
    void FormatErrors(QString& report) const;

private:
    bool enter(TorkXml_ParseState_Base* state, QXmlAttributes const& attributes);
    bool isWithinLimits(QString const& qName, QXmlAttributes const& attributes);
    bool addPrefix(QString const& prefix);
    void removePrefix(QString const& prefix);
    void usePrefix(QString const& prefix);

    struct UsedPrefix
    {
        QString prefix;
        int depth; // of the element that uses it
    };

    QVector<QString> m_elements;
    QVector<TorkXml_ParseState_Base*> m_states;
    QString m_currentElement;
    QStringList m_errors;

    QSet<QString> m_prefixes;           // of namespaces, in force
    QVector<UsedPrefix> m_usedPrefixes; // those of them that nothing declares
    int m_prefixWeight = 0;
    qint64 m_prefixComparisons = 0;
};
