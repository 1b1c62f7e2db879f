// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPointer>
#include <QStyledItemDelegate>

namespace Velocor {

class SettingsCommands;

/// Edits the cells of a SettingsModel through SettingsCommands, and says what is wrong with a text
/// while it is being typed. A cell that shows only the start of its text is not edited. GUI thread
/// only.
class SettingsDelegate : public QStyledItemDelegate
{
    Q_OBJECT

public:
    /// @param commands  not owned; outlives this object
    SettingsDelegate(SettingsCommands* commands, QObject* parent);

    /// The field in which the user is typing; null if there is none.
    QWidget* field() const { return m_field.data(); }

    QSize sizeHint(QStyleOptionViewItem const& option, QModelIndex const& index) const override;
    QWidget* createEditor(QWidget* parent, QStyleOptionViewItem const& option,
                          QModelIndex const& index) const override;
    void destroyEditor(QWidget* editor, QModelIndex const& index) const override;
    void setModelData(QWidget* editor, QAbstractItemModel* model,
                      QModelIndex const& index) const override;

Q_SIGNALS: // const, as they come from the functions of a delegate, which are
    /// Editing a cell has begun or ended.
    void editingChanged() const; // clazy:exclude=const-signal-or-slot

    /// What was typed is not used.
    ///
    /// @param reason  for the user
    void rejected(QString const& reason) const; // clazy:exclude=const-signal-or-slot

    /// A cell is to be edited whose text is too long for that.
    void longTextRequested() const; // clazy:exclude=const-signal-or-slot

private:
    QString problemOf(QModelIndex const& index, QString const& text) const;

    SettingsCommands* m_commands;
    mutable QPointer<QWidget> m_field;
};

} // namespace Velocor
