// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogPreferences.h"

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"
#include "common/log/TorkLog.h"

#include <QFile>
#include <QFileInfo>
#include <QObject>

#include <algorithm>

namespace Velocor {

namespace {

QString Section()
{
    return QStringLiteral("config");
}

// The settings file as the log reads it, but without the entries that this would make. Opening a
// pipe would wait, and a device may have no end.
class SettingsFile : public TorkConfigFile
{
public:
    explicit SettingsFile(QString const& path) : TorkConfigFile(path, QStringLiteral("LogSettings"))
    {
        QFile file(path);
        m_isLoaded = QFileInfo(path).isFile() && file.open(QIODevice::ReadOnly) && LoadFrom(&file);
    }

    bool isLoaded() const { return m_isLoaded; }

    QString Value(char const* key, char const* byDefault)
    {
        QString none = QString::fromLatin1(byDefault);
        QString value;
        ReadItem(Section(), QString::fromLatin1(key), none, value);
        return value;
    }

    void SetValue(char const* key, QString const& value)
    {
        // The store refuses a null text; an empty one shows in the comparison after saving.
        WriteItem(Section(), QString::fromLatin1(key),
                  value.isNull() ? QString(QLatin1String("")) : value);
    }

private:
    bool m_isLoaded = false;
};

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
    SettingsFile file(FileName());
    LogPreferences preferences;
    preferences.elapsedPrefix = file.Value("elapsedTimePrefix", "dT:");
    preferences.dateFormat = file.Value("dateTimeFormat", "yyyy-MM-dd hh:mm:ss.z");
    preferences.filePrefix = file.Value("filePrefix", "logdata");
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
    SettingsFile file(FileName());
    if (!file.isLoaded())
        return QObject::tr("The settings file %1 could not be saved.").arg(FileName());
    file.SetValue("elapsedTimePrefix", elapsedPrefix);
    file.SetValue("dateTimeFormat", dateFormat);
    file.SetValue("filePrefix", filePrefix);
    if (!file.SaveAtomically())
        return file.m_lastError;

    const SettingsFile readBack(FileName());
    const bool arrived = readBack.isLoaded() && readBack.ToXml() == file.ToXml();
    return arrived ? QString()
                   : QObject::tr("The settings file %1 does not hold all of the "
                                 "settings now.")
                         .arg(FileName());
}

// A control character would break the lines of the log.
bool LogPreferences::IsKept(QString const& text)
{
    const bool printable = std::all_of(text.begin(), text.end(), [](QChar c) {
        return c.unicode() >= 0x20 && c.unicode() != 0x7f;
    });
    return printable && TorkConfigText::IsPlainValue(text);
}

bool LogPreferences::IsFilePrefix(QString const& text)
{
    return IsKept(text) && !text.contains(QLatin1Char('/')) && text != QLatin1String(".") &&
           text != QLatin1String("..");
}

} // namespace Velocor
