// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QLabel>

namespace Velocor {

/// A label with plain text that wraps and is never lower than its lines. Qt's has room for one line
/// only, as soon as something around it does not ask what a width needs.
class WrappedLabel : public QLabel
{
    Q_OBJECT

public:
    explicit WrappedLabel(QWidget* parent = nullptr);

    QSize minimumSizeHint() const override;

protected:
    void resizeEvent(QResizeEvent* event) override;
};

} // namespace Velocor
