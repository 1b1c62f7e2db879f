// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogMark.h"
#include "app/logfile/LogSource.h"

#include <QObject>
#include <QThread>

#include <memory>
#include <vector>

namespace Velocor {

class LogMarkFinder;
class LogMarkStore;
class LogModel;

/// The marks of a model's file: which rows they are on, and their notes.
///
/// Whenever the model reads its file from the start or a marked line is written over, a
/// LogMarkFinder looks for the lines in another thread. GUI thread.
class LogMarks : public QObject
{
    Q_OBJECT

public:
    /// @param model  not owned
    explicit LogMarks(LogModel* model, QObject* parent = nullptr);
    ~LogMarks() override;

    /// @param store  not owned; null: marks are not kept
    void SetStore(LogMarkStore* store) { m_store = store; }

    /// Takes the marks of the model's file from the store, after the model was told to open it.
    void Load();

    /// Marks a row or removes its mark and note, and saves the marks.
    ///
    /// @return why this failed, for users; empty on success
    QString Toggle(int row);

    /// Sets the note of a row, which also marks it, and saves the marks.
    ///
    /// @return why this failed, for users; empty on success
    QString SetNote(int row, QString const& note);

    bool isMarked(int row) const { return indexOf(row) >= 0; }

    /// The note of a row; empty if there is none.
    QString NoteOf(int row) const;

    /// The rows with marks, ascending.
    std::shared_ptr<std::vector<int> const> const& rows() const { return m_rows; }

Q_SIGNALS:
    /// Marks, notes, or the rows they are on.
    void changed();

    // To the finder's thread.
    void findRequested(int request, Velocor::LogSource const& source,
                       QVector<Velocor::LogMark> const& marks, Velocor::LogFileType const& type);

private:
    int indexOf(int row) const;
    void load();
    QString save();
    QString saveAll();
    void noteRefreshed();
    bool dropOverwritten();
    void find();
    void take(int request, QVector<LogMark> const& marks);
    void update();
    void addRows(std::vector<int>& rows, int from) const;

    LogModel* m_model;
    LogMarkStore* m_store = nullptr;
    QThread m_thread;
    LogMarkFinder* m_finder = nullptr;
    int m_request = 0;
    LogSource m_source;
    QVector<LogMark> m_marks;
    std::shared_ptr<std::vector<int> const> m_rows;
    int m_rowCount = 0;       // rows looked at
    bool m_wasReset = false;  // the file may be another one
    bool m_haveMoved = false; // rows before the last ones have changed
};

} // namespace Velocor
