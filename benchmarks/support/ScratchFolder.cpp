// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/ScratchFolder.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <cstdio>
#include <cstdlib>

namespace {

QString Template()
{
    QString root = QString::fromLocal8Bit(qgetenv("VELOCOR_BENCH_DIR"));
    const QString memory = QStringLiteral("/dev/shm");
    if (root.isEmpty())
        root = QFileInfo(memory).isWritable() ? memory : QDir::tempPath();
    return root + QStringLiteral("/velocor-bench-XXXXXX");
}

} // namespace

ScratchFolder::ScratchFolder() : m_folder(Template())
{
    Require(m_folder.isValid(), QStringLiteral("no folder for files: ") + m_folder.errorString());
}

QString ScratchFolder::file(QString const& name) const
{
    return m_folder.path() + QLatin1Char('/') + name;
}

QByteArray ReadAll(QString const& fileName)
{
    QFile file(fileName);
    Require(file.open(QIODevice::ReadOnly), fileName + QStringLiteral(": ") + file.errorString());
    return file.readAll();
}

void Require(bool holds, QString const& message)
{
    if (holds)
        return;
    std::fprintf(stderr, "benchmark: %s\n", message.toLocal8Bit().constData());
    std::exit(1);
}
