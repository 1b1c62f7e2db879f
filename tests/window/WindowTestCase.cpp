// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "WindowTestCase.h"

#include "WindowTest.h"

#include <QClipboard>
#include <QLoggingCategory>

void WindowTestCase::initTestCase()
{
    // The X11 plug-in warns when a window disappears while it is being queried, which would end up
    // in a test's log. The environment would be too late: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void WindowTestCase::cleanup()
{
    WindowTest::stopWaiting();
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
    QGuiApplication::clipboard()->clear();
}

// A clear button fades for a moment even if its window has gone, and no one tells when that is
// over.
void WindowTestCase::cleanupTestCase()
{
    QTest::qWait(250);
}
