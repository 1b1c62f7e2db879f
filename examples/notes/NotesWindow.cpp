// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "NotesWindow.h"

#include "app/AppUtils.h"
#include "app/UserMessages.h"
#include "common/config/TorkConfigText.h"

#include <QAction>
#include <QCloseEvent>
#include <QColorDialog>
#include <QDebug>
#include <QFile>
#include <QFileDialog>
#include <QFileInfo>
#include <QFontDialog>
#include <QMenu>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QSaveFile>

namespace {

const int RecentCount = 8;

} // namespace

NotesWindow::NotesWindow(QString const& settingsFile)
    : m_settings(settingsFile), m_text(new QPlainTextEdit)
{
    setCentralWidget(m_text);
    connect(m_text, &QPlainTextEdit::modificationChanged, this, &QWidget::setWindowModified);
    MakeMenus();
    TakeNote(QString());
    LoadSettings(!QFile::exists(settingsFile));
}

NotesWindow::~NotesWindow() = default;

void NotesWindow::MakeMenus()
{
    QMenu* file = menuBar()->addMenu(tr("&File"));
    m_recentMenu = new QMenu(tr("Open &Recent"), this);
    QAction* open = file->addAction(tr("&Open..."), this,
                                    [this] { OpenNote(QFileDialog::getOpenFileName(this)); });
    open->setShortcut(QKeySequence::Open);
    file->addMenu(m_recentMenu);
    file->addAction(tr("&Save"), this, &NotesWindow::Save)->setShortcut(QKeySequence::Save);
    file->addAction(tr("Save &As..."), this, &NotesWindow::SaveAs)
        ->setShortcut(QKeySequence::SaveAs);
    file->addAction(tr("&Quit"), this, &QWidget::close)->setShortcut(QKeySequence::Quit);

    // Populated just before it is shown: populating it while one of its own actions runs would
    // delete that action.
    connect(file, &QMenu::aboutToShow, this, &NotesWindow::ShowRecent);
    connect(m_recentMenu, &QMenu::triggered, this,
            [this](QAction* action) { OpenNote(action->text()); });

    QMenu* view = menuBar()->addMenu(tr("&View"));
    view->addAction(tr("&Font..."), this, [this] {
        m_text->setFont(QFontDialog::getFont(nullptr, m_text->font(), this));
    });
    view->addAction(tr("&Color..."), this, [this] {
        SetColor(QColorDialog::getColor(m_text->palette().color(QPalette::Text), this));
    });
}

void NotesWindow::LoadSettings(bool firstStart)
{
    if (!m_settings.Load() && !firstStart)
        WarningMessage(this, m_settings.m_lastError, true);

    resize(640, 480);
    QPoint position;
    QSize size;
    if (m_settings.ReadScreenMetrics("NotesWindow", position, size) && !size.isEmpty()) {
        move(position);
        resize(size);
    }

    QFont font = m_text->font();
    m_settings.ReadFont("Notes", "font", font);
    m_text->setFont(font);

    QColor color;
    m_settings.ReadColor("Notes", "color", color);
    SetColor(color);

    QString none;
    m_settings.ReadItem("Notes", "recent", none, m_recent);
    m_recent = TorkConfigText::DecodeValue(m_recent);
}

void NotesWindow::SaveSettings()
{
    QPoint position = pos();
    QSize extent = size();
    m_settings.WriteScreenMetrics("NotesWindow", position, extent);
    QFont font = m_text->font();
    m_settings.WriteFont("Notes", "font", font);
    QColor color = m_text->palette().color(QPalette::Text);
    m_settings.WriteColor("Notes", "color", color);
    // A file name can contain anything; the store preserves only some of it without encoding.
    m_settings.WriteItem("Notes", "recent", TorkConfigText::EncodeValue(m_recent));

    if (!m_settings.SaveAtomically())
        CriticalMessage(this, m_settings.m_lastError, true);
}

void NotesWindow::SetColor(QColor const& color)
{
    if (!color.isValid()) // nothing chosen, or no usable value stored
        return;

    QPalette palette = m_text->palette();
    palette.setColor(QPalette::Text, color);
    m_text->setPalette(palette);
}

void NotesWindow::ShowRecent()
{
    AppUtils::SetupMRUMenu(m_recentMenu, m_recent);
    // A list that was once empty has kept an entry without a name.
    bool any = false;
    const QList<QAction*> actions = m_recentMenu->actions();
    for (QAction* action : actions) {
        action->setVisible(!action->text().isEmpty());
        any = any || action->isVisible();
    }
    m_recentMenu->setEnabled(any);
}

void NotesWindow::TakeNote(QString const& path)
{
    m_path = path;
    m_text->document()->setModified(false);
    setWindowTitle((path.isEmpty() ? tr("New note") : QFileInfo(path).fileName()) + "[*]");
    AppUtils::AddToMRUList(path, m_recent, RecentCount); // does nothing without a name
}

bool NotesWindow::OpenNote(QString const& path)
{
    if (path.isEmpty() || !MayLeaveNote())
        return false;

    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        AppUtils::RemoveFromMRUList(path, m_recent);
        WarningMessage(this, tr("Cannot open %1:\n%2").arg(path, file.errorString()), true);
        return false;
    }
    m_text->setPlainText(QString::fromUtf8(file.readAll()));
    TakeNote(path);
    qDebug() << "opened" << path;
    return true;
}

bool NotesWindow::SaveNote(QString const& path)
{
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly) || file.write(m_text->toPlainText().toUtf8()) < 0 ||
        !file.commit()) {
        CriticalMessage(this, tr("Cannot save %1:\n%2").arg(path, file.errorString()), true);
        return false;
    }
    TakeNote(path);
    qDebug() << "saved" << path;
    return true;
}

bool NotesWindow::Save()
{
    return m_path.isEmpty() ? SaveAs() : SaveNote(m_path);
}

bool NotesWindow::SaveAs()
{
    const QString path = QFileDialog::getSaveFileName(this, QString(), m_path);
    return !path.isEmpty() && SaveNote(path);
}

bool NotesWindow::MayLeaveNote()
{
    if (!isWindowModified())
        return true;

    switch (QMessageBox::question(this, windowTitle(), tr("Save the changes to this note?"),
                                  QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel,
                                  QMessageBox::Save)) {
    case QMessageBox::Save:
        return Save();
    case QMessageBox::Discard:
        return true;
    default:
        return false;
    }
}

void NotesWindow::closeEvent(QCloseEvent* event)
{
    if (!MayLeaveNote()) {
        event->ignore();
        return;
    }
    SaveSettings();
    event->accept();
}
