// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QString>
#include <QStringList>

#include <algorithm>

/// Reads and writes whole files, for tests that compare what a program leaves on the disk.
///
///     TestFiles::write(folder + "app.log", "old\n");
///     QCOMPARE(TestFiles::listing(folder), QStringList({"app.log: old\n"}));
namespace TestFiles {

/// Replaces the file's contents with these bytes and creates its parent folders.
inline bool write(QString const& path, QByteArray const& bytes)
{
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
        qWarning("%s: %s", qPrintable(path), qPrintable(file.errorString()));
        return false;
    }
    return file.write(bytes) == bytes.size();
}

/// Gives a file these bytes as a log does that grows: writes only those that differ, at once. So
/// whoever watches the file never finds it shorter than before and after, and never modified with
/// nothing new in it.
inline bool writeOver(QString const& path, QByteArray const& bytes)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadWrite | QIODevice::Unbuffered)) {
        qWarning("%s: %s", qPrintable(path), qPrintable(file.errorString()));
        return false;
    }
    const QByteArray before = file.readAll();
    const auto differing = std::mismatch(
        before.begin(), before.begin() + std::min(before.size(), bytes.size()), bytes.begin());
    const QByteArray changed = bytes.mid(static_cast<int>(differing.first - before.begin()));
    if (!file.seek(bytes.size() - changed.size()) || file.write(changed) != changed.size())
        return false;
    return before.size() <= bytes.size() || file.resize(bytes.size());
}

/// The bytes of a file; if it does not open, a text that no test expects.
inline QByteArray read(QString const& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return "(does not open: " + file.errorString().toLocal8Bit() + ')';
    return file.readAll();
}

/// The entries of a listing, sorted by name.
inline QStringList sorted(QStringList entries)
{
    std::sort(entries.begin(), entries.end(), [](QString const& left, QString const& right) {
        return left.section(": ", 0, 0) < right.section(": ", 0, 0);
    });
    return entries;
}

/// Everything below a folder, including hidden entries, sorted by name: "name: content" for a file,
/// "name/" for a folder. Bytes are shown as Latin-1.
inline QStringList listing(QString const& folder)
{
    QStringList entries;
    const QDir top(folder);
    QDirIterator walk(folder, QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                      QDirIterator::Subdirectories);
    while (walk.hasNext()) {
        const QString path = walk.next();
        const QString name = top.relativeFilePath(path);
        if (walk.fileInfo().isDir())
            entries.append(name + '/');
        else
            entries.append(name + ": " + QString::fromLatin1(read(path)));
    }
    return sorted(entries);
}

} // namespace TestFiles
