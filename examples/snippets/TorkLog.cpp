// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"

#include <QDebug>

void StartToLog()
{
    TorkLog::initialize("viewer");
    TorkLog::logger()->warning("The index is out of date.");
    qDebug() << "pages" << 3; // an entry of severity Trace
}
