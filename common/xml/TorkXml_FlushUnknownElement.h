// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"
#include "common/xml/TorkXml_ParseState_Base.h"

/// Accepts and drops an element with everything in it, so that a reader can skip what it does not
/// know instead of failing. Return a new one from GetNextState(); the manager owns and deletes it.
/// Skipped elements still count toward the depth limit.
///
///     TorkXml_ParseState_Base* FolderState::GetNextState(QString const& name)
///     {
///         if (name == "bookmark")
///             return new BookmarkState(name, ParseManager());
///         return new TorkXml_FlushUnknownElement(name, ParseManager());
///     }
class TORK_EXPORT TorkXml_FlushUnknownElement : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
    /// Called by the manager when the element ends.
    ~TorkXml_FlushUnknownElement() override;

    /// Returns false: every nested element gets its own flush state, so that a nested element of
    /// the same name does not end the skip.
    bool CanHandleElement(QString const& name) override;

    /// Returns a new flush state for the nested element, owned by the caller; never null.
    TorkXml_ParseState_Base* GetNextState(QString const& name) override;

    /// Drops the text or attribute and returns true: the parse continues.
    bool ProcessContent(QString const& name, QString const& content) override;
};
