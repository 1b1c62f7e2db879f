// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Shows a text file: starter [FILE]

#include "MainWindow.h"

#include "app/AppPaths.h"
#include "app/FailedWrites.h"
#include "app/QuitOnSignal.h"
#include "common/log/TorkLog.h"

#include <QApplication>

// The order matters: the data folder follows from the names, the log is below it, and the message
// boxes take their title from the caption.
int main(int argc, char** argv)
{
    SurviveFailedWrites();
    QApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct(); // from appdata.cfg
    TorkLog::initialize("starter");        // creates the data folder too
    application.setProperty("caption", AppPaths::ProductName());
    QApplication::setDesktopFileName("starter");

    const QuitOnSignal quitOnSignal;
    MainWindow window(application.property("DataPath").toString() + "starter.cfg");
    window.show();
    if (QApplication::arguments().size() > 1)
        window.Open(QApplication::arguments().at(1));

    TorkLog::logger()->write(TorkLog::Notification, "ready");
    return QApplication::exec();
}
