// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseState_Base.h"

#include "common/log/TorkEmptyText_p.h"
#include "common/xml/TorkXml_ParseManager_Base.h"

TorkXml_ParseState_Base::TorkXml_ParseState_Base()
    : TorkXml_ParseState_Base(TorkEmptyText(), nullptr)
{}

TorkXml_ParseState_Base::TorkXml_ParseState_Base(QString const& element,
                                                 TorkXml_ParseManager_Base* manager)
    : m_element(element), m_manager(manager), m_auxiliaryText(TorkEmptyText())
{}

TorkXml_ParseState_Base::~TorkXml_ParseState_Base() = default;

bool TorkXml_ParseState_Base::IsElement(QString const& name)
{
    return m_element == name;
}

bool TorkXml_ParseState_Base::CanHandleElement(QString const&)
{
    return false;
}

TorkXml_ParseState_Base* TorkXml_ParseState_Base::GetNextState(QString const&)
{
    return nullptr;
}

bool TorkXml_ParseState_Base::ProcessContent(QString const&, QString const&)
{
    return false;
}

bool TorkXml_ParseState_Base::EndElement(QString const&)
{
    return false;
}

QString const& TorkXml_ParseState_Base::CurrentElement() const
{
    return m_manager->CurrentElement();
}
