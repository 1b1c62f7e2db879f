// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QSize>

class QFormLayout;
class QSpinBox;

namespace Velocor {

/// Edits a size in pixels. GUI thread only.
class SizeDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param name  the name of the value
    /// @param size  at first; negative numbers, which the store cannot read, become 0
    SizeDialog(QString const& name, QSize size, QWidget* parent = nullptr);

    QSize size() const;

private:
    QSpinBox* m_width;
    QSpinBox* m_height;
};

/// A field for a number of pixels, selected when it gets the keyboard focus.
///
/// @param minimum  the maximum is that of the store
/// @return owned by the caller, or by the layout that takes it
QSpinBox* NewPixelField(QString const& accessibleName, int minimum, int value);

/// Adds a field to a form, which takes ownership of it.
///
/// @param text  of its label, with a mnemonic
void AddPixelField(QFormLayout* form, QString const& text, QSpinBox* field);

} // namespace Velocor
