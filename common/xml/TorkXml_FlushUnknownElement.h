// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXml_ParseState_Base.h"

/// Accepts and drops one element with all that is in it, so that a reader can skip what it does
/// not know without failing.
///
///     TorkXml_ParseState_Base* FolderState::GetNextState(QString const& name)
///     {
///         if (name == "bookmark")
///             return new BookmarkState(name, ParseManager());
///         return new TorkXml_FlushUnknownElement(name, ParseManager());
///     }
class TorkXml_FlushUnknownElement : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
    ~TorkXml_FlushUnknownElement() override;

    /// False: every nested element gets a flush state of its own, so that an element of the same
    /// name further in does not end the skip.
    bool CanHandleElement(QString const& name) override;

    /// A new flush state for the nested element; never null.
    TorkXml_ParseState_Base* GetNextState(QString const& name) override;

    /// Drops the content and returns true.
    bool ProcessContent(QString const& name, QString const& content) override;
};
