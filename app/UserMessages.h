// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

class QWidget;

/// \file
/// Message boxes that also log.
///
/// Each of the three functions shows `text` in a modal box with an OK button, titled with the
/// application object's property "caption", and then issues the same text on one line as a toolkit
/// message of its level, which the log records. The log line is thus written after the user has
/// closed the box. GUI thread only.
///
///     CriticalMessage(window, "The index is damaged.\nIt will be rebuilt.", true);
///
/// The box guesses whether `text` is rich text, as Qt's message boxes do, and a file called
/// `<img src=...>` makes the guess wrong: the box loads that image. So escape a text that holds
/// something from outside if it looks rich. The log then holds the escaped text:
///
///     QString text = "Cannot open " + path;
///     if (Qt::mightBeRichText(text))
///         text = "<p style='white-space:pre-wrap'>" + text.toHtmlEscaped() + "</p>";
///     CriticalMessage(window, text, true);

/// Tells of a failure; logged as critical.
///
/// @param parent  the window that the box belongs to; may be null
/// @param text  shown, as rich text if it looks rich; line feeds and tabs are logged as blanks
/// @param show  false: only logs
void CriticalMessage(QWidget* parent, QString const& text, bool show);

/// Tells of a problem; logged as warning. Parameters as for CriticalMessage().
void WarningMessage(QWidget* parent, QString const& text, bool show);

/// Tells of something worth knowing; logged as debug. Parameters as for CriticalMessage().
void DebugMessage(QWidget* parent, QString const& text, bool show);

/// Replaces every line feed and every tab in `text` by one blank, and returns it.
QString& StripFormatting(QString& text);

/// Words an error for people: here `out` becomes `error` unchanged. Returns `out`.
QString& FormatError(QString const& error, QString& out);
