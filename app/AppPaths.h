// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// The identity and the directories of the program, published on the application object.
///
/// Every directory ends in "/". The properties "RootPath" (installation), "DataPath" (the user's
/// data of this program) and "DocPath" (the user's documents) hold them as strings. Nothing is
/// made on disk or checked. Main thread, at start-up; without an application object nothing is
/// published. AppUtils computes the same directories without publishing them.
///
///     AppPaths::SetOrganizationAndProduct();
///     QString data = QCoreApplication::instance()->property("DataPath").toString();
class AppPaths
{
public:
    /// Sets organisation and product from the launch data file "appdata.cfg" in the installation
    /// root, or to "yourorganization" and "yourproduct" where the file sets none or is unusable,
    /// and publishes the three directories. Cannot fail.
    static void SetOrganizationAndProduct();

    /// Sets the given names, which the data directory depends on, and publishes the directories.
    static void SetOrganizationAndProduct(QString const& organization, QString const& product);

    /// The product name that was set last; empty if it was set empty, where the application object
    /// answers with the executable's name instead.
    static QString const& ProductName();

    /// The installation root: the folder that holds the application bundle, or else the parent of
    /// the executable's folder. Published as "RootPath".
    ///
    /// @param path  receives the directory; if it is not empty, nothing is set or published
    static void SetupRootPath(QString& path);

    /// The installation root, always computed and never published.
    static void SetupProgramPath(QString& path);

    /// The user's data directory of this program. Published as "DataPath".
    static void SetupDataRootPath(QString& path);

    /// The user's documents directory. Published as "DocPath".
    static void SetupDocumentPath(QString& path);

    /// SetupRootPath() on `root`, then SetupDataRootPath() on `data`.
    static void SetupPaths(QString& root, QString& data);
};
