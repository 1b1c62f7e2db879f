// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QLabel>

namespace Velocor {

/// A label for plain text on one line. Text that does not fit is shortened with an ellipsis; the
/// label never asks for more room than it gets.
class ElidedLabel : public QLabel
{
public:
    /// @param mode  where the ellipsis goes
    explicit ElidedLabel(Qt::TextElideMode mode, QWidget* parent = nullptr);

    /// The text as it is shown at the current width.
    QString ShownText() const;

    QSize minimumSizeHint() const override;

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    Qt::TextElideMode m_mode;
};

} // namespace Velocor
