// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

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
/// initialize() creates the one log and routes Qt's debug, warning, critical and fatal messages
/// into it, so everything issued with qDebug() and the like is an entry too. The log keeps its
/// settings in its own settings file. File formats: docs/log-file.md and docs/log-settings.md.
///
/// Files: the file is opened by the first entry. If it is then too full for that entry, it is
/// rotated: the older files move up by one, and it becomes number 1. Give each program, and each of
/// its processes, its own log name: two that write to one file overwrite each other's entries.
///
/// Errors: writing an entry never fails for the caller. An entry that cannot be written is lost,
/// and errorString() has the reason why the file could not be opened. Nothing is thrown.
///
/// Threads: any thread may write entries and use the plain setters and getters. initialize(),
/// shutdown(), clear() and the operations that fill a shared buffer (fileSpec(), newLogFileName(),
/// severityName()) are for one thread at a time. Nothing may log while a file is being written; a
/// message that Qt itself raises there goes to Qt's default output.
///
///     TorkLog::initialize("viewer");
///     TorkLog::logger()->warning("The index is out of date.");
///     qDebug() << "pages" << 3; // an entry of severity Trace
class TORK_EXPORT TorkLog : public QObject
{
    Q_OBJECT

public:
    /// How serious an entry is. Any other value is written with an empty severity name.
    enum EventSeverity : int { Trace = 0, Notification = 1, Warning = 2, Error = 3, Fatal = 4 };

    /// What processPreferences() does. Any other value does nothing and fails.
    enum PreferencesOperation : int { PreferencesLoad = 0, PreferencesSave = 1 };

    /// The one log, owned by the class; null before initialize() and after shutdown(). Never assign
    /// to it; logger() returns the same.
    static TorkLog* m_gLog;

    /// A separate log with default settings, disabled and without a directory. It touches no
    /// file and receives none of Qt's messages; initialize() creates the one log of a program.
    TorkLog();

    /// The same, with the directory that holds the log files; see setOutputPath().
    explicit TorkLog(QString const& path);

    /// Flushes and closes the current log file.
    ~TorkLog() override;

    /// Creates the one log. If there is one already, it is returned and nothing changes.
    ///
    /// Installs TorkLog_MessageHandler(), then loads the settings file, or creates it with the
    /// current settings. An existing settings file overrides `prefix` and `enable`. Set
    /// organization and product first, as the default directory depends on them.
    ///
    /// @param path  log directory, ending in "/"; empty: "logs/" in Qt's data location
    /// @param prefix  base name of the log files, without ".log"
    /// @param preferencesFileName  settings file, see setPreferencesFileName()
    /// @param enable  whether entries are written
    /// @return the log, never null
    static TorkLog* initialize(QString const& path, QString const& prefix,
                               QString const& preferencesFileName, bool enable);

    /// Creates the one log in the default directory, with the default settings file, enabled.
    ///
    /// @param prefix  base name of the log files, without ".log"
    /// @return the log, never null
    static TorkLog* initialize(QString const& prefix);

    /// Deletes the log, if there is one, after waiting for Qt messages that are being written. The
    /// message handler stays installed and drops every message.
    ///
    /// It does not wait for direct calls: no other thread may still be using logger(). initialize()
    /// may then create a new log.
    static void shutdown();

    /// The one log; null before initialize() and after shutdown().
    static TorkLog* logger() { return m_gLog; }

    /// Resets every setting and buffer to its default: disabled, no directory, no name. An open
    /// file stays open. The settings file is not touched.
    void clear();

    /// Sets the directory of the log files, which is created when needed. It takes effect when the
    /// file is next opened; an open file stays in use. Any thread.
    ///
    /// @param path  usually ends in "/"
    void setOutputPath(QString const& path);

    /// The directory of the log files, as it was set. Any thread.
    QString path() const;

    /// Switches logging on or off. While it is off, entries are dropped. Any thread. Not saved
    /// before savePreferences().
    void setEnable(bool enable) { m_enabled = enable; }

    /// Whether entries are written; false by default, true after initialize(prefix) unless the
    /// settings file says otherwise. Any thread.
    bool enabled() const { return m_enabled; }

    /// Sets whether entries contain the milliseconds since the previous entry. Any thread.
    void setLogElapsedTime(bool log) { m_logElapsedTime = log; }

    /// Whether entries contain the milliseconds since the previous entry; false by default. The
    /// difference is between two times of day, so it is negative after midnight. Any thread.
    bool logElapsedTime() const { return m_logElapsedTime; }

    /// Sets whether entries are echoed to Qt's debug output. Any thread.
    void setLogPipeToConsole(bool pipe) { m_logPipeToConsole = pipe; }

    /// Whether entries are echoed to Qt's debug output; false by default. Any thread.
    bool logPipeToConsole() const { return m_logPipeToConsole; }

    /// Sets the highest number that an older file may keep. Any thread.
    ///
    /// @param count  0 sets 2; any other value is used unchanged, unless the current limit is above
    ///               100: then it becomes 100, whatever `count` is
    void setMaxLogFiles(unsigned int count);

    /// The highest number that an older file may keep; 10 by default. Any thread.
    unsigned int maxLogFiles() const { return m_maxLogFiles; }

    /// Sets the size limit to 2048 bytes if `size` is less than that; any other `size` changes
    /// nothing. Larger limits come from the settings file. Any thread.
    ///
    /// @param size  in bytes
    void setMaxLogFileSize(unsigned int size);

    /// The size, in bytes, beyond which the file is rotated when it is next opened; 1000000 by
    /// default. The file of a running program may exceed it. Any thread.
    unsigned int maxLogFileSize() const { return m_maxLogFileSize; }

    /// Qt's text for the last log file that could not be opened, or "Not a regular file" for a
    /// pipe, a socket or a block device; empty if there was none. A later success does not clear
    /// it. Any thread.
    QString errorString() const;

    /// The name of the current log file without its directory, or a wildcard for the older files.
    ///
    /// @param all  whether to return the wildcard
    /// @return a buffer that the next call overwrites
    QString& fileSpec(bool all);

    /// The full name that the next log file to be opened gets; currentLogFile() also knows the open
    /// one. Opens nothing.
    ///
    /// @return a buffer that the next call overwrites
    QString& newLogFileName();

    /// The full name of the file that entries go to: the open file, even if the settings have
    /// changed since; if none is open, the file that the next entry opens. Any thread.
    QString currentLogFile() const;

    /// Opens a log file for writing from its start, without truncating it, after closing the open
    /// one. Usually not needed: the first entry opens the file. Any thread.
    ///
    /// @param fileName  full name; its directory is not created
    /// @return whether the file is open; if not, errorString() has the reason
    bool open(QString const& fileName);

    /// Flushes and closes the log file; the next entry opens it again, and rotates it if it is too
    /// full. Any thread.
    ///
    /// @return whether a file was open
    bool close();

    /// Finds or opens the file that an entry goes to, and makes room for it. Call it only while no
    /// other thread writes.
    ///
    /// The caller may seek, read and write in the file: later entries continue from its position,
    /// even after the file has been closed and opened again.
    ///
    /// @param text  the entry that will be written; only its length in characters matters
    /// @return the open file, owned by the log; null if none could be opened
    QFile* locateLogFile(QString const& text);

    /// Moves the numbered older files up by one, removes those above the limit, and makes the
    /// current file number 1. Also removes the unfinished copy of a rotation that was killed. Done
    /// when an entry opens a file that is too full; on its own only while no other thread writes.
    ///
    /// A file that cannot be moved or removed stays; nothing is reported.
    void deleteOldFiles();

    /// Writes a one-line entry: time stamp, severity name, elapsed time if enabled, message. Any
    /// thread.
    ///
    /// The entry has reached the operating system when the call returns. If the file cannot be
    /// opened, the entry is lost; see errorString().
    ///
    /// @param severity  an EventSeverity; any other value gets an empty name
    /// @param message  written unchanged: a line break in it starts a line that is not an entry
    void write(int severity, QString const& message);

    /// Writes a complete line, including its line end, in Latin-1 with "?" for what Latin-1 lacks.
    /// Nothing is added, so the next elapsed time does not count from it. Any thread.
    void write(QString const& line);

    /// write() with severity Trace. Any thread.
    void trace(QString const& message) { write(Trace, message); }

    /// write() with severity Warning. Any thread.
    void warning(QString const& message) { write(Warning, message); }

    /// write() with severity Error. Any thread.
    void error(QString const& message) { write(Error, message); }

    /// write() with severity Fatal. The program continues. Any thread.
    void fatal(QString const& message) { write(Fatal, message); }

    /// The translated name of a severity; empty for any other value.
    ///
    /// @return a buffer that the next call overwrites
    QString& severityName(EventSeverity severity);

    /// Sets the path of the settings file. Reads and creates nothing.
    ///
    /// @param name  a path; a bare file name is relative to the current log directory; empty means
    ///              "logsettings.cfg" there
    /// @return always true
    bool setPreferencesFileName(QString const& name);

    /// The full path of the settings file; empty before it is set. Any thread.
    QString preferencesFileName() const;

    /// The format of time stamps, as QDateTime::toString() takes it; "yyyy-MM-dd hh:mm:ss.z" by
    /// default. Only the settings file changes it. Any thread.
    QString dateTimeFormat() const;

    /// The text before the elapsed time of an entry; "dT:" by default. Only the settings file
    /// changes it. Any thread.
    QString elapsedTimePrefix() const;

    /// The base name of log files that are opened from now on; currentLogFile() returns the open
    /// one. Any thread.
    QString filePrefix() const;

    /// Whether the settings file exists. Any thread.
    bool havePreferencesFile() const;

    /// processPreferences() with PreferencesLoad: reads the settings file again, for instance after
    /// the user edited it.
    bool loadPreferences();

    /// processPreferences() with PreferencesSave: writes the current settings to the settings file,
    /// creating the log directory if the file belongs there.
    bool savePreferences();

    /// Loads or saves the settings that the settings file keeps.
    ///
    /// Loading sets a missing value to its default, even in a file that does not parse; limits are
    /// not checked. Nothing changes if the file does not exist. An open log file stays in use, even
    /// if the base name changes. Saving reports true even if the file could not be written: see
    /// TorkConfigFile::Save().
    ///
    /// @return the result of the load or save; false for any other operation or a missing file
    bool processPreferences(PreferencesOperation operation);

private:
    // The files. The caller holds m_mutex, except for makeLogDirectory(), which needs no lock.
    //
    // inLogDirectory() joins the log directory and a name with a slash, unless the directory ends
    // in one or is empty.
    QString inLogDirectory(QString const& name) const;
    QString currentFileName() const;
    QString currentFilePath() const;
    QFileInfo currentFile() const;
    static void makeLogDirectory(QString const& path);
    bool openFile(QString const& fileName);
    bool locate(int length);
    void shiftOldFiles(QString const& directory) const;
    void pruneOldFiles(qint64 highest) const;

    // Entries. These lock m_mutex only where they must, so that threads format in parallel. The
    // caller of echo() holds it.
    int writeEntry(qint64 now, int severity, QString const& message);
    void writeLine(ushort const* line, int length);
    int appendStamp(QVarLengthArray<ushort, 512>& line, qint64 now) const;
    QString elapsedTime(int timeOfDay) const;
    void echo(QString const& line) const;

    // Settings. The caller of setDateTimeFormat() holds m_mutex; the others lock it themselves.
    bool load();
    bool save();
    void makeDirectoryOfPreferences(QString const& fileName) const;
    void setFilePrefix(QString const& prefix);
    void setDateTimeFormat(QString const& format);

    // Keeps fork() from leaving a child with a lock that a thread of the parent holds.
    static void registerForkHandlers();

    // Each setting that the settings file keeps is followed by its key there. What is atomic can be
    // read and set without m_mutex.
    QString m_path;
    std::atomic<quint32> m_maxLogFiles{0};
    QString m_maxLogFilesKey;
    std::atomic<quint32> m_maxLogFileSize{0};
    QString m_maxLogFileSizeKey;
    QString m_filePrefix;
    QString m_filePrefixKey;
    QString m_fileExtension;

    // Never null. Remembers the name of the file it has open, whatever the settings say.
    std::unique_ptr<TorkLogWriter> m_writer;
    QString m_errorString;

    // The buffers of fileSpec() and newLogFileName().
    QString m_fileSpec;
    QString m_logFileName;
    QString m_spare; // unused
    QString m_preferencesFileName;
    std::atomic<bool> m_enabled{false};
    QString m_enabledKey;

    // Without effect and not saved; the echo is m_logPipeToConsole.
    bool m_outputToConsole = false;
    QString m_outputToConsoleKey;
    QString m_dateTimeFormat;
    QString m_dateTimeFormatKey;

    // Local time of day, in milliseconds since midnight, also of entries that were dropped.
    std::atomic<int> m_lastEntryTime;
    std::atomic<bool> m_logElapsedTime{false};
    QString m_logElapsedTimeKey;
    QString m_elapsedTimePrefix;
    QString m_elapsedTimePrefixKey;
    QString m_severityName;
    std::atomic<bool> m_logPipeToConsole{false};
    QString m_logPipeToConsoleKey;
    int m_writing = 0; // 1 while a line is being written

    // Guards the files, and the texts that writing an entry reads.
    mutable QMutex m_mutex;

    // Incremented with every change of the date format, so that a stamp cached for the old one is
    // not reused.
    std::atomic<quint64> m_formatGeneration{0};
};

/// The Qt message handler that writes every message to the log; does nothing while there is no log.
/// Any thread. TorkLog::initialize() installs it; call it from your own handler to log and do more.
///
/// Warnings become Warning, critical messages Error, fatal messages Fatal, and all others Trace. It
/// never aborts the program; Qt does that itself after a fatal message.
///
/// @param context  passed on to Qt's default handler only, never written to the log
TORK_EXPORT void TorkLog_MessageHandler(QtMsgType type, QMessageLogContext const& context,
                                        QString const& message);
