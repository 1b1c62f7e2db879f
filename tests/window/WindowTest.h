// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/FileTabs.h"
#include "app/window/MainWindow.h"
#include "support/DemoLog.h"
#include "support/TestRun.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QPointer>
#include <QtTest>

#include <functional>
#include <memory>

/// A program's surroundings, and common operations of the tests of its window.
class WindowTest : public TestRun
{
public:
    using TestRun::TestRun;

    /// How long to wait for what has to happen, in milliseconds: long enough for a crowded machine.
    static constexpr int Patience = 20000;

    /// A complete window on the screen, with keyboard focus.
    ///
    /// @param files  opened at the start
    static std::unique_ptr<Velocor::MainWindow> show(QStringList const& files = QStringList())
    {
        auto window = std::make_unique<Velocor::MainWindow>();
        if (!files.isEmpty())
            window->OpenAtStart(files);
        window->show();
        if (!QTest::qWaitForWindowExposed(window.get(), Patience) || !activate(window.get()))
            qWarning("the window does not get the keyboard focus");
        // It completes itself after its first paint.
        QElapsedTimer time;
        time.start();
        while (!window->findChild<Velocor::FileTabs*>() && time.elapsed() < Patience)
            QTest::qWait(10);
        return window;
    }

    /// Gives a window the keyboard focus, as a window manager would, and waits until it has it.
    static bool activate(QWidget* window)
    {
        window->activateWindow();
        return QTest::qWaitForWindowActive(window, Patience);
    }

    /// Runs a function with the next modal dialog, soon after it appears. The dialog is closed if
    /// the test fails in the meantime, or if it is still open after a long time; otherwise it would
    /// block everything else.
    template <class Dialog>
    static void whenShown(std::function<void(Dialog*)> const& work)
    {
        auto* timer = new QTimer(qApp);
        timer->setObjectName(waiting());
        QPointer<Dialog> seen;
        QObject::connect(timer, &QTimer::timeout, timer, [timer, work, seen]() mutable {
            auto* dialog = qobject_cast<Dialog*>(QApplication::activeModalWidget());
            if (!dialog || !dialog->isVisible())
                return;
            // The first time, it may still be on its way to its event loop: a dialog that is closed
            // before that stays in it for good.
            if (seen != dialog) {
                seen = dialog;
                return;
            }
            timer->stop();
            timer->deleteLater();
            work(dialog);
            if (!seen)
                return;
            if (QTest::currentTestFailed())
                seen->reject();
            QTimer::singleShot(Patience, dialog, [dialog] {
                if (!dialog->isVisible())
                    return;
                qWarning("the %s is still open", dialog->metaObject()->className());
                dialog->reject();
            });
        });
        timer->start(20);
    }

    /// Forgets all functions of whenShown() whose dialog did not appear.
    static void stopWaiting()
    {
        qDeleteAll(qApp->findChildren<QTimer*>(waiting(), Qt::FindDirectChildrenOnly));
    }

private:
    static QString waiting() { return "waits for a dialog"; }
};
