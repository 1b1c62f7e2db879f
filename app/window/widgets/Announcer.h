// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QWidget>

namespace Velocor {

/// Has screen readers say what is shown somewhere in a window: they say little of what changes away
/// from the keyboard focus, but every notification. This is one that never shows; see
/// InstallAccessibleParts(). GUI thread only.
///
///     Announcer::Say(field, tr("There is already one"));
class Announcer : public QWidget
{
    Q_OBJECT

public:
    /// Says a text. Does nothing if no assistive technology is in use.
    ///
    /// @param widget  any in the window that the text is shown in
    static void Say(QWidget const* widget, QString const& text);

private:
    explicit Announcer(QWidget* window);
};

} // namespace Velocor
