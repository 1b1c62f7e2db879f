// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program outside the tree that uses every class of the frame, and whose own classes have the
// same names as those of the program in this tree. Returns 0 if neither interferes with the other.

#include "StrangersClasses.h"

#include "app/AppPaths.h"
#include "app/AppUtils.h"
#include "app/LaunchOption.h"
#include "app/LaunchOptionParser.h"
#include "app/QuitOnSignal.h"
#include "app/UserMessages.h"

#include <QApplication>
#include <QListWidget>
#include <QTimer>
#include <QVariant>

#include <csignal>
#include <cstdio>

namespace {

int s_failures = 0;

void Check(bool holds, char const* what)
{
    if (holds)
        return;
    std::fprintf(stderr, "does not hold: %s\n", what);
    ++s_failures;
}

void Identity()
{
    AppPaths::SetOrganizationAndProduct("Some Organization", "Some Product");
    Check(AppPaths::ProductName() == "Some Product", "the product has its name");
    Check(qApp->property("DataPath").toString().endsWith("/Some Product/"), "data has a folder");
    QString documents;
    AppUtils::SetupDocumentPath(documents);
    Check(documents.endsWith('/'), "documents have a folder");
}

void LaunchData()
{
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("name", "name", "n", 1, ""));
    // Deeper than the stranger's own NestedDeeperThan() would allow.
    QString xml = "<args><arg key=\"name\">value</arg></args>";
    QString flat = "<arg key=\"name\">value</arg>";
    parser.ParseOptions(xml);
    Check(parser.ParseOptions(flat) && parser.FindOption("name")->value == "value",
          "launch data is read");
}

void RecentLists()
{
    QString list("a");
    Check(AppUtils::AddToMRUList("b", list, 5) && list == "b|a", "the list has both files");
    QMenu menu;
    QListWidget widget;
    Check(AppUtils::SetupMRUMenu(&menu, list) && menu.actions().size() == 2, "the menu is filled");
    Check(AppUtils::SetupMRUListWidget(&widget, list) && widget.count() == 2, "so is the list");
}

void Messages()
{
    CriticalMessage(nullptr, "only logged", false);
    WarningMessage(nullptr, "only logged", false);
    DebugMessage(nullptr, "only logged", false);
    QString text("two\nlines");
    QString error;
    Check(StripFormatting(text) == "two lines", "formatting is removed");
    Check(FormatError("error", error) == "error", "an error is formatted");
}

void OwnClasses()
{
    MainWindow window;
    LogFilter filter;
    LogView view;
    RecentFiles recent;
    SettingsEditor editor;
    WithoutOpenGl withoutOpenGl;
    window.show();
    QCoreApplication::processEvents();
    Check(window.isWhole() && filter.isWhole() && view.isWhole(), "own window, filter, view");
    Check(recent.isWhole() && editor.isWhole() && withoutOpenGl.isWhole(), "own list, editor");
    Check(QString(window.metaObject()->className()) == "MainWindow", "own meta-object");
    Check(NestedDeeperThan("", 0), "own function");
    WakeEventLoop(0);
}

} // namespace

int main(int argc, char** argv)
{
    QApplication application(argc, argv);
    QuitOnSignal quitOnSignal;
    Identity();
    LaunchData();
    RecentLists();
    Messages();
    OwnClasses();

    // Ends through the frame's handler, not through the stranger's function of that name.
    MainWindow window;
    window.show();
    QTimer::singleShot(0, [] { std::raise(SIGTERM); });
    QTimer::singleShot(20000, [] { QCoreApplication::exit(3); });
    Check(QApplication::exec() == 0, "a signal ends the program");
    return s_failures == 0 ? 0 : 1;
}
