// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "app/UserMessages.h"

#include <QWidget>

void AddColumn(QString const& dataPath, QWidget* window)
{
    TorkConfigFile settings(dataPath + "viewer.cfg");
    settings.Load(); // no file yet: the defaults below hold
    int columns = 0;
    settings.ReadInt("Main Window", "columns", 3, columns);
    settings.WriteItem("Main Window", "columns", columns + 1);
    if (!settings.SaveAtomically())
        WarningMessage(window, settings.m_lastError, true);
}
