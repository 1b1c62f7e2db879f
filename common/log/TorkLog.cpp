// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The settings record of the log.

#include "common/log/TorkLog.h"

#include "common/log/TorkEmptyText_p.h"
#include "common/log/TorkLogLock_p.h"
#include "common/log/TorkLogStamp_p.h"
#include "common/log/TorkLogWriter_p.h"

TorkLog::TorkLog() : TorkLog(TorkEmptyText()) {}

TorkLog::TorkLog(QString const& path)
    : QObject(nullptr), m_writer(std::make_unique<TorkLogWriter>()),
      m_lastEntryTime(TorkLogStamp::TimeOfDay(QDateTime::currentMSecsSinceEpoch()))
{
    clear();
    m_path = path;
    // Called here, where usually no other thread runs yet: to find Qt's handler, it must replace
    // the installed one for a moment.
    TorkLog_DefaultMessageHandler();
}

TorkLog::~TorkLog()
{
    m_writer->close();
}

void TorkLog::clear()
{
    const QString empty = TorkEmptyText();
    TorkLogLock lock(m_mutex);

    m_path = empty;
    m_maxLogFiles = 10;
    m_maxLogFilesKey = QStringLiteral("maxLogFiles");
    m_maxLogFileSize = 1000000;
    m_maxLogFileSizeKey = QStringLiteral("maxLogFileSize");
    m_filePrefix = empty;
    m_filePrefixKey = QStringLiteral("filePrefix");
    m_fileExtension = QStringLiteral("log");
    m_errorString = empty;
    m_fileSpec = empty;
    m_logFileName = empty;
    m_spare = empty;
    m_preferencesFileName = empty;
    m_enabled = false;
    m_enabledKey = QStringLiteral("loggingEnabled");
    m_outputToConsole = false;
    m_outputToConsoleKey = QStringLiteral("outputToConsole");
    setDateTimeFormat(QStringLiteral("yyyy-MM-dd hh:mm:ss.z"));
    m_dateTimeFormatKey = QStringLiteral("dateTimeFormat");
    m_logElapsedTime = false;
    m_logElapsedTimeKey = QStringLiteral("logElapsedTime");
    m_elapsedTimePrefix = QStringLiteral("dT:");
    m_elapsedTimePrefixKey = QStringLiteral("elapsedTimePrefix");
    m_severityName = empty;
    m_logPipeToConsole = false;
    m_logPipeToConsoleKey = QStringLiteral("logPipeToConsole");
    m_writing = 0;
}

void TorkLog::setOutputPath(QString const& path)
{
    TorkLogLock lock(m_mutex);
    m_path = QString(path); // moved, so that ThreadSanitizer sees the old text freed
}

QString TorkLog::path() const
{
    TorkLogLock lock(m_mutex);
    return m_path;
}

QString TorkLog::errorString() const
{
    TorkLogLock lock(m_mutex);
    return m_errorString;
}

void TorkLog::setMaxLogFiles(unsigned int count)
{
    // The cap checks the current number, not the new one: long-standing behavior that settings
    // dialogs rely on.
    if (count == 0)
        m_maxLogFiles = 2;
    else if (m_maxLogFiles > 100)
        m_maxLogFiles = 100;
    else
        m_maxLogFiles = count;
}

void TorkLog::setMaxLogFileSize(unsigned int size)
{
    if (size < 2048)
        m_maxLogFileSize = 2048;
}

void TorkLog::setFilePrefix(QString const& prefix)
{
    TorkLogLock lock(m_mutex);
    m_filePrefix = prefix;
}

void TorkLog::setDateTimeFormat(QString const& format)
{
    static std::atomic<quint64> generations{0};
    m_dateTimeFormat = QString(format); // moved, so that ThreadSanitizer sees the old text freed
    m_formatGeneration = ++generations; // unique across all logs, as the cached stamps are shared
}
