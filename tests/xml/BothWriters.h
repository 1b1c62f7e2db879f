// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlFile.h"
#include "support/QtVersions.h"

#include "support/TestFiles.h"
#include "xml/WriterSteps.h"

#include <QTemporaryDir>
#include <QtTest>

/// Runs the same steps on both writers.
namespace BothWriters {

inline QString Repeated(QChar character, int count)
{
    return QString(count, character);
}

struct Outcome
{
    QVector<int> codes;
    QByteArray text;
};

inline Outcome WrittenByFile(Steps const& steps)
{
    Outcome outcome;
    const QTemporaryDir dir;
    const QString name = dir.filePath("out.xml");
    {
        TorkXmlFile writer(name);
        if (!writer.open(QIODevice::WriteOnly))
            qFatal("%s: %s", qPrintable(name), qPrintable(writer.errorString()));
        QtVersions::useUtf8(writer); // a new device, as at open, resets the codec to the locale's
        outcome.codes = Perform(writer, steps);
        writer.flush();
        writer.close();
    }
    outcome.text = TestFiles::read(name);
    return outcome;
}

} // namespace BothWriters
