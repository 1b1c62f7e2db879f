// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/OwnNames.h"

#include "app/report/Redactor.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStringList>
#include <QSysInfo>

#include <array>
#include <pwd.h>
#include <unistd.h>

namespace Velocor {

namespace {

void AddHome(Redactor& redactor, QString const& path)
{
    if (path.count(QLatin1Char('/')) > 1 || path == QLatin1String("/root"))
        redactor.AddSecret(SecretKind::HomeFolder, path);
}

void AddUser(Redactor& redactor, QString const& name)
{
    if (!OwnNames::IsCommon(name))
        redactor.AddSecret(SecretKind::UserName, name);
}

void AddAccount(Redactor& redactor)
{
    std::array<char, 16 * 1024> buffer = {};
    passwd entry = {};
    passwd* found = nullptr;
    if (::getpwuid_r(::getuid(), &entry, buffer.data(), buffer.size(), &found) != 0 || !found)
        return;
    AddUser(redactor, QString::fromLocal8Bit(entry.pw_name));
    AddHome(redactor, QFile::decodeName(entry.pw_dir));
    OwnNames::AddFullName(redactor, QString::fromUtf8(entry.pw_gecos));
}

} // namespace

bool OwnNames::IsCommon(QString const& name)
{
    static const QStringList names = {
        QStringLiteral("root"),          QStringLiteral("admin"),
        QStringLiteral("administrator"), QStringLiteral("user"),
        QStringLiteral("guest"),         QStringLiteral("nobody"),
        QStringLiteral("test"),          QStringLiteral("build"),
        QStringLiteral("builder"),       QStringLiteral("runner"),
        QStringLiteral("vagrant"),       QStringLiteral("docker"),
        QStringLiteral("live"),          QStringLiteral("default"),
        QStringLiteral("localhost"),     QStringLiteral("localhost.localdomain"),
        QStringLiteral("debian"),        QStringLiteral("ubuntu"),
        QStringLiteral("fedora"),        QStringLiteral("none"),
        QStringLiteral("local"),         QStringLiteral("host")};
    return names.contains(name, Qt::CaseInsensitive);
}

void OwnNames::AddFullName(Redactor& redactor, QString const& description)
{
    constexpr int ShortestPart = 3;
    const QString name = description.section(QLatin1Char(','), 0, 0).trimmed();
    if (IsCommon(name))
        return;
    redactor.AddSecret(SecretKind::FullName, name);
    const QStringList parts = name.split(QLatin1Char(' '));
    for (QString const& part : parts) {
        // A word like "will" is a name only with a capital.
        if (part.size() >= ShortestPart && !IsCommon(part))
            redactor.AddSecret(SecretKind::FullName, part, true);
    }
}

void OwnNames::AddTo(Redactor& redactor)
{
    const QString home = QDir::homePath();
    AddHome(redactor, home);
    AddHome(redactor, QFileInfo(home).canonicalFilePath());
    for (char const* variable : {"USER", "LOGNAME", "SUDO_USER"})
        AddUser(redactor, QString::fromLocal8Bit(qgetenv(variable)));
    AddAccount(redactor);
    const QString host = QSysInfo::machineHostName();
    if (!IsCommon(host)) {
        redactor.AddSecret(SecretKind::HostName, host);
        redactor.AddSecret(SecretKind::HostName, host.section(QLatin1Char('.'), 0, 0));
    }
}

} // namespace Velocor
