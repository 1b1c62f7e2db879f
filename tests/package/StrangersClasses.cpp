// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "StrangersClasses.h"

#include <QMenuBar>

MainWindow::MainWindow() : m_menu(menuBar()->addMenu("Own")), m_values()
{
    m_values[39] = 0.5;
}

bool MainWindow::isWhole() const
{
    return m_menu->title() == "Own" && m_values[39] == 0.5;
}

LogView::~LogView() = default;

bool NestedDeeperThan(char const*, int)
{
    return true;
}

void WakeEventLoop(int) {}
