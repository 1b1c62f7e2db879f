// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsTextPage.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/settings/LineDialog.h"
#include "app/window/settings/NumberedText.h"
#include "app/window/settings/TextFindBar.h"
#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/WrappedLabel.h"

#include <QAction>
#include <QFile>
#include <QFileInfo>
#include <QKeyEvent>
#include <QLabel>
#include <QPushButton>
#include <QTextBlock>
#include <QTextDocument>

namespace Velocor {

namespace {

constexpr int ParsePause = 300; // milliseconds

enum Command { GoToErrorCommand, ShowSettingsCommand };

// What can be read: "1 section with 2 keys".
QString Contents(SettingsDocument const& document)
{
    int keys = 0;
    for (SettingsDocument::Section const& section : document.sections)
        keys += section.items.size();
    const int sections = document.sections.size();
    return SettingsTextPage::tr("%1 with %2")
        .arg(sections == 1 ? SettingsTextPage::tr("1 section")
                           : SettingsTextPage::tr("%1 sections").arg(sections),
             keys == 1 ? SettingsTextPage::tr("1 key") : SettingsTextPage::tr("%1 keys").arg(keys));
}

} // namespace

SettingsTextPage::SettingsTextPage(QWidget* parent)
    : QWidget(parent), m_text(new NumberedText), m_find(new TextFindBar(m_text)),
      m_state(new WrappedLabel), m_save(new QPushButton(tr("Sa&ve")))
{
    m_text->setAccessibleName(tr("File text"));
    m_state->setAccessibleName(tr("State of the text"));
    m_state->setTextInteractionFlags(Qt::TextSelectableByMouse);
    m_pause.setSingleShot(true);
    m_pause.setInterval(ParsePause);
    makeActions();
    m_save->setAutoDefault(false);
    m_save->setToolTip(PlainToolTip(tr("Save the file (Ctrl+S)")));
    connect(m_save, &QPushButton::clicked, this, &SettingsTextPage::saveRequested);
    auto* buttons = new FlowLayout(6);
    buttons->addWidget(makeCommandButton(GoToErrorCommand));
    buttons->addWidget(makeCommandButton(ShowSettingsCommand));
    buttons->AddStretch();
    buttons->addWidget(m_save);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_text, 1);
    layout->addWidget(m_find);
    layout->addWidget(m_state);
    layout->addLayout(buttons);
    setFocusProxy(m_text);
    connect(m_text, &QPlainTextEdit::textChanged, this, [this] { m_pause.start(); });
    connect(&m_pause, &QTimer::timeout, this, &SettingsTextPage::parse);
    QTextDocument const* document = m_text->document();
    connect(document, &QTextDocument::modificationChanged, this, &SettingsTextPage::showState);
    connect(document, &QTextDocument::undoAvailable, this, &SettingsTextPage::stateChanged);
    connect(document, &QTextDocument::redoAvailable, this, &SettingsTextPage::stateChanged);
}

QVector<SettingsTextCommand> SettingsTextPage::AllCommands()
{
    const auto key = [](char const* text) {
        return QKeySequence(QLatin1String(text));
    };
    return {
        {tr("Go to &Error"), key("F8"), tr("Go to where the text cannot be read"),
         &SettingsTextPage::GoToError},
        {tr("Show as Se&ttings"), key("Ctrl+T"),
         tr("Show what can be read of the text as sections, keys and values"),
         &SettingsTextPage::ShowSettings},
        {tr("&Find"), key("Ctrl+F"), tr("Find a text in the file"), &SettingsTextPage::OpenFind},
        {tr("Find Ne&xt"), key("F3"), tr("Go to the next match in the text"),
         &SettingsTextPage::FindNext},
        {tr("Find &Previous"), key("Shift+F3"), tr("Go to the previous match in the text"),
         &SettingsTextPage::FindPrevious},
        {tr("&Go to Line..."), key("Ctrl+G"), tr("Go to a line of the text by its number"),
         &SettingsTextPage::GoToLine},
        {tr("Sa&ved States..."), key("Ctrl+Shift+T"), tr("Bring back an earlier state of the file"),
         &SettingsTextPage::OpenStates},
    };
}

void SettingsTextPage::makeActions()
{
    const QVector<SettingsTextCommand> all = AllCommands();
    for (SettingsTextCommand const& command : all) {
        // For menus to show. The page never has the focus, so keyPressEvent() handles it.
        auto* action = new QAction(command.text, this);
        action->setShortcut(command.key);
        action->setShortcutContext(Qt::WidgetShortcut);
        action->setStatusTip(command.statusTip);
        connect(action, &QAction::triggered, this, command.work);
        m_actions.append(action);
    }
}

QPushButton* SettingsTextPage::makeCommandButton(int command)
{
    QAction const* action = m_actions.at(command);
    auto* button = new QPushButton(action->text());
    button->setAutoDefault(false);
    button->setMinimumWidth(button->sizeHint().width() +
                            2 * button->fontMetrics().averageCharWidth());
    const QString key = action->shortcut().toString(QKeySequence::NativeText);
    button->setToolTip(PlainToolTip(QStringLiteral("%1 (%2)").arg(action->statusTip(), key)));
    connect(button, &QPushButton::clicked, action, &QAction::trigger);
    connect(action, &QAction::changed, button,
            [button, action] { button->setEnabled(action->isEnabled()); });
    return button;
}

QByteArray SettingsTextPage::BytesOf(QString const& path)
{
    QFile file(path);
    const bool isOpen = QFileInfo(path).isFile() && file.open(QIODevice::ReadOnly);
    return isOpen ? file.read(EditLimit + 1) : QByteArray();
}

void SettingsTextPage::Show(QByteArray const& bytes, SettingsDocument const& parsed)
{
    m_original = bytes;
    m_parsed = parsed;
    m_file = SettingsText::Of(bytes.left(EditLimit));
    m_text->setReadOnly(false); // or bytes() would not look at the text
    m_text->setPlainText(m_file.text);
    m_text->setReadOnly(!parsed.isReadable || this->bytes() != bytes);
    m_text->setTextInteractionFlags(m_text->textInteractionFlags() | Qt::TextSelectableByKeyboard);
    m_pause.stop();
    SetModified(false);
    showState();
    m_text->GoToError();
}

void SettingsTextPage::Replace(QByteArray const& bytes)
{
    QTextCursor cursor(m_text->document());
    cursor.select(QTextCursor::Document);
    cursor.insertText(SettingsText::Of(bytes).text);
    parse();
}

bool SettingsTextPage::isReadOnly() const
{
    return m_text->isReadOnly();
}

// Not toPlainText(), which converts non-breaking spaces to spaces.
QString SettingsTextPage::text() const
{
    return m_text->document()->toRawText().replace(QChar(QChar::ParagraphSeparator),
                                                   QLatin1Char('\n'));
}

QByteArray SettingsTextPage::bytes() const
{
    return isReadOnly() ? m_original : m_file.ToBytes(text());
}

SettingsDocument const& SettingsTextPage::parsed()
{
    if (m_pause.isActive())
        parse();
    return m_parsed;
}

bool SettingsTextPage::isModified() const
{
    return m_text->document()->isModified();
}

void SettingsTextPage::SetModified(bool isModified)
{
    m_text->document()->setModified(isModified);
}

bool SettingsTextPage::canUndo() const
{
    return m_text->document()->isUndoAvailable();
}

bool SettingsTextPage::canRedo() const
{
    return m_text->document()->isRedoAvailable();
}

void SettingsTextPage::Undo()
{
    m_text->undo();
}

void SettingsTextPage::Redo()
{
    m_text->redo();
}

void SettingsTextPage::parse()
{
    m_pause.stop();
    const QString edited = text();
    const int unwritable = isReadOnly() ? -1 : m_file.FirstUnwritable(edited);
    m_parsed = SettingsFileReader::ReadBytes(bytes());
    if (unwritable >= 0) {
        const QString before = edited.left(unwritable);
        m_parsed.isParsed = false;
        m_parsed.isReadable = false;
        m_parsed.error = tr("the file is in Latin-1, which lacks this character");
        m_parsed.line = before.count(QLatin1Char('\n')) + 1;
        m_parsed.column = unwritable - before.lastIndexOf(QLatin1Char('\n'));
    }
    showState();
}

void SettingsTextPage::showState()
{
    const QString found = Contents(m_parsed);
    QString state;
    const bool isMalformed = !m_parsed.isParsed && !m_parsed.isTooLarge;
    if (m_parsed.isParsed)
        state = tr("This text can be read: %1.").arg(found);
    else if (m_parsed.isTooLarge)
        state = tr("This file is too large to be shown as settings.");
    else if (m_parsed.line > 0)
        state = tr("Line %1, column %2: %3. Programs get what is before it: %4.")
                    .arg(m_parsed.line)
                    .arg(m_parsed.column)
                    .arg(m_parsed.error, found);
    else
        state = m_parsed.error;
    if (isReadOnly() && isOnlyStart())
        state += tr(" Only the start of the file is shown, and it cannot be edited as text.");
    else if (isReadOnly())
        state += tr(" This file cannot be edited as text.");
    m_state->setText(state);
    m_text->SetError(isMalformed ? m_parsed.line : 0, m_parsed.column);
    m_actions.at(GoToErrorCommand)->setEnabled(isMalformed && m_parsed.line > 0);
    m_actions.at(ShowSettingsCommand)->setEnabled(!m_parsed.isTooLarge);
    m_save->setEnabled(isModified());
    Q_EMIT stateChanged();
}

void SettingsTextPage::GoToError()
{
    parsed();
    m_text->GoToError();
}

void SettingsTextPage::OpenFind()
{
    m_find->Open();
}

void SettingsTextPage::FindNext()
{
    m_find->FindNext(1);
}

void SettingsTextPage::FindPrevious()
{
    m_find->FindNext(-1);
}

void SettingsTextPage::GoToLine()
{
    QTextDocument const* document = m_text->document();
    LineDialog dialog(m_text->textCursor().blockNumber() + 1, document->blockCount(), this);
    if (dialog.exec() == QDialog::Accepted)
        m_text->setTextCursor(QTextCursor(document->findBlockByNumber(dialog.line() - 1)));
    m_text->setFocus();
}

void SettingsTextPage::OpenStates()
{
    Q_EMIT statesRequested();
}

void SettingsTextPage::ShowSettings()
{
    Q_EMIT settingsRequested();
}

// Keys that the text does not use arrive here.
void SettingsTextPage::keyPressEvent(QKeyEvent* event)
{
    const QKeySequence pressed(static_cast<int>(event->modifiers()) + event->key());
    const QVector<SettingsTextCommand> all = AllCommands();
    for (int i = 0; i < all.size(); ++i) {
        if (all.at(i).key == pressed) {
            parsed(); // what was just typed decides which actions are enabled
            m_actions.at(i)->trigger();
            return;
        }
    }
    QWidget::keyPressEvent(event);
}

} // namespace Velocor
