// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QString>

class TorkXml_ParseManager_Base;

/// Handles one XML element while a document is read; the base of all parse states.
///
/// The parse manager keeps a stack of states. The one on top gets its element's attributes and the
/// character data, says which child elements it handles itself, creates the states of the others,
/// and is notified when its element ends. Derive one class per kind of element. The manager owns a
/// state as soon as GetNextState() or GetFirstState() returns it, and deletes it. One parse on one
/// thread.
///
///     class TitleState : public TorkXml_ParseState_Base
///     {
///     public:
///         using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
///         bool ProcessContent(QString const&, QString const& text) override
///         {
///             m_title += text; // long texts come in pieces
///             return true;
///         }
///     private:
///         QString m_title;
///     };
class TORK_EXPORT TorkXml_ParseState_Base
{
public:
    /// A state without an element name and without a manager.
    TorkXml_ParseState_Base();

    /// @param element  local name of the element that this state handles
    /// @param manager  drives this state; not owned
    TorkXml_ParseState_Base(QString const& element, TorkXml_ParseManager_Base* manager);

    virtual ~TorkXml_ParseState_Base();

    TorkXml_ParseState_Base(TorkXml_ParseState_Base const&) = delete;
    TorkXml_ParseState_Base& operator=(TorkXml_ParseState_Base const&) = delete;

    /// Whether `name` is exactly the name of this state's element.
    virtual bool IsElement(QString const& name);

    /// Whether this state handles the child element `name` itself. The child then gets no state,
    /// its attributes are dropped, and its text is passed to this state's ProcessContent().
    ///
    /// A child of the same name as this state's own element ends this state one level early: end
    /// tags are matched by name alone.
    ///
    /// @return always false here
    virtual bool CanHandleElement(QString const& name);

    /// Creates the state of the child element `name`; the manager takes ownership.
    ///
    /// @return null, which fails the parse, if the child is unknown; always null here
    virtual TorkXml_ParseState_Base* GetNextState(QString const& name);

    /// Takes one piece of content: an attribute's name and value, or the name of the current
    /// element and some of its text.
    ///
    /// @return false to stop the parse (for text only; ignored for attributes); always false here,
    ///         so override it wherever text may occur, including white space between elements
    virtual bool ProcessContent(QString const& name, QString const& content);

    /// This state's own element ended; the state is deleted next. The result is ignored.
    virtual bool EndElement(QString const& name);

    /// The manager's current element name. Only for states with a manager.
    QString const& CurrentElement() const;

    /// The manager; null if the state was made without one.
    TorkXml_ParseManager_Base* ParseManager() const { return m_manager; }

    /// The local name of the element that this state handles.
    QString const& ElementName() const { return m_element; }

protected:
    QString m_element;
    TorkXml_ParseManager_Base* m_manager = nullptr;
    QString m_auxiliaryText; ///< for derived states; not used here
};
