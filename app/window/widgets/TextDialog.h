// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

class QDialog;
class QDialogButtonBox;
class QLayout;
class QPlainTextEdit;

namespace Velocor {

/// Removes the icons that some desktop styles add to standard buttons.
void RemoveButtonIcons(QDialogButtonBox* buttons);

/// Makes `text` a view of unwrapped text in a fixed-width font, and Tab leave it.
void ShowUnwrapped(QPlainTextEdit* text);

/// Lays out a dialog with a heading, a text, and buttons, whose Cancel or Close closes it. The
/// dialog takes ownership of all three, and Tab goes through them in this order.
void LayOutTextDialog(QDialog* dialog, QLayout* heading, QPlainTextEdit* text,
                      QDialogButtonBox* buttons);

} // namespace Velocor
