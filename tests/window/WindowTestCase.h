// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

/// What all tests of the window do before the first test function and after each.
class WindowTestCase : public QObject
{
    Q_OBJECT

protected slots:
    virtual void initTestCase();

    /// Leaves no window on the screen, nothing on the clipboard, and nobody waiting for a dialog.
    virtual void cleanup();

    /// Lets animations end, which Qt deletes only then.
    void cleanupTestCase();
};
