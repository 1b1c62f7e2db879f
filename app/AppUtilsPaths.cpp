// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Apart from the lists of recent files, whose menus need Qt Widgets: a program without a window
// uses only these.

#include "app/AppUtils.h"

#include <QCoreApplication>
#include <QStandardPaths>

namespace {

QString Location(QStandardPaths::StandardLocation location)
{
    return QStandardPaths::writableLocation(location) + QLatin1Char('/');
}

QString BeforeLast(QString const& text, QString const& separator)
{
    const int position = text.lastIndexOf(separator);
    return position < 0 ? text : text.left(position);
}

} // namespace

void AppUtils::SetupRootPath(QString& path)
{
    if (!path.isEmpty())
        return;

    // The executable is in X/Some.app/Contents/MacOS in a bundle, in X/bin otherwise: return X.
    const QString folder =
        BeforeLast(QCoreApplication::applicationDirPath(), QStringLiteral("/Contents/MacOS"));
    path = BeforeLast(folder, QStringLiteral("/")) + QLatin1Char('/');
}

void AppUtils::SetupProgramPath(QString& path)
{
    SetupRootPath(path);
}

void AppUtils::SetupDataRootPath(QString& path)
{
    path = Location(QStandardPaths::AppLocalDataLocation);
}

void AppUtils::SetupDocumentPath(QString& path)
{
    path = Location(QStandardPaths::DocumentsLocation);
}

void AppUtils::SetOrganizationAndProduct(QString const& organization, QString const& product)
{
    QCoreApplication::setOrganizationName(organization);
    QCoreApplication::setApplicationName(product);
}

void AppUtils::SetupPaths(QString const& organization, QString const& product, QString& root,
                          QString& data)
{
    SetOrganizationAndProduct(organization, product);
    SetupRootPath(root);
    SetupDataRootPath(data);
}
