// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFile>
#include <QProcess>

/// A small file system in a folder, mounted while it lives. The path ends in "/".
class SmallDisk
{
public:
    explicit SmallDisk(QString const& path)
        : isMounted(QProcess::execute("mount", {"-t", "tmpfs", "-o", "size=64k", "tmpfs", path}) ==
                    0),
          m_path(path)
    {}
    ~SmallDisk()
    {
        if (isMounted)
            QProcess::execute("umount", {m_path});
    }
    Q_DISABLE_COPY(SmallDisk)

    /// Until nothing more fits.
    bool fill() const
    {
        QFile filler(m_path + "filler");
        if (!filler.open(QIODevice::WriteOnly | QIODevice::Unbuffered))
            return false;
        while (filler.write(QByteArray(4096, 'f')) == 4096) {}
        return true;
    }

    bool makeRoom() const { return QFile::remove(m_path + "filler"); }

    const bool isMounted; ///< if not, the test cannot run here

private:
    QString m_path;
};
