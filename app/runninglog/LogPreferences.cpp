// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogPreferences.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "common/log/TorkLog.h"

#include <QObject>
#include <QRegularExpression>

#include <algorithm>

namespace Velocor {

namespace {

QString Section()
{
    return QStringLiteral("config");
}

} // namespace

QString LogPreferences::FileName()
{
    TorkLog const* log = TorkLog::logger();
    if (!log)
        return QString();
    QString folder = log->path();
    if (!folder.isEmpty() && !folder.endsWith(QLatin1Char('/')))
        folder += QLatin1Char('/');
    return folder + QLatin1String("logsettings.cfg");
}

LogPreferences LogPreferences::Read()
{
    const SettingsDocument document = SettingsFileReader::Read(FileName());
    LogPreferences preferences;
    preferences.elapsedPrefix =
        document.Value(Section(), QStringLiteral("elapsedTimePrefix"), QStringLiteral("dT:"));
    preferences.dateFormat = document.Value(Section(), QStringLiteral("dateTimeFormat"),
                                            QStringLiteral("yyyy-MM-dd hh:mm:ss.z"));
    preferences.filePrefix =
        document.Value(Section(), QStringLiteral("filePrefix"), QStringLiteral("logdata"));
    if (TorkLog const* log = TorkLog::logger()) {
        preferences.enabled = log->enabled();
        preferences.elapsedTime = log->logElapsedTime();
        preferences.echo = log->logPipeToConsole();
        preferences.maxFiles = static_cast<int>(std::min(log->maxLogFiles(), 1000000U));
    }
    return preferences;
}

QString LogPreferences::Apply() const
{
    TorkLog* log = TorkLog::logger();
    if (!log)
        return QObject::tr("There is no log.");
    log->setEnable(enabled);
    log->setLogElapsedTime(elapsedTime);
    log->setLogPipeToConsole(echo);
    const auto files = static_cast<unsigned>(std::max(1, maxFiles));
    if (log->maxLogFiles() > 100)
        log->setMaxLogFiles(files); // the setter goes down to 100 first
    log->setMaxLogFiles(files);

    log->savePreferences();
    SettingsDocument document = SettingsFileReader::Read(FileName());
    if (!document.isParsed)
        return QObject::tr("The settings file %1 could not be saved.").arg(FileName());
    document.SetValue(Section(), QStringLiteral("elapsedTimePrefix"), elapsedPrefix);
    document.SetValue(Section(), QStringLiteral("dateTimeFormat"), dateFormat);
    document.SetValue(Section(), QStringLiteral("filePrefix"), filePrefix);

    QString error;
    if (!SettingsFileWriter::Save(FileName(), document, &error))
        return error;
    const bool arrived = SettingsFileReader::Read(FileName()).HasSameValues(document);
    return arrived ? QString()
                   : QObject::tr("The settings file %1 does not hold all of the "
                                 "settings now.")
                         .arg(FileName());
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
