// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ProgramsButton.h"

#include "app/window/log/ProgramColors.h"
#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QGuiApplication>
#include <QMenu>
#include <QPalette>

#include <algorithm>

namespace Velocor {

namespace {

// In a menu, an ampersand is for the key of an item.
QString WithoutMnemonic(QString name)
{
    return name.replace(QLatin1Char('&'), QLatin1String("&&"));
}

} // namespace

ProgramsButton::ProgramsButton(QWidget* parent) : QToolButton(parent), m_menu(new QMenu(this))
{
    setToolTip(PlainToolTip(tr("Which programs' lines are shown")));
    setPopupMode(QToolButton::InstantPopup);
    setToolButtonStyle(Qt::ToolButtonTextOnly);
    setFocusPolicy(Qt::TabFocus);
    setMenu(m_menu);
    connect(m_menu, &QMenu::aboutToShow, this, &ProgramsButton::fill);
    showState();
}

void ProgramsButton::SetLogs(QList<ProgramLog> const& logs)
{
    m_logs = logs;
    showState();
}

void ProgramsButton::fill()
{
    m_menu->clear();
    for (int log = 0; log < m_logs.size(); ++log) {
        const QString path = m_logs.at(log).path;
        QAction* action = m_menu->addAction(ProgramColors::Icon(log, QGuiApplication::palette()),
                                            WithoutMnemonic(m_logs.at(log).name));
        action->setCheckable(true);
        action->setChecked(!m_hidden.contains(path));
        action->setToolTip(PlainToolTip(path));
        connect(action, &QAction::toggled, this, [this, path](bool isShown) {
            if (isShown)
                m_hidden.remove(path);
            else
                m_hidden.insert(path);
            showState();
            Q_EMIT hiddenChanged();
        });
    }
    m_menu->addSeparator();
    QAction* all = m_menu->addAction(tr("&Show All"));
    all->setEnabled(!m_hidden.isEmpty());
    connect(all, &QAction::triggered, this, [this] {
        m_hidden.clear();
        showState();
        Q_EMIT hiddenChanged();
    });
    QAction* add = m_menu->addAction(tr("&Add Logs..."));
    connect(add, &QAction::triggered, this, &ProgramsButton::addRequested);
}

void ProgramsButton::showState()
{
    const auto shown = std::count_if(m_logs.begin(), m_logs.end(), [this](ProgramLog const& log) {
        return !m_hidden.contains(log.path);
    });
    const QString text = tr("&Programs: %1 of %2").arg(shown).arg(m_logs.size());
    setText(text);
    setAccessibleName(QString(text).remove(QLatin1Char('&')));
}

} // namespace Velocor
