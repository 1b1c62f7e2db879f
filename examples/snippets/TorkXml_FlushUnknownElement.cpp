// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_FlushUnknownElement.h"

namespace {

class BookmarkState : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
};

class FolderState : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
    TorkXml_ParseState_Base* GetNextState(QString const& name) override;
};

TorkXml_ParseState_Base* FolderState::GetNextState(QString const& name)
{
    if (name == "bookmark")
        return new BookmarkState(name, ParseManager());
    return new TorkXml_FlushUnknownElement(name, ParseManager());
}

} // namespace

TorkXml_ParseState_Base* MakeFolderState(TorkXml_ParseManager_Base* manager)
{
    return new FolderState("folder", manager);
}
