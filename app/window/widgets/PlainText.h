// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMessageBox>
#include <QString>

class QLabel;

/// \file
/// Texts for widgets that would otherwise read them as rich text.
///
/// Labels, message boxes and tool tips guess whether a text is rich. File names, log lines and what
/// settings files hold are not ours: read as rich text, they could show links, load files named in
/// an `<img>` and hide what they really say. So the window makes its labels, boxes and tool tips
/// with what is declared here and with nothing else; scripts/check-house-rules.sh looks for others.
/// GUI thread only.
namespace Velocor {

/// A tool tip that shows `text` character by character.
///
/// Tool tips have no text format: a text that Qt takes for rich comes back as escaped rich text. So
/// does a long one, because Qt wraps rich tool tips only; one of more than `LongestToolTip`
/// characters is shortened as by Shortened(). Any other text comes back unchanged.
QString PlainToolTip(QString const& text);

/// The most characters of a tool tip.
constexpr int LongestToolTip = 4096;

/// The text, or if it has more than `limit` characters, its start and the size of the whole:
/// "abc... (1.2 MB)", with one character for the dots.
///
/// @param limit  at least 1; the result may be longer by a few characters
QString Shortened(QString const& text, int limit);

/// A label that shows its text as plain text. "&" marks a key only if the label has a buddy.
///
/// @return owned by the caller, or by the layout that takes it
QLabel* NewPlainLabel(QString const& text = QString());

/// A message box whose texts are all plain.
///
///     PlainMessageBox box(QMessageBox::Critical, this, tr("%1 was not saved.").arg(path));
///     box.exec();
class PlainMessageBox : public QMessageBox
{
public:
    /// The box's title is that of the parent's window.
    ///
    /// @param text  shown in full; a limit is the caller's business
    PlainMessageBox(Icon icon, QWidget* parent, QString const& text, StandardButtons buttons = Ok,
                    QString const& details = QString());

    /// Makes all labels of a box plain, also those that are not of this class.
    static void MakePlain(QMessageBox* box);
};

} // namespace Velocor
