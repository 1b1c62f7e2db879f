// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LineSaver.h"

#include <QFileInfo>
#include <QSaveFile>

#include <algorithm>

namespace Velocor {

LineSaver::LineSaver(LogSource const& source, QVector<qint64> const& starts,
                     LogFileType const& type, QString const& target, QObject* parent)
    : QThread(parent), m_source(source), m_target(target), m_starts(starts),
      m_lineEnd(type.lineEnd())
{}

LineSaver::~LineSaver()
{
    requestInterruption();
    wait();
}

void LineSaver::run()
{
    m_error = save();
}

QString LineSaver::copyLine(LogBytes& from, qint64 start, QSaveFile& to) const
{
    const QString changed = tr("The log has changed in the meantime");
    if (!from.Seek(start))
        return changed;
    char const* last = nullptr;
    char before = '\0';
    for (int size = 256; !last; size = 1 << 16) { // most lines are short
        const qint64 offset = from.position();
        QByteArray bytes = from.Read(size);
        if (bytes.isEmpty() && offset == start)
            return changed;
        last = m_lineEnd.Find(bytes.constBegin(), bytes.constEnd(), offset, before);
        const bool isEnd = bytes.size() < size;
        if (last)
            bytes.truncate(static_cast<int>(last - bytes.constBegin()) + 1);
        else if (isEnd) // the last line of the log may be followed by others here
            bytes += m_lineEnd.bytes();
        if (to.write(bytes) != bytes.size()) // of which commit() does not know
            return tr("Only a part could be written");
        if (isEnd)
            break;
        before = bytes.back();
    }
    return QString();
}

bool LineSaver::isSource(QFileInfo const& target) const
{
    const auto isSame = [&target](QString const& path) {
        return target.canonicalFilePath() == QFileInfo(path).canonicalFilePath();
    };
    const std::vector<LogSource::File> files = m_source.Files();
    return std::any_of(files.begin(), files.end(),
                       [&](LogSource::File const& file) { return isSame(file.path); });
}

QString LineSaver::save()
{
    const QFileInfo target(m_target);
    if (target.exists() && !target.isFile())
        return tr("Not a regular file");
    if (target.exists() && isSource(target))
        return tr("This is the log itself");
    if (!m_source.older && !m_source.logs && !QFileInfo(m_source.path).isFile())
        return tr("The log no longer exists");
    LogBytes from;
    if (!from.Open(m_source))
        return from.error();
    QSaveFile to(m_target);
    if (!to.open(QIODevice::WriteOnly))
        return to.errorString();

    int percent = 0;
    for (int i = 0; i < m_starts.size(); ++i) {
        if (isInterruptionRequested())
            return tr("Canceled");
        const QString error = copyLine(from, m_starts.at(i), to);
        if (!error.isEmpty())
            return error;
        const int now = static_cast<int>(100LL * (i + 1) / m_starts.size());
        if (now > percent)
            Q_EMIT progressed(percent = now);
    }
    return to.commit() ? QString() : to.errorString();
}

} // namespace Velocor
