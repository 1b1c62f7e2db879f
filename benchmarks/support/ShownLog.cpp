// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/ShownLog.h"

#include "support/TimedLines.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

using namespace Velocor;

void RunEventLoopFor(int milliseconds)
{
    QEventLoop loop;
    QTimer::singleShot(milliseconds, &loop, &QEventLoop::quit);
    loop.exec();
}

void RunEventLoopUntil(std::function<bool()> const& isDone)
{
    while (!isDone())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
}

ShownLog::ShownLog(LogModel* model) : LogView(model), m_model(model)
{
    resize(1080, 680);
    show();
    bool isPainted = false;
    m_afterPaint = [&] {
        isPainted = true;
    };
    RunEventLoopUntil([&] { return isPainted; });
    m_afterPaint = nullptr;
}

void ShownLog::Open(QString const& fileName, bool isAll)
{
    m_model->Open(fileName, LogLineParser(), false, isAll);
    RunEventLoopUntil([&] { return !m_model->isReading(); });
}

void ShownLog::Open(QList<ProgramLog> const& logs)
{
    m_model->OpenFamily(logs.at(0).path, logs, LogLineParser(), {});
    RunEventLoopUntil([&] { return !m_model->isReading(); });
}

double ShownLog::OpenToFirstPage(QString const& fileName)
{
    double time = 0;
    QElapsedTimer timer;
    m_afterPaint = [&] {
        if (time == 0 && rowAt(viewport()->height() - 1) >= 0)
            time = double(timer.nsecsElapsed());
    };
    timer.start();
    m_model->Open(fileName, LogLineParser(), false);
    RunEventLoopUntil([&] { return time > 0; });
    m_afterPaint = nullptr;
    return time;
}

void ShownLog::TimeLines(TimedLines& lines)
{
    const int before = m_model->rowCount();
    m_afterPaint = [&] {
        const int rows = m_model->rowCount();
        const QRect last = visualRect(m_model->index(rows - 1, 0));
        if (viewport()->rect().intersects(last))
            lines.NoteArrived(size_t(rows - before));
    };
    RunEventLoopUntil([&] { return lines.isOver(); });
    m_afterPaint = nullptr;
}

void ShownLog::paintEvent(QPaintEvent* event)
{
    LogView::paintEvent(event);
    if (m_afterPaint)
        m_afterPaint();
}
