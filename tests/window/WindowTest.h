// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/MainWindow.h"
#include "common/log/TorkLog.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QApplication>
#include <QPointer>
#include <QTemporaryDir>
#include <QtTest>

#include <functional>
#include <memory>

/// A program's surroundings for tests of its window: identity, directories and a log, all in a
/// folder that goes when the object does.
class WindowTest
{
public:
    /// @param log  what stands in the log file before the window opens it
    explicit WindowTest(QByteArray const& log = QByteArray())
    {
        m_handler = qInstallMessageHandler(nullptr);
        QCoreApplication::setOrganizationName("Org");
        QCoreApplication::setApplicationName("Product");
        qApp->setProperty("caption", "Caption");
        qApp->setProperty("RootPath", folder() + "root/");
        qApp->setProperty("DataPath", folder() + "data/");
        qApp->setProperty("DocPath", folder() + "documents/");
        QDir().mkpath(folder() + "documents");
        TorkLog::initialize(folder() + "data/logs/", "app", QString(), true);
        if (!log.isNull())
            TestFiles::write(logFile(), log);
    }

    ~WindowTest()
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_handler);
    }

    WindowTest(WindowTest const&) = delete;
    WindowTest& operator=(WindowTest const&) = delete;

    QString folder() const { return QFileInfo(m_folder.path()).canonicalFilePath() + "/"; }
    QString logFile() const { return folder() + "data/logs/app.log"; }
    QString settingsFile() const { return folder() + "data/velocor.cfg"; }

    /// A window on the screen, with the keyboard and with its log read.
    static std::unique_ptr<Velocor::MainWindow> show()
    {
        auto window = std::make_unique<Velocor::MainWindow>();
        window->show();
        // Where no window manager does it, the window has to ask for the keyboard itself.
        if (QTest::qWaitForWindowExposed(window.get()))
            window->activateWindow();
        if (!QTest::qWaitForWindowActive(window.get()))
            qWarning("the window does not get the keyboard");
        return window;
    }

    /// Does something with the modal dialog that comes up next, soon after it is on the screen. The
    /// dialog is closed if the test fails meanwhile, or else nothing would go on behind it.
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

private:
    QTemporaryDir m_folder;
    QtMessageHandler m_handler = nullptr;
};
