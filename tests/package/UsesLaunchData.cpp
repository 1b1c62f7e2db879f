// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program whose names come from its launch data file. Returns 0 if they do.

#include "app/AppPaths.h"

#include <QCoreApplication>

int main(int argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct();
    return QCoreApplication::organizationName() == "Ada" && AppPaths::ProductName() == "Library"
               ? 0
               : 1;
}
