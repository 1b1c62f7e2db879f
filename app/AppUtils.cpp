// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppUtils.h"

#include "app/EmptyText_p.h"
#include "app/MruSeparator_p.h"

#include <QAction>
#include <QListWidget>
#include <QMenu>
#include <QStringList>

namespace {

QStringList Entries(QString const& list)
{
    return list.split(Velocor::MruSeparator);
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
