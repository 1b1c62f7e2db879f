// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlLimits.h"

#include <QtDebug>

void CheckDepth(int depth)
{
    if (depth >= TorkXmlMaximumDepth)
        qWarning("Deeper than anything here could read again.");
}
