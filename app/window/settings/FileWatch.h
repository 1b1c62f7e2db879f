// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFileSystemWatcher>
#include <QObject>
#include <QTimer>

namespace Velocor {

/// Tells when a file may have changed, was removed or is there again. GUI thread only.
class FileWatch : public QObject
{
    Q_OBJECT

public:
    explicit FileWatch(QObject* parent = nullptr);

    /// Watches a file, which need not exist, instead of an earlier one.
    void SetFile(QString const& path);

Q_SIGNALS:
    /// Something has happened to the file or in its folder. Several changes within a tenth of a
    /// second are one.
    void changed();

private:
    void watch();

    QString m_path;
    QFileSystemWatcher m_watcher;
    QTimer m_delay;
};

} // namespace Velocor
