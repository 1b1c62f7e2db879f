// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogLocator.h"

#include <QObject>
#include <QThread>

namespace Velocor {

class LogModel;

/// Finds the row of a place in a model, without holding up the window. GUI thread.
class LogGoTo : public QObject
{
    Q_OBJECT

public:
    /// @param model  not owned
    explicit LogGoTo(LogModel* model, QObject* parent = nullptr);
    ~LogGoTo() override;

    /// Looks for a place; emits arrived() later. A place asked for earlier is given up.
    ///
    /// @param currentRow  -1 if there is none
    void Find(LogPlace const& place, int currentRow);

    /// From how many rows on a time is announced as being looked for: the times are read from the
    /// file.
    static constexpr int ManyRows = 100000;

Q_SIGNALS:
    /// The row of the place; -1 if there is none.
    ///
    /// @param message  what the user should know; may be empty
    void arrived(int row, QString const& message);

    /// It may take a while; also how far it is.
    void started(QString const& message);

    // To the locator's thread.
    void locateRequested(Velocor::LogLocateRequest const& request);

private:
    void startLocator();
    size_t firstLine(int currentRow) const;
    void take(LogLocation const& location);

    LogModel* m_model;
    QThread m_thread;
    LogLocator* m_locator = nullptr;
    int m_number = 0;
    bool m_isLong = false;
};

} // namespace Velocor
