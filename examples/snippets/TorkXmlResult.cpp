// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlResult.h"
#include "common/xml/TorkXmlStream.h"

#include <QtDebug>

void WriteNamed(TorkXmlStream& writer, QString const& name, QString const& value)
{
    if (writer.WriteAttribute(name, value) == TorkXmlResult::EmptyName)
        qWarning("An attribute without a name was left out.");
}
