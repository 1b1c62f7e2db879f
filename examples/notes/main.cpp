// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A small window for writing notes: notes [FILE]

#include "NotesWindow.h"

#include "app/AppPaths.h"
#include "app/FailedWrites.h"
#include "app/QuitOnSignal.h"
#include "common/log/TorkLog.h"

#include <QApplication>

// The order matters: the data directory follows from the names, the log is below it, and the
// message boxes take their title from the caption.
int main(int argc, char** argv)
{
    SurviveFailedWrites();
    QApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct("Tork", "Notes");
    TorkLog::initialize("notes"); // creates the data directory too
    application.setProperty("caption", "Notes");

    const QuitOnSignal quitOnSignal;
    NotesWindow window(application.property("DataPath").toString() + "notes.cfg");
    window.show();
    window.OpenNote(application.arguments().value(1));

    TorkLog::logger()->write(TorkLog::Notification, "ready");
    return QApplication::exec();
}
