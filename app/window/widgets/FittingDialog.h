// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDialog>

namespace Velocor {

/// A dialog that fits its screen in any size of text. If it is too wide, its labels wrap, and then
/// its buttons are below each other; if it is too high, it scrolls.
///
/// Subclasses fill it with a layout before it is first shown.
class FittingDialog : public QDialog
{
    Q_OBJECT

public:
    using QDialog::QDialog;

    void setVisible(bool visible) override;

    /// How large a dialog may be on the screen of its parent, without its title bar.
    QSize Room() const;

private:
    void fit();
    void narrow(int width);
    void makeScroll();
};

} // namespace Velocor
