// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SavedStates.h"

#include "app/language/LeftToRight.h"

#include <QCryptographicHash>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QLocale>
#include <QObject>
#include <QSaveFile>

#include <algorithm>

namespace Velocor {

namespace {

// A state is called SHA1-TIME.cfg: the SHA-1 of the file's path, and the time in UTC. So the names
// of a file's states sort by time.
const QString TimeFormat = QStringLiteral("yyyyMMddTHHmmsszzz");
const QString Ending = QStringLiteral(".cfg");
constexpr int HashLength = 40;

// However the path is spelled; a file that does not exist has no canonical one.
QString HashOf(QString const& path)
{
    const QFileInfo info(path);
    const QString canonical = info.canonicalFilePath();
    const QString full = canonical.isEmpty() ? info.absoluteFilePath() : canonical;
    const QByteArray hash =
        QCryptographicHash::hash(QFile::encodeName(full), QCryptographicHash::Sha1);
    return QString::fromLatin1(hash.toHex());
}

QByteArray ContentOf(QString const& path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

} // namespace

QVector<SavedStates::State> SavedStates::named(QString const& pattern) const
{
    QVector<State> states;
    if (m_folder.isEmpty())
        return states;
    const QFileInfoList files = QDir(m_folder).entryInfoList({pattern}, QDir::Files, QDir::NoSort);
    for (QFileInfo const& file : files) {
        const QString name = file.completeBaseName();
        QDateTime time = QLocale::c().toDateTime(name.mid(HashLength + 1), TimeFormat);
        time.setTimeSpec(Qt::UTC);
        if (time.isValid() && name.at(HashLength) == QLatin1Char('-') && !file.isSymLink())
            states.append({file.filePath(), time.toLocalTime(), file.size()});
    }
    std::sort(states.begin(), states.end(),
              [](State const& a, State const& b) { return a.time > b.time; });
    return states;
}

QVector<SavedStates::State> SavedStates::Of(QString const& path) const
{
    return named(HashOf(path) + QLatin1String("-*") + Ending);
}

QString SavedStates::makeFolder() const
{
    const QFileDevice::Permissions own =
        QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner;
    const QFileInfo folder(m_folder.left(m_folder.size() - 1));
    const bool isThere = folder.isDir() && !folder.isSymLink();
    if (!isThere && !QDir().mkpath(m_folder))
        return QObject::tr("Cannot create the folder %1").arg(LeftToRight(m_folder));
    if (!QFile::setPermissions(m_folder, own))
        return QObject::tr("Cannot protect the folder %1").arg(LeftToRight(m_folder));
    return QString();
}

QString SavedStates::Keep(QString const& path) const
{
    const QFileInfo info(path);
    if (m_folder.isEmpty() || !info.isFile())
        return QString();
    if (info.size() > MaximumFileSize)
        return QObject::tr("it is larger than 1 MiB");
    QFile original(path);
    if (!original.open(QIODevice::ReadOnly))
        return original.errorString();
    const QByteArray content = original.readAll();
    const QVector<State> states = Of(path);
    if (!states.isEmpty() && ContentOf(states.first().path) == content)
        return QString();
    const QString problem = makeFolder();
    if (!problem.isEmpty())
        return problem;

    // Later than every other, even if two are kept at once or the clock was set back.
    QDateTime time = QDateTime::currentDateTimeUtc();
    if (!states.isEmpty() && states.first().time >= time)
        time = states.first().time.toUTC().addMSecs(1);
    QSaveFile copy(m_folder + HashOf(path) + QLatin1Char('-') +
                   QLocale::c().toString(time, TimeFormat) + Ending);
    const QFileDevice::Permissions ofOwner =
        QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner;
    const bool isKept =
        copy.open(QIODevice::WriteOnly) &&
        copy.setPermissions((info.permissions() & ofOwner) | QFileDevice::ReadOwner) &&
        copy.write(content) == content.size() && copy.commit();
    if (!isKept)
        return copy.errorString();
    removeOldest(path);
    return QString();
}

void SavedStates::removeOldest(QString const& path) const
{
    const QVector<State> ofFile = Of(path);
    for (int i = MaximumOfFile; i < ofFile.size(); ++i)
        QFile::remove(ofFile.at(i).path);
    const QVector<State> all = named(QLatin1Char('*') + Ending);
    qint64 size = 0;
    for (int i = 0; i < all.size(); ++i) {
        size += all.at(i).size;
        if (i >= MaximumOfAll || size > MaximumSize)
            QFile::remove(all.at(i).path);
    }
}

bool SavedStates::RemoveAll(QString const& path) const
{
    const QVector<State> states = Of(path);
    for (State const& state : states)
        QFile::remove(state.path);
    return Of(path).isEmpty();
}

} // namespace Velocor
