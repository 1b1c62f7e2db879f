// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

class QWidget;

namespace Velocor {

/// Turns Ctrl and the mouse wheel over widgets into steps of zoom. The widgets do not get these
/// events: a read-only text would zoom by itself, and a table would scroll. GUI thread.
class WheelZoom : public QObject
{
    Q_OBJECT

public:
    explicit WheelZoom(QObject* parent = nullptr);

    /// @param widget  the one that gets the events, such as a viewport
    void Watch(QWidget* widget);

Q_SIGNALS:
    /// Larger (1) or smaller (-1) text.
    void zoomRequested(int steps);

protected:
    bool eventFilter(QObject* object, QEvent* event) override;

private:
    int m_wheel = 0; // eighths of a degree that have not zoomed yet
};

} // namespace Velocor
