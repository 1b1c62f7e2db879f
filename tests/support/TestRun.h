// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/log/TorkLog.h"
#include "support/TestFiles.h"

#include <QCoreApplication>
#include <QTemporaryDir>
#include <QVariant>

/// A program's surroundings for tests: identity, directories and a log, all in a folder that is
/// removed with the object.
class TestRun
{
public:
    /// @param log  contents of the log file before anything opens it
    explicit TestRun(QByteArray const& log = QByteArray())
    {
        m_handler = qInstallMessageHandler(nullptr);
        QCoreApplication::setOrganizationName("Org");
        QCoreApplication::setApplicationName("Product");
        QCoreApplication::instance()->setProperty("caption", "Caption");
        QCoreApplication::instance()->setProperty("RootPath", folder() + "root/");
        QCoreApplication::instance()->setProperty("DataPath", folder() + "data/");
        QCoreApplication::instance()->setProperty("DocPath", folder() + "documents/");
        QDir().mkpath(folder() + "documents");
        TorkLog::initialize(folder() + "data/logs/", "app", QString(), true);
        if (!log.isNull())
            TestFiles::write(logFile(), log);
    }

    ~TestRun()
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_handler);
    }

    TestRun(TestRun const&) = delete;
    TestRun& operator=(TestRun const&) = delete;

    QString folder() const { return QFileInfo(m_folder.path()).canonicalFilePath() + "/"; }
    QString logFile() const { return folder() + "data/logs/app.log"; }
    QString settingsFile() const { return folder() + "data/velocor.cfg"; }

private:
    QTemporaryDir m_folder;
    QtMessageHandler m_handler = nullptr;
};
