// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/Report.h"

#include "app/report/ZipArchive.h"

#include <QDateTime>
#include <QDir>
#include <QFileInfo>
#include <QObject>
#include <QSaveFile>

#include <map>
#include <set>

namespace Velocor {

namespace {

QString KindText(SecretKind kind)
{
    switch (kind) {
    case SecretKind::Word:
        return QObject::tr("words");
    case SecretKind::HomeFolder:
        return QObject::tr("home folders");
    case SecretKind::UserName:
        return QObject::tr("names of users");
    case SecretKind::FullName:
        return QObject::tr("full names");
    case SecretKind::HostName:
        return QObject::tr("names of computers");
    case SecretKind::MailAddress:
        return QObject::tr("mail addresses");
    case SecretKind::NetworkAddress:
        return QObject::tr("network addresses");
    case SecretKind::HardwareAddress:
        return QObject::tr("hardware addresses");
    case SecretKind::PrivateKey:
        return QObject::tr("private keys");
    case SecretKind::Token:
        return QObject::tr("tokens");
    case SecretKind::Password:
        return QObject::tr("passwords");
    }
    return QString();
}

// Placeholders look like HTML, so everything is in code blocks, whatever it contains.
QString CodeBlock(QString const& text)
{
    QString fence = QStringLiteral("```");
    while (text.contains(fence))
        fence += QLatin1Char('`');
    const QString end = text.endsWith(QLatin1Char('\n')) ? QString() : QStringLiteral("\n");
    return fence + QStringLiteral("text\n") + text + end + fence + QLatin1Char('\n');
}

QString WriteFile(QString const& path, QByteArray const& bytes)
{
    if (QFileInfo::exists(path) && !QFileInfo(path).isFile())
        return QObject::tr("Not a regular file");
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return file.errorString();
    if (file.write(bytes) != bytes.size()) // of which commit() does not know
        return QObject::tr("Only a part could be written");
    return file.commit() ? QString() : file.errorString();
}

} // namespace

Report::Report(QList<ReportPart> const& parts, Redactor& redactor)
{
    const QString time = QDateTime::currentDateTimeUtc().toString(Qt::ISODate);
    QString text = QObject::tr("# Report\n\nCreated %1\n").arg(time);
    for (ReportPart const& part : parts)
        text += QStringLiteral("\n## %1\n\n").arg(part.title) + CodeBlock(part.text);
    m_files.push_back({QStringLiteral("report.md"), redactor.Redact(text)});
    for (ReportPart const& part : parts) {
        for (ReportFile const& file : part.files)
            m_files.push_back({file.name, redactor.Redact(file.text)});
    }
    m_files.front().content.text += Replaced(m_files, redactor);
}

QString Report::Replaced(std::vector<File> const& files, Redactor const& redactor)
{
    std::map<SecretKind, std::set<int>> secrets;
    std::map<SecretKind, int> places;
    for (File const& file : files) {
        for (Redactor::Place const& place : file.content.places) {
            if (redactor.isShown(place.secret))
                continue;
            secrets[redactor.Kind(place.secret)].insert(place.secret);
            ++places[redactor.Kind(place.secret)];
        }
    }
    QString text = QObject::tr("\n## Replaced by placeholders\n\n");
    if (secrets.empty())
        return text + QObject::tr("Nothing.\n");
    text += QObject::tr("| what | different | places |\n") + QStringLiteral("|---|---|---|\n");
    for (auto const& [kind, all] : secrets)
        text += QStringLiteral("| %1 | %2 | %3 |\n")
                    .arg(KindText(kind))
                    .arg(all.size())
                    .arg(places[kind]);
    return text;
}

QString Report::Save(QString const& path) const
{
    if (!path.endsWith(QLatin1String(".zip"), Qt::CaseInsensitive))
        return saveFolder(path);
    ZipArchive archive;
    for (File const& file : m_files)
        archive.Add(file.name, file.content.text.toUtf8());
    return WriteFile(path, archive.Bytes());
}

QString Report::saveFolder(QString const& path) const
{
    const QDir folder(path);
    if (QFileInfo::exists(path) && (!QFileInfo(path).isDir() || !folder.isEmpty()))
        return QObject::tr("It exists");
    for (File const& file : m_files) {
        const QString name = folder.filePath(file.name);
        if (!QDir().mkpath(QFileInfo(name).path()))
            return QObject::tr("The folder cannot be created");
        const QString error = WriteFile(name, file.content.text.toUtf8());
        if (!error.isEmpty())
            return error;
    }
    return QString();
}

} // namespace Velocor
