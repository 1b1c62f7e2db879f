// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/ProgramLogs.h"

#include <QList>
#include <QSet>
#include <QString>
#include <QToolButton>

class QMenu;

namespace Velocor {

/// The choice of the programs whose logs are shown as one: a button with a menu that switches each
/// on or off. GUI thread.
class ProgramsButton : public QToolButton
{
    Q_OBJECT

public:
    explicit ProgramsButton(QWidget* parent = nullptr);

    /// Offers these logs, all of which are shown, except those that are hidden already.
    void SetLogs(QList<ProgramLog> const& logs);

    /// Paths of the logs that are switched off.
    QSet<QString> const& hidden() const { return m_hidden; }

Q_SIGNALS:
    /// The user has switched logs on or off.
    void hiddenChanged();

    /// The user wants to see further logs with these.
    void addRequested();

private:
    void fill();
    void showState();

    QMenu* m_menu;
    QList<ProgramLog> m_logs;
    QSet<QString> m_hidden;
};

} // namespace Velocor
