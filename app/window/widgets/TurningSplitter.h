// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QSplitter>

namespace Velocor {

/// Shows its widgets side by side or, if it is too narrow for them, below each other.
class TurningSplitter : public QSplitter
{
    Q_OBJECT

public:
    using QSplitter::QSplitter;

    /// As wide as its widest widget.
    QSize minimumSizeHint() const override;

protected:
    bool event(QEvent* event) override;

private:
    void turn();
};

} // namespace Velocor
