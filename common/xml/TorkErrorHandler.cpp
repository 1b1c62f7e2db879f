// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorHandler.h"

#include "common/log/TorkEmptyText_p.h"

#include <QDebug>
#include <QXmlParseException>

TorkErrorHandler::TorkErrorHandler(TorkLog* log) : m_log(log), m_errorText(TorkEmptyText()) {}

TorkErrorHandler::~TorkErrorHandler() = default;

bool TorkErrorHandler::warning(QXmlParseException const& exception)
{
    qWarning() << format(exception);
    return true;
}

// The labels differ on purpose: log readers distinguish errors from fatal errors by them.
bool TorkErrorHandler::error(QXmlParseException const& exception)
{
    format(exception);
    qCritical() << "TorkErrorHandler::error " << m_errorText;
    return true;
}

bool TorkErrorHandler::fatalError(QXmlParseException const& exception)
{
    format(exception);
    qCritical() << "TorkErrorHandler::fatalError: " << m_errorText;
    return false;
}

QString TorkErrorHandler::errorString() const
{
    return m_errorText;
}

QString& TorkErrorHandler::format(QXmlParseException const& exception)
{
    // Arguments are substituted one at a time, for compatibility: a message that contains a
    // placeholder gets the next text in its place.
    m_detailText = QStringLiteral("%1\nPublic ID: %2, System ID: %3\nLine: %4, Column: %5")
                       .arg(exception.message())
                       .arg(exception.publicId()) // clazy:exclude=qstring-arg
                       .arg(exception.systemId())
                       .arg(exception.lineNumber())
                       .arg(exception.columnNumber());
    m_errorText = QLatin1String("Xml Parse Failure.\n") + m_detailText;
    return m_detailText;
}
