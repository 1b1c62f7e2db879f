// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlGuard.h"

#include "common/xml/TorkXmlLexer.h"

#include <QXmlErrorHandler>
#include <QXmlParseException>
#include <QXmlSimpleReader>

// Stands in for the reader's error handler from the end that the guard made until the reader tells
// of it, to name the limit instead.
class TorkXmlGuard::Watcher : public QXmlErrorHandler
{
public:
    bool read(QChar character)
    {
        m_isOver = !m_lexer.read(character);
        if (m_isOver && m_reader) {
            m_errorHandler = m_reader->errorHandler();
            m_reader->setErrorHandler(this);
        }
        return !m_isOver;
    }

    bool isOver() const { return m_isOver; }
    void watch(QXmlSimpleReader& reader) { m_reader = &reader; }

    bool warning(QXmlParseException const&) override { return true; }
    bool error(QXmlParseException const&) override { return true; }

    bool fatalError(QXmlParseException const& exception) override
    {
        m_reader->setErrorHandler(m_errorHandler);
        return m_errorHandler &&
               m_errorHandler->fatalError(QXmlParseException(
                   m_lexer.reason(), exception.columnNumber(), exception.lineNumber(),
                   exception.publicId(), exception.systemId()));
    }

    QString errorString() const override { return m_lexer.reason(); }

private:
    TorkXmlLexer m_lexer;
    QXmlSimpleReader* m_reader = nullptr;
    QXmlErrorHandler* m_errorHandler = nullptr;
    bool m_isOver = false;
};

TorkXmlGuard::TorkXmlGuard(QIODevice* device) : QXmlInputSource(device), m_watcher(new Watcher) {}

TorkXmlGuard::~TorkXmlGuard() = default;

void TorkXmlGuard::Watch(QXmlSimpleReader& reader)
{
    m_watcher->watch(reader);
}

QChar TorkXmlGuard::next()
{
    if (m_watcher->isOver())
        return QChar(EndOfDocument);

    // Where Qt's next() fetches more, it calls this one again.
    if (m_isInside)
        return QXmlInputSource::next();
    m_isInside = true;
    const QChar character = QXmlInputSource::next();
    m_isInside = false;

    const bool isText = character != QChar(EndOfData) && character != QChar(EndOfDocument);
    return !isText || m_watcher->read(character) ? character : QChar(EndOfDocument);
}
