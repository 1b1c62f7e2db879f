// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsDelegate.h"

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/FieldHint.h"
#include "app/window/settings/SettingsCommands.h"
#include "app/window/settings/SettingsModel.h"
#include "app/window/widgets/RowHeight.h"

#include <QLineEdit>

namespace Velocor {

SettingsDelegate::SettingsDelegate(SettingsCommands* commands, QObject* parent)
    : QStyledItemDelegate(parent), m_commands(commands)
{}

QSize SettingsDelegate::sizeHint(QStyleOptionViewItem const& option, QModelIndex const& index) const
{
    const QSize size = QStyledItemDelegate::sizeHint(option, index);
    return QSize(size.width(), RowHeight(option.fontMetrics));
}

QWidget* SettingsDelegate::createEditor(QWidget* parent, QStyleOptionViewItem const& option,
                                        QModelIndex const& index) const
{
    if (SettingsModel::IsLong(index)) {
        Q_EMIT longTextRequested();
        return nullptr;
    }
    auto* field =
        qobject_cast<QLineEdit*>(QStyledItemDelegate::createEditor(parent, option, index));
    const bool isValue = index.column() == SettingsModel::ValueColumn;
    field->setAccessibleName(isValue ? tr("Value") : tr("Name"));
    auto* hint = new FieldHint(field);
    const QPersistentModelIndex cell(index);
    connect(field, &QLineEdit::textEdited, hint,
            [this, hint, cell](QString const& text) { hint->Show(problemOf(cell, text)); });
    m_field = field;
    Q_EMIT editingChanged();
    return field;
}

void SettingsDelegate::destroyEditor(QWidget* editor, QModelIndex const& index) const
{
    m_field.clear();
    QStyledItemDelegate::destroyEditor(editor, index);
    Q_EMIT editingChanged();
}

// A value that the store cannot keep is accepted: saving asks.
QString SettingsDelegate::problemOf(QModelIndex const& index, QString const& text) const
{
    if (index.column() == SettingsModel::ValueColumn)
        return SettingsFileWriter::ValueProblem(text);
    const QString name = QString(text).remove(QLatin1Char(' '));
    if (name == SettingsModel::FullText(index))
        return QString();
    const SettingsCommands::NameProblem problem = m_commands->CheckName(index, name);
    return problem.hint.isEmpty() ? problem.reason
                                  : problem.reason + QLatin1String(". ") + problem.hint;
}

void SettingsDelegate::setModelData(QWidget* editor, QAbstractItemModel*,
                                    QModelIndex const& index) const
{
    const QString reason =
        m_commands->SetText(index, static_cast<QLineEdit const*>(editor)->text());
    if (!reason.isEmpty())
        Q_EMIT rejected(reason);
}

} // namespace Velocor
