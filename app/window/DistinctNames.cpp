// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/DistinctNames.h"

#include <QMap>

#include <algorithm>

namespace Velocor {

namespace {

QString Name(QString const& path)
{
    return path.section(QLatin1Char('/'), -1);
}

// The last `depth` folders of a path.
QString Folders(QString const& path, int depth)
{
    const QString folders = path.section(QLatin1Char('/'), -1 - depth, -2);
    return folders.isEmpty() ? QStringLiteral("/") : folders;
}

bool AreDistinct(QStringList texts)
{
    std::sort(texts.begin(), texts.end());
    return std::adjacent_find(texts.begin(), texts.end()) == texts.end();
}

// For paths of one name.
QStringList ShortestFolders(QStringList const& paths)
{
    int deepest = 0;
    for (QString const& path : paths)
        deepest = std::max<int>(deepest, path.count(QLatin1Char('/')));
    QStringList folders;
    for (int depth = 1; depth <= deepest; ++depth) {
        folders.clear();
        for (QString const& path : paths)
            folders.append(Folders(path, depth));
        if (AreDistinct(folders))
            break;
    }
    return folders;
}

} // namespace

QStringList DistinctNames(QStringList const& paths)
{
    QMap<QString, QStringList> groups;
    for (QString const& path : paths)
        groups[Name(path)].append(path);

    QStringList names;
    for (QString const& path : paths) {
        const QString name = Name(path);
        QStringList const& group = groups[name];
        if (group.size() == 1)
            names.append(name);
        else
            names.append(name + QStringLiteral(" \u2013 ") +
                         ShortestFolders(group).at(group.indexOf(path)));
    }
    return names;
}

} // namespace Velocor
