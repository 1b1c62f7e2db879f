// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlResult.h"

#include <QString>

/// What each of the two XML writers keeps between calls.
///
/// Not for applications: it is in an installed header only because TorkXmlStream and TorkXmlFile,
/// which share no base class, each have one as a member. A subclass that overrides Write() sees the
/// output, but not this state. One thread at a time, like the writer that contains it.
/// This header also gives both writers' callers the result codes.
struct TorkXmlLayout
{
    /// Number of indentation units before a tag that starts a line. Callers balance it; it may
    /// become negative, which indents nothing.
    qint32 level = 0;

    /// The text of one level of indentation: two spaces, which nothing changes.
    QString unit = QStringLiteral("  ");

    /// The attributes of the open start tag, and its closing characters, until they are written.
    /// Each begins with a space, except after a line break; nothing in it is escaped.
    QString pending;

    /// A buffer that is kept from tag to tag, so that writing one does not allocate. Empty while a
    /// tag is being written, as an overridden Write() may call the writer again.
    QString tag;
};
