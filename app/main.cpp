// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"
#include "app/CommandLine_p.h"
#include "app/FailedWrites.h"
#include "app/QuitOnSignal.h"
#include "app/ScreenlessPlatform_p.h"
#include "app/StandardStreams_p.h"
#include "app/WithoutOpenGl_p.h"
#include "app/window/AccessibleParts.h"
#include "app/window/MainWindow.h"
#include "app/window/ReachableStyle.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QDebug>
#include <QFile>
#include <QTimer>

#include <unistd.h>

namespace {

QString Caption()
{
    QString const& product = AppPaths::ProductName();
    return product.isEmpty() ? QStringLiteral("Velocor") : product;
}

// The caller of --help wants the text, and no window that flashes up.
void Answer(QByteArray const& text)
{
    Velocor::PrintWithoutWaiting(text);
    QTimer::singleShot(0, QCoreApplication::instance(), &QCoreApplication::quit);
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

    QApplication::setStyle(new Velocor::ReachableStyle);
    Velocor::InstallAccessibleParts();

    QuitOnSignal quitOnSignal;
    const Velocor::CommandLine commandLine(QApplication::arguments());
    const bool answers = !commandLine.answer().isEmpty();
    Velocor::MainWindow window;
    window.setAttribute(Qt::WA_DontShowOnScreen, answers);
    if (!answers)
        window.OpenAtStart(commandLine.files());
    window.show();

    qDebug() << "app.exec() starting";
    Velocor::PrintWithoutWaiting(commandLine.complaints(), STDERR_FILENO);
    if (answers)
        Answer(commandLine.answer());
    else
        PrintLogFileIfScreenless();
    return QApplication::exec();
}
