// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program outside the tree for which the frame has to work. Returns 0 if it does.

#include "app/AppPaths.h"
#include "app/AppUtils.h"
#include "app/FailedWrites.h"
#include "app/LaunchOptionParser.h"
#include "app/QuitOnSignal.h"
#include "app/UserMessages.h"

#include <QApplication>
#include <QMenu>
#include <QVariant>

int main(int argc, char** argv)
{
    SurviveFailedWrites();
    QApplication application(argc, argv);
    const QuitOnSignal quitOnSignal;
    AppPaths::SetOrganizationAndProduct("Some Organization", "Some Product");
    QString xml = "<arg key=\"name\">value</arg>";
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("name", "name", "n", 1, ""));
    QMenu menu;

    const bool works = application.property("DataPath").toString().endsWith("/Some Product/") &&
                       parser.ParseOptions(xml) && parser.FindOption("name")->value == "value" &&
                       AppUtils::SetupMRUMenu(&menu, "b|a") && menu.actions().size() == 2;
    WarningMessage(nullptr, "only logged", false);
    return works ? 0 : 1;
}
