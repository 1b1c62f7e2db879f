// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QScopedPointer>
#include <QXmlInputSource>

class QXmlSimpleReader;

/// An input source that keeps hostile documents away from Qt's XML reader.
///
/// The reader calls itself once per open element and per open group of a content model, compares
/// each entity that is declared with all others, puts each in as often as it is named, and copies
/// and compares namespace prefixes: a hundred kilobytes of any of these could exhaust the stack,
/// take minutes or fill the memory, before a content handler is called. The guard follows what
/// the reader reads and ends the document where it goes beyond a limit of TorkXmlLimits.h; within
/// them the reader gets exactly what a plain QXmlInputSource would give it.
///
/// The parse then fails as that of a malformed document does: parse() returns false, and the
/// reader's error handler receives one fatal error whose message names the limit. The content
/// handler has received everything before that place, so discard what it built.
///
/// What an entity resolver puts in place of external entities is not watched. Make a guard for each
/// parse: what it has counted is never reset. One thread.
///
///     QFile file(path);
///     TorkXmlGuard source(&file);
///     QXmlSimpleReader reader;
///     source.Watch(reader);
///     reader.setContentHandler(&manager);
///     reader.parse(source);
class TORK_EXPORT TorkXmlGuard : public QXmlInputSource
{
public:
    /// Reads from a device, which is not owned and must outlive the guard.
    ///
    /// @param device  opened by the guard if it is closed; one that cannot be read is an empty
    ///                document, so the parse fails
    explicit TorkXmlGuard(QIODevice* device);

    /// Leaves the device open and the reader as it is.
    ~TorkXmlGuard() override;

    /// Makes the reader's error handler, even one that is set later, receive the limit that was
    /// exceeded. Without this it receives an unexpected end of the file. Call it before parse().
    ///
    /// @param reader  not owned; must outlive the parse
    void Watch(QXmlSimpleReader& reader);

    /// For the reader: the next character of the document. From the first that exceeds a limit on,
    /// it is always QXmlInputSource::EndOfDocument.
    QChar next() override;

private:
    class Watcher;
    QChar takeNext();
    QChar fetchNext();

    QScopedPointer<Watcher> m_watcher;
    bool m_isOver = false; ///< whether a limit was passed

    // What was last read from the device, walked through here instead of by Qt's own next(). For
    // the goal "load, against QSettings" in docs/performance.md; tests/plain/tst_PlainGuard.cpp
    // compares the two.
    QString m_fetched;
    QChar const* m_next = nullptr;
    QChar const* m_end = nullptr;
    bool m_toldEndOfData = true;
};
