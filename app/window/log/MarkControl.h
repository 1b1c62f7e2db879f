// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

#include <memory>
#include <vector>

class QWidget;

namespace Velocor {

class LogMarkStore;
class LogMarks;
class LogModel;
class LogView;

/// What users do with the marks of a log: set them, write notes, go from one to the next. GUI
/// thread.
class MarkControl : public QObject
{
    Q_OBJECT

public:
    /// @param model   not owned
    /// @param view    not owned
    /// @param parent  of the object and of its dialogs
    MarkControl(LogModel* model, LogView* view, QWidget* parent);

    /// Sets where the marks are kept, before a file is opened.
    ///
    /// @param store  not owned
    void SetStore(LogMarkStore* store);

    /// Takes the marks of the model's file from the store, after the model was told to open it.
    void Load();

    /// Marks the current line or removes its mark.
    void Toggle();

    /// Asks for a note on the current line.
    void AskNote();

    /// Goes to the next (step 1) or previous (step -1) marked line, or reports that there is none.
    void GoTo(int step);

    /// Lists the marked lines, and goes to the one that the user chooses.
    void ShowList();

    /// The rows with marks, ascending.
    std::shared_ptr<std::vector<int> const> const& rows() const;

    /// Whether the current line is marked.
    bool isMarked() const;

    /// The note on the current line; empty if there is none.
    QString note() const;

Q_SIGNALS:
    /// Marks, notes, or the rows they are on.
    void changed();

    /// A message for the status bar.
    void messageReported(QString const& text);

private:
    void report(QString const& message);
    void show();

    LogModel* m_model;
    LogView* m_view;
    LogMarks* m_marks;
    QWidget* m_window;
};

} // namespace Velocor
