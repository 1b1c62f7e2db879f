// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The settings file of the log.

#include "common/log/TorkLog.h"

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLogLock_p.h"

#include <QDir>

#include <utility>

namespace {

QString Section()
{
    return QStringLiteral("config");
}

bool ReadSwitch(TorkConfigFile& settings, QString const& key, bool defaultValue)
{
    bool value = defaultValue;
    settings.ReadBool(Section(), key, defaultValue, value);
    return value;
}

// A number that does not convert leaves the current one unchanged.
quint32 ReadNumber(TorkConfigFile& settings, QString const& key, quint32 defaultValue,
                   quint32 current)
{
    unsigned int value = current;
    settings.ReadUint(Section(), key, defaultValue, value);
    return value;
}

QString ReadText(TorkConfigFile& settings, QString const& key, QString defaultValue)
{
    QString value;
    settings.ReadItem(Section(), key, defaultValue, value);
    return value;
}

} // namespace

bool TorkLog::setPreferencesFileName(QString const& name)
{
    QString chosen = name.isEmpty() ? QStringLiteral("logsettings.cfg") : name;
    TorkLogLock lock(m_mutex);
    if (!chosen.contains(QLatin1Char('/')))
        chosen = inLogDirectory(chosen);
    m_preferencesFileName = std::move(chosen);
    return true;
}

QString TorkLog::preferencesFileName() const
{
    TorkLogLock lock(m_mutex);
    return m_preferencesFileName;
}

QString TorkLog::dateTimeFormat() const
{
    TorkLogLock lock(m_mutex);
    return m_dateTimeFormat;
}

QString TorkLog::elapsedTimePrefix() const
{
    TorkLogLock lock(m_mutex);
    return m_elapsedTimePrefix;
}

QString TorkLog::filePrefix() const
{
    TorkLogLock lock(m_mutex);
    return m_filePrefix;
}

bool TorkLog::havePreferencesFile() const
{
    return QFile::exists(preferencesFileName());
}

bool TorkLog::loadPreferences()
{
    return processPreferences(PreferencesLoad);
}

bool TorkLog::savePreferences()
{
    return processPreferences(PreferencesSave);
}

bool TorkLog::processPreferences(PreferencesOperation operation)
{
    switch (operation) {
    case PreferencesLoad:
        return load();
    case PreferencesSave:
        return save();
    }
    return false;
}

bool TorkLog::load()
{
    const QString fileName = preferencesFileName();
    if (!QFile::exists(fileName))
        return false;

    // The values are read even if the file did not parse: what is missing gets its default.
    TorkConfigFile settings(fileName, QStringLiteral("LogSettings"));
    const bool loaded = settings.Load();

    m_maxLogFiles = ReadNumber(settings, m_maxLogFilesKey, 10, m_maxLogFiles);
    m_maxLogFileSize = ReadNumber(settings, m_maxLogFileSizeKey, 1000000, m_maxLogFileSize);
    m_enabled = ReadSwitch(settings, m_enabledKey, true);
    m_logElapsedTime = ReadSwitch(settings, m_logElapsedTimeKey, false);
    m_logPipeToConsole = ReadSwitch(settings, m_logPipeToConsoleKey, false);

    TorkLogLock lock(m_mutex);
    setDateTimeFormat(
        ReadText(settings, m_dateTimeFormatKey, QStringLiteral("yyyy-MM-dd hh:mm:ss.z")));
    m_elapsedTimePrefix = ReadText(settings, m_elapsedTimePrefixKey, QStringLiteral("dT:"));
    m_filePrefix = ReadText(settings, m_filePrefixKey, QStringLiteral("logdata"));
    return loaded;
}

bool TorkLog::save()
{
    // Only copied under the lock, as TorkConfigFile traces to this log.
    QString fileName;
    QString dateTimeFormat;
    QString elapsedTimePrefix;
    QString filePrefix;
    {
        TorkLogLock lock(m_mutex);
        fileName = m_preferencesFileName;
        dateTimeFormat = m_dateTimeFormat;
        elapsedTimePrefix = m_elapsedTimePrefix;
        filePrefix = m_filePrefix;
    }
    makeDirectoryOfPreferences(fileName);

    TorkConfigFile settings(fileName, QStringLiteral("LogSettings"));
    settings.WriteItem(Section(), m_maxLogFilesKey, m_maxLogFiles.load());
    settings.WriteItem(Section(), m_maxLogFileSizeKey, m_maxLogFileSize.load());
    settings.WriteBool(Section(), m_enabledKey, m_enabled);
    settings.WriteBool(Section(), m_logElapsedTimeKey, m_logElapsedTime);
    settings.WriteItem(Section(), m_dateTimeFormatKey, dateTimeFormat);
    settings.WriteItem(Section(), m_elapsedTimePrefixKey, elapsedTimePrefix);
    settings.WriteItem(Section(), m_filePrefixKey, filePrefix);
    settings.WriteBool(Section(), m_logPipeToConsoleKey, m_logPipeToConsole);
    return settings.Save();
}

// On the first start, the settings are saved before the first entry creates the log directory.
void TorkLog::makeDirectoryOfPreferences(QString const& fileName) const
{
    const QString directory = QDir::cleanPath(QFileInfo(fileName).absolutePath());
    const QString logs = path();
    const bool isInLogDirectory = directory == QDir::cleanPath(QDir(logs).absolutePath());
    if (isInLogDirectory && !QDir(directory).exists())
        makeLogDirectory(logs);
}
