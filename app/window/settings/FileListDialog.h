// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QStringList>

class QDialogButtonBox;
class QLabel;
class QListWidget;
class QPushButton;

namespace Velocor {

/// Edits a list of recently used files: its entries, their number and their order. GUI thread only.
class FileListDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param name  the name of the value
    /// @param entries  at first
    FileListDialog(QString const& name, QStringList const& entries, QWidget* parent = nullptr);

    QStringList entries() const;

private:
    QPushButton* addButton(QDialogButtonBox* buttons, QString const& text);
    void insert(int row, QString const& text);
    void addEntry();
    void removeEntry();
    void moveEntry(int step);
    void updateState();

    QListWidget* m_list;
    QLabel* m_problem;
    QDialogButtonBox* m_buttons;
    QPushButton* m_remove;
    QPushButton* m_up;
    QPushButton* m_down;
};

} // namespace Velocor
