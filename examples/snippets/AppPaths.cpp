// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"

#include <QCoreApplication>
#include <QVariant>

QString DataDirectory()
{
    AppPaths::SetOrganizationAndProduct();
    QString data = QCoreApplication::instance()->property("DataPath").toString();
    return data;
}
