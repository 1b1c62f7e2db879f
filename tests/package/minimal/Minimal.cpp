// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The minimum that a program can do with the frame, or without it.

#include <QCoreApplication>
#include <QString>

#ifdef WITH_FRAME
#include "app/AppUtils.h"
#endif

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    QString list = application.applicationName();
#ifdef WITH_FRAME
    return AppUtils::AddToMRUList("file", list, 10) ? 0 : 1;
#else
    return list.isEmpty() ? 1 : 0;
#endif
}
