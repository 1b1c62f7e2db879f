// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Logs and saves until it is killed, and reports after each call that it has returned.
//
//     reliability_victim ROOT RUN ENTRIES [NAMED]
//     reliability_victim ROOT RUN atomically
//
// The second only saves, each time by atomically replacing the file. ROOT contains the folder
// logs/, settings.cfg and report, the shared memory. The log file is closed after every ENTRIES
// entries, so that the next one reopens it; 0: it stays open. With NAMED the file system does not
// support unnamed files.

#include "reliability/Victim.h"

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"

#include <QFile>

#include <cerrno>
#include <cstdarg>
#include <cstdlib>
#include <fcntl.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

bool s_areFilesNamed = false;

const quint64 entriesPerSave = 100;

Victim::Report* shared(QString const& path)
{
    static QFile file(path);
    if (!file.open(QIODevice::ReadWrite))
        return nullptr;
    return reinterpret_cast<Victim::Report*>(file.map(0, sizeof(Victim::Report)));
}

void fill(TorkConfigFile& configuration, quint64 run, quint64 number)
{
    configuration.WriteItem("state", "version", QString("%1.%2").arg(run).arg(number));
    configuration.WriteItem("state", "filler", QString::fromLatin1(Victim::filler(number)));
}

// False if a save fails.
bool saveAtomically(TorkConfigFile& configuration, quint64 run, Victim::Report& report)
{
    report.running = 1;
    for (quint64 number = 1;; ++number) {
        fill(configuration, run, number);
        report.saveBegun = number;
        if (!configuration.SaveAtomically() || !configuration.m_lastError.isEmpty())
            return false;
        report.saveReturned = number;
    }
}

} // namespace

// Overrides the C library's, for Qt.
#ifdef O_TMPFILE
extern "C" int open64(char const* path, int flags, ...)
{
    va_list arguments;
    va_start(arguments, flags);
    const bool isUnnamed = (flags & O_TMPFILE) == O_TMPFILE;
    const mode_t mode = isUnnamed || (flags & O_CREAT) ? va_arg(arguments, mode_t) : 0;
    va_end(arguments);
    if (isUnnamed && s_areFilesNamed) {
        errno = EOPNOTSUPP;
        return -1;
    }
    return static_cast<int>(syscall(SYS_openat, AT_FDCWD, path, flags, mode));
}
#endif

int main(int argc, char** argv)
{
    if (argc != 4 && argc != 5)
        return 2;
    s_areFilesNamed = argc == 5;
    const QString root = QFile::decodeName(argv[1]);
    const quint64 run = std::strtoull(argv[2], nullptr, 10);
    const quint64 entriesBetween = std::strtoull(argv[3], nullptr, 10);
    Victim::Report* const report = shared(root + "report");
    if (!report)
        return 1;

    TorkConfigFile configuration(root + "app.cfg");
    if (QByteArray(argv[3]) == "atomically")
        return saveAtomically(configuration, run, *report) ? 0 : 1;

    // Off until the settings are loaded, so that loading them is not traced into the file.
    TorkLog* const log = TorkLog::initialize(root + "logs/", "app", root + "settings.cfg", false);
    report->running = 1;

    for (quint64 entry = 1;; ++entry) {
        const QString message = QString::fromLatin1(Victim::message(run, entry));
        report->entryBegun = entry;
        if (entry % 2)
            log->error(message);
        else
            qCritical("%s", qPrintable(message));
        report->entryReturned = entry;

        if (entriesBetween && entry % entriesBetween == 0)
            log->close();
        if (entry % entriesPerSave == 0) {
            report->saveBegun = entry / entriesPerSave;
            fill(configuration, run, entry / entriesPerSave);
            configuration.Save();
            report->saveReturned = entry / entriesPerSave;
        }
    }
}
