// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

class QSpinBox;

namespace Velocor {

/// Asks for the number of a line. GUI thread only.
class LineDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param line  at first, starting at 1
    /// @param count  the number of lines
    LineDialog(int line, int count, QWidget* parent = nullptr);

    /// The line that was chosen, starting at 1.
    int line() const;

private:
    QSpinBox* m_line;
};

} // namespace Velocor
