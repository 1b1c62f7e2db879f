// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOptionParser.h"

QString ProductName(QString const& path)
{
    QString name = "yourproduct";
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "The product name"));
    if (parser.ReadDataFile(path) && parser.FindOption("product")->isSet)
        name = parser.FindOption("product")->value;
    return name;
}
