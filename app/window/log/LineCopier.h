// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QObject>

namespace Velocor {

class LogModel;
class LogView;

/// Copies the selected lines of a log to the clipboard, and says how many. GUI thread.
class LineCopier : public QObject
{
    Q_OBJECT

public:
    /// @param model  not owned
    /// @param view   not owned
    LineCopier(LogModel* model, LogView* view, QObject* parent = nullptr);

    /// Copies whole entries, as stored in the file.
    void Copy();

    /// Copies the selected lines as a Markdown code block, or as CSV.
    void CopyAsMarkdown();
    void CopyAsCsv();

Q_SIGNALS:
    /// A message for the status bar.
    void messageReported(QString const& text);

private:
    void take(int count, QString const& text);
    int linesIn(QList<int> const& rows) const;

    LogModel* m_model;
    LogView* m_view;
};

} // namespace Velocor
