// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkOrderedHash.h"

#include <QDebug>

void CountWheels()
{
    TorkOrderedHash<int> wheels;
    wheels.insert("car", 4);
    wheels.insert("bicycle", 2);
    for (auto const& entry : wheels)
        qDebug() << entry.key << entry.value; // the car first
}
