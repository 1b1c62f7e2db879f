// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

class QWidget;

/// \file
/// Message boxes that also log.
///
/// Each of the three functions shows `text` in a modal box with an OK button, titled with the
/// application object's property "caption", and then sends the same text on one line as a Qt
/// message of the matching level, which the log records. The log entry is therefore written after
/// the user has closed the box. GUI thread only.
///
///     CriticalMessage(window, "The index is damaged.\nIt will be rebuilt.", true);
///
/// The box detects rich text as all Qt message boxes do, so a file named `<img src=...>` would make
/// it load that image. Escape text from outside the program if it looks like rich text. The log
/// then contains the escaped text:
///
///     QString text = "Cannot open " + path;
///     if (Qt::mightBeRichText(text))
///         text = "<p style='white-space:pre-wrap'>" + text.toHtmlEscaped() + "</p>";
///     CriticalMessage(window, text, true);

/// Reports a failure; logged as critical.
///
/// @param parent  the window that the box belongs to; may be null
/// @param text  shown, as rich text if it looks like it; line feeds and tabs are logged as spaces
/// @param show  if false, only logs
void CriticalMessage(QWidget* parent, QString const& text, bool show);

/// Reports a problem; logged as warning. Parameters as for CriticalMessage().
void WarningMessage(QWidget* parent, QString const& text, bool show);

/// Shows information; logged as debug. Parameters as for CriticalMessage().
void DebugMessage(QWidget* parent, QString const& text, bool show);

/// Replaces every line feed and every tab in `text` with one space, and returns it.
QString& StripFormatting(QString& text);

/// Formats an error for users: copies `error` to `out` unchanged. Returns `out`.
QString& FormatError(QString const& error, QString& out);
