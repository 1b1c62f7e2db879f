// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LineSaver.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

namespace Velocor {

LineSaver::LineSaver(QString const& source, QVector<qint64> const& starts, QString const& target,
                     QObject* parent)
    : QThread(parent), m_source(source), m_target(target), m_starts(starts)
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

QString LineSaver::save()
{
    const QFileInfo source(m_source);
    const QFileInfo target(m_target);
    if (target.exists() && !target.isFile())
        return tr("Not a regular file");
    if (target.exists() && target.canonicalFilePath() == source.canonicalFilePath())
        return tr("This is the log itself");
    if (!source.isFile())
        return tr("The log no longer exists");
    QFile from(m_source);
    if (!from.open(QIODevice::ReadOnly))
        return from.errorString();
    QSaveFile to(m_target);
    if (!to.open(QIODevice::WriteOnly))
        return to.errorString();

    int percent = 0;
    for (int i = 0; i < m_starts.size(); ++i) {
        if (isInterruptionRequested())
            return tr("Canceled");
        QByteArray line = from.seek(m_starts.at(i)) ? from.readLine() : QByteArray();
        if (line.isEmpty())
            return tr("The log has changed in the meantime");
        if (!line.endsWith('\n')) // the last line of the log may be followed by others here
            line += '\n';
        if (to.write(line) != line.size()) // of which commit() does not know
            return tr("Only a part could be written");
        const int now = static_cast<int>(100LL * (i + 1) / m_starts.size());
        if (now > percent)
            Q_EMIT progressed(percent = now);
    }
    return to.commit() ? QString() : to.errorString();
}

} // namespace Velocor
