// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsDelegate.h"

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/FieldHint.h"
#include "app/window/settings/SettingsCommands.h"
#include "app/window/settings/SettingsModel.h"
#include "app/window/widgets/RowHeight.h"

#include <QApplication>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMouseEvent>
#include <QStyle>

#include <limits>

namespace Velocor {

namespace {

constexpr int PageStep = 10; // of a number

QString NoNumberText()
{
    return SettingsDelegate::tr("Not a number from %1 to %2")
        .arg(std::numeric_limits<int>::min())
        .arg(std::numeric_limits<int>::max());
}

// A guess may be wrong, so only a choice excludes other texts.
bool IsChosenNumber(QModelIndex const& index)
{
    auto const* model = static_cast<SettingsModel const*>(index.model());
    return SettingsModel::KindOf(index) == ValueKind::Number && model->HasChosenKind(index);
}

} // namespace

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
    const bool isValue = index.column() == SettingsModel::ValueColumn;
    if (isValue && SettingsModel::HasDialog(index)) {
        Q_EMIT dialogRequested();
        return nullptr;
    }
    if (SettingsModel::IsLong(index))
        return nullptr;
    auto* field =
        qobject_cast<QLineEdit*>(QStyledItemDelegate::createEditor(parent, option, index));
    field->setAccessibleName(isValue ? tr("Value") : tr("Name"));
    auto* hint = new FieldHint(field);
    const QPersistentModelIndex cell(index);
    connect(field, &QLineEdit::textEdited, hint,
            [this, hint, cell](QString const& text) { hint->Show(problemOf(cell, text)); });
    m_field = field;
    m_isNumber = isValue && SettingsModel::KindOf(index) == ValueKind::Number;
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
    if (index.column() == SettingsModel::ValueColumn) {
        int number = 0;
        const bool isProblem = SettingsModel::KindOf(index) == ValueKind::Number &&
                               text != SettingsModel::FullText(index) &&
                               !TypedText::ToNumber(text, number);
        if (!isProblem)
            return SettingsFileWriter::ValueProblem(text);
        return IsChosenNumber(index) ? NoNumberText()
                                     : NoNumberText() + tr("; the value becomes a text");
    }
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
    QString text = static_cast<QLineEdit const*>(editor)->text();
    int number = 0;
    const QString old = SettingsModel::FullText(index);
    const bool isNumber = index.column() == SettingsModel::ValueColumn && text != old &&
                          SettingsModel::KindOf(index) == ValueKind::Number;
    if (isNumber && TypedText::ToNumber(text, number)) {
        text = TypedText::FromNumber(number);
    } else if (isNumber && IsChosenNumber(index)) {
        Q_EMIT rejected(NoNumberText() + tr(", so \"%1\" is kept.").arg(old));
        return;
    }
    const QString reason = m_commands->SetText(index, text);
    if (!reason.isEmpty())
        Q_EMIT rejected(reason);
}

// A click on the check box changes the value; beside it, the cell is like any other.
bool SettingsDelegate::editorEvent(QEvent* event, QAbstractItemModel* model,
                                   QStyleOptionViewItem const& option, QModelIndex const& index)
{
    const bool isClick = event->type() == QEvent::MouseButtonRelease;
    const bool isMouse = isClick || event->type() == QEvent::MouseButtonPress ||
                         event->type() == QEvent::MouseButtonDblClick;
    if (!isMouse || !index.data(Qt::CheckStateRole).isValid())
        return QStyledItemDelegate::editorEvent(event, model, option, index);
    QStyleOptionViewItem item(option);
    initStyleOption(&item, index);
    QStyle const* style = item.widget ? item.widget->style() : QApplication::style();
    const QRect box =
        style->subElementRect(QStyle::SE_ItemViewItemCheckIndicator, &item, item.widget);
    auto const* mouse = static_cast<QMouseEvent const*>(event);
    if (mouse->button() != Qt::LeftButton || !box.contains(mouse->pos()))
        return QStyledItemDelegate::editorEvent(event, model, option, index);
    if (isClick)
        m_commands->Toggle(index);
    return true;
}

void SettingsDelegate::step(QLineEdit* field, int by) const
{
    int number = 0;
    if (!TypedText::ToNumber(field->text(), number))
        return;
    const qint64 least = std::numeric_limits<int>::min();
    const qint64 greatest = std::numeric_limits<int>::max();
    const qint64 next = qBound(least, qint64(number) + by, greatest);
    field->selectAll();
    field->insert(TypedText::FromNumber(static_cast<int>(next)));
    field->selectAll();
}

bool SettingsDelegate::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() == QEvent::KeyPress && m_isNumber && object == m_field) {
        auto* field = static_cast<QLineEdit*>(m_field.data());
        switch (static_cast<QKeyEvent const*>(event)->key()) {
        case Qt::Key_Up:
            step(field, 1);
            return true;
        case Qt::Key_Down:
            step(field, -1);
            return true;
        case Qt::Key_PageUp:
            step(field, PageStep);
            return true;
        case Qt::Key_PageDown:
            step(field, -PageStep);
            return true;
        default:
            break;
        }
    }
    return QStyledItemDelegate::eventFilter(object, event);
}

} // namespace Velocor
