// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/LogFormats.h"

#include <QFile>
#include <QFileInfo>
#include <QXmlStreamReader>

namespace Velocor {

namespace {

constexpr qint64 MaximumSize = 1 << 20;

} // namespace

// With Qt Core's own reader: the classes that write the file need Qt Widgets.
LogLineParser LogFormats::ParserFor(QString const& logFile)
{
    QStringList dateFormats;
    QStringList elapsedPrefixes;
    QFile file(QFileInfo(logFile).path() + QLatin1String("/logsettings.cfg"));
    const bool isPlain = QFileInfo(file.fileName()).isFile() && file.size() <= MaximumSize;
    if (isPlain && file.open(QIODevice::ReadOnly)) {
        QXmlStreamReader xml(&file);
        while (!xml.atEnd()) {
            if (xml.readNext() != QXmlStreamReader::StartElement)
                continue;
            if (xml.name() == QLatin1String("dateTimeFormat"))
                dateFormats.append(xml.readElementText());
            else if (xml.name() == QLatin1String("elapsedTimePrefix"))
                elapsedPrefixes.append(xml.readElementText());
        }
    }
    return LogLineParser(dateFormats, elapsedPrefixes);
}

} // namespace Velocor
