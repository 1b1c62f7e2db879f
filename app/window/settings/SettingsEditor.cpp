// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsEditor.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/settings/FileNotice.h"
#include "app/window/settings/MalformedFileView.h"
#include "app/window/settings/SettingsFindBar.h"
#include "app/window/settings/SettingsTree.h"
#include "app/window/settings/ValueEditing.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QFileDialog>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QMessageBox>
#include <QPushButton>
#include <QStackedWidget>
#include <QTimer>

namespace Velocor {

namespace {

// The maximum length of each name in the heading of a dialog, in characters.
constexpr int MaximumTitlePartLength = 200;

} // namespace

SettingsEditor::SettingsEditor(QWidget* parent)
    : QWidget(parent), m_saver(this), m_commands(&m_model),
      m_comparison(&m_model, &m_commands, this), m_notice(new NoticeBar),
      m_fileNotice(new FileNotice), m_removal(new NoticeBar(tr("Removal"))),
      m_pages(new QStackedWidget), m_tree(new SettingsTree(&m_model, &m_commands)),
      m_find(new SettingsFindBar(m_tree)), m_text(new MalformedFileView)
{
    m_pages->addWidget(makeTreePage());
    m_pages->addWidget(m_text);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(8, 8, 8, 8);
    layout->setSpacing(6);
    layout->addWidget(m_notice);
    layout->addWidget(m_fileNotice);
    layout->addWidget(m_removal);
    layout->addWidget(m_pages, 1);
    setFocusProxy(m_tree);
    connectParts();
}

void SettingsEditor::connectParts()
{
    connect(m_fileNotice, &FileNotice::reloadRequested, this, &SettingsEditor::Reload);
    connect(m_fileNotice, &FileNotice::compareRequested, this, &SettingsEditor::compareWithFile);
    connect(m_fileNotice, &FileNotice::keepRequested, this, &SettingsEditor::keepMine);
    connect(m_fileNotice, &FileNotice::saveAsRequested, this, &SettingsEditor::saveAs);
    connect(m_tree, &SettingsTree::findRequested, m_find, &SettingsFindBar::Open);
    connect(m_tree, &SettingsTree::findNextRequested, m_find, &SettingsFindBar::FindNext);
    connect(m_tree, &SettingsTree::editingChanged, this, &SettingsEditor::updateState);
    connect(m_tree, &SettingsTree::rejected, this, &SettingsEditor::messageReported);
    connect(m_tree, &SettingsTree::dialogRequested, this, &SettingsEditor::editInDialogSoon);
    connect(m_commands.undoStack(), &QUndoStack::indexChanged, m_removal, &NoticeBar::Dismiss);
    connect(m_commands.undoStack(), &QUndoStack::indexChanged, this, &SettingsEditor::updateState);
    connect(m_commands.undoStack(), &QUndoStack::cleanChanged, this, &SettingsEditor::updateState);
    connect(&m_commands, &SettingsCommands::removed, m_removal, &NoticeBar::ShowMessage);
    QPushButton* undo = m_removal->AddButton(tr("Undo"));
    undo->setToolTip(PlainToolTip(tr("Bring back what was removed (Ctrl+Z)")));
    connect(undo, &QPushButton::clicked, this, &SettingsEditor::Undo);
}

// The tree uses members of this object, and both it and the stack of changes send signals when they
// end. Qt would disconnect them only when this object is no more than a QObject.
SettingsEditor::~SettingsEditor()
{
    disconnect(m_tree, nullptr, this, nullptr);
    disconnect(m_commands.undoStack(), nullptr, this, nullptr);
    delete m_pages;
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
    m_addSection = makeButton(tr("Add &Section"), tr("Add an empty section (Alt+Ins)"));
    m_addKey = makeButton(tr("Add &Key"), tr("Add a key to the selected section (Ins)"));
    m_remove = makeButton(tr("&Remove"), tr("Remove the selected sections and keys (Del)"));
    m_save = makeButton(tr("Sa&ve"), tr("Save the file (Ctrl+S)"));
    connect(m_addSection, &QPushButton::clicked, m_tree, &SettingsTree::AddSection);
    connect(m_addKey, &QPushButton::clicked, m_tree, &SettingsTree::AddKey);
    connect(m_remove, &QPushButton::clicked, m_tree, &SettingsTree::Remove);
    connect(m_save, &QPushButton::clicked, this, &SettingsEditor::Save);
    connect(m_tree->selectionModel(), &QItemSelectionModel::currentChanged, this,
            &SettingsEditor::updateButtons);

    auto* buttons = new QHBoxLayout;
    buttons->addWidget(m_addSection);
    buttons->addWidget(m_addKey);
    buttons->addWidget(m_remove);
    buttons->addStretch(1);
    buttons->addWidget(m_save);

    auto* page = new QWidget;
    auto* layout = new QVBoxLayout(page);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_tree, 1);
    layout->addWidget(m_find);
    layout->addLayout(buttons);
    return page;
}

void SettingsEditor::Open(QString const& path)
{
    m_path = path;
    m_notice->Dismiss();
    m_fileNotice->SetFile(path); // first, so that it tells of a change while the file is read
    const SettingsDocument document = SettingsFileReader::Read(path);
    m_saver.NoteRead(path, document);
    m_model.SetDocument(document.isParsed ? document : SettingsDocument());
    m_commands.undoStack()->clear();
    if (document.isParsed)
        showTree(document);
    else
        showMalformed(document);
    m_fileNotice->SetComparable(document.isParsed);
    if (!m_ownerNote.isEmpty())
        m_notice->ShowMessage(m_ownerNote);
    updateState();
}

void SettingsEditor::Reload()
{
    m_fileNotice->SetFile(m_path);
    const SettingsDocument document = SettingsFileReader::Read(m_path);
    const bool canUndo = document.isParsed && m_pages->currentIndex() == TreePage &&
                         document.rootName == m_model.document().rootName;
    if (!canUndo) {
        Open(m_path);
        return;
    }
    m_tree->EndEditing();
    const SettingsModel::Place place = SettingsModel::PlaceOf(m_tree->currentIndex());
    m_commands.Replace(document, tr("Reload"));
    m_commands.undoStack()->setClean();
    m_saver.NoteRead(m_path, document);
    m_tree->GoTo(m_model.IndexOf(place));
    m_tree->setFocus();
}

void SettingsEditor::ShowWhatWillBeWritten()
{
    if (m_tree->EndEditing())
        m_comparison.ShowSaving(m_path);
}

void SettingsEditor::compareWithFile()
{
    if (m_tree->EndEditing())
        m_comparison.CompareWith(m_path, tr("In the file"));
}

void SettingsEditor::CompareWithOther()
{
    if (!m_tree->EndEditing())
        return;
    const QString path =
        QFileDialog::getOpenFileName(this, tr("Compare With"), QFileInfo(m_path).path(),
                                     tr("Settings (*.cfg *.xml *.bak);;All files (*)"));
    if (!path.isEmpty())
        m_comparison.CompareWith(path, QFileInfo(path).fileName());
}

// Saving has to write the file, even if nothing was changed here.
void SettingsEditor::keepMine()
{
    m_saver.AcceptFile();
    m_fileNotice->SetFile(m_path);
    if (m_pages->currentIndex() == TreePage)
        m_commands.undoStack()->resetClean();
    setFocus();
}

void SettingsEditor::saveAs()
{
    if (!m_tree->EndEditing())
        return;
    const QString path = QFileDialog::getSaveFileName(this, tr("Save Settings As"), m_path,
                                                      tr("Settings (*.cfg *.xml);;All files (*)"));
    if (path.isEmpty() || !m_saver.SaveAs(path, document()))
        return;
    m_path = path;
    noteSaved();
}

void SettingsEditor::noteSaved()
{
    m_notice->Dismiss();
    m_fileNotice->SetFile(m_path);
    m_commands.undoStack()->setClean();
    updateState();
    Q_EMIT saved();
    Q_EMIT messageReported(tr("Saved %1").arg(QFileInfo(m_path).fileName()));
}

void SettingsEditor::showTree(SettingsDocument const& document)
{
    m_tree->ShowAll();
    updateButtons();
    m_pages->setCurrentIndex(TreePage);
    setFocusProxy(m_tree);
    if (document.lossCount > 0)
        m_notice->ShowMessage(
            document.lossCount == 1
                ? tr("Saving would lose 1 item in this file.")
                : tr("Saving would lose %1 items in this file.").arg(document.lossCount));
}

void SettingsEditor::showMalformed(SettingsDocument const& document)
{
    QString message = tr("Cannot show %1 as a tree: %2").arg(m_path, document.error);
    if (document.line > 0)
        message += tr(" (line %1, column %2)").arg(document.line).arg(document.column);
    m_notice->ShowMessage(message);
    m_text->ShowFile(m_path, document);
    m_pages->setCurrentIndex(TextPage);
    setFocusProxy(m_text);
}

// Delayed, because the tree is still handling the key or click.
void SettingsEditor::editInDialogSoon(bool asText)
{
    if (m_isInDialog)
        return;
    m_isInDialog = true;
    QTimer::singleShot(0, this, [this, asText] {
        editInDialog(asText);
        m_isInDialog = false;
    });
}

void SettingsEditor::editInDialog(bool asText)
{
    const QModelIndex current = m_tree->currentIndex();
    const QModelIndex cell = current.sibling(current.row(), SettingsModel::ValueColumn);
    if (!cell.isValid() || SettingsModel::IsSection(cell))
        return;
    const SettingsModel::Place place = SettingsModel::PlaceOf(cell);
    SettingsDocument::Section const& section = m_model.document().sections.at(place.section);
    const QString name =
        tr("%1 / %2").arg(Shortened(section.name, MaximumTitlePartLength),
                          Shortened(section.items.at(place.item).key, MaximumTitlePartLength));
    const ValueKind kind = asText ? ValueKind::Text : SettingsModel::KindOf(cell);
    const QPersistentModelIndex edited(cell); // the file may change while the dialog is open
    const QString text = EditedValue(kind, name, SettingsModel::FullText(cell), this);
    if (!text.isNull() && edited.isValid())
        m_commands.SetText(edited, text);
}

bool SettingsEditor::isModified() const
{
    return !m_commands.undoStack()->isClean();
}

// What is being typed can be saved too: saving takes it first.
bool SettingsEditor::CanSave() const
{
    return isModified() || m_tree->isEditing();
}

void SettingsEditor::updateState()
{
    m_save->setEnabled(CanSave());
    Q_EMIT stateChanged();
}

void SettingsEditor::updateButtons()
{
    const bool hasRow = m_tree->currentIndex().isValid();
    m_addKey->setEnabled(hasRow);
    m_remove->setEnabled(hasRow);
}

void SettingsEditor::Undo()
{
    m_tree->EndEditing();
    m_commands.undoStack()->undo();
    m_tree->GoToChanged();
}

void SettingsEditor::Redo()
{
    m_tree->EndEditing();
    m_commands.undoStack()->redo();
    m_tree->GoToChanged();
}

QList<QAction*> SettingsEditor::commands() const
{
    return m_pages->currentIndex() == TreePage ? m_tree->commands() : QList<QAction*>();
}

void SettingsEditor::AddOuterActions(QList<QAction*> const& actions)
{
    m_tree->AddOuterActions(actions);
}

bool SettingsEditor::Save()
{
    if (m_pages->currentIndex() != TreePage)
        return false;
    if (!m_tree->EndEditing())
        return false; // "Saved" would take the place of the reason
    if (!isModified())
        return true;
    if (!m_saver.Save(document()))
        return false;
    noteSaved();
    return true;
}

bool SettingsEditor::MayClose()
{
    m_tree->EndEditing();
    if (!isModified())
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
