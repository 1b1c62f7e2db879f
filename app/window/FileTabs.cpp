// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/FileTabs.h"

#include "app/window/ApplicationProperty.h"
#include "app/window/DistinctNames.h"
#include "app/window/log/HighlightDialog.h"
#include "app/window/log/LogPanel.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QAction>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>
#include <QTabBar>
#include <QToolButton>

#include <algorithm>

namespace Velocor {

FileTabs::FileTabs(LogMarkStore* marks, QWidget* parent)
    : QTabWidget(parent), m_marks(marks), m_highlightRules(std::make_shared<HighlightRules>())
{
    setDocumentMode(true);
    setTabBarAutoHide(true);
    // Tab would go to the bar even while that is hidden, and stay where it is.
    setFocusProxy(nullptr);
    setFocusPolicy(Qt::NoFocus);
    setMovable(false);
    setElideMode(Qt::ElideMiddle);
    setAccessibleName(tr("Open files"));
    tabBar()->setAccessibleName(tr("Open files"));
    connect(m_highlightRules.get(), &HighlightRules::stopped, this, &FileTabs::messageReported);
    m_ownLog = addLog(QString());
    setTabText(0, tr("Log"));
    addStepAction(tr("Next Tab"), QKeySequence::NextChild, QKeySequence(tr("Ctrl+PgDown")), 1);
    addStepAction(tr("Previous Tab"), QKeySequence::PreviousChild, QKeySequence(tr("Ctrl+PgUp")),
                  -1);
    connect(this, &QTabWidget::currentChanged, this, &FileTabs::stateChanged);
    connect(this, &FileTabs::stateChanged, this, &FileTabs::updateTitles);
}

// QTabWidget has keys, too, but a selection box in a page takes them.
void FileTabs::addStepAction(QString const& text, QKeySequence::StandardKey keys,
                             QKeySequence const& other, int step)
{
    auto* action = new QAction(text, this);
    QList<QKeySequence> shortcuts = QKeySequence::keyBindings(keys);
    shortcuts.append(other);
    action->setShortcuts(shortcuts);
    connect(action, &QAction::triggered, this,
            [this, step] { goTo(widget((currentIndex() + step + count()) % count())); });
    addAction(action);
}

QString FileTabs::PathOf(QWidget const* page)
{
    if (auto const* log = qobject_cast<LogPanel const*>(page))
        return log->path();
    auto const* editor = qobject_cast<SettingsEditor const*>(page);
    return editor ? editor->path() : QString();
}

// Setting a text lays out the tabs, even if it is the same.
void FileTabs::updateTitles()
{
    QStringList paths;
    for (int i = 1; i < count(); ++i)
        paths.append(PathOf(widget(i)));
    QStringList titles = DistinctNames(paths);
    for (int i = 1; i < count(); ++i) {
        QString& title = titles[i - 1];
        title.replace(QLatin1Char('&'), QLatin1String("&&"));
        auto const* editor = qobject_cast<SettingsEditor const*>(widget(i));
        if (editor && editor->isModified())
            title += QLatin1String(" *");
        if (tabText(i) != title)
            setTabText(i, title);
    }
}

// The style's close button is an image that is invisible on dark palettes.
void FileTabs::addCloseButton(QWidget* page, QString const& name)
{
    auto* button = new QToolButton;
    button->setText(QString(QChar(0xd7)));
    button->setAutoRaise(true);
    button->setFocusPolicy(Qt::NoFocus); // Ctrl+W does the same
    button->setAccessibleName(tr("Close %1").arg(name));
    button->setToolTip(PlainToolTip(tr("Close the file (Ctrl+W)")));
    connect(button, &QToolButton::clicked, this, [this, page] { closeTab(indexOf(page)); });
    tabBar()->setTabButton(indexOf(page), QTabBar::RightSide, button);
}

LogPanel* FileTabs::addLog(QString const& path)
{
    auto* panel = new LogPanel;
    const QString name = path.isEmpty() ? tr("Log") : QFileInfo(path).fileName();
    panel->setAccessibleName(name);
    panel->SetMarkStore(m_marks);
    panel->SetFilterHistory(m_filterHistory);
    panel->SetHighlightRules(m_highlightRules);
    connect(panel, &LogPanel::stateChanged, this, &FileTabs::stateChanged);
    connect(panel, &LogPanel::messageReported, this, &FileTabs::messageReported);
    connect(panel, &LogPanel::zoomRequested, this, &FileTabs::zoomRequested);
    connect(panel, &LogPanel::sinceRequested, this, &FileTabs::sinceRequested);
    panel->SetTextFont(m_textFont);
    panel->SetLineWrap(m_isWrapped);
    panel->SetLineNumbers(m_hasNumbers);
    panel->SetActivity(m_showsActivity);
    panel->SetSince(m_showsSince);
    panel->SetLeastGap(m_leastGap);
    panel->SetFoldsRepeats(m_foldsRepeats);
    if (!path.isEmpty())
        panel->Open(path, false);
    setTabToolTip(addTab(panel, QString()), PlainToolTip(LeftToRight(path)));
    if (!path.isEmpty())
        addCloseButton(panel, name);
    return panel;
}

// However the path is spelled.
QString FileTabs::ownerNoteOf(QString const& path) const
{
    const QFileInfo file(path);
    for (auto note = m_ownerNotes.begin(); note != m_ownerNotes.end(); ++note) {
        if (QFileInfo(note.key()).absoluteFilePath() == file.absoluteFilePath() ||
            (file.exists() &&
             QFileInfo(note.key()).canonicalFilePath() == file.canonicalFilePath()))
            return note.value();
    }
    return QString();
}

SettingsEditor* FileTabs::addEditor(QString const& path)
{
    auto* editor = new SettingsEditor;
    const QString name = QFileInfo(path).fileName();
    editor->setAccessibleName(name);
    editor->SetOwnerNote(ownerNoteOf(path));
    const QString dataPath = ApplicationProperty("DataPath");
    if (!dataPath.isEmpty())
        editor->SetStates(SavedStates(dataPath + QLatin1String("settings-states/")));
    editor->Open(path);
    connect(editor, &SettingsEditor::saved, this, [this, editor] {
        // Maybe another file now.
        const QString savedName = QFileInfo(editor->path()).fileName();
        editor->setAccessibleName(savedName);
        setTabToolTip(indexOf(editor), PlainToolTip(LeftToRight(editor->path())));
        tabBar()
            ->tabButton(indexOf(editor), QTabBar::RightSide)
            ->setAccessibleName(tr("Close %1").arg(savedName));
        Q_EMIT saved(editor->path());
    });
    connect(editor, &SettingsEditor::messageReported, this, &FileTabs::messageReported);
    connect(editor, &SettingsEditor::stateChanged, this, &FileTabs::stateChanged);
    setTabToolTip(addTab(editor, QString()), PlainToolTip(LeftToRight(path)));
    addCloseButton(editor, name);
    return editor;
}

bool FileTabs::IsSettingsFile(QString const& path)
{
    // The priority of a line from syslog; no element has such a name.
    static const QRegularExpression priority(QStringLiteral("^<[0-9]{1,3}>"));
    QFile file(path);
    if (!QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly))
        return false;
    QByteArray start = file.read(1024);
    if (start.startsWith("\xEF\xBB\xBF"))
        start.remove(0, 3);
    start = start.trimmed();
    return start.startsWith('<') && !priority.match(QString::fromLatin1(start)).hasMatch();
}

int FileTabs::positionOf(QString const& path) const
{
    for (int i = 0; i < count(); ++i) {
        if (PathOf(widget(i)) == path)
            return i;
    }
    return -1;
}

void FileTabs::OpenFile(QString const& path)
{
    goTo(pageOf(path));
}

void FileTabs::OpenInBackground(QString const& path)
{
    pageOf(path);
    Q_EMIT stateChanged();
}

void FileTabs::GoTo(QString const& path)
{
    goTo(widget(std::max(0, positionOf(path))));
}

// The existing page of a file, or a new one.
QWidget* FileTabs::pageOf(QString const& path)
{
    const int position = positionOf(path);
    if (position >= 0)
        return widget(position);
    if (IsSettingsFile(path))
        return addEditor(path);
    return addLog(path);
}

LogPanel* FileTabs::OpenLog(QString const& path)
{
    LogPanel* panel = addLog(path);
    goTo(panel);
    return panel;
}

void FileTabs::goTo(QWidget* page)
{
    setCurrentWidget(page);
    page->setFocus();
    Q_EMIT stateChanged();
}

void FileTabs::CloseCurrent()
{
    closeTab(currentIndex());
}

void FileTabs::closeTab(int position)
{
    QWidget* page = widget(position);
    if (!page || page == m_ownLog)
        return;
    auto* editor = qobject_cast<SettingsEditor*>(page);
    if (editor && !editor->MayClose())
        return;
    removeTab(position);
    page->deleteLater();
    goTo(currentWidget()); // or nothing would have the focus
}

bool FileTabs::MayCloseAll()
{
    for (int i = 0; i < count(); ++i) {
        auto* editor = qobject_cast<SettingsEditor*>(widget(i));
        if (!editor)
            continue;
        if (editor->isModified())
            setCurrentIndex(i);
        if (!editor->MayClose())
            return false;
    }
    return true;
}

void FileTabs::SetTextFont(QFont const& font)
{
    m_textFont = font;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetTextFont(font);
    }
}

void FileTabs::SetLineWrap(bool wrapped)
{
    m_isWrapped = wrapped;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetLineWrap(wrapped);
    }
}

void FileTabs::SetLineNumbers(bool shown)
{
    m_hasNumbers = shown;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetLineNumbers(shown);
    }
}

void FileTabs::SetActivity(bool shown)
{
    m_showsActivity = shown;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetActivity(shown);
    }
}

void FileTabs::SetSince(bool shown)
{
    m_showsSince = shown;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetSince(shown);
    }
}

void FileTabs::SetLeastGap(qint64 span)
{
    m_leastGap = span;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetLeastGap(span);
    }
}

void FileTabs::SetFoldsRepeats(bool folds)
{
    m_foldsRepeats = folds;
    for (int i = 0; i < count(); ++i) {
        if (auto* log = qobject_cast<LogPanel*>(widget(i)))
            log->SetFoldsRepeats(folds);
    }
}

void FileTabs::EditHighlightRules()
{
    HighlightDialog(m_highlightRules, this).exec();
}

void FileTabs::MarkOwnLog(bool marked)
{
    if (tabIcon(0).isNull() == marked)
        setTabIcon(0, marked ? SeverityIcons::Icon(LogEntry::Warning, palette()) : QIcon());
}

LogPanel* FileTabs::currentLog() const
{
    return qobject_cast<LogPanel*>(currentWidget());
}

SettingsEditor* FileTabs::currentEditor() const
{
    return qobject_cast<SettingsEditor*>(currentWidget());
}

} // namespace Velocor
