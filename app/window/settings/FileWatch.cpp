// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/FileWatch.h"

#include <QDir>
#include <QFileInfo>

namespace Velocor {

namespace {

constexpr int Delay = 100; // milliseconds

} // namespace

FileWatch::FileWatch(QObject* parent) : QObject(parent)
{
    m_delay.setSingleShot(true);
    m_delay.setInterval(Delay);
    const auto start = [this] {
        m_delay.start();
    };
    connect(&m_watcher, &QFileSystemWatcher::fileChanged, this, start);
    connect(&m_watcher, &QFileSystemWatcher::directoryChanged, this, start);
    connect(&m_delay, &QTimer::timeout, this, [this] {
        watch();
        Q_EMIT changed();
    });
}

void FileWatch::SetFile(QString const& path)
{
    m_path = path;
    watch();
}

// A file that was replaced is no longer watched, nor is a folder that was removed. While the folder
// is gone, the next one that exists tells of its return.
void FileWatch::watch()
{
    const QStringList watched = m_watcher.files() + m_watcher.directories();
    if (!watched.isEmpty())
        m_watcher.removePaths(watched);
    QString folder = QFileInfo(m_path).absolutePath();
    while (!QFileInfo(folder).isDir() && folder != QDir::rootPath())
        folder = QFileInfo(folder).absolutePath();
    m_watcher.addPath(folder);
    if (QFileInfo(m_path).isFile())
        m_watcher.addPath(m_path);
}

} // namespace Velocor
