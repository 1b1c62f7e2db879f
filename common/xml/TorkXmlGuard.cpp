// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlGuard.h"

#include "common/xml/TorkXmlLexer_p.h"

#include <QXmlDefaultHandler>
#include <QXmlParseException>
#include <QXmlSimpleReader>

// Replaces the reader's error handler from the end that the guard made until the reader reports it,
// to name the limit instead.
class TorkXmlGuard::Watcher : public QXmlDefaultHandler
{
public:
    bool passes(QChar character) const
    {
        return m_lexer.passes(character) && character < QChar(EndOfData);
    }

    bool read(QChar character)
    {
        const bool isWithin = m_lexer.read(character);
        if (!isWithin && m_reader) {
            m_errorHandler = m_reader->errorHandler();
            m_reader->setErrorHandler(this);
        }
        return isWithin;
    }

    void watch(QXmlSimpleReader& reader) { m_reader = &reader; }

    bool fatalError(QXmlParseException const& exception) override
    {
        m_reader->setErrorHandler(m_errorHandler);
        return m_errorHandler &&
               m_errorHandler->fatalError(QXmlParseException(
                   m_lexer.reason(), exception.columnNumber(), exception.lineNumber()));
    }

private:
    TorkXmlLexer m_lexer;
    QXmlSimpleReader* m_reader = nullptr;
    QXmlErrorHandler* m_errorHandler = nullptr;
};

TorkXmlGuard::TorkXmlGuard(QIODevice* device) : QXmlInputSource(device), m_watcher(new Watcher) {}

TorkXmlGuard::~TorkXmlGuard() = default;

void TorkXmlGuard::Watch(QXmlSimpleReader& reader)
{
    m_watcher->watch(reader);
}

QChar TorkXmlGuard::next()
{
    return m_next != m_end && m_watcher->passes(*m_next) ? *m_next++ : takeNext();
}

// For the few characters of a document that mean something to the guard. Not inlined, so that
// next() stays small: for the goal "load, against QSettings" in docs/performance.md, compared by
// tests/plain/tst_PlainGuard.cpp.
Q_NEVER_INLINE QChar TorkXmlGuard::takeNext()
{
    if (m_next == m_end)
        return fetchNext();

    const QChar character = *m_next++;
    // As a character of the text, the reader would take it for the source's own end of data.
    if (character == QChar(EndOfData))
        return QChar(EndOfDocument);
    if (character == QChar(EndOfDocument) || m_watcher->read(character))
        return character;

    m_next = m_end;
    m_isOver = true;
    return QChar(EndOfDocument);
}

// Returns EndOfData once when the fetched text is used up, for a reader that parses incrementally,
// and fetches more when it is called again.
QChar TorkXmlGuard::fetchNext()
{
    if (m_isOver)
        return QChar(EndOfDocument);

    m_toldEndOfData = !m_toldEndOfData;
    if (m_toldEndOfData)
        return QChar(EndOfData);

    fetchData();
    m_fetched = data();
    m_next = m_fetched.constData();
    m_end = m_next + m_fetched.length();
    return m_next == m_end ? QChar(EndOfDocument) : next();
}
