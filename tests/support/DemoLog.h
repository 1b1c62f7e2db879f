// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QTime>

/// Log files for tests and screenshots of the window.
namespace DemoLog {

/// One entry, stamped on 3 March 2025 or the day before.
inline QByteArray entry(QString const& time, char const* severity, QString const& message,
                        bool dayBefore = false)
{
    const QString day = dayBefore ? "2025-03-02" : "2025-03-03";
    return QString("%1 %2 %3 %4\n").arg(day, time, severity, message).toLatin1();
}

/// The text that a run has written over that of the previous run, as the log does it: the newest
/// run first, followed by the rest of the older one, cut where the newest ends.
inline QByteArray writtenOver(QByteArray const& older, QByteArray const& newer)
{
    return newer + older.mid(newer.size());
}

/// `count` entries of a run, one a second, with warnings and errors among them.
inline QByteArray run(int count, QTime time, char const* what, bool dayBefore = false)
{
    QByteArray text;
    for (int i = 0; i < count; ++i) {
        char const* severity = i % 7 == 5 ? "Warning" : i % 11 == 9 ? "Error" : "Trace";
        text += entry(time.addSecs(i).toString("hh:mm:ss.zzz"), severity,
                      QString("%1 %2").arg(what).arg(i), dayBefore);
    }
    return text;
}

/// What a busy program may have written in its newest run and the previous one.
inline QByteArray lifelike()
{
    QByteArray older;
    older += entry("17:20:03.112", "Trace", "Loading configuration from logsettings.cfg", true);
    older += entry("17:20:03.114", "Trace", "app.exec() starting", true);
    for (int i = 0; i < 12; ++i)
        older += entry(QString("17:21:%1.504").arg(10 + i), "Trace",
                       QString("\"Page\" %1 laid out in 14 ms").arg(i + 1), true);
    older += entry("17:24:40.006", "Notification", "Index saved, 1204 documents", true);
    older += entry("17:24:51.770", "Warning", "The disk holds less than 5 % free space", true);
    older += entry("17:25:02.318", "Trace", "Closing the window", true);

    QByteArray newer;
    newer += entry("09:02:11.031", "Trace", "Loading configuration from logsettings.cfg");
    newer += entry("09:02:11.034", "Trace", "app.exec() starting");
    newer += entry("09:02:11.210", "Notification", "Index opened, 1204 documents");
    newer +=
        entry("09:02:15.842", "Warning", "\"fonts.cfg\" has no section \"Titles\", using defaults");
    newer += entry("09:02:19.077", "Trace", "Importing \"minutes-2025-02.xml\"");
    newer +=
        entry("09:02:19.090", "Error",
              "TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\ntag mismatch\\nPublic ID: , "
              "System ID: \\nLine: 204, Column: 17\"");
    newer += entry("09:02:24.611", "Trace", "Imported 11 of 12 documents");
    newer += entry("09:03:01.400", "Fatal", "The index is damaged and will be rebuilt");
    newer += entry("09:03:07.925", "Trace", "Rebuilding the index");
    newer += entry("09:03:09.113", "Notification", "Index saved, 1215 documents");
    return writtenOver(older, newer);
}

} // namespace DemoLog
