// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QString>
#include <QXmlErrorHandler>

class QXmlParseException;
class TorkLog;

/// Turns problems that Qt's XML reader reports into readable texts with line and column.
///
/// Keeps the last text for the caller, and issues each as a Qt message, so it reaches the log if
/// TorkLog::initialize() was called.
///
/// Use one handler per parse, on one thread: errorString() is never cleared, so a second parse
/// would start with the problem of the first. The reader does not own it.
///
///     TorkErrorHandler errors(TorkLog::logger());
///     reader.setErrorHandler(&errors);
///     if (!reader.parse(source))
///         WarningMessage(window, errors.errorString(), true);
class TORK_EXPORT TorkErrorHandler : public QXmlErrorHandler
{
public:
    /// A handler without a problem yet.
    ///
    /// @param log  kept for compatibility, but not used: messages reach the log through Qt; not
    ///             owned, may be null
    explicit TorkErrorHandler(TorkLog* log);

    /// Does not touch the log.
    ~TorkErrorHandler() override;

    /// Issues the problem as a Qt warning, a Warning in the log. Returns true: the reader
    /// continues.
    bool warning(QXmlParseException const& exception) override;

    /// Issues the problem as a critical Qt message, an Error in the log. Returns true: the reader
    /// continues.
    bool error(QXmlParseException const& exception) override;

    /// Issues the problem as a critical Qt message, an Error in the log. Returns false: the reader
    /// stops, and QXmlSimpleReader::parse() returns false.
    bool fatalError(QXmlParseException const& exception) override;

    /// The last problem, even a mere warning, as three lines after the heading "Xml Parse
    /// Failure.": message, public and system identifier, line and column. Empty if there was none.
    QString errorString() const override;

    /// Formats a problem and keeps the text for errorString(). Issues no message.
    ///
    /// @return the description with its identifiers, line and column, without the heading that
    ///         errorString() has; a buffer that the next problem overwrites
    QString& format(QXmlParseException const& exception);

private:
    [[maybe_unused]] TorkLog* m_log; // messages reach it through Qt
    QString m_errorText;             // with the heading
    QString m_detailText;            // the buffer that format() returns
};
