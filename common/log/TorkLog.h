// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDateTime>
#include <QFile>
#include <QFileInfo>
#include <QMutex>
#include <QObject>
#include <QString>
#include <QVarLengthArray>
#include <QtGlobal>

#include <atomic>
#include <memory>

class TorkLogWriter;

/// The process-wide log: one current file of one-line entries, and numbered older files.
///
/// initialize() makes the one log and routes the toolkit's debug, warning, critical and fatal
/// messages into it; everything that is issued with qDebug() and the like is then an entry too.
/// The log keeps its settings in a settings file of its own. File formats: docs/log-file.md and
/// docs/log-settings.md.
///
/// Threads: any thread may write entries and use the plain setters and getters. initialize(),
/// shutdown(), clear() and the operations that fill a shared buffer (fileSpec(), newLogFileName(),
/// severityName()) are for one thread at a time. While a file is being written nothing may log; a
/// message that the toolkit itself raises there goes to the toolkit's default output.
///
///     TorkLog::initialize("viewer");
///     TorkLog::logger()->warning("The index is out of date.");
///     qDebug() << "pages" << 3; // an entry of severity Trace
class TorkLog : public QObject
{
    Q_OBJECT

public:
    /// How serious an entry is. Any other value is written with an empty severity name.
    enum EventSeverity : int { Trace = 0, Notification = 1, Warning = 2, Error = 3, Fatal = 4 };

    /// What processPreferences() does. Any other value does nothing and fails.
    enum PreferencesOperation : int { PreferencesLoad = 0, PreferencesSave = 1 };

    /// The one log, owned by the class; null before initialize() and after shutdown().
    static TorkLog* m_gLog;

    /// A record with its defaults and no directory. initialize() makes the one log of a program.
    TorkLog();

    /// The same, with the directory that holds the log files.
    explicit TorkLog(QString const& path);

    /// Flushes and closes the current log file.
    ~TorkLog() override;

    /// Makes the one log, unless there is one already: then that is returned and nothing changes.
    ///
    /// Installs TorkLog_MessageHandler(), then loads the settings file, or creates it with the
    /// settings in force. A settings file that exists overrides `prefix` and `enable`.
    ///
    /// @param path  log directory, ending in "/"; empty: "logs/" in the toolkit's data location
    /// @param prefix  base name of the log files
    /// @param preferencesFileName  settings file, see setPreferencesFileName()
    /// @param enable  whether entries are written
    /// @return the log, never null
    static TorkLog* initialize(QString const& path, QString const& prefix,
                               QString const& preferencesFileName, bool enable);

    /// Makes the one log in the default directory, with the default settings file, switched on.
    static TorkLog* initialize(QString const& prefix);

    /// Deletes the log, if there is one, after waiting for messages that are just being written.
    /// The message handler stays installed and drops every message.
    static void shutdown();

    /// The one log; null before initialize() and after shutdown().
    static TorkLog* logger() { return m_gLog; }

    /// Sets every setting and buffer to its default. An open file stays open.
    void clear();

    /// The directory of the log files, as a rule ending in "/". It takes effect when the file is
    /// next opened.
    void setOutputPath(QString const& path);
    QString path() const;

    /// The logging switch. While it is off, entries are dropped.
    void setEnable(bool enable) { m_enabled = enable; }
    bool enabled() const { return m_enabled; }

    /// Whether entries carry the milliseconds since the entry before.
    void setLogElapsedTime(bool log) { m_logElapsedTime = log; }
    bool logElapsedTime() const { return m_logElapsedTime; }

    /// Whether entries are echoed to the toolkit's debug output.
    void setLogPipeToConsole(bool pipe) { m_logPipeToConsole = pipe; }
    bool logPipeToConsole() const { return m_logPipeToConsole; }

    /// Sets the highest number that an older file may keep: 2 for 0; 100 if the number in force
    /// so far is above 100; else `count`.
    void setMaxLogFiles(unsigned int count);
    unsigned int maxLogFiles() const { return m_maxLogFiles; }

    /// Sets the size limit to 2048 bytes for a `size` below that; any other `size` changes
    /// nothing. Larger limits come from the settings file.
    void setMaxLogFileSize(unsigned int size);
    unsigned int maxLogFileSize() const { return m_maxLogFileSize; }

    /// Qt's text for the last log file that could not be opened, or "Not a regular file" for a
    /// pipe, a socket or a block device; empty if none.
    QString errorString() const;

    /// The bare name of the current log file, or with `all` the wildcard of the older files.
    /// Returns a buffer that the next call overwrites.
    QString& fileSpec(bool all);

    /// Forms the full name of the current log file. Returns a buffer that the next call
    /// overwrites.
    QString& newLogFileName();

    /// The full name of the file that entries go to: of the open file, whatever the settings say by
    /// now, or, if none is open, the name that the next entry opens. Any thread.
    QString currentLogFile() const;

    /// Opens a log file for writing from its start on, without truncating it, after closing the
    /// one that is open. On failure the reason is left in errorString().
    bool open(QString const& fileName);

    /// Flushes and closes the log file; the next entry opens it again.
    ///
    /// @return whether a file was open
    bool close();

    /// Finds or opens the file that an entry goes to, making room for it. Part of write(), which
    /// calls it with the file lock held; on its own only while no other thread writes.
    ///
    /// @param text  the entry that will be written; its length in characters counts
    /// Whoever has the file may seek, read and write: entries follow from there on, also after the
    /// file has been closed and opened again.
    ///
    /// @return the open file, owned by the log; null if none could be opened
    QFile* locateLogFile(QString const& text);

    /// Moves the numbered older files up by one, removes those above the limit, and makes the
    /// current file number 1. Removes what a rotation that was killed has left of its copy. Part
    /// of locateLogFile(), with the same thread rule.
    void deleteOldFiles();

    /// Writes a one-line entry: time stamp, severity name, elapsed time if wanted, message.
    ///
    /// The entry has reached the operating system when the call returns. If the file cannot be
    /// opened the entry is lost; see errorString().
    void write(int severity, QString const& message);

    /// Writes a ready line, line end included, in Latin-1 with "?" for what Latin-1 lacks.
    void write(QString const& line);

    void trace(QString const& message) { write(Trace, message); }
    void warning(QString const& message) { write(Warning, message); }
    void error(QString const& message) { write(Error, message); }
    void fatal(QString const& message) { write(Fatal, message); }

    /// The translated name of a severity; empty for any other value. Returns a buffer that the
    /// next call overwrites.
    QString& severityName(EventSeverity severity);

    /// Sets the path of the settings file. Reads and creates nothing.
    ///
    /// @param name  a path; a bare file name lies in the log directory; empty: "logsettings.cfg"
    /// @return always true
    bool setPreferencesFileName(QString const& name);

    /// The full path of the settings file; empty before it is set. Any thread.
    QString preferencesFileName() const;

    /// The format in force for time stamps, as QDateTime::toString() takes it. Any thread.
    QString dateTimeFormat() const;

    /// The text in force before the elapsed time of an entry. Any thread.
    QString elapsedTimePrefix() const;

    /// The base name of the log files that are opened from now on; currentLogFile() tells the one
    /// that is open. Any thread.
    QString filePrefix() const;

    /// Whether the settings file exists.
    bool havePreferencesFile() const;

    /// processPreferences() with PreferencesLoad and PreferencesSave.
    bool loadPreferences();
    bool savePreferences();

    /// Loads or saves the settings that the settings file keeps.
    ///
    /// Loading sets a missing value to its default, also in a file that does not parse; limits
    /// are not checked. Nothing changes if the file does not exist.
    ///
    /// @return the result of the load or save; false for any other operation or a missing file
    bool processPreferences(PreferencesOperation operation);

private:
    QString currentFileName() const;
    QString currentFilePath() const;
    QFileInfo currentFile() const;
    static void makeLogDirectory(QString const& path);
    bool openFile(QString const& fileName);
    bool locate(int length);
    void shiftOldFiles(QString const& directory) const;
    void pruneOldFiles(QString const& directory, qint64 highest) const;

    int writeEntry(qint64 now, int severity, QString const& message);
    void writeLine(ushort const* line, int length);
    int appendStamp(QVarLengthArray<ushort, 512>& line, qint64 now) const;
    QString elapsedTime(int timeOfDay) const;
    void echo(QString const& line) const;

    bool load();
    bool save();
    void makeDirectoryOfPreferences(QString const& fileName) const;
    void setFilePrefix(QString const& prefix);
    void setDateTimeFormat(QString const& format);

    static void registerForkHandlers();

    // Each setting that the settings file keeps stands beside its key.
    QString m_path;
    std::atomic<quint32> m_maxLogFiles{0};
    QString m_maxLogFilesKey;
    std::atomic<quint32> m_maxLogFileSize{0};
    QString m_maxLogFileSizeKey;
    QString m_filePrefix;
    QString m_filePrefixKey;
    QString m_fileExtension;
    std::unique_ptr<TorkLogWriter> m_writer;
    QString m_errorString;
    QString m_fileSpec;
    QString m_logFileName;
    QString m_spare;
    QString m_preferencesFileName;
    std::atomic<bool> m_enabled{false};
    QString m_enabledKey;
    bool m_outputToConsole = false;
    QString m_outputToConsoleKey;
    QString m_dateTimeFormat;
    QString m_dateTimeFormatKey;
    std::atomic<int> m_lastEntryTime; // local time of day, in milliseconds since midnight
    std::atomic<bool> m_logElapsedTime{false};
    QString m_logElapsedTimeKey;
    QString m_elapsedTimePrefix;
    QString m_elapsedTimePrefixKey;
    QString m_severityName;
    std::atomic<bool> m_logPipeToConsole{false};
    QString m_logPipeToConsoleKey;
    int m_writing = 0;
    mutable QMutex m_mutex; // the files, and the texts that writing an entry reads

    // Changes with every change of the date format, so that no stamp kept for the old one is
    // reused.
    std::atomic<quint64> m_formatGeneration{0};
};

/// The toolkit's message handler that writes every message into the log; does nothing while there
/// is no log. Any thread.
///
/// Warnings become Warning, critical messages Error, fatal messages Fatal, all others Trace. It
/// never aborts. The context is not used.
void TorkLog_MessageHandler(QtMsgType type, QMessageLogContext const& context,
                            QString const& message);
