// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The guard with any document: unless it reports a limit, Qt's reader reports the same events as
// with a plain source, including errors and their positions.

#include "FuzzInput.h"
#include "XmlMutator.h"

#include "common/xml/TorkXmlGuard.h"
#include "xml/XmlEvents.h"

namespace {

// An input is too short to reach any other limit.
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

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    return MutateDocument(data, size, maximum, seed);
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    const QByteArray document(reinterpret_cast<char const*>(data), int(size));
    const QStringList guarded = XmlEvents::of<TorkXmlGuard>(
        document, [](TorkXmlGuard& source, QXmlSimpleReader& reader) { source.Watch(reader); });
    if (NamesLimit(guarded)) {
        // Without entities, prefixes or hundreds of levels nothing exceeds a limit.
        Require(document.contains("<!ENTITY") || document.count(':') > 64 ||
                document.count('<') > 1000 || document.count('(') > 1000);
        return 0;
    }
    const QStringList plain =
        XmlEvents::of<QXmlInputSource>(document, [](QXmlInputSource&, QXmlSimpleReader&) {});
    Require(guarded == plain);
    return 0;
}
