// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppUtils.h"

#include <QMenu>

void Opened(QString const& fileName, QString& recent, QMenu* recentMenu)
{
    AppUtils::AddToMRUList(fileName, recent, 10);
    AppUtils::SetupMRUMenu(recentMenu, recent);
}
