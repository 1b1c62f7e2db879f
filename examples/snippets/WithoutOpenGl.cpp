// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/WithoutOpenGl.h"

#include <QApplication>

int main(int argc, char** argv)
{
    Velocor::WithoutOpenGl withoutOpenGl;
    QApplication app(argc, argv);
    withoutOpenGl.End();
    return QApplication::exec();
}
