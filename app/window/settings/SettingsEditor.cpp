// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsEditor.h"

#include "app/settingsfile/SettingsDefaults.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/FileNotice.h"
#include "app/window/settings/SavedStatesDialog.h"
#include "app/window/settings/SettingsFindBar.h"
#include "app/window/settings/SettingsTextPage.h"
#include "app/window/settings/SettingsTree.h"
#include "app/window/settings/ValueEditing.h"
#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
#include <QPushButton>
#include <QStackedWidget>
#include <QTimer>

#include <algorithm>

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
      m_find(new SettingsFindBar(m_tree, &m_model)), m_text(new SettingsTextPage)
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
    connect(m_tree, &SettingsTree::textRequested, this, &SettingsEditor::ShowAsText);
    connect(m_tree, &SettingsTree::statesRequested, this, &SettingsEditor::ShowStates);
    connect(m_text, &SettingsTextPage::statesRequested, this, &SettingsEditor::ShowStates);
    connect(m_text, &SettingsTextPage::settingsRequested, this, &SettingsEditor::ShowAsTree);
    connect(m_text, &SettingsTextPage::saveRequested, this, &SettingsEditor::Save);
    connect(m_text, &SettingsTextPage::stateChanged, this, &SettingsEditor::updateState);
    connect(m_commands.undoStack(), &QUndoStack::indexChanged, this,
            &SettingsEditor::noteTreeChange);
    connect(m_tree, &SettingsTree::dialogRequested, this, &SettingsEditor::editInDialogSoon);
    connect(m_commands.undoStack(), &QUndoStack::indexChanged, m_removal, &NoticeBar::Dismiss);
    connect(m_commands.undoStack(), &QUndoStack::indexChanged, this, &SettingsEditor::updateState);
    connect(m_commands.undoStack(), &QUndoStack::cleanChanged, this, &SettingsEditor::updateState);
    connect(&m_commands, &SettingsCommands::removed, m_removal, &NoticeBar::ShowMessage);
    QPushButton* undo = m_removal->AddButton(tr("Undo"));
    undo->setToolTip(PlainToolTip(tr("Bring back what was removed (Ctrl+Z)")));
    connect(undo, &QPushButton::clicked, this, &SettingsEditor::Undo);
}

// The tree uses members of this object, and both it and the stack of changes send signals when
// they end. Qt would disconnect them only when this object is no more than a QObject.
SettingsEditor::~SettingsEditor()
{
    disconnect(m_tree, nullptr, this, nullptr);
    disconnect(m_text, nullptr, this, nullptr);
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
    connect(&m_model, &SettingsModel::modelReset, this, &SettingsEditor::updateButtons);

    auto* buttons = new FlowLayout(6);
    buttons->addWidget(m_addSection);
    buttons->addWidget(m_addKey);
    buttons->addWidget(m_remove);
    buttons->AddStretch();
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
    const SettingsDocument document = SettingsFileReader::ReadShown(path);
    m_saver.NoteRead(path, document);
    m_model.SetSaved(document);
    m_model.SetDefaults(SettingsDefaults::Of(path));
    m_model.SetDocument(document.isParsed ? document : SettingsDocument());
    m_commands.undoStack()->clear();
    m_hasTree = document.isParsed;
    m_hasText = !document.isParsed;
    if (document.isParsed)
        showTree(document);
    else
        showMalformed(document);
    if (!m_ownerNote.isEmpty())
        m_notice->ShowMessage(m_ownerNote);
    updateState();
}

void SettingsEditor::Reload()
{
    const QFileInfo file(m_path);
    if (!file.isReadable()) { // what is here may be all that is left
        Q_EMIT messageReported(tr("%1 cannot be read").arg(LeftToRight(file.fileName())));
        return;
    }
    m_fileNotice->SetFile(m_path);
    m_tree->EndEditing();
    const SettingsDocument document = SettingsFileReader::ReadShown(m_path);
    const bool canUndo =
        ShowsTree() ? reloadTree(document) || reloadTreeAsText(document) : reloadText(document);
    if (canUndo) {
        m_saver.NoteRead(m_path, document);
        m_model.SetSaved(document);
        updateState();
    } else if (!isModified() || confirmDiscard()) {
        Open(m_path);
    } else {
        m_fileNotice->TellChanged();
    }
}

// Returns whether the file could be taken into the tree as a change that can be undone.
bool SettingsEditor::reloadTree(SettingsDocument const& document)
{
    if (!document.isParsed || document.rootName != m_model.document().rootName)
        return false;
    const SettingsModel::Place place = SettingsModel::PlaceOf(m_tree->currentIndex());
    m_commands.Replace(document, tr("Reload"));
    m_commands.undoStack()->setClean();
    m_find->Refresh();
    m_hasText = false;
    m_tree->GoTo(m_model.IndexOf(place));
    m_tree->setFocus();
    m_notice->Dismiss();
    tellLosses(document);
    return true;
}

// A file that the tree cannot show takes the place of its changes as text, so that they can be
// brought back there; unless they are not all in the text, or there are none.
bool SettingsEditor::reloadTreeAsText(SettingsDocument const& document)
{
    const QByteArray bytes = SettingsTextPage::BytesOf(m_path);
    const QByteArray mine = SettingsFileWriter::ToBytes(m_model.document());
    const bool fits = std::max(bytes.size(), mine.size()) <= SettingsTextPage::EditLimit;
    if (!isModified() || !fits || !SettingsFileWriter::Losses(m_model.document()).isEmpty())
        return false;
    m_hasText = false;
    m_text->Show(mine, SettingsFileReader::ReadBytes(mine));
    if (m_text->isReadOnly())
        return false;
    m_hasText = true;
    showPage(TextPage);
    m_notice->Dismiss();
    if (!document.isParsed)
        tellMalformed(document);
    m_notice->ShowMessage(tr("The file is shown as text, where Undo brings your changes back."));
    return reloadText(document);
}

// A malformed text that was left unchanged is not worth a change to undo: the file may have been
// mended, and is then shown as a tree.
bool SettingsEditor::reloadText(SettingsDocument const& document)
{
    const QByteArray bytes = SettingsTextPage::BytesOf(m_path);
    const bool isWorth = m_text->isModified() || m_text->parsed().isParsed;
    if (!isWorth || m_text->isReadOnly() || document.isTooLarge ||
        bytes.size() > SettingsTextPage::EditLimit)
        return false;
    m_text->Replace(bytes);
    m_text->SetModified(m_text->bytes() != bytes); // such as other line breaks than before
    m_hasTree = false;
    m_text->setFocus();
    return true;
}

bool SettingsEditor::confirmDiscard()
{
    PlainMessageBox box(
        QMessageBox::Warning, this,
        tr("Discard your changes to %1?").arg(LeftToRight(QFileInfo(m_path).fileName())),
        QMessageBox::Discard | QMessageBox::Cancel,
        tr("They cannot be brought back after reloading this file."));
    box.setDefaultButton(QMessageBox::Cancel);
    return box.exec() == QMessageBox::Discard;
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
    const SettingsDocument document = SettingsFileReader::ReadShown(m_path);
    m_saver.AcceptFile();
    m_saver.NoteLosses(document);
    m_model.SetSaved(document);
    m_fileNotice->SetFile(m_path);
    if (ShowsTree())
        m_commands.undoStack()->resetClean();
    else if (!m_text->isReadOnly())
        m_text->SetModified(true);
    setFocus();
}

void SettingsEditor::saveAs()
{
    if (!m_tree->EndEditing())
        return;
    const QString path = QFileDialog::getSaveFileName(this, tr("Save Settings As"), m_path,
                                                      tr("Settings (*.cfg *.xml);;All files (*)"));
    if (path.isEmpty())
        return;
    const bool isSaved = ShowsTree() ? m_saver.SaveAs(path, document())
                         : m_text->isOnlyStart()
                             ? m_saver.SaveCopyAs(path)
                             : m_saver.SaveTextAs(path, m_text->bytes(), m_text->parsed());
    if (!isSaved)
        return;
    m_path = path;
    m_model.SetDefaults(SettingsDefaults::Of(path));
    noteSaved();
}

void SettingsEditor::noteSaved()
{
    m_notice->Dismiss();
    m_fileNotice->SetFile(m_path);
    m_model.SetSaved(ShowsTree() ? document() : m_text->parsed());
    if (ShowsTree()) {
        m_commands.undoStack()->setClean();
        m_hasText = false;
    } else {
        m_text->SetModified(false);
        m_hasTree = false; // the next one is that of this text
    }
    updateState();
    Q_EMIT saved();
    QString message = tr("Saved %1").arg(LeftToRight(QFileInfo(m_path).fileName()));
    if (!m_saver.statesProblem().isEmpty())
        message += tr(", but its state is not kept: %1").arg(m_saver.statesProblem());
    Q_EMIT messageReported(message);
}

void SettingsEditor::showTree(SettingsDocument const& document)
{
    m_tree->ShowAll();
    m_find->Refresh();
    updateButtons();
    showPage(TreePage);
    tellLosses(document);
}

void SettingsEditor::tellLosses(SettingsDocument const& document)
{
    if (document.lossCount > 0)
        m_notice->ShowMessage(
            tr("Saving would lose %Ln item(s) in this file.", nullptr, document.lossCount));
}

void SettingsEditor::tellMalformed(SettingsDocument const& document)
{
    QString message = tr("Cannot show %1 as a tree: %2").arg(LeftToRight(m_path), document.error);
    if (document.line > 0 && !document.isTooLarge)
        message += tr(" (line %1, column %2)").arg(document.line).arg(document.column);
    m_notice->ShowMessage(message);
}

void SettingsEditor::showMalformed(SettingsDocument const& document)
{
    tellMalformed(document);
    m_text->Show(SettingsTextPage::BytesOf(m_path), document);
    m_shownText = m_text->bytes();
    showPage(TextPage);
}

void SettingsEditor::showPage(Page page)
{
    const bool isTree = page == TreePage;
    m_pages->setCurrentIndex(page);
    setFocusProxy(isTree ? static_cast<QWidget*>(m_tree) : m_text);
    m_fileNotice->SetComparable(isTree);
}

void SettingsEditor::noteTreeChange()
{
    m_treeChanged = true;
}

void SettingsEditor::ShowAsText()
{
    if (!ShowsTree() || !m_tree->EndEditing())
        return;
    const bool isChanged = m_hasText ? m_treeChanged : isModified();
    const QByteArray content = SettingsFileWriter::ToBytes(document());
    if (!m_hasText)
        m_text->Show(SettingsTextPage::BytesOf(m_path), SettingsFileReader::ReadShown(m_path));
    const bool isTooLarge = content.size() > SettingsTextPage::EditLimit;
    if (isChanged && (m_text->isReadOnly() || isTooLarge)) {
        Q_EMIT messageReported(tr("This file cannot be edited as text: save the changes first"));
        return;
    }
    m_hasText = true;
    if (isChanged)
        m_text->Replace(content);
    m_treeChanged = false;
    m_shownText = m_text->bytes();
    m_removal->Dismiss();
    showPage(TextPage);
    m_text->setFocus();
    updateState();
}

void SettingsEditor::ShowAsTree()
{
    if (ShowsTree())
        return;
    const SettingsDocument parsed =
        m_text->isReadOnly() ? SettingsFileReader::ReadShown(m_path) : m_text->parsed();
    if (parsed.isTooLarge) {
        Q_EMIT messageReported(tr("This file is too large to be shown as settings"));
        return;
    }
    const SettingsDocument settings = parsed.WithErrorAsLoss();
    m_saver.NoteLosses(settings);
    if (m_hasTree && m_text->bytes() == m_shownText) {
        showPage(TreePage);
    } else {
        if (m_hasTree && settings.rootName == m_model.document().rootName) {
            m_commands.Replace(settings, tr("Edit as Text"));
            m_find->Refresh();
            showPage(TreePage);
        } else {
            m_commands.undoStack()->clear();
            m_model.SetDocument(settings);
            m_notice->Dismiss();
            showTree(settings);
        }
        // Even if both have the same values, one has to be asked before the text is lost.
        if (m_text->isModified() || !parsed.isParsed)
            m_commands.undoStack()->resetClean();
        else
            m_commands.undoStack()->setClean();
    }
    m_hasTree = true;
    m_treeChanged = false;
    m_shownText = m_text->bytes();
    m_tree->setFocus();
    updateState();
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

void SettingsEditor::ShowStates()
{
    if (!m_tree->EndEditing())
        return;
    SavedStatesDialog dialog(m_saver.states(), m_path, ShowsTree(), this);
    connect(&dialog, &SavedStatesDialog::compareRequested, this,
            [this](QString const& path, QString const& title) {
                m_comparison.CompareWith(path, title);
            });
    connect(&dialog, &SavedStatesDialog::bringBackRequested, this, &SettingsEditor::bringBack);
    dialog.exec();
}

// As a tree if that is all of it; else as text, which every state is.
void SettingsEditor::bringBack(QString const& statePath, QString const& title)
{
    const SettingsDocument state = SettingsFileReader::ReadShown(statePath);
    if (!state.isReadable) {
        Q_EMIT messageReported(tr("The state of %1 is gone").arg(title));
        return;
    }
    const bool isTree =
        state.isParsed && state.lossCount == 0 && state.rootName == document().rootName;
    if (ShowsTree() && isTree) {
        m_commands.Replace(state, tr("Bring Back"));
        m_find->Refresh();
        m_tree->setFocus();
    } else {
        ShowAsText();
        if (ShowsTree())
            return; // it has told why
        bringBackText(SettingsTextPage::BytesOf(statePath), state);
    }
    Q_EMIT messageReported(tr("Brought back the state of %1; save to keep it").arg(title));
}

// What is shown and cannot be edited is in the file, so that it need not be undone.
void SettingsEditor::bringBackText(QByteArray const& bytes, SettingsDocument const& state)
{
    if (m_text->isReadOnly()) {
        m_text->Show(bytes, state);
        m_text->SetModified(true);
        m_hasTree = false;
    } else {
        m_text->Replace(bytes);
    }
}

bool SettingsEditor::ShowsTree() const
{
    return m_pages->currentIndex() == TreePage;
}

bool SettingsEditor::isModified() const
{
    if (!ShowsTree())
        return m_text->isModified();
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

bool SettingsEditor::CanUndo() const
{
    return ShowsTree() ? m_commands.undoStack()->canUndo() : m_text->canUndo();
}

bool SettingsEditor::CanRedo() const
{
    return ShowsTree() ? m_commands.undoStack()->canRedo() : m_text->canRedo();
}

QString SettingsEditor::UndoText() const
{
    if (ShowsTree())
        return m_commands.undoStack()->undoText();
    return m_text->canUndo() ? tr("Edit Text") : QString();
}

QString SettingsEditor::RedoText() const
{
    if (ShowsTree())
        return m_commands.undoStack()->redoText();
    return m_text->canRedo() ? tr("Edit Text") : QString();
}

void SettingsEditor::Undo()
{
    if (!ShowsTree()) {
        m_text->Undo();
        return;
    }
    m_tree->EndEditing();
    m_commands.undoStack()->undo();
    m_tree->GoToChanged();
}

void SettingsEditor::Redo()
{
    if (!ShowsTree()) {
        m_text->Redo();
        return;
    }
    m_tree->EndEditing();
    m_commands.undoStack()->redo();
    m_tree->GoToChanged();
}

QList<QAction*> SettingsEditor::commands() const
{
    return ShowsTree() ? m_tree->commands() : m_text->commands();
}

void SettingsEditor::AddOuterActions(QList<QAction*> const& actions)
{
    m_tree->AddOuterActions(actions);
}

bool SettingsEditor::Save()
{
    if (!ShowsTree())
        return saveText();
    if (!m_tree->EndEditing())
        return false; // "Saved" would take the place of the reason
    if (!isModified())
        return true;
    if (!m_saver.Save(document()))
        return false;
    noteSaved();
    return true;
}

bool SettingsEditor::saveText()
{
    if (!m_text->isModified())
        return !m_text->isReadOnly();
    if (!m_saver.SaveText(m_text->bytes(), m_text->parsed()))
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
                        tr("Save changes to %1?").arg(LeftToRight(QFileInfo(m_path).fileName())),
                        QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel);
    box.setDefaultButton(QMessageBox::Save);
    const int answer = box.exec();
    if (answer == QMessageBox::Save)
        return Save();
    return answer == QMessageBox::Discard;
}

} // namespace Velocor
