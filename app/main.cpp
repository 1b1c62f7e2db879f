// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"
#include "app/QuitOnSignal.h"
#include "app/WithoutOpenGl.h"
#include "app/window/MainWindow.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QDebug>
#include <QMessageLogger>

#include <cstdio>

namespace {

QString Caption()
{
    QString const& product = AppPaths::ProductName();
    return product.isEmpty() ? QStringLiteral("Velocor") : product;
}

// Started without a screen, the program can tell where its log is only on the terminal.
void TellLogFileWithoutScreen()
{
    const QString platform = QGuiApplication::platformName();
    if (platform != QLatin1String("offscreen") && platform != QLatin1String("minimal"))
        return;

    const QByteArray logFile = TorkLog::logger()->newLogFileName().toLocal8Bit();
    std::printf("Log file: %s\n", logFile.constData());
    std::fflush(stdout);
}

} // namespace

// The order matters: the log's directory follows from the names, and message boxes from the
// caption.
int main(int argc, char** argv)
{
    Velocor::WithoutOpenGl withoutOpenGl;
    QApplication application(argc, argv);
    withoutOpenGl.End();
    AppPaths::SetOrganizationAndProduct();
    TorkLog::initialize(QStringLiteral("velocor"));
    application.setProperty("caption", Caption());

    QuitOnSignal quitOnSignal;
    Velocor::MainWindow window;
    window.show();
    TellLogFileWithoutScreen();

    QMessageLogger(nullptr, 0, nullptr).debug() << "app.exec() starting";
    return QApplication::exec();
}
