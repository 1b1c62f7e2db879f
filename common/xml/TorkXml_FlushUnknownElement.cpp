// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_FlushUnknownElement.h"

TorkXml_FlushUnknownElement::~TorkXml_FlushUnknownElement() = default;

bool TorkXml_FlushUnknownElement::CanHandleElement(QString const&)
{
    return false;
}

TorkXml_ParseState_Base* TorkXml_FlushUnknownElement::GetNextState(QString const& name)
{
    return new TorkXml_FlushUnknownElement(name, ParseManager());
}

bool TorkXml_FlushUnknownElement::ProcessContent(QString const&, QString const&)
{
    return true;
}
