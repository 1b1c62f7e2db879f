// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/language/LeftToRight.h"

#include <QMessageBox>
#include <QString>

class QHeaderView;
class QLabel;
class QPlainTextEdit;
class QPoint;
class QWidget;

/// \file
/// Plain text in widgets that detect rich text automatically.
///
/// Labels, message boxes and tool tips detect rich text. File names, log lines and the content of
/// settings files are untrusted: as rich text, they could show links, load files named in an
/// `<img>` and hide parts of the text. So the window creates its labels, message boxes and tool
/// tips only through these functions, which scripts/check-house-rules.sh verifies. GUI thread only.
namespace Velocor {

/// A tool tip that shows `text` character by character.
///
/// Tool tips have no text format property, so text that Qt would detect as rich text is returned as
/// escaped rich text. So is long text, because Qt wraps only rich tool tips. Text of more than
/// `MaximumToolTipLength` characters is shortened by Shortened(). Other text is returned unchanged.
QString PlainToolTip(QString const& text);

/// Shows a text at a global position as a tool tip of a widget, character by character; hides the
/// tool tip if the text is empty.
void ShowPlainToolTip(QPoint const& position, QString const& text, QWidget* widget);

/// The maximum length of a tool tip, in characters.
constexpr int MaximumToolTipLength = 4096;

/// The text, or if it has more than `limit` characters, its start and the total size:
/// "abc... (1.2 MB)", with a one-character ellipsis.
///
/// @param limit  at least 1; the result may be longer by a few characters
QString Shortened(QString const& text, int limit);

/// A label that shows its text as plain text. "&" marks a mnemonic only if the label has a buddy.
///
/// @return owned by the caller, or by the layout that takes it
QLabel* NewPlainLabel(QString const& text = QString());

/// Shows the titles of columns from left to right in any language, as what is in the columns.
void KeepLeftToRight(QHeaderView* header);

/// Shows all lines of a text from left to right in any language, because they are from a file.
void KeepLeftToRight(QPlainTextEdit* text);

/// A message box with plain text only.
///
///     PlainMessageBox box(QMessageBox::Critical, this, tr("Could not save %1.").arg(path));
///     box.exec();
class PlainMessageBox : public QMessageBox
{
public:
    /// The title is the application's "caption", like that of every message box.
    ///
    /// @param text  shown in full; the caller limits its length
    PlainMessageBox(Icon icon, QWidget* parent, QString const& text, StandardButtons buttons = Ok,
                    QString const& details = QString());

    /// Sets all labels of any message box to plain text.
    static void MakePlain(QMessageBox* box);
};

} // namespace Velocor
