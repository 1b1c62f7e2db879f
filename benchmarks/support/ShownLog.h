// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/ProgramLogs.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"

#include <QList>
#include <QString>

#include <functional>

class TimedLines;

void RunEventLoopFor(int milliseconds);
void RunEventLoopUntil(std::function<bool()> const& isDone);

/// The view of a log on the screen, and what is known about its painting.
class ShownLog : public Velocor::LogView
{
public:
    /// Returns when it has been painted.
    ///
    /// @param model  not owned
    explicit ShownLog(Velocor::LogModel* model);

    /// Returns when all lines have been read.
    ///
    /// @param isAll  whether to read the older files of the log, too
    void Open(QString const& fileName, bool isAll = false);

    /// The same for several logs, by time.
    void Open(QList<Velocor::ProgramLog> const& logs);

    /// The time until rows fill the view, in nanoseconds.
    double OpenToFirstPage(QString const& fileName);

    /// Returns when all lines have been painted.
    void TimeLines(TimedLines& lines);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    Velocor::LogModel* m_model;
    std::function<void()> m_afterPaint;
};
