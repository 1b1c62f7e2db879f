// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QByteArray>
#include <QRegularExpression>
#include <QString>
#include <QStringList>

#include <utility>

/// The contents of a configuration file object, formatted so that a test compares them in one go.
namespace ConfigContents {

/// Every name that loading `document` could possibly give a section.
inline QStringList possibleSections(QByteArray const& document)
{
    QStringList names{QLatin1String(""), QStringLiteral("UnknownSection"),
                      QStringLiteral("VelocorSettings"),
                      QString(QChar(QChar::ReplacementCharacter))};
    static const QRegularExpression word(QStringLiteral("[^\\s<>/&;=\"']+"));
    auto words = word.globalMatch(QString::fromUtf8(document));
    while (words.hasNext()) {
        const QString name = words.next().captured();
        names << name << name.section(QLatin1Char(':'), -1);
    }
    return names;
}

/// The sections among `candidates` that the file holds, sorted: "One{key=[value];more=[]}Two{}".
inline QString of(TorkConfigFile& file, QStringList candidates)
{
    candidates.removeDuplicates();
    candidates.sort();
    QString contents;
    for (QString const& name : std::as_const(candidates)) {
        TorkConfigFileSection* section = file.FindSection(name);
        if (!section)
            continue;
        QStringList items;
        const QStringList keys = section->keyList();
        for (QString const& key : keys) {
            QString value = QStringLiteral("(not found)");
            section->FindValue(key, value);
            items.append(key + QStringLiteral("=[") + value + QLatin1Char(']'));
        }
        items.sort();
        contents += name + QLatin1Char('{') + items.join(QLatin1Char(';')) + QLatin1Char('}');
    }
    return contents;
}

} // namespace ConfigContents
