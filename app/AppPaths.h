// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// The identity and the directories of the program, published on the application object.
///
/// Every directory ends in "/". The properties "RootPath" (installation), "DataPath" (the user's
/// data for this program) and "DocPath" (the user's documents) hold them as strings. Nothing is
/// created or checked on disk. Main thread, at startup; without an application object nothing is
/// published. AppUtils computes the same directories without publishing them.
///
///     AppPaths::SetOrganizationAndProduct();
///     QString data = QCoreApplication::instance()->property("DataPath").toString();
class AppPaths
{
public:
    /// Sets organization and product from the launch data file "appdata.cfg" in the installation
    /// root, with "yourorganization" and "yourproduct" as defaults for what the file does not set,
    /// and publishes the three directories. Cannot fail.
    static void SetOrganizationAndProduct();

    /// Sets the given names, which the data directory depends on, and publishes the directories.
    static void SetOrganizationAndProduct(QString const& organization, QString const& product);

    /// The product name that was last set. If it was set to an empty string this is empty, while
    /// the application object falls back to the name of the executable.
    static QString const& ProductName();

    /// The installation root: the folder that holds the application bundle, or else the parent of
    /// the executable's folder. Published as "RootPath".
    ///
    /// @param path  receives the directory; if it is not empty, nothing is set or published
    static void SetupRootPath(QString& path);

    /// The installation root, always computed and never published.
    static void SetupProgramPath(QString& path);

    /// The user's data directory for this program. Published as "DataPath".
    static void SetupDataRootPath(QString& path);

    /// The user's documents directory. Published as "DocPath".
    static void SetupDocumentPath(QString& path);

    /// SetupRootPath() on `root`, then SetupDataRootPath() on `data`.
    static void SetupPaths(QString& root, QString& data);
};
