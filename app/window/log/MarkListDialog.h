// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QVector>

class QTreeWidget;

namespace Velocor {

class LogMarks;
class LogView;

/// Lists the marked lines that the view shows, with their notes, and lets the user choose one.
class MarkListDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param marks  not owned
    /// @param view   not owned; with a model
    MarkListDialog(LogMarks const& marks, LogView const& view, QWidget* parent = nullptr);

    /// Where the line that was chosen starts in the file, because rows may move meanwhile; -1 if
    /// none was.
    qint64 start() const;

private:
    void fill(LogMarks const& marks, LogView const& view);

    QTreeWidget* m_list;
    QVector<qint64> m_starts; // of the lines listed
};

} // namespace Velocor
