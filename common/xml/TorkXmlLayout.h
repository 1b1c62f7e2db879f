// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlResult.h"

#include <QString>

/// Where an XML writer stands: what each of the two writers keeps between calls.
struct TorkXmlLayout
{
    /// Indentation units before a tag that starts a line; may become negative.
    qint32 level = 0;

    /// What one level of indentation looks like.
    QString unit = QStringLiteral("  ");

    /// The attributes of the start tag that is open, and its closing characters, until they are
    /// written.
    QString pending = QLatin1String("");

    /// Memory for the next tag, kept from the last one.
    QString tag;
};
