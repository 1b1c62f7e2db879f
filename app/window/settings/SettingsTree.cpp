// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsTree.h"

#include "app/window/settings/SettingsCommands.h"
#include "app/window/settings/SettingsDelegate.h"
#include "app/window/settings/ValueIcons.h"
#include "app/window/widgets/PlainText.h"

#include <QAction>
#include <QActionGroup>
#include <QClipboard>
#include <QGuiApplication>
#include <QHeaderView>
#include <QKeyEvent>
#include <QMenu>

namespace Velocor {

SettingsTree::SettingsTree(SettingsModel* model, SettingsCommands* commands, QWidget* parent)
    : QTreeView(parent), m_model(model), m_commands(commands),
      m_delegate(new SettingsDelegate(commands, this))
{
    setAccessibleName(tr("Settings"));
    setLayoutDirection(Qt::LeftToRight); // in any language: names and values are code
    header()->setAccessibleName(tr("Settings columns"));
    KeepLeftToRight(header());
    setEditTriggers(DoubleClicked);
    setSelectionMode(ExtendedSelection);
    setAlternatingRowColors(true);
    setUniformRowHeights(true);
    setTextElideMode(Qt::ElideMiddle); // a long value ends in its size
    setContextMenuPolicy(Qt::ActionsContextMenu);
    setModel(model);
    setItemDelegate(m_delegate);
    connect(m_delegate, &SettingsDelegate::editingChanged, this, &SettingsTree::editingChanged);
    connect(m_delegate, &SettingsDelegate::rejected, this, [this](QString const& reason) {
        m_isRejected = true;
        Q_EMIT rejected(reason);
    });
    connect(m_delegate, &SettingsDelegate::dialogRequested, this,
            [this] { Q_EMIT dialogRequested(false); });
    connect(model, &SettingsModel::applied, this,
            [this](QModelIndex const& index) { m_changed = index; });
    connect(model, &SettingsModel::rowsInserted, this, &SettingsTree::expandNew);
    makeActions();
}

void SettingsTree::expandNew(QModelIndex const& parent, int first, int last)
{
    for (int row = first; row <= last && !parent.isValid(); ++row)
        expand(m_model->index(row, SettingsModel::NameColumn));
}

QVector<SettingsCommand> SettingsTree::AllCommands()
{
    const auto keys = [](char const* text) {
        return QList<QKeySequence>{QKeySequence(QLatin1String(text))};
    };
    return {
        {tr("&Edit Value"), keys("F2") + keys("Return") + keys("Enter"), tr("Edit the value"),
         &SettingsTree::EditValue},
        {tr("Edit in &Large Field"), keys("Ctrl+Return") + keys("Ctrl+Enter"),
         tr("Edit the value as a text of several lines"), &SettingsTree::EditInLargeField},
        {tr("&Toggle"), keys("Space"), tr("Change yes to no, and no to yes"),
         &SettingsTree::Toggle},
        {tr("C&hoose Kind"), keys("Ctrl+K"), tr("Choose what kind of value this is"),
         &SettingsTree::ChooseKind},
        {tr("Re&name"), keys("Shift+F2"), tr("Edit the name of the section or key"),
         &SettingsTree::EditName},
        {tr("Add &Key"), keys("Ins"), tr("Add a key to the section"), &SettingsTree::AddKey},
        {tr("Add &Section"), keys("Alt+Ins"), tr("Add an empty section"),
         &SettingsTree::AddSection},
        {tr("Dupl&icate"), keys("Ctrl+D"), tr("Add a copy of the section or key"),
         &SettingsTree::Duplicate},
        {tr("Re&move"), keys("Del"), tr("Remove the selected sections and keys"),
         &SettingsTree::Remove},
        {tr("Move &Up"), keys("Alt+Up"), tr("Move the section or key up"), &SettingsTree::MoveUp},
        {tr("Move &Down"), keys("Alt+Down"), tr("Move the section or key down"),
         &SettingsTree::MoveDown},
        {tr("&Back to Default"), keys("Ctrl+Backspace"),
         tr("Give the selected keys their default values"), &SettingsTree::BackToDefault},
        {tr("All Back t&o Default"), keys("Ctrl+Shift+Backspace"),
         tr("Give all keys of the file their default values"), &SettingsTree::AllBackToDefault},
        {tr("&Find"), keys("Ctrl+F"), tr("Find a text in names and values"),
         &SettingsTree::OpenFind},
        {tr("Find Ne&xt"), keys("F3"), tr("Go to the next match"), &SettingsTree::FindNext},
        {tr("Find &Previous"), keys("Shift+F3"), tr("Go to the previous match"),
         &SettingsTree::FindPrevious},
        {tr("Edit &as Text"), keys("Ctrl+T"), tr("Edit the file as text"),
         &SettingsTree::EditAsText},
        {tr("Sa&ved States..."), keys("Ctrl+Shift+T"),
         tr("Compare with earlier states of the file, and bring one back"),
         &SettingsTree::OpenStates},
    };
}

void SettingsTree::makeActions()
{
    const QVector<SettingsCommand> all = AllCommands();
    for (SettingsCommand const& command : all) {
        // Only while the tree itself has the focus: it would take the key from fields. Others,
        // and what a field does not use, are up to keyPressEvent().
        auto* action = new QAction(command.text, this);
        action->setShortcut(command.keys.first());
        action->setShortcutContext(Qt::WidgetShortcut);
        action->setStatusTip(command.statusTip);
        connect(action, &QAction::triggered, this, command.work);
        m_actions.append(action);
    }
    addActions(m_actions);
    updateActions();
}

void SettingsTree::AddOuterActions(QList<QAction*> const& actions)
{
    if (m_hasOuterActions)
        return;
    m_hasOuterActions = true;
    auto* separator = new QAction(this);
    separator->setSeparator(true);
    insertActions(m_actions.first(), actions);
    insertAction(m_actions.first(), separator);
}

// Without a current row, there is nothing to change.
void SettingsTree::updateActions()
{
    const bool hasRow = currentIndex().isValid();
    const QVector<SettingsCommand> all = AllCommands();
    for (int i = 0; i < m_actions.size(); ++i) {
        const auto work = all.at(i).work;
        const bool isOfFile = work == &SettingsTree::AddSection ||
                              work == &SettingsTree::EditAsText ||
                              work == &SettingsTree::OpenFind || work == &SettingsTree::OpenStates;
        const bool isOfDefaults =
            work == &SettingsTree::BackToDefault || work == &SettingsTree::AllBackToDefault;
        m_actions.at(i)->setEnabled(isOfFile ||
                                    (hasRow && (!isOfDefaults || m_model->hasDefaults())));
    }
}

// Keys that a field does not use arrive here, too.
void SettingsTree::keyPressEvent(QKeyEvent* event)
{
    if (isEditing()) {
        QTreeView::keyPressEvent(event);
        return;
    }
    const int modifiers = static_cast<int>(event->modifiers() & ~Qt::KeypadModifier);
    const QKeySequence pressed(modifiers + event->key());
    const QVector<SettingsCommand> all = AllCommands();
    for (int i = 0; i < all.size(); ++i) {
        if (all.at(i).keys.contains(pressed)) {
            m_actions.at(i)->trigger();
            return;
        }
    }
    QTreeView::keyPressEvent(event);
}

void SettingsTree::currentChanged(QModelIndex const& current, QModelIndex const& previous)
{
    QTreeView::currentChanged(current, previous);
    if (current.isValid() != previous.isValid())
        updateActions();
}

void SettingsTree::ShowAll()
{
    expandAll();
    resizeColumnToContents(SettingsModel::NameColumn);
    setColumnWidth(SettingsModel::NameColumn,
                   qBound(160, columnWidth(SettingsModel::NameColumn) + 24, 360));
    GoTo(m_model->index(0, SettingsModel::NameColumn));
    updateActions();
}

void SettingsTree::noteCollapsed()
{
    m_collapsed.clear();
    for (int row = 0; row < m_model->rowCount(); ++row) {
        const QModelIndex section = m_model->index(row, SettingsModel::NameColumn);
        if (!isExpanded(section))
            m_collapsed.insert(section.data(Qt::EditRole).toString());
    }
}

void SettingsTree::SetFilter(SettingsFilter const& filter)
{
    EndEditing();
    const SettingsModel::Place place = SettingsModel::PlaceOf(currentIndex());
    const bool wasEmpty = m_model->filter().isEmpty();
    if (wasEmpty)
        noteCollapsed();
    const bool hasOtherRows = m_model->SetFilter(filter);
    if (hasOtherRows || (wasEmpty && !m_collapsed.isEmpty()))
        expandAll();
    for (int row = 0; row < m_model->rowCount() && filter.isEmpty(); ++row) {
        const QModelIndex section = m_model->index(row, SettingsModel::NameColumn);
        if (m_collapsed.contains(section.data(Qt::EditRole).toString()))
            collapse(section);
    }
    const QModelIndex same = m_model->IndexOf(place);
    GoTo(same.isValid() ? same : m_model->index(0, SettingsModel::NameColumn));
    updateActions();
}

void SettingsTree::GoTo(QModelIndex const& index)
{
    if (!index.isValid())
        return;
    expand(index.parent());
    // setCurrentIndex() would add to the selection while Ctrl is pressed, as for Ctrl+Z.
    selectionModel()->setCurrentIndex(index, QItemSelectionModel::ClearAndSelect |
                                                 QItemSelectionModel::Rows);
    scrollTo(index);
}

void SettingsTree::GoToChanged()
{
    GoTo(m_changed);
}

void SettingsTree::OpenFind()
{
    Q_EMIT findRequested();
}

void SettingsTree::FindNext()
{
    Q_EMIT findNextRequested(1);
}

void SettingsTree::FindPrevious()
{
    Q_EMIT findNextRequested(-1);
}

void SettingsTree::EditAsText()
{
    Q_EMIT textRequested();
}

void SettingsTree::BackToDefault()
{
    EndEditing();
    m_commands->BackToDefault(chosenRows());
}

void SettingsTree::AllBackToDefault()
{
    EndEditing();
    m_commands->AllBackToDefault();
}

void SettingsTree::OpenStates()
{
    Q_EMIT statesRequested();
}

bool SettingsTree::isEditing() const
{
    return m_delegate->field() != nullptr;
}

bool SettingsTree::EndEditing()
{
    m_isRejected = false;
    if (QWidget* field = m_delegate->field()) {
        commitData(field);
        closeEditor(field, QAbstractItemDelegate::NoHint);
    }
    return !m_isRejected;
}

void SettingsTree::editCell(QModelIndex const& row, SettingsModel::Column column)
{
    if (!row.isValid())
        return;
    const QModelIndex cell = row.sibling(row.row(), column);
    GoTo(cell);
    edit(cell);
}

void SettingsTree::AddSection()
{
    EndEditing();
    editCell(m_commands->AddSection(), SettingsModel::NameColumn);
}

void SettingsTree::AddKey()
{
    EndEditing();
    editCell(m_commands->AddKey(currentIndex()), SettingsModel::NameColumn);
}

// A section has no value.
void SettingsTree::EditValue()
{
    const bool isSection = SettingsModel::IsSection(currentIndex());
    editCell(currentIndex(), isSection ? SettingsModel::NameColumn : SettingsModel::ValueColumn);
}

void SettingsTree::EditName()
{
    editCell(currentIndex(), SettingsModel::NameColumn);
}

void SettingsTree::EditInLargeField()
{
    if (currentIndex().isValid() && !SettingsModel::IsSection(currentIndex()))
        Q_EMIT dialogRequested(true);
}

void SettingsTree::Toggle()
{
    m_commands->Toggle(currentIndex());
}

void SettingsTree::ChooseKind()
{
    const QPersistentModelIndex row = currentIndex();
    if (!row.isValid() || SettingsModel::IsSection(row))
        return;
    const SettingsModel::Place place = SettingsModel::PlaceOf(row);
    SettingsDocument::Section const& section = m_model->document().sections.at(place.section);
    auto* menu = new QMenu(tr("Kind of value"), this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    menu->setAccessibleName(menu->title());
    auto* group = new QActionGroup(menu);
    const auto add = [&](QString const& text, bool isChecked) {
        QAction* action = group->addAction(text);
        action->setCheckable(true);
        action->setChecked(isChecked);
        menu->addAction(action);
        return action;
    };
    const bool isChosen = m_model->HasChosenKind(row);
    const ValueKind guess = TypedText::Guess(section.name, section.items.at(place.item).value);
    connect(add(tr("&Guess: %1").arg(ValueKindName(guess)), !isChosen), &QAction::triggered, this,
            [this, row] { m_model->GuessKind(row); });
    const QList<ValueKind> kinds = TypedText::AllKinds();
    for (ValueKind kind : kinds) {
        if (!TypedText::IsPossible(kind, section.name))
            continue;
        QAction const* action =
            add(ValueKindName(kind), isChosen && SettingsModel::KindOf(row) == kind);
        connect(action, &QAction::triggered, this,
                [this, row, kind] { m_model->ChooseKind(row, kind); });
    }
    const QModelIndex cell =
        currentIndex().sibling(currentIndex().row(), SettingsModel::ValueColumn);
    menu->setActiveAction(group->checkedAction());
    menu->popup(viewport()->mapToGlobal(visualRect(cell).bottomLeft()));
}

void SettingsTree::Duplicate()
{
    EndEditing();
    GoTo(m_commands->Duplicate(currentIndex()));
}

// The selected ones or, without any, the current one.
QModelIndexList SettingsTree::chosenRows() const
{
    QModelIndexList rows = selectionModel()->selectedRows();
    if (rows.isEmpty() && currentIndex().isValid())
        rows.append(currentIndex().sibling(currentIndex().row(), SettingsModel::NameColumn));
    return rows;
}

void SettingsTree::Remove()
{
    EndEditing();
    m_commands->Remove(chosenRows());
    GoToChanged();
}

void SettingsTree::MoveUp()
{
    m_commands->Move(currentIndex(), -1);
    scrollTo(currentIndex());
}

void SettingsTree::MoveDown()
{
    m_commands->Move(currentIndex(), 1);
    scrollTo(currentIndex());
}

void SettingsTree::copy()
{
    QModelIndex cell = currentIndex();
    if (!cell.isValid())
        return;
    if (!SettingsModel::IsSection(cell))
        cell = cell.sibling(cell.row(), SettingsModel::ValueColumn);
    QGuiApplication::clipboard()->setText(SettingsModel::FullText(cell));
}

// Qt searches the current column, and what one remembers is a name.
void SettingsTree::keyboardSearch(QString const& search)
{
    const QModelIndex current = currentIndex();
    selectionModel()->setCurrentIndex(current.sibling(current.row(), SettingsModel::NameColumn),
                                      QItemSelectionModel::NoUpdate);
    QTreeView::keyboardSearch(search);
}

void SettingsTree::closeEditor(QWidget* editor, QAbstractItemDelegate::EndEditHint hint)
{
    const bool isNext = hint == QAbstractItemDelegate::EditNextItem;
    const bool isPrevious = hint == QAbstractItemDelegate::EditPreviousItem;
    QTreeView::closeEditor(editor, isNext || isPrevious ? QAbstractItemDelegate::NoHint : hint);
    if (isNext || isPrevious)
        editValueBeside(isNext ? 1 : -1);
}

// From the name of a key, the next value is its own. One with a dialog is only gone to: that would
// be in the way of somebody who is typing.
void SettingsTree::editValueBeside(int step)
{
    const SettingsModel::Place place = SettingsModel::PlaceOf(currentIndex());
    const bool isName = currentIndex().column() == SettingsModel::NameColumn;
    const bool isOwn = isName && place.item >= 0 && step > 0;
    const QModelIndex row =
        isOwn ? m_model->IndexOf(place) : m_model->ItemBeside(currentIndex(), step);
    const QModelIndex value = row.sibling(row.row(), SettingsModel::ValueColumn);
    if (!value.isValid())
        return;
    GoTo(value);
    if (!SettingsModel::HasDialog(value))
        edit(value);
}

} // namespace Velocor
