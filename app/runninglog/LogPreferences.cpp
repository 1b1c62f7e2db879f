// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogPreferences.h"

#include "app/runninglog/RunningLog.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "common/log/TorkLog.h"

#include <QDir>
#include <QFileInfo>
#include <QObject>
#include <QRegularExpression>

#include <algorithm>

namespace Velocor {

namespace {

QString Section()
{
    return QStringLiteral("config");
}

QString Switch(bool on)
{
    return on ? QStringLiteral("yes") : QStringLiteral("no");
}

} // namespace

QString LogPreferences::FileName()
{
    TorkLog const* log = TorkLog::logger();
    return log ? log->preferencesFileName() : QString();
}

LogPreferences LogPreferences::Read()
{
    LogPreferences preferences;
    if (TorkLog const* log = TorkLog::logger()) {
        preferences.enabled = log->enabled();
        preferences.elapsedTime = log->logElapsedTime();
        preferences.echo = log->logPipeToConsole();
        preferences.maxFiles = static_cast<int>(std::min(log->maxLogFiles(), 1000000U));
        preferences.filePrefix = log->filePrefix();
    }

    const SettingsDocument document = SettingsFileReader::Read(FileName());
    preferences.elapsedPrefix =
        document.Value(Section(), QStringLiteral("elapsedTimePrefix"), RunningLog::ElapsedPrefix());
    preferences.dateFormat =
        document.Value(Section(), QStringLiteral("dateTimeFormat"), RunningLog::DateFormat());
    preferences.filePrefix =
        document.Value(Section(), QStringLiteral("filePrefix"), preferences.filePrefix);
    return preferences;
}

QString LogPreferences::Apply() const
{
    TorkLog* log = TorkLog::logger();
    if (!log)
        return QObject::tr("There is no log.");

    const auto files = static_cast<unsigned>(std::max(1, maxFiles));
    const QString error = save(log->maxLogFileSize(), files);
    if (!error.isEmpty())
        return error;

    log->setEnable(enabled);
    log->setLogElapsedTime(elapsedTime);
    log->setLogPipeToConsole(echo);
    if (log->maxLogFiles() > 100)
        log->setMaxLogFiles(files); // the setter goes down to 100 first
    log->setMaxLogFiles(files);
    return QString();
}

// All of the log's settings, also the one that is not changed here: the file may be missing or may
// not parse.
QString LogPreferences::save(unsigned maxFileSize, unsigned files) const
{
    SettingsDocument document;
    document.rootName = QStringLiteral("LogSettings");
    const auto set = [&document](char const* key, QString const& value) {
        document.SetValue(Section(), QLatin1String(key), value);
    };
    set("maxLogFiles", QString::number(files));
    set("maxLogFileSize", QString::number(maxFileSize));
    set("loggingEnabled", Switch(enabled));
    set("logElapsedTime", Switch(elapsedTime));
    set("dateTimeFormat", dateFormat);
    set("elapsedTimePrefix", elapsedPrefix);
    set("filePrefix", filePrefix);
    set("logPipeToConsole", Switch(echo));

    const QString fileName = FileName();
    QString error;
    QDir().mkpath(QFileInfo(fileName).path());
    if (!SettingsFileWriter::Save(fileName, document, &error))
        return QObject::tr("The settings file %1 could not be saved: %2").arg(fileName, error);
    const bool arrived = SettingsFileReader::Read(fileName).HasSameValues(document);
    return arrived ? QString()
                   : QObject::tr("The settings file %1 does not hold all of the settings now.")
                         .arg(fileName);
}

bool LogPreferences::IsKept(QString const& text)
{
    static const QRegularExpression placeholder(QStringLiteral("%L?[0-9]"));
    const bool printable = std::all_of(text.begin(), text.end(), [](QChar c) {
        return c.unicode() >= 0x20 && c.unicode() < 0x7f;
    });
    return !text.isEmpty() && printable && !text.contains(QLatin1String("]]>")) &&
           !text.contains(placeholder);
}

bool LogPreferences::IsFilePrefix(QString const& text)
{
    return IsKept(text) && !text.contains(QLatin1Char('/')) && text != QLatin1String(".") &&
           text != QLatin1String("..");
}

} // namespace Velocor
