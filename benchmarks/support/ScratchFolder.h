// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QTemporaryDir>

/// A folder for the files of one measurement, on memory-backed disk where there is one, so that
/// no disk is measured. It goes away with the object. VELOCOR_BENCH_DIR puts it elsewhere.
class ScratchFolder
{
public:
    ScratchFolder();

    /// The path of a file in the folder.
    QString file(QString const& name) const;

    /// The folder's path, ending in "/".
    QString path() const { return file(QString()); }

private:
    QTemporaryDir m_folder;
};

/// Reads a whole file; ends the program where it cannot be read.
QByteArray ReadAll(QString const& fileName);

/// Ends the program with a message unless `holds`. For what must be true of a measurement.
void Require(bool holds, QString const& message);
