// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QTemporaryDir>

/// A folder for the files of one measurement, in memory where possible, so that the disk is not
/// measured. It is removed with the object. VELOCOR_BENCH_DIR overrides its location.
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

/// Reads a whole file; exits if it cannot be read.
QByteArray ReadAll(QString const& fileName);

/// Exits with a message unless `holds`. For conditions that a measurement depends on.
void Require(bool holds, QString const& message);
