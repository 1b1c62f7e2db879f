// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QProcessEnvironment>
#include <QString>
#include <QStringList>

/// Copies a program as @p folder / @p name, so that it runs from there. False if that fails.
bool CopyProgram(QString const& program, QString const& folder, QString const& name);

/// The environment of this process with home, data, configuration and runtime folders below
/// @p folder (home, data, config, run), which are made.
QProcessEnvironment PrivateEnvironment(QString const& folder);

/// What a program left behind that ran to its end.
struct ProgramResult
{
    bool finished = false; ///< ended by itself, within the time limit, without a crash
    int exitCode = -1;
    QByteArray output;
    QByteArray errors;
};

/// Runs a program to its end.
ProgramResult RunProgram(QString const& program, QStringList const& arguments,
                         QProcessEnvironment const& environment);
