// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QScopedPointer>
#include <QXmlInputSource>

class QXmlSimpleReader;

/// An input source that keeps hostile documents away from Qt's XML reader.
///
/// The reader calls itself once per open element and per open group of a content model, compares
/// each entity that is declared with all others, puts each in as often as it is named, and copies
/// and compares namespace prefixes: a hundred kilobytes of any of these could exhaust the stack,
/// take minutes or fill the memory, before a content handler hears of it. The guard follows what
/// the reader reads and ends the document where it goes beyond a limit of TorkXmlLimits.h; within
/// them the reader gets exactly what a plain QXmlInputSource would give it.
///
/// The parse then fails as that of a malformed document does. The reader's error handler is told of
/// one fatal error whose message names the limit; there is no other sign.
///
/// What an entity resolver puts in place of external entities is not watched. One parse, one
/// thread.
///
///     QFile file(path);
///     TorkXmlGuard source(&file);
///     QXmlSimpleReader reader;
///     source.Watch(reader);
///     reader.setContentHandler(&manager);
///     reader.parse(source);
class TorkXmlGuard : public QXmlInputSource
{
public:
    /// Reads from a device, which is not owned and must outlive the guard.
    explicit TorkXmlGuard(QIODevice* device);
    ~TorkXmlGuard() override;

    /// Has the reader's error handler, also one that is set later, told which limit was passed.
    /// Without this it is told of an unexpected end of the file. The reader must outlive the parse.
    void Watch(QXmlSimpleReader& reader);

    /// The next character; from the one that goes beyond a limit on, the end of the document.
    QChar next() override;

private:
    class Watcher;
    QChar takeNext();
    QChar fetchNext();

    QScopedPointer<Watcher> m_watcher;
    bool m_isOver = false; ///< whether a limit was passed

    // What the device gave last, walked through here instead of by Qt's own next(): loading
    // settings would fall behind its peers without it.
    QString m_fetched;
    QChar const* m_next = nullptr;
    QChar const* m_end = nullptr;
    bool m_toldEndOfData = true;
};
