// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseState_Base.h"

#include <QString>

namespace {

class TitleState : public TorkXml_ParseState_Base
{
public:
    using TorkXml_ParseState_Base::TorkXml_ParseState_Base;
    bool ProcessContent(QString const&, QString const& text) override
    {
        m_title += text; // long texts come in pieces
        return true;
    }

private:
    QString m_title;
};

} // namespace

TorkXml_ParseState_Base* MakeTitleState(TorkXml_ParseManager_Base* manager)
{
    return new TitleState("title", manager);
}
