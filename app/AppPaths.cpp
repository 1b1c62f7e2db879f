// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"

#include "app/AppUtils.h"
#include "app/EmptyText_p.h"
#include "app/LaunchOptionParser.h"

#include <QCoreApplication>
#include <QFile>
#include <QVariant>

namespace {

void Publish(char const* property, QString const& path)
{
    if (QCoreApplication* application = QCoreApplication::instance())
        application->setProperty(property, path);
}

QString& StoredProductName()
{
    static QString name = Velocor::EmptyText();
    return name;
}

void TakeValue(LaunchOptionParser const& parser, QString const& key, QString& value)
{
    LaunchOption const* option = parser.FindOption(key);
    if (option && option->isSet) // also if the value is empty
        value = option->value;
}

} // namespace

void AppPaths::SetOrganizationAndProduct()
{
    const QString organizationKey = QStringLiteral("organization");
    const QString productKey = QStringLiteral("product");
    QString organization = QStringLiteral("yourorganization");
    QString product = QStringLiteral("yourproduct");

    QString root;
    SetupRootPath(root);
    const QString dataFile = root + QLatin1String("appdata.cfg");

    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption(organizationKey, organizationKey, QStringLiteral("o"), 1,
                                      QStringLiteral("The product organization name")));
    parser.AddOption(new LaunchOption(productKey, productKey, QStringLiteral("p"), 1,
                                      QStringLiteral("The product name")));
    if (QFile::exists(dataFile) && parser.ReadDataFile(dataFile)) {
        TakeValue(parser, organizationKey, organization);
        TakeValue(parser, productKey, product);
    }

    SetOrganizationAndProduct(organization, product);
}

void AppPaths::SetOrganizationAndProduct(QString const& organization, QString const& product)
{
    StoredProductName() = product;
    AppUtils::SetOrganizationAndProduct(organization, product);

    QString root, data, documents;
    SetupRootPath(root);
    SetupDataRootPath(data);
    SetupDocumentPath(documents);
}

QString const& AppPaths::ProductName()
{
    return StoredProductName();
}

void AppPaths::SetupRootPath(QString& path)
{
    if (!path.isEmpty())
        return;

    AppUtils::SetupRootPath(path);
    Publish("RootPath", path);
}

void AppPaths::SetupProgramPath(QString& path)
{
    path.clear();
    AppUtils::SetupRootPath(path);
}

void AppPaths::SetupDataRootPath(QString& path)
{
    AppUtils::SetupDataRootPath(path);
    Publish("DataPath", path);
}

void AppPaths::SetupDocumentPath(QString& path)
{
    AppUtils::SetupDocumentPath(path);
    Publish("DocPath", path);
}

void AppPaths::SetupPaths(QString& root, QString& data)
{
    SetupRootPath(root);
    SetupDataRootPath(data);
}
