// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogPreferences.h"

#include "app/language/LeftToRight.h"
#include "app/runninglog/RunningLog.h"
#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"
#include "common/log/TorkLog.h"

#include <QDir>
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

QString RootName()
{
    return QStringLiteral("LogSettings");
}

// The store rejects null strings; an empty one is found by the comparison after saving.
QString NotNull(QString const& text)
{
    return QLatin1String("") + text;
}

// The settings file as the log reads it, but without writing log entries. Only a regular file:
// opening a pipe would block, and a device may have no end.
class SettingsFile : public TorkConfigFile
{
public:
    explicit SettingsFile(QString const& path) : TorkConfigFile(path, RootName())
    {
        QFile file(path);
        m_isLoaded = QFileInfo(path).isFile() && file.open(QIODevice::ReadOnly) && LoadFrom(&file);
    }

    bool isLoaded() const { return m_isLoaded; }

    QString Value(char const* key, QString defaultValue)
    {
        QString value;
        ReadItem(Section(), QString::fromLatin1(key), defaultValue, value);
        return value;
    }

private:
    bool m_isLoaded = false;
};

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

    SettingsFile file(FileName());
    preferences.elapsedPrefix = file.Value("elapsedTimePrefix", RunningLog::ElapsedPrefix());
    preferences.dateFormat = file.Value("dateTimeFormat", RunningLog::DateFormat());
    preferences.filePrefix = file.Value("filePrefix", preferences.filePrefix);
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
        log->setMaxLogFiles(files); // the first call only lowers it to 100
    log->setMaxLogFiles(files);
    return QString();
}

// Writes all of the log's settings, even those not changed here: the file may be missing or
// malformed.
QString LogPreferences::save(unsigned maxFileSize, unsigned files) const
{
    const QString fileName = FileName();
    QDir().mkpath(QFileInfo(fileName).path());
    TorkConfigFile file(fileName, RootName());
    file.WriteItem(Section(), QStringLiteral("maxLogFiles"), files);
    file.WriteItem(Section(), QStringLiteral("maxLogFileSize"), maxFileSize);
    file.WriteBool(Section(), QStringLiteral("loggingEnabled"), enabled);
    file.WriteBool(Section(), QStringLiteral("logElapsedTime"), elapsedTime);
    file.WriteItem(Section(), QStringLiteral("dateTimeFormat"), NotNull(dateFormat));
    file.WriteItem(Section(), QStringLiteral("elapsedTimePrefix"), NotNull(elapsedPrefix));
    file.WriteItem(Section(), QStringLiteral("filePrefix"), NotNull(filePrefix));
    file.WriteBool(Section(), QStringLiteral("logPipeToConsole"), echo);
    if (!file.SaveAtomically())
        return file.m_lastError;

    const SettingsFile readBack(fileName);
    const bool arrived = readBack.isLoaded() && readBack.ToXml() == file.ToXml();
    return arrived ? QString()
                   : QObject::tr("The settings file %1 is incomplete after saving.")
                         .arg(LeftToRight(fileName));
}

// A control character would break log lines.
bool LogPreferences::IsStorable(QString const& text)
{
    const bool printable = std::all_of(text.begin(), text.end(), [](QChar c) {
        return c.unicode() >= 0x20 && c.unicode() != 0x7f;
    });
    return printable && TorkConfigText::IsPlainValue(text);
}

bool LogPreferences::IsValidFilePrefix(QString const& text)
{
    return IsStorable(text) && !text.contains(QLatin1Char('/')) && text != QLatin1String(".") &&
           text != QLatin1String("..");
}

} // namespace Velocor
