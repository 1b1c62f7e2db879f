// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/FailedWrites.h"

#include <QApplication>

int main(int argc, char** argv)
{
    SurviveFailedWrites();
    QApplication app(argc, argv);
    return QApplication::exec();
}
