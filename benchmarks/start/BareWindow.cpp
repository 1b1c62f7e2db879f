// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The floor of a start: what any Qt program with a window does.

#include <QApplication>
#include <QMainWindow>

int main(int argc, char** argv)
{
    QApplication application(argc, argv);
    QMainWindow window;
    window.show();
    return QApplication::exec();
}
