// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The least that a program which leaves OpenGL alone can do: an empty window of the size of the
// real one, as the size has a cost too.

#include "app/WithoutOpenGl_p.h"

#include <QApplication>
#include <QMainWindow>

int main(int argc, char** argv)
{
    Velocor::WithoutOpenGl withoutOpenGl;
    QApplication application(argc, argv);
    withoutOpenGl.End();
    QMainWindow window;
    window.resize(1080, 680);
    window.show();
    return QApplication::exec();
}
