// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsEditor.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/settings/MalformedFileView.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/RowHeight.h"
#include "common/config/TorkConfigText.h"

#include <QFileInfo>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QMessageBox>
#include <QPushButton>
#include <QScopedValueRollback>
#include <QStackedWidget>
#include <QStyledItemDelegate>
#include <QTimer>
#include <QTreeWidget>

#include <functional>

namespace Velocor {

namespace {

// The maximum number of characters that a cell shows and edits. Qt would lay out the whole text
// each time the cell is drawn.
constexpr int MaximumCellLength = 1000;
constexpr int ShortenedLength = 200;

constexpr int FullTextRole = Qt::UserRole; // the full text of a cell that shows only the start
constexpr int NameRole = Qt::UserRole + 1; // the name before it was edited

// The maximum length of each name in a status message, in characters.
constexpr int MaximumNameLength = 40;

bool IsLong(QTreeWidgetItem const* item, int column)
{
    return item->data(column, FullTextRole).isValid();
}

QString FullText(QTreeWidgetItem const* item, int column)
{
    return IsLong(item, column) ? item->data(column, FullTextRole).toString() : item->text(column);
}

void SetFullText(QTreeWidgetItem* item, int column, QString const& text)
{
    const bool isLong = text.size() > MaximumCellLength;
    item->setData(column, FullTextRole, isLong ? QVariant(text) : QVariant());
    item->setText(column, isLong ? Shortened(text, ShortenedLength) : text);
}

// A name is kept in full in its role, so that it can be restored.
void SetName(QTreeWidgetItem* item, QString const& name)
{
    SetFullText(item, 0, name);
    item->setData(0, NameRole, name);
}

// Opens a dialog for cells with shortened text, which must not be edited in place.
class CellDelegate : public QStyledItemDelegate
{
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    std::function<void()> editLong;
    std::function<void(bool)> noteEditing;

    QSize sizeHint(QStyleOptionViewItem const& option, QModelIndex const& index) const override
    {
        const QSize size = QStyledItemDelegate::sizeHint(option, index);
        return QSize(size.width(), RowHeight(option.fontMetrics));
    }

    QWidget* createEditor(QWidget* parent, QStyleOptionViewItem const& option,
                          QModelIndex const& index) const override
    {
        if (!index.data(FullTextRole).isValid()) {
            noteEditing(true);
            return QStyledItemDelegate::createEditor(parent, option, index);
        }
        editLong();
        return nullptr;
    }

    void destroyEditor(QWidget* editor, QModelIndex const& index) const override
    {
        QStyledItemDelegate::destroyEditor(editor, index);
        noteEditing(false);
    }
};

QString NameHint()
{
    return QObject::tr("Use letters, digits, \"_\", \"-\" and \".\"; start with a letter or \"_\"");
}

} // namespace

SettingsEditor::SettingsEditor(QWidget* parent)
    : QWidget(parent), m_saver(this), m_notice(new NoticeBar), m_pages(new QStackedWidget),
      m_text(new MalformedFileView)
{
    m_pages->addWidget(makeTreePage());
    m_pages->addWidget(m_text);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(8, 8, 8, 8);
    layout->setSpacing(6);
    layout->addWidget(m_notice);
    layout->addWidget(m_pages, 1);
    setFocusProxy(m_tree);
}

// If a cell is being edited, deleting the tree emits a signal. Qt would disconnect it only after
// the children are deleted, when this object is no more than a QObject.
SettingsEditor::~SettingsEditor()
{
    disconnect(m_tree, nullptr, this, nullptr);
    static_cast<CellDelegate*>(m_tree->itemDelegate())->noteEditing = [](bool) {
    };
}

QPushButton* SettingsEditor::makeButton(QString const& text, QString const& toolTip)
{
    auto* button = new QPushButton(text);
    button->setAutoDefault(false);
    button->setToolTip(PlainToolTip(toolTip));
    button->setMinimumWidth(button->sizeHint().width() +
                            2 * button->fontMetrics().averageCharWidth());
    return button;
}

QWidget* SettingsEditor::makeTreePage()
{
    m_tree = new QTreeWidget;
    m_tree->setAccessibleName(tr("Settings"));
    m_tree->setHeaderLabels({tr("Section / key"), tr("Value")});
    m_tree->header()->setAccessibleName(tr("Settings columns"));
    m_tree->setEditTriggers(QAbstractItemView::DoubleClicked | QAbstractItemView::EditKeyPressed |
                            QAbstractItemView::AnyKeyPressed);
    m_tree->setAlternatingRowColors(true);
    m_tree->setUniformRowHeights(true);
    m_tree->setTextElideMode(Qt::ElideMiddle); // a long value ends in its size
    auto* delegate = new CellDelegate(m_tree);
    delegate->editLong = [this] {
        editLongValueSoon();
    };
    delegate->noteEditing = [this](bool editing) {
        m_isEditing = editing;
        updateCanSave();
    };
    m_tree->setItemDelegate(delegate);
    connect(m_tree, &QTreeWidget::itemChanged, this, &SettingsEditor::checkNames);
    connect(m_tree, &QTreeWidget::itemActivated, this, &SettingsEditor::editLongValueSoon);

    QPushButton* addSectionButton = makeButton(tr("Add &Section"), tr("Add an empty section"));
    m_addValue = makeButton(tr("Add &Key"), tr("Add a key to the selected section"));
    m_remove = makeButton(tr("&Remove"), tr("Remove the selected section or key"));
    m_save = makeButton(tr("Sa&ve"), tr("Save the file (Ctrl+S)"));
    connect(addSectionButton, &QPushButton::clicked, this, &SettingsEditor::addSection);
    connect(m_addValue, &QPushButton::clicked, this, &SettingsEditor::addValue);
    connect(m_remove, &QPushButton::clicked, this, &SettingsEditor::remove);
    connect(m_save, &QPushButton::clicked, this, &SettingsEditor::Save);
    connect(m_tree, &QTreeWidget::currentItemChanged, this, [this](QTreeWidgetItem const* current) {
        m_addValue->setEnabled(current != nullptr);
        m_remove->setEnabled(current != nullptr);
    });

    auto* buttons = new QHBoxLayout;
    buttons->addWidget(addSectionButton);
    buttons->addWidget(m_addValue);
    buttons->addWidget(m_remove);
    buttons->addStretch(1);
    buttons->addWidget(m_save);

    auto* page = new QWidget;
    auto* layout = new QVBoxLayout(page);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_tree, 1);
    layout->addLayout(buttons);
    return page;
}

void SettingsEditor::Open(QString const& path)
{
    m_path = path;
    m_notice->Dismiss();
    const SettingsDocument document = SettingsFileReader::Read(path);
    m_saver.NoteRead(path, document);
    if (document.isParsed)
        showTree(document);
    else
        showBroken(document);
    setModified(false);
}

void SettingsEditor::showTree(SettingsDocument const& document)
{
    m_rootName = document.rootName;
    {
        const QScopedValueRollback<bool> filling(m_filling, true);
        m_tree->clear();
        for (SettingsDocument::Section const& section : document.sections) {
            QTreeWidgetItem* top = addItem(nullptr, section.name, QString());
            for (SettingsDocument::Item const& item : section.items)
                addItem(top, item.key, item.value);
        }
        m_tree->expandAll();
        m_tree->resizeColumnToContents(0);
        m_tree->setColumnWidth(0, qBound(160, m_tree->columnWidth(0) + 24, 360));
    }
    m_tree->setCurrentItem(m_tree->topLevelItem(0));
    m_addValue->setEnabled(m_tree->currentItem());
    m_remove->setEnabled(m_tree->currentItem());
    m_pages->setCurrentIndex(0);
    setFocusProxy(m_tree);
    if (document.lossCount > 0)
        m_notice->ShowMessage(
            document.lossCount == 1
                ? tr("Saving would lose 1 item in this file.")
                : tr("Saving would lose %1 items in this file.").arg(document.lossCount));
}

void SettingsEditor::showBroken(SettingsDocument const& document)
{
    QString message = tr("Cannot show %1 as a tree: %2").arg(m_path, document.error);
    if (document.line > 0)
        message += tr(" (line %1, column %2)").arg(document.line).arg(document.column);
    m_notice->ShowMessage(message);
    m_text->ShowFile(m_path, document);
    m_pages->setCurrentIndex(1);
    setFocusProxy(m_text);
}

QTreeWidgetItem* SettingsEditor::addItem(QTreeWidgetItem* section, QString const& key,
                                         QString const& value)
{
    auto* item = section ? new QTreeWidgetItem(section) : new QTreeWidgetItem(m_tree);
    SetName(item, key);
    SetFullText(item, 1, value);
    item->setToolTip(0, PlainToolTip(NameHint()));
    item->setFlags(Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemIsEditable);
    if (!section) {
        QFont bold = m_tree->font();
        bold.setBold(true);
        item->setFont(0, bold);
    }
    return item;
}

// The names of the other sections, or of the other keys in the section.
QStringList SettingsEditor::namesBeside(QTreeWidgetItem* item) const
{
    QStringList names;
    QTreeWidgetItem const* section = item->parent() ? item->parent() : m_tree->invisibleRootItem();
    for (int i = 0; i < section->childCount(); ++i) {
        if (section->child(i) != item)
            names.append(FullText(section->child(i), 0));
    }
    return names;
}

void SettingsEditor::addNamed(QTreeWidgetItem* section, QString const& base, QString const& value)
{
    QTreeWidgetItem* item = nullptr;
    {
        const QScopedValueRollback<bool> filling(m_filling, true);
        item = addItem(section, base, value);
        const QStringList taken = namesBeside(item);
        for (int number = 2; taken.contains(item->text(0)); ++number)
            SetName(item, base + QString::number(number));
    }
    setModified(true);
    m_tree->setCurrentItem(item);
    m_tree->editItem(item, 0);
}

void SettingsEditor::addSection()
{
    addNamed(nullptr, QStringLiteral("Section"), QString());
}

void SettingsEditor::addValue()
{
    QTreeWidgetItem* current = m_tree->currentItem();
    if (!current)
        return;
    QTreeWidgetItem* section = current->parent() ? current->parent() : current;
    section->setExpanded(true);
    addNamed(section, QStringLiteral("key"), tr("value"));
}

void SettingsEditor::remove()
{
    delete m_tree->currentItem();
    setModified(true);
}

QString SettingsEditor::nameProblem(QTreeWidgetItem* item, QString const& name) const
{
    if (!TorkConfigText::IsPlainName(name))
        return tr("\"%1\" is not a valid section or key name, so \"%2\" is kept. ") + NameHint();
    if (namesBeside(item).contains(name))
        return tr("There is already a \"%1\" here, so \"%2\" is kept.");
    return QString();
}

// Restores a name if the new one cannot be used; clears the value of a section.
void SettingsEditor::checkNames(QTreeWidgetItem* item)
{
    if (m_filling)
        return;
    const QScopedValueRollback<bool> filling(m_filling, true);
    const QString oldName = item->data(0, NameRole).toString();
    QString name = FullText(item, 0);
    name.remove(QLatin1Char(' '));
    const QString problem = name == oldName ? QString() : nameProblem(item, name);
    if (!problem.isEmpty()) {
        SetName(item, oldName);
        Q_EMIT messageReported(
            problem.arg(Shortened(name, MaximumNameLength), Shortened(oldName, MaximumNameLength)));
        return;
    }
    SetName(item, name);
    SetFullText(item, 1, item->parent() ? FullText(item, 1) : QString());
    setModified(true);
}

// Delayed, because the tree is still handling the key or click; and only once, because a double
// click both edits a cell and activates it.
void SettingsEditor::editLongValueSoon()
{
    if (m_editingLongValue)
        return;
    m_editingLongValue = true;
    QTimer::singleShot(0, this, [this] {
        editLongValue();
        m_editingLongValue = false;
    });
}

void SettingsEditor::editLongValue()
{
    QTreeWidgetItem* item = m_tree->currentItem();
    if (!item || !IsLong(item, 1))
        return;
    const QString name = tr("%1 / %2").arg(item->parent()->text(0), item->text(0));
    ValueDialog dialog(name, FullText(item, 1), this);
    if (dialog.exec() != QDialog::Accepted || !dialog.isModified())
        return;
    {
        const QScopedValueRollback<bool> filling(m_filling, true);
        SetFullText(item, 1, dialog.value());
    }
    setModified(true);
}

void SettingsEditor::setModified(bool modified)
{
    if (modified != m_modified) {
        m_modified = modified;
        Q_EMIT modifiedChanged(modified);
    }
    updateCanSave();
}

// What is being typed can be saved too: saving ends the editing of the cell first.
void SettingsEditor::updateCanSave()
{
    const bool canSave = m_modified || m_isEditing;
    if (canSave == m_save->isEnabled())
        return;
    m_save->setEnabled(canSave);
    Q_EMIT canSaveChanged(canSave);
}

bool SettingsEditor::CanSave() const
{
    return m_save->isEnabled();
}

SettingsDocument SettingsEditor::document() const
{
    SettingsDocument document;
    document.rootName = m_rootName;
    for (int i = 0; i < m_tree->topLevelItemCount(); ++i) {
        QTreeWidgetItem const* top = m_tree->topLevelItem(i);
        SettingsDocument::Section section{FullText(top, 0), {}};
        for (int j = 0; j < top->childCount(); ++j)
            section.items.append({FullText(top->child(j), 0), FullText(top->child(j), 1)});
        document.sections.append(section);
    }
    return document;
}

bool SettingsEditor::Save()
{
    if (m_pages->currentIndex() != 0)
        return false;
    m_pages->setFocus(); // ends cell editing
    if (!m_modified)
        return true;
    if (!m_saver.Save(document()))
        return false;
    m_notice->Dismiss();
    setModified(false);
    Q_EMIT messageReported(tr("Saved %1").arg(QFileInfo(m_path).fileName()));
    return true;
}

bool SettingsEditor::MayClose()
{
    m_pages->setFocus(); // ends cell editing
    if (!m_modified)
        return true;
    PlainMessageBox box(QMessageBox::Question, this,
                        tr("Save changes to %1?").arg(QFileInfo(m_path).fileName()),
                        QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel);
    box.setDefaultButton(QMessageBox::Save);
    const int answer = box.exec();
    if (answer == QMessageBox::Save)
        return Save();
    return answer == QMessageBox::Discard;
}

} // namespace Velocor
