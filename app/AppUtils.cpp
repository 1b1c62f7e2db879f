// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppUtils.h"

#include "app/EmptyText_p.h"
#include "app/MruSeparator_p.h"

#include <QAction>
#include <QCoreApplication>
#include <QListWidget>
#include <QMenu>
#include <QStandardPaths>
#include <QStringList>

namespace {

QStringList Entries(QString const& list)
{
    return list.split(Velocor::MruSeparator);
}

QString Location(QStandardPaths::StandardLocation location)
{
    return QStandardPaths::writableLocation(location) + QLatin1Char('/');
}

QString BeforeLast(QString const& text, QString const& separator)
{
    const int position = text.lastIndexOf(separator);
    return position < 0 ? text : text.left(position);
}

// Adds or removes one entry. Returns false if nothing changes.
bool Update(QStringList& entries, QString const& file, AppUtils::MRUOpCode op)
{
    switch (op) {
    case AppUtils::MRUAdd:
        entries.removeOne(file);
        entries.prepend(file);
        return true;
    case AppUtils::MRURemove:
        return entries.removeOne(file);
    }
    return false;
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
    path = Location(QStandardPaths::DataLocation);
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

bool AppUtils::SetupMRUMenu(QMenu* menu, QString const& list)
{
    menu->clear();
    const QStringList entries = Entries(list);
    menu->setEnabled(!entries.isEmpty());
    for (QString const& entry : entries)
        menu->addAction(entry);
    return !entries.isEmpty();
}

bool AppUtils::SetupMRUListWidget(QListWidget* widget, QString const& list)
{
    widget->clear();
    const QStringList entries = Entries(list);
    widget->setEnabled(!entries.isEmpty());
    widget->addItems(entries);
    return !entries.isEmpty();
}

bool AppUtils::UpdateMRUList(QString const& file, QString& list, int maxCount, MRUOpCode op)
{
    if (file.isEmpty())
        return false;

    QStringList entries = Entries(list);
    if (!Update(entries, file, op))
        return false;

    // Also without entries it must not be null.
    list = Velocor::EmptyText() +
           QStringList(entries.mid(0, qMax(0, maxCount))).join(Velocor::MruSeparator);
    return true;
}

bool AppUtils::AddToMRUList(QString const& file, QString& list, int maxCount)
{
    return UpdateMRUList(file, list, maxCount, MRUAdd);
}

bool AppUtils::RemoveFromMRUList(QString const& file, QString& list)
{
    return UpdateMRUList(file, list, 10, MRURemove);
}
