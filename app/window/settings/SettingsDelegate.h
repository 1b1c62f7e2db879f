// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPointer>
#include <QStyledItemDelegate>

class QLineEdit;

namespace Velocor {

class SettingsCommands;

/// Edits the cells of a SettingsModel through SettingsCommands, and says what is wrong with a text
/// while it is being typed. Up and Down step a number. A value that has a dialog, and a name of
/// which the cell shows only the start, are not edited. GUI thread only.
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
    bool editorEvent(QEvent* event, QAbstractItemModel* model, QStyleOptionViewItem const& option,
                     QModelIndex const& index) override;
    void setModelData(QWidget* editor, QAbstractItemModel* model,
                      QModelIndex const& index) const override;

Q_SIGNALS: // const, as they come from the functions of a delegate, which are
    /// Editing a cell has begun or ended.
    void editingChanged() const; // clazy:exclude=const-signal-or-slot

    /// What was typed is not used.
    ///
    /// @param reason  for the user
    void rejected(QString const& reason) const; // clazy:exclude=const-signal-or-slot

    /// A value is to be edited that has a dialog.
    void dialogRequested() const; // clazy:exclude=const-signal-or-slot

protected:
    bool eventFilter(QObject* object, QEvent* event) override;

private:
    void step(QLineEdit* field, int by) const;
    QString problemOf(QModelIndex const& index, QString const& text) const;

    SettingsCommands* m_commands;
    mutable QPointer<QWidget> m_field;
    mutable bool m_isNumber = false; ///< whether the user is typing one
};

} // namespace Velocor
