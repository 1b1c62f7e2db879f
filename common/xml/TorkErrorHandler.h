// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QXmlErrorHandler>

class QXmlParseException;
class TorkLog;

/// Turns the problems that the toolkit's XML reader reports into readable texts with their place.
///
/// Keeps the last text for the caller and issues each on the toolkit's message channel, from where
/// it reaches the log. One handler serves one parse on one thread.
///
///     TorkErrorHandler errors(TorkLog::logger());
///     reader.setErrorHandler(&errors);
///     if (!reader.parse(source))
///         WarningMessage(window, errors.errorString(), true);
class TorkErrorHandler : public QXmlErrorHandler
{
public:
    /// @param log  kept, not owned, not written to; may be null
    explicit TorkErrorHandler(TorkLog* log);
    ~TorkErrorHandler() override;

    /// Issues the problem as a warning. Returns true: the reader goes on.
    bool warning(QXmlParseException const& exception) override;

    /// Issues the problem as a critical message. Returns true: the reader goes on.
    bool error(QXmlParseException const& exception) override;

    /// Issues the problem as a critical message. Returns false: the reader stops.
    bool fatalError(QXmlParseException const& exception) override;

    /// The last problem in full, a mere warning too; empty if there was none.
    QString errorString() const override;

    /// Words a problem and keeps both texts.
    ///
    /// @return the description with its identifiers, line and column, without the heading that
    ///         errorString() has; a buffer that the next problem overwrites
    QString& format(QXmlParseException const& exception);

private:
    [[maybe_unused]] TorkLog* m_log; // messages reach it through the toolkit
    QString m_errorText;
    QString m_detailText;
};
