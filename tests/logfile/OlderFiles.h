// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/OlderLogFiles.h"
#include "support/TestFiles.h"

#include <memory>

/// Writes older files of a log and opens them, the first of them the oldest.
class OlderFiles
{
public:
    /// @param folder  with a slash at its end
    explicit OlderFiles(QString folder) : m_folder(std::move(folder)) {}

    /// @param size  how much of the file counts; -1 for all of it
    void add(QByteArray const& bytes, QByteArray const& separator = QByteArray(), int size = -1)
    {
        const QString path = m_folder + QString::number(m_files->count()) + ".log";
        auto file = std::make_shared<QFile>(path);
        if (!TestFiles::write(path, bytes) ||
            !file->open(QIODevice::ReadOnly | QIODevice::Unbuffered))
            qFatal("cannot write %s", qPrintable(path));
        m_files->Add(path, file, size < 0 ? bytes.size() : size, separator);
    }

    std::shared_ptr<Velocor::OlderLogFiles const> files() const { return m_files; }

private:
    QString m_folder;
    std::shared_ptr<Velocor::OlderLogFiles> m_files = std::make_shared<Velocor::OlderLogFiles>();
};
