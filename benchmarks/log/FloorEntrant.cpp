// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include "support/ScratchFolder.h"

#include <QDateTime>
#include <QFile>
#include <QObject>

#include <fcntl.h>
#include <unistd.h>

namespace {

// The lower bound for any log: the line is preformatted, and one call passes it to the kernel.
class FloorEntrant : public LogEntrant
{
public:
    explicit FloorEntrant(QString const& folder)
        : m_file(::open(QFile::encodeName(folder + "floor.log").constData(),
                        O_WRONLY | O_CREAT | O_CLOEXEC, 0644)),
          m_line("2024-01-31 12:34:56.789 Notification " + LogMessage() + "\n")
    {
        Require(m_file != -1, QStringLiteral("the floor's file does not open"));
    }

    ~FloorEntrant() override { ::close(m_file); }

    void write() override
    {
        if (::write(m_file, m_line.data(), m_line.size()) != ssize_t(m_line.size()))
            Require(false, QStringLiteral("write(2) failed"));
    }

protected:
    int m_file;

private:
    std::string m_line;
};

// What the log's fixed behavior requires in addition: the time, the severity's name in the current
// language, and the file's size.
class FixedPartsEntrant : public FloorEntrant
{
public:
    using FloorEntrant::FloorEntrant;

    void write() override
    {
        const qint64 now = QDateTime::currentMSecsSinceEpoch();
        const QString name = QObject::tr("Notification");
        const qint64 size = ::lseek(m_file, 0, SEEK_END);
        Require(now > 0 && !name.isEmpty() && size >= 0, QStringLiteral("a part is missing"));
        FloorEntrant::write();
    }
};

} // namespace

std::unique_ptr<LogEntrant> MakeFloorEntrant(QString const& folder)
{
    return std::make_unique<FloorEntrant>(folder);
}

std::unique_ptr<LogEntrant> MakeFixedPartsEntrant(QString const& folder)
{
    return std::make_unique<FixedPartsEntrant>(folder);
}
