// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The guard over any document: unless it names a limit, Qt's reader tells of the same events as
// through a plain source, errors and their places included.

#include "FuzzInput.h"

#include "common/xml/TorkXmlGuard.h"
#include "xml/XmlEvents.h"

namespace {

// An input is too short to come to any other limit.
bool NamesLimit(QStringList const& events)
{
    for (QString const& event : events) {
        if (event.startsWith("error|References to entities stand for more than ") ||
            event.startsWith("error|References make more than ") ||
            event.startsWith("error|More than "))
            return true;
    }
    return false;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    const QByteArray document(reinterpret_cast<char const*>(data), int(size));
    const QStringList guarded = XmlEvents::of<TorkXmlGuard>(
        document, [](TorkXmlGuard& source, QXmlSimpleReader& reader) { source.Watch(reader); });
    if (NamesLimit(guarded)) {
        // Without entities, prefixes or levels by the hundred nothing is beyond a limit.
        Require(document.contains("<!ENTITY") || document.count(':') > 64 ||
                document.count('<') > 1000 || document.count('(') > 1000);
        return 0;
    }
    const QStringList plain =
        XmlEvents::of<QXmlInputSource>(document, [](QXmlInputSource&, QXmlSimpleReader&) {});
    Require(guarded == plain);
    return 0;
}
