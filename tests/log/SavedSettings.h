// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/log/TorkLog.h"

#include <QtTest>

#include <algorithm>

/// The text of saved log settings, and what a log reports about its own.
namespace SavedSettings {

const char stampOfNow[] = "2021-03-04 05:06:07.123";

inline QByteArray stamped(QByteArray const& text)
{
    return QByteArray(stampOfNow) + ' ' + text;
}

/// The names that TestFiles::listing() shows.
inline QStringList names(QString const& folder)
{
    QStringList result = TestFiles::listing(folder);
    for (QString& entry : result) {
        const int colon = entry.indexOf(": ");
        if (colon != -1)
            entry.truncate(colon);
    }
    return result;
}

/// A settings file with its items in alphabetical order, as their real order is unspecified.
inline QByteArray inOrder(QByteArray const& text)
{
    const QByteArray start = "<LogSettings>\n<config>\n";
    const QByteArray end = "</config>\n</LogSettings>\n";
    if (!text.startsWith(start) || !text.endsWith(end))
        return text;

    QByteArray items = text.mid(start.size(), text.size() - start.size() - end.size());
    if (!items.endsWith('\n'))
        return text;
    items.chop(1);
    QList<QByteArray> lines = items.split('\n');
    std::sort(lines.begin(), lines.end());
    return start + lines.join('\n') + '\n' + end;
}

inline QByteArray saved(const char* maxLogFiles, const char* maxLogFileSize, const char* enabled,
                        const char* elapsed, QByteArray const& format,
                        QByteArray const& elapsedPrefix, QByteArray const& prefix, const char* pipe)
{
    return QByteArray("<LogSettings>\n<config>\n"
                      "<dateTimeFormat>") +
           format + "</dateTimeFormat>\n<elapsedTimePrefix>" + elapsedPrefix +
           "</elapsedTimePrefix>\n<filePrefix>" + prefix + "</filePrefix>\n<logElapsedTime>" +
           elapsed + "</logElapsedTime>\n<logPipeToConsole>" + pipe +
           "</logPipeToConsole>\n<loggingEnabled>" + enabled +
           "</loggingEnabled>\n<maxLogFileSize>" + maxLogFileSize +
           "</maxLogFileSize>\n<maxLogFiles>" + maxLogFiles +
           "</maxLogFiles>\n</config>\n</LogSettings>\n";
}

inline QByteArray savedByStart(const char* enabled, QByteArray const& prefix)
{
    return saved("10", "1000000", enabled, "no", "yyyy-MM-dd hh:mm:ss.z", "dT:", prefix, "no");
}

inline QByteArray config(QByteArray const& items)
{
    return "<LogSettings>\n<config>\n" + items + "</config>\n</LogSettings>\n";
}

/// The settings as the getters and the file name report them.
inline QString described(TorkLog& log)
{
    const auto onOff = [](bool on) {
        return QString(on ? "on" : "off");
    };
    return QStringList({QString::number(log.maxLogFiles()), QString::number(log.maxLogFileSize()),
                        onOff(log.enabled()), onOff(log.logElapsedTime()),
                        onOff(log.logPipeToConsole()), log.fileSpec(false)})
        .join(' ');
}

const char loadDefaults[] = "10 1000000 on off off logdata.log";

} // namespace SavedSettings
