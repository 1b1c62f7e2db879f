// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/MainWindow.h"
#include "support/DemoLog.h"
#include "support/TestRun.h"

#include <QApplication>
#include <QPointer>
#include <QtTest>

#include <functional>
#include <memory>

/// A program's surroundings, and common operations of the tests of its window.
class WindowTest : public TestRun
{
public:
    using TestRun::TestRun;

    /// A window on the screen, with keyboard focus and its log read.
    static std::unique_ptr<Velocor::MainWindow> show()
    {
        auto window = std::make_unique<Velocor::MainWindow>();
        window->show();
        // Without a window manager, the window has to take the keyboard focus itself.
        if (QTest::qWaitForWindowExposed(window.get()))
            window->activateWindow();
        if (!QTest::qWaitForWindowActive(window.get()))
            qWarning("the window does not get the keyboard focus");
        return window;
    }

    /// Runs a function with the next modal dialog, soon after it appears. The dialog is closed if
    /// the test fails in the meantime; otherwise it would block everything else.
    template <class Dialog>
    static void whenShown(std::function<void(Dialog*)> const& work)
    {
        auto* timer = new QTimer(qApp);
        QObject::connect(timer, &QTimer::timeout, timer, [timer, work] {
            auto* dialog = qobject_cast<Dialog*>(QApplication::activeModalWidget());
            if (!dialog || !dialog->isVisible())
                return;
            timer->stop();
            timer->deleteLater();
            const QPointer<Dialog> open(dialog);
            work(dialog);
            if (QTest::currentTestFailed() && open)
                open->reject();
        });
        timer->start(20);
    }
};
