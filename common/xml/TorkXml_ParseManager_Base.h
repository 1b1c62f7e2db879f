// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QSet>
#include <QString>
#include <QStringList>
#include <QVector>
#include <QXmlDefaultHandler>

class TorkXml_ParseState_Base;

/// Drives a stack of parse states through a document that Qt's SAX reader reads.
///
/// Derive from it and supply the first state. The manager owns every state on its stack. Use a new
/// manager for each document: nothing resets the stacks or the errors in between.
///
/// Errors: an operation that returns false stops the reader. The reasons are collected, in order,
/// for FormatErrors(), and are also logged as warnings. Elements nested deeper than
/// TorkXmlMaximumDepth stop the parse with an error, and so do more namespace prefixes than
/// TorkXmlLimits.h allows. The manager cannot see document types, so read untrusted files through a
/// TorkXmlGuard. A malformed document is reported to the reader's error handler, not here.
///
/// Threads: one at a time. See docs/xml.md.
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
class TORK_EXPORT TorkXml_ParseManager_Base : public QXmlDefaultHandler
{
public:
    /// A manager without states, elements or errors.
    TorkXml_ParseManager_Base();

    /// Deletes the states that a parse which stopped early left on the stack, from the top down.
    ~TorkXml_ParseManager_Base() override;

    TorkXml_ParseManager_Base(TorkXml_ParseManager_Base const&) = delete;
    TorkXml_ParseManager_Base& operator=(TorkXml_ParseManager_Base const&) = delete;

    /// Does nothing; states from an earlier parse stay. Returns true.
    bool startDocument() override;

    /// Does nothing; states whose element has not ended stay on the stack. Returns true.
    bool endDocument() override;

    /// Notes the prefix for the limits. Returns true; past a limit, the next element fails.
    bool startPrefixMapping(QString const& prefix, QString const& uri) override;

    /// Stops counting the prefix toward the limits. Returns true.
    bool endPrefixMapping(QString const& prefix) override;

    /// Makes the element the current one. If the state on top handles it in place, that is all;
    /// otherwise GetFirstState() or GetNextState() supplies its state, which is pushed and gets
    /// each attribute through ProcessContent(), "href" of any prefix under the name "xlink:href".
    ///
    /// @param localName  the name without its prefix, by which the states are chosen
    /// @param qName  the name with its prefix, which only counts toward the limits
    /// @return false, with an error of code 1016, if no state knows the element; false, with an
    ///         error that names it, beyond a limit
    bool startElement(QString const& namespaceURI, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override;

    /// Ends the state on top if the element is its own, then removes and deletes it, even if its
    /// EndElement() pushed others above it; those stay. A state that took itself off the stack is
    /// not deleted. Then the enclosing element is the current one again. Returns true.
    bool endElement(QString const& namespaceURI, QString const& localName,
                    QString const& qName) override;

    /// Gives the text to the state on top, under the name of the current element, which may be one
    /// that this state handles in place. The reader may deliver a long text in several pieces.
    ///
    /// @return that state's answer; false without a state
    bool characters(QString const& text) override;

    /// Ignores the text. Returns true.
    bool ignorableWhitespace(QString const& text) override;

    /// Makes the state of the document's root element, owned by the manager from then on. Also
    /// called for a later element if a state took the last one off the stack.
    ///
    /// @param name  of the element, without its prefix
    /// @return null, which fails the parse, if the root is not known; here always null
    virtual TorkXml_ParseState_Base* GetFirstState(QString const& name);

    /// Makes the state of a child element that the state on top does not handle in place, owned by
    /// the manager from then on. Override it for elements that may be anywhere.
    ///
    /// @param name  of the child, without its prefix
    /// @return null, which fails the parse, if the child is not known; here what the state on top
    ///         makes of it
    virtual TorkXml_ParseState_Base* GetNextState(QString const& name);

    /// Appends an element name and makes it the current one. startElement() does this; a name
    /// pushed elsewhere has to be popped again. Returns true.
    bool PushElement(QString const& name);

    /// Removes the innermost element name; the one before it becomes the current one. endElement()
    /// does this.
    ///
    /// @return false if there is none, and nothing changes
    bool PopElement();

    /// Puts a state on top, which the manager owns from then on. It gets the text and the child
    /// elements that follow, until the element that it is named for ends.
    ///
    /// @param state  allocated with `new`; not on the stack yet
    /// @return always true
    bool PushState(TorkXml_ParseState_Base* state);

    /// Removes the top state, which the caller owns from then on, without ending it. A state may do
    /// this to survive its element.
    ///
    /// @return null if there is none
    TorkXml_ParseState_Base* PopState();

    /// The top state, still owned by the manager; null if there is none.
    TorkXml_ParseState_Base* LastState() const;

    /// The innermost open element's name; empty if there is none.
    QString const& CurrentElement() const { return m_currentElement; }

    /// Appends an error text to the report, and passes it to qWarning() if the process-wide log
    /// exists. Does not stop the parse: to do that, return false from a state's ProcessContent().
    void AppendError(QString const& text);

    /// The same for "Error: CODE TEXT".
    ///
    /// @param code  any number, such as one of TorkXmlResult
    void AppendError(QString const& text, int code);

    /// The same for "Error: CODE on Element: ELEMENT", a line feed and "Content: CONTENT": for a
    /// state that cannot use its text.
    void AppendError(QString const& element, QString const& content, int code);

    /// Formats all errors so far as one report: a heading, then each error and a line feed. The
    /// heading is there even if there are no errors, so call this only after a parse that failed.
    ///
    /// @param report  overwritten
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
