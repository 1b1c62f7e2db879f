// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/TimedLines.h"

#include "support/LargeLog.h"
#include "support/ScratchFolder.h"

#include <QFile>

#include <algorithm>
#include <fcntl.h>
#include <memory>
#include <random>
#include <unistd.h>

AppendedLog::AppendedLog(QString const& fileName)
    : m_file(::open(QFile::encodeName(fileName), O_WRONLY | O_APPEND | O_CLOEXEC))
{
    Require(m_file >= 0, fileName + QStringLiteral(" cannot be written"));
}

AppendedLog::~AppendedLog()
{
    ::close(m_file);
}

void AppendedLog::Append(QByteArray const& text) const
{
    Require(::write(m_file, text.constData(), size_t(text.size())) == text.size(),
            QStringLiteral("the log cannot be written"));
}

TimedLines::TimedLines(QStringList const& fileNames, qint64 lines, int count) : m_count(count)
{
    m_thread = std::thread([this, fileNames, lines, count] {
        std::vector<std::unique_ptr<AppendedLog>> files;
        for (QString const& name : fileNames)
            files.push_back(std::make_unique<AppendedLog>(name));
        LargeLog log(lines);
        std::mt19937 random{20260303};
        for (int i = 0; i < count; ++i) {
            std::this_thread::sleep_for(std::chrono::milliseconds(20 + random() % 40));
            QByteArray text;
            log.Append(text);
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_written.push_back(std::chrono::steady_clock::now());
            files[random() % files.size()]->Append(text);
        }
    });
}

TimedLines::~TimedLines()
{
    m_thread.join();
}

void TimedLines::NoteArrived(size_t lines)
{
    const auto now = std::chrono::steady_clock::now();
    const std::lock_guard<std::mutex> lock(m_mutex);
    for (size_t i = m_times.size(); i < std::min(lines, m_written.size()); ++i)
        m_times.push_back(std::chrono::duration<double, std::nano>(now - m_written[i]).count());
}
