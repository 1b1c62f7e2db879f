// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"
#include "app/FailedWrites.h"
#include "app/QuitOnSignal.h"
#include "app/ScreenlessPlatform_p.h"
#include "app/StandardStreams_p.h"
#include "app/WithoutOpenGl_p.h"
#include "app/window/MainWindow.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QDebug>
#include <QFile>

namespace {

QString Caption()
{
    QString const& product = AppPaths::ProductName();
    return product.isEmpty() ? QStringLiteral("Velocor") : product;
}

// Without a screen, the terminal is the only place to show where the log is.
void PrintLogFileIfScreenless()
{
    if (!Velocor::IsScreenlessPlatform())
        return;
    const QString logFile = TorkLog::logger()->currentLogFile();
    Velocor::PrintWithoutWaiting("Log file: " + QFile::encodeName(logFile) + '\n');
}

} // namespace

// The order matters: Qt must not be used before the application object exists, the log directory
// depends on the names, and message boxes take their title from the caption. Printing comes after
// the log entry, so that a problem with standard output cannot prevent the entry.
int main(int argc, char** argv)
{
    Velocor::OpenMissingStandardStreams();
    SurviveFailedWrites();
    Velocor::WithoutOpenGl withoutOpenGl;
    QApplication application(argc, argv);
    withoutOpenGl.End();
    AppPaths::SetOrganizationAndProduct();
    TorkLog::initialize(QStringLiteral("velocor"));
    application.setProperty("caption", Caption());

    QuitOnSignal quitOnSignal;
    Velocor::MainWindow window;
    window.show();

    qDebug() << "app.exec() starting";
    PrintLogFileIfScreenless();
    return QApplication::exec();
}
