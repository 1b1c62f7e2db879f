// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Prints, as one JSON object, the results of the identity and directory operations for a program
// that runs from this one's location.
//
//     frame_probe root      the result of each root operation on an empty string
//     frame_probe identity  the names and properties after the startup step
//     frame_probe bare      both in a process that has no application object

#include "app/AppPaths.h"
#include "app/AppUtils.h"

#include <QCoreApplication>
#include <QJsonDocument>
#include <QJsonObject>
#include <QVariant>

#include <cstring>

#include <cstdio>

namespace {

using PathOperation = void (*)(QString&);

QString Result(PathOperation operation, QString path = QString())
{
    operation(path);
    return path;
}

QJsonObject Roots()
{
    QString pathsRoot;
    QString pathsData;
    AppPaths::SetupPaths(pathsRoot, pathsData);
    QString utilsRoot;
    QString utilsData;
    AppUtils::SetupPaths("Org", "Product", utilsRoot, utilsData);

    return {{"AppPaths::SetupRootPath", Result(AppPaths::SetupRootPath)},
            {"AppPaths::SetupProgramPath", Result(AppPaths::SetupProgramPath)},
            {"AppPaths::SetupPaths", pathsRoot},
            {"AppUtils::SetupRootPath", Result(AppUtils::SetupRootPath)},
            {"AppUtils::SetupProgramPath", Result(AppUtils::SetupProgramPath)},
            {"AppUtils::SetupPaths", utilsRoot}};
}

QJsonObject Names()
{
    return {{"organization", QCoreApplication::organizationName()},
            {"product", QCoreApplication::applicationName()}};
}

QJsonObject Identity()
{
    AppPaths::SetOrganizationAndProduct();
    QJsonObject result = Names();
    for (char const* name : {"RootPath", "DataPath", "DocPath"})
        result.insert(name, QCoreApplication::instance()->property(name).toString());
    return result;
}

QJsonObject Bare(int& argc, char** argv)
{
    QJsonObject roots = Roots();

    AppPaths::SetOrganizationAndProduct();
    const QJsonObject defaults = Names();
    AppPaths::SetOrganizationAndProduct("First Org", "First Product");
    const QJsonObject paths = Names();
    const QString data = Result(AppPaths::SetupDataRootPath, "overwritten");
    const QString documents = Result(AppPaths::SetupDocumentPath, "overwritten");
    AppUtils::SetOrganizationAndProduct("Second Org", "Second Product");
    const QJsonObject utils = Names();
    const QString utilsData = Result(AppUtils::SetupDataRootPath, "overwritten");
    const QString utilsDocuments = Result(AppUtils::SetupDocumentPath, "overwritten");

    const QCoreApplication later(argc, argv);
    return {{"roots", roots},
            {"defaults", defaults},
            {"paths", paths},
            {"data", data},
            {"documents", documents},
            {"utils", utils},
            {"utilsData", utilsData},
            {"utilsDocuments", utilsDocuments},
            {"laterProperties", later.dynamicPropertyNames().size()}};
}

} // namespace

int main(int argc, char** argv)
{
    QJsonObject result;
    if (argc > 1 && std::strcmp(argv[1], "bare") == 0) {
        result = Bare(argc, argv);
    } else {
        QCoreApplication application(argc, argv);
        const bool identity = application.arguments().value(1) == "identity";
        result = identity ? Identity() : Roots();
        if (!identity)
            result.insert("RootPath", application.property("RootPath").toString());
    }
    std::fputs(QJsonDocument(result).toJson(QJsonDocument::Compact).constData(), stdout);
    return 0;
}
