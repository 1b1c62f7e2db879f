// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/RecentFiles.h"

#include "app/AppUtils.h"

#include <QAction>
#include <QFileInfo>
#include <QMenu>

namespace Velocor {

namespace {

constexpr QLatin1Char Separator('|');

// The empty list reads as one empty entry, which would stay behind the files for good.
QString WithoutEmptyEntries(QString const& list)
{
    QStringList entries = list.split(Separator);
    entries.removeAll(QString());
    return entries.join(Separator);
}

} // namespace

RecentFiles::RecentFiles(QMenu* menu, QObject* parent) : QObject(parent), m_menu(menu)
{
    m_menu->setToolTipsVisible(true);
    connect(m_menu, &QMenu::triggered, this, [this](QAction* action) {
        const QString path = action->data().toString();
        if (!path.isEmpty())
            emit Chosen(path);
    });
    fillMenu();
}

void RecentFiles::SetList(QString const& list)
{
    m_list = WithoutEmptyEntries(list);
    fillMenu();
}

void RecentFiles::Add(QString const& path)
{
    if (path.contains(Separator))
        return;
    AppUtils::AddToMRUList(path, m_list, MostFiles);
    SetList(m_list);
}

void RecentFiles::Remove(QString const& path)
{
    AppUtils::RemoveFromMRUList(path, m_list);
    SetList(m_list);
}

void RecentFiles::Clear()
{
    SetList(QString());
}

// The menu shows names with their number as a key to press; paths are the actions' tool tips.
void RecentFiles::fillMenu()
{
    m_menu->clear();
    m_menu->setEnabled(!m_list.isEmpty());
    if (m_list.isEmpty())
        return;

    AppUtils::SetupMRUMenu(m_menu, m_list);
    int number = 0;
    const QList<QAction*> actions = m_menu->actions();
    for (QAction* action : actions) {
        const QString path = action->text();
        QString name = QFileInfo(path).fileName();
        name.replace(QLatin1Char('&'), QLatin1String("&&"));
        action->setData(path);
        action->setToolTip(path);
        action->setStatusTip(path);
        action->setText(++number < 10 ? QStringLiteral("&%1 %2").arg(number).arg(name) : name);
    }
    m_menu->addSeparator();
    QAction* clear = m_menu->addAction(tr("&Clear"));
    clear->setToolTip(tr("Forget all recently opened files"));
    connect(clear, &QAction::triggered, this, &RecentFiles::Clear);
}

} // namespace Velocor
