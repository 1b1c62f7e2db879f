// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/UserMessages.h"

#include <QWidget>

void TellOfDamage(QWidget* window)
{
    CriticalMessage(window, "The index is damaged.\nIt will be rebuilt.", true);
}
