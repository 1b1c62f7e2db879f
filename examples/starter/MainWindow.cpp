// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "MainWindow.h"

#include "app/AppPaths.h"
#include "app/AppUtils.h"
#include "app/UserMessages.h"
#include "common/config/TorkConfigText.h"

#include <QAction>
#include <QCloseEvent>
#include <QDebug>
#include <QFile>
#include <QFileDialog>
#include <QFileInfo>
#include <QMenu>
#include <QMenuBar>
#include <QPlainTextEdit>

namespace {

const int RecentCount = 8;

// The boxes would show a file name with tags in it as rich text.
QString Plain(QString const& text)
{
    if (!Qt::mightBeRichText(text))
        return text;
    return "<p style='white-space:pre-wrap'>" + text.toHtmlEscaped() + "</p>";
}

} // namespace

MainWindow::MainWindow(QString const& settingsFile)
    : m_settings(settingsFile), m_text(new QPlainTextEdit)
{
    m_text->setReadOnly(true);
    setCentralWidget(m_text);
    setWindowTitle(AppPaths::ProductName());
    makeMenus();
    loadSettings(!QFile::exists(settingsFile));
}

MainWindow::~MainWindow() = default;

void MainWindow::makeMenus()
{
    QMenu* file = menuBar()->addMenu(tr("&File"));
    QAction* open = file->addAction(tr("&Open..."));
    open->setShortcut(QKeySequence::Open);
    connect(open, &QAction::triggered, this, [this] {
        const QString path = QFileDialog::getOpenFileName(this);
        if (!path.isEmpty())
            Open(path);
    });
    m_recentMenu = file->addMenu(tr("Open &Recent"));
    QAction* quit = file->addAction(tr("&Quit"));
    quit->setShortcut(QKeySequence::Quit);
    connect(quit, &QAction::triggered, this, &QWidget::close);

    // Populated just before it is shown: populating it while one of its own actions runs would
    // delete that action.
    connect(file, &QMenu::aboutToShow, this, &MainWindow::showRecent);
    connect(m_recentMenu, &QMenu::triggered, this,
            [this](QAction* action) { Open(action->text()); });
}

void MainWindow::loadSettings(bool firstStart)
{
    if (!m_settings.Load() && !firstStart)
        WarningMessage(nullptr, m_settings.m_lastError, true);

    resize(640, 480);
    QPoint position;
    QSize extent;
    if (m_settings.ReadScreenMetrics("MainWindow", position, extent) && !extent.isEmpty()) {
        move(position);
        resize(extent);
    }

    QString none;
    m_settings.ReadItem("Files", "recent", none, m_recent);
    m_recent = TorkConfigText::DecodeValue(m_recent);
}

void MainWindow::saveSettings()
{
    QPoint position = pos();
    QSize extent = size();
    m_settings.WriteScreenMetrics("MainWindow", position, extent);
    // A file name can contain anything; settings preserve only some of it without encoding.
    m_settings.WriteItem("Files", "recent", TorkConfigText::EncodeValue(m_recent));
    if (!m_settings.SaveAtomically())
        CriticalMessage(this, Plain(m_settings.m_lastError), true);
}

void MainWindow::showRecent()
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

bool MainWindow::Open(QString const& name)
{
    const QString path = QFileInfo(name).absoluteFilePath(); // the next start may be elsewhere
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        AppUtils::RemoveFromMRUList(path, m_recent);
        WarningMessage(this, Plain(tr("Cannot open %1:\n%2").arg(path, file.errorString())), true);
        return false;
    }
    m_text->setPlainText(QString::fromUtf8(file.readAll()));
    setWindowTitle(QFileInfo(path).fileName() + " - " + AppPaths::ProductName());
    AppUtils::AddToMRUList(path, m_recent, RecentCount);
    qDebug() << "opened" << path;
    return true;
}

void MainWindow::closeEvent(QCloseEvent* event)
{
    saveSettings();
    event->accept();
}
