// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The settings file of the log, the life of the one log, and the toolkit's messages.

#include "common/log/TorkLog.h"

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLogLock_p.h"

#include <QDir>
#include <QStandardPaths>

#include <mutex>
#include <shared_mutex>
#include <utility>

namespace {

// Held for reading while the message handler uses the log, so that shutdown() cannot delete the
// log under a message of another thread.
std::shared_mutex s_lifetime;

QString Section()
{
    return QStringLiteral("config");
}

int SeverityOf(QtMsgType type)
{
    switch (type) {
    case QtWarningMsg:
        return TorkLog::Warning;
    case QtCriticalMsg:
        return TorkLog::Error;
    case QtFatalMsg:
        return TorkLog::Fatal;
    default:
        return TorkLog::Trace;
    }
}

bool ReadSwitch(TorkConfigFile& settings, QString const& key, bool defaultValue)
{
    bool value = defaultValue;
    settings.ReadBool(Section(), key, defaultValue, value);
    return value;
}

// A number that does not convert leaves the one in force.
quint32 ReadNumber(TorkConfigFile& settings, QString const& key, quint32 defaultValue,
                   quint32 inForce)
{
    unsigned int value = inForce;
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

void TorkLog_MessageHandler(QtMsgType type, QMessageLogContext const& context,
                            QString const& message)
{
    if (TorkLogLock::isHeldHere()) {
        TorkLog_DefaultMessageHandler()(type, context, message);
        return;
    }

    std::shared_lock<std::shared_mutex> lock(s_lifetime);
    if (TorkLog* log = TorkLog::m_gLog)
        log->write(SeverityOf(type), message);
}

TorkLog* TorkLog::initialize(QString const& path, QString const& prefix,
                             QString const& preferencesFileName, bool enable)
{
    {
        std::unique_lock<std::shared_mutex> lock(s_lifetime);
        if (m_gLog)
            return m_gLog;
        m_gLog = new TorkLog(path);
    }

    const QString dataLocation = QStandardPaths::writableLocation(QStandardPaths::DataLocation);
    m_gLog->setOutputPath(path.isEmpty() ? dataLocation + QLatin1String("/logs/") : path);

    qInstallMessageHandler(TorkLog_MessageHandler);

    m_gLog->setFilePrefix(prefix); // before other threads' messages open the file
    m_gLog->setEnable(enable);
    m_gLog->setPreferencesFileName(preferencesFileName);
    if (m_gLog->havePreferencesFile())
        m_gLog->loadPreferences();
    else
        m_gLog->savePreferences();
    return m_gLog;
}

TorkLog* TorkLog::initialize(QString const& prefix)
{
    const QString byDefault = QLatin1String("");
    return initialize(byDefault, prefix, byDefault, true);
}

void TorkLog::shutdown()
{
    TorkLog* log = nullptr;
    {
        std::unique_lock<std::shared_mutex> lock(s_lifetime);
        std::swap(log, m_gLog);
    }
    delete log;
}

bool TorkLog::setPreferencesFileName(QString const& name)
{
    QString chosen = name.isEmpty() ? QStringLiteral("logsettings.cfg") : name;
    if (!chosen.contains(QLatin1Char('/'))) {
        const QString directory = path();
        const bool endsInSlash = directory.lastIndexOf(QLatin1Char('/')) == directory.length() - 1;
        const QString separator = endsInSlash ? QString() : QStringLiteral("/");
        chosen = directory + separator + chosen;
    }
    TorkLogLock lock(m_mutex);
    m_preferencesFileName = std::move(chosen);
    return true;
}

QString TorkLog::preferencesFileName() const
{
    TorkLogLock lock(m_mutex);
    return m_preferencesFileName;
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

    // The values are read whether or not the file parsed: what is missing takes its default.
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
    // Only copied under the lock: the store traces what it does into this log.
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

// On the first start the settings are saved before the first entry makes the log directory.
void TorkLog::makeDirectoryOfPreferences(QString const& fileName) const
{
    const QString directory = QDir::cleanPath(QFileInfo(fileName).absolutePath());
    const QString logs = path();
    const bool liesInLogDirectory = directory == QDir::cleanPath(QDir(logs).absolutePath());
    if (liesInLogDirectory && !QDir(directory).exists())
        makeLogDirectory(logs);
}
