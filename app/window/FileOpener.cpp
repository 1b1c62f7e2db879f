// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/FileOpener.h"

#include "app/MruSeparator_p.h"
#include "app/window/FileTabs.h"
#include "app/window/RecentFiles.h"
#include "app/window/StandardInput.h"
#include "app/window/WindowSettings.h"
#include "app/window/log/LogPanel.h"
#include "app/window/widgets/PlainText.h"

#include <QDir>
#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
#include <QMimeData>
#include <QUrl>

namespace Velocor {

namespace {

constexpr int MaximumDroppedFiles = 20;
constexpr int MaximumProblemLength = 1000; // characters

} // namespace

FileOpener::FileOpener(FileTabs* tabs, QWidget* window) : m_tabs(tabs), m_window(window) {}

void FileOpener::FillRecentMenu(QMenu* menu)
{
    m_recent = new RecentFiles(menu, this);
    connect(m_recent, &RecentFiles::fileChosen, this, &FileOpener::Open);
}

void FileOpener::RestoreRecent(WindowSettings& settings)
{
    m_recent->SetList(settings.Text(QStringLiteral("recentFiles")));
}

void FileOpener::Reopen(WindowSettings& settings)
{
    const QStringList files =
        settings.Text(QStringLiteral("openFiles")).split(MruSeparator).mid(0, MaximumFiles);
    for (QString const& file : files) {
        if (QFileInfo(file).isAbsolute() && QFileInfo(file).isFile())
            m_tabs->OpenInBackground(file);
    }
    m_tabs->GoTo(settings.Text(QStringLiteral("currentFile")));
}

void FileOpener::Save(WindowSettings& settings) const
{
    settings.SetText(QStringLiteral("recentFiles"), m_recent->list());
    const QStringList files = openFiles();
    const QString current = FileTabs::PathOf(m_tabs->currentWidget());
    settings.SetText(QStringLiteral("openFiles"), files.join(MruSeparator));
    settings.SetText(QStringLiteral("currentFile"), files.contains(current) ? current : QString());
}

// Not standard input, which is gone, and no path that would read back as two.
QStringList FileOpener::openFiles() const
{
    QStringList files;
    for (int i = 1; i < m_tabs->count(); ++i) {
        QWidget const* page = m_tabs->widget(i);
        const QString path = FileTabs::PathOf(page);
        if (!page->findChild<StandardInput*>() && !path.contains(MruSeparator) &&
            path.size() <= RecentFiles::MaximumPathLength && files.size() < MaximumFiles)
            files.append(path);
    }
    return files;
}

void FileOpener::Choose()
{
    const QFileInfo current(FileTabs::PathOf(m_tabs->currentWidget()));
    const bool isInput = m_tabs->currentWidget()->findChild<StandardInput*>();
    const QString path = QFileDialog::getOpenFileName(
        m_window, tr("Open"), isInput ? QDir::currentPath() : current.absolutePath(),
        tr("Logs (*.log *.log.* *.txt);;Settings files (*.cfg *.xml);;All files (*)"));
    if (!path.isEmpty())
        Open(path);
}

void FileOpener::Open(QString const& path)
{
    const QString full = QFileInfo(path).absoluteFilePath();
    if (!QFileInfo::exists(full)) {
        offerToForget(path);
        return;
    }
    const QString problem = open(full);
    if (!problem.isEmpty())
        Q_EMIT messageReported(problem);
}

// Returns why it cannot be opened; empty if it was.
QString FileOpener::open(QString const& path)
{
    const QFileInfo info(path);
    if (!info.exists())
        return tr("%1 does not exist").arg(LeftToRight(path));
    if (info.isDir())
        return tr("%1 is a folder").arg(LeftToRight(path));
    if (!info.isFile()) // opening a pipe would block, and a device may have no end
        return tr("%1 is not a regular file").arg(LeftToRight(path));
    m_tabs->OpenFile(path);
    m_recent->Add(path);
    return QString();
}

void FileOpener::OpenAll(QStringList const& files)
{
    QStringList problems;
    const QStringList opened = files.mid(0, MaximumFiles);
    for (QString const& file : opened) {
        const int input = file == QLatin1String("-") ? 0 : StandardInput::PipeOf(file);
        const QString problem = input >= 0 ? openInput(input) : open(file);
        if (!problem.isEmpty())
            problems.append(Shortened(problem, MaximumProblemLength));
    }
    if (files.size() > MaximumFiles)
        problems.append(
            tr("Only the first %1 of %2 files were opened").arg(MaximumFiles).arg(files.size()));
    if (!problems.isEmpty())
        Q_EMIT problemReported(problems.join(QLatin1Char('\n')));
}

QString FileOpener::openInput(int descriptor)
{
    auto* input = new StandardInput(descriptor);
    if (input->path().isEmpty()) {
        delete input;
        return tr("Standard input cannot be shown, because no file can be created in %1")
            .arg(LeftToRight(QDir::tempPath()));
    }
    connect(input, &StandardInput::failed, this, &FileOpener::problemReported);
    input->setParent(m_tabs->OpenLog(input->path())); // ends with its tab
    return QString();
}

void FileOpener::offerToForget(QString const& path)
{
    if (!m_recent->Contains(path)) {
        Q_EMIT messageReported(tr("%1 does not exist").arg(LeftToRight(path)));
        return;
    }
    PlainMessageBox box(
        QMessageBox::Question, m_window,
        tr("%1 no longer exists.\nRemove it from the list of recent files?").arg(LeftToRight(path)),
        QMessageBox::Yes | QMessageBox::No);
    if (box.exec() == QMessageBox::Yes)
        m_recent->Remove(path);
}

bool FileOpener::CanDrop(QMimeData const* data)
{
    const QList<QUrl> urls = data->urls();
    for (QUrl const& url : urls) {
        if (url.isLocalFile())
            return true;
    }
    return false;
}

void FileOpener::Drop(QMimeData const* data)
{
    const QList<QUrl> urls = data->urls().mid(0, MaximumDroppedFiles);
    for (QUrl const& url : urls) {
        if (url.isLocalFile())
            Open(url.toLocalFile());
    }
}

} // namespace Velocor
