// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/RecentFiles.h"

#include "app/AppUtils.h"
#include "app/MruSeparator_p.h"
#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QFileInfo>
#include <QMenu>

namespace Velocor {

namespace {

constexpr int MaximumNameLength = 100; // characters

// The empty list reads as one empty entry, which would stay in the list forever. A path that is too
// long is dropped: shortened, it would name another file.
QString UsableEntries(QString const& list)
{
    QStringList entries;
    int start = 0;
    while (start < list.size() && entries.size() < RecentFiles::MaximumFiles) {
        int end = list.indexOf(MruSeparator, start);
        if (end < 0)
            end = list.size();
        if (end > start && end - start <= RecentFiles::MaximumPathLength)
            entries.append(list.mid(start, end - start));
        start = end + 1;
    }
    return entries.join(MruSeparator);
}

// "&" would mark a mnemonic, and a tab would start the shortcut column.
QString MenuText(QString const& path)
{
    QString name = LeftToRight(Shortened(QFileInfo(path).fileName(), MaximumNameLength));
    name.replace(QLatin1Char('\t'), QLatin1Char(' '));
    return name.replace(QLatin1Char('&'), QLatin1String("&&"));
}

} // namespace

RecentFiles::RecentFiles(QMenu* menu, QObject* parent) : QObject(parent), m_menu(menu)
{
    m_menu->setToolTipsVisible(true);
    connect(m_menu, &QMenu::triggered, this, [this](QAction* action) {
        const QString path = action->data().toString();
        if (!path.isEmpty())
            Q_EMIT fileChosen(path);
    });
    fillMenu();
}

void RecentFiles::SetList(QString const& list)
{
    m_list = UsableEntries(list);
    fillMenu();
}

void RecentFiles::Add(QString const& path)
{
    if (path.contains(MruSeparator) || path.size() > MaximumPathLength)
        return;
    AppUtils::AddToMRUList(path, m_list, MaximumFiles);
    SetList(m_list);
}

bool RecentFiles::Contains(QString const& path) const
{
    return m_list.split(MruSeparator).contains(path);
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

// The menu shows file names with a number as mnemonic; the tool tips show the full paths.
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
        const QString name = MenuText(path);
        action->setData(path);
        action->setToolTip(PlainToolTip(LeftToRight(path)));
        action->setStatusTip(LeftToRight(path));
        action->setText(++number < 10 ? QStringLiteral("&%1 %2").arg(number).arg(name) : name);
    }
    m_menu->addSeparator();
    QAction* clear = m_menu->addAction(tr("&Clear"));
    clear->setToolTip(PlainToolTip(tr("Clear the list of recent files")));
    connect(clear, &QAction::triggered, this, &RecentFiles::Clear);
}

} // namespace Velocor
