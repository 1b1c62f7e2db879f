// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/ActivityCounter.h"
#include "app/logfile/LogSpan.h"

#include <QThread>
#include <QTimer>
#include <QWidget>

namespace Velocor {

class LogModel;
class LogView;

/// When a log was busy: a bar for each moment, as high as there were entries, with the problems
/// among them in their colors. It stands for the rows that the view shows, and follows them.
///
/// A click goes to the first entry of a bar, dragging shows only entries of these times, and the
/// wheel zooms. With the keyboard, Left, Right, Home and End choose a bar, Enter goes there, Plus
/// and Minus zoom; with Shift, the former choose several bars, and Enter shows only their times.
/// Escape shows all times again. Counting runs in a thread of its own. GUI thread.
class ActivityStrip : public QWidget
{
    Q_OBJECT

public:
    /// @param model  not owned
    /// @param view   not owned; shows the model
    ActivityStrip(LogModel* model, LogView* view, QWidget* parent = nullptr);
    ~ActivityStrip() override;

    /// Shows or hides the strip. Nothing is counted while it is hidden.
    void SetShown(bool shown);

    /// What is shown.
    Activity const& activity() const { return m_activity; }

    /// Where a bar is.
    QRect BarRect(int bar) const;

    QSize sizeHint() const override;

Q_SIGNALS:
    /// The bars are shown.
    void shown();

    /// What the keyboard has chosen, for the status bar.
    void messageReported(QString const& text);

    /// Only entries of these times are to be shown.
    void spanChosen(Velocor::LogSpan const& span);

    // To the counter's thread.
    void countRequested(Velocor::ActivityRequest const& request);

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    void startCounter();
    void countSoon();
    void count();
    void take(Activity const& activity);
    void describe();
    QRect ground() const;
    int partCount() const;
    int barAt(int x) const;
    int barCount() const { return static_cast<int>(m_activity.bars.size()); }
    QString timeText(qint64 time) const;
    QString textOf(int bar) const;
    QString placeholder() const;
    void paintBar(QPainter& painter, int bar, size_t most) const;
    void paintTimes(QPainter& painter) const;
    void choose(int bar);
    bool goTo(int bar);
    void show(qint64 from, qint64 to);
    void zoom(int bar, double factor);
    bool moveOn(int step);
    void extendTo(int bar);
    bool extend(int key);
    void chooseSpan(int one, int other);
    void leave();

    LogModel* m_model;
    LogView* m_view;
    QThread m_thread;
    ActivityCounter* m_counter = nullptr;
    int m_number = 0;
    bool m_isCounting = false;
    bool m_isOutdated = true;
    QString m_path; // of the log that is zoomed
    qint64 m_from = -1;
    qint64 m_to = -1;
    Activity m_activity;
    int m_chosen = -1;  // bar
    int m_anchor = -1;  // the other end, if several are chosen
    int m_pressed = -1; // bars, while the mouse button is down
    int m_dragged = -1;
    QTimer m_timer;
};

} // namespace Velocor
