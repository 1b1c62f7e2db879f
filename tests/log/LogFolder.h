// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/log/TorkLog.h"
#include "support/TestFiles.h"

#include <QMap>
#include <QTemporaryDir>
#include <QtTest>

/// A folder for one log and its settings, initially empty. It is kept when the test has failed.
class LogFolder
{
public:
    using Settings = QMap<QString, QString>;

    LogFolder() { QDir().mkpath(logs()); }
    ~LogFolder()
    {
        if (QTest::currentTestFailed())
            m_folder.setAutoRemove(false);
    }

    Q_DISABLE_COPY(LogFolder)

    /// Everything, ending in "/".
    QString root() const { return m_folder.path() + '/'; }

    /// The log directory, ending in "/". It exists.
    QString logs() const { return root() + "logs/"; }

    /// A settings file outside the log directory. It does not exist at first.
    QString settingsFile() const { return root() + "settings.cfg"; }

    /// The text of a settings file with these values.
    static QByteArray settingsText(Settings const& values)
    {
        QByteArray text = "<LogSettings>\n<config>\n";
        for (auto value = values.begin(); value != values.end(); ++value)
            text += QString("<%1><![CDATA[%2]]></%1>\n").arg(value.key(), value.value()).toUtf8();
        return text + "</config>\n</LogSettings>\n";
    }

    /// Sets a log up from a settings file. Missing values have the file's defaults, except that the
    /// stamp is the letter T, which makes entries predictable.
    void configure(TorkLog& log, Settings values) const
    {
        if (!values.contains("dateTimeFormat"))
            values["dateTimeFormat"] = "'T'";
        QVERIFY(TestFiles::write(settingsFile(), settingsText(values)));
        log.setPreferencesFileName(settingsFile());
        QVERIFY(log.loadPreferences());
    }

    /// A log in the log directory with this base name and size limit, enabled.
    void prepare(TorkLog& log, QString const& prefix, unsigned int maxLogFileSize = 1000000) const
    {
        log.setOutputPath(logs());
        configure(log,
                  {{"filePrefix", prefix}, {"maxLogFileSize", QString::number(maxLogFileSize)}});
    }

    /// The contents of the log directory: see TestFiles::listing().
    QStringList listing() const { return TestFiles::listing(logs()); }

private:
    QTemporaryDir m_folder;
};
