// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/ReportCommand.h"

#include "app/report/OwnNames.h"
#include "app/report/Report.h"
#include "app/report/ReportReader.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDateTime>
#include <QDir>
#include <QFileInfo>
#include <QLocale>
#include <QObject>

namespace Velocor {

namespace {

// In the order of the parts.
QStringList PartNames()
{
    return {QStringLiteral("versions"), QStringLiteral("places"), QStringLiteral("log-settings"),
            QStringLiteral("settings"), QStringLiteral("runs"),   QStringLiteral("problems")};
}

QString FolderOf(char const* property)
{
    return QCoreApplication::instance()->property(property).toString();
}

// The log's name is a setting, so it may be another one than usual.
QString OwnLog(QString const& logs)
{
    const QString usual = logs + QLatin1String("velocor.log");
    const QStringList others =
        QDir(logs).entryList({QStringLiteral("*.log")}, QDir::Files, QDir::Time);
    return QFileInfo::exists(usual) || others.isEmpty() ? usual : logs + others.first();
}

QList<ReportPart> AllParts()
{
    const QString data = FolderOf("DataPath");
    const QString logs = data + QLatin1String("logs/");
    QList<ReportPart> parts = {
        {QObject::tr("Versions and system"), ReportReader::Versions(), {}},
        {QObject::tr("Identity and places"), ReportReader::Places(), {}},
        ReportReader::Settings(QObject::tr("Log settings"),
                               {logs + QLatin1String("logsettings.cfg")}),
        ReportReader::Settings(QObject::tr("Settings files"),
                               {data + QLatin1String("velocor.cfg"),
                                FolderOf("RootPath") + QLatin1String("/appdata.cfg")})};
    return parts + ReportReader::Log(OwnLog(logs));
}

} // namespace

ReportCommand::ReportCommand(QStringList const& arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QObject::tr(
        "Saves a report of a problem of the window's program: report.md, the log of the last two "
        "runs, and settings files. Names, home folders, addresses, keys, tokens and passwords are "
        "replaced by placeholders; look at it before you share it.\n\n"
        "PATH ends in .zip, or is a new folder. Without it, the report is a file in this folder, "
        "whose name is printed."));
    parser.addOption(
        {{QStringLiteral("h"), QStringLiteral("help")}, QObject::tr("Print this help and exit.")});
    parser.addOption(
        {QStringLiteral("without"),
         QObject::tr("Leave out parts: %1.").arg(PartNames().join(QLatin1String(", "))),
         QStringLiteral("LIST")});
    parser.addOption({QStringLiteral("hide"),
                      QObject::tr("Replace this text, too. May be repeated."),
                      QStringLiteral("TEXT")});
    parser.addPositionalArgument(QStringLiteral("report"), QString(), QStringLiteral("report"));
    parser.addPositionalArgument(QStringLiteral("PATH"), QObject::tr("The report."),
                                 QStringLiteral("[PATH]"));
    const QStringList all = QCoreApplication::arguments();
    if (!parser.parse(all.mid(0, 1) + arguments)) {
        m_error = parser.errorText();
    } else if (parser.isSet(QStringLiteral("help"))) {
        m_answer = parser.helpText().toLocal8Bit();
    } else if (parser.positionalArguments().size() > 2) {
        m_error = QObject::tr("Only one report at a time.");
    } else {
        QStringList without = parser.value(QStringLiteral("without")).split(QLatin1Char(','));
        without.removeAll(QString());
        const QString time =
            QLocale::c().toString(QDateTime::currentDateTime(), QStringLiteral("yyyyMMdd-hhmmss"));
        const QString usual = QStringLiteral("velocor-report-%1.zip").arg(time);
        save(parser.positionalArguments().value(1, usual), without,
             parser.values(QStringLiteral("hide")));
    }
}

void ReportCommand::save(QString const& path, QStringList const& without, QStringList const& words)
{
    const QStringList names = PartNames();
    for (QString const& name : without) {
        if (!names.contains(name))
            m_error = QObject::tr("Not a part of a report: %1").arg(name);
    }
    if (!m_error.isEmpty())
        return;
    const QList<ReportPart> all = AllParts();
    QList<ReportPart> parts;
    for (int i = 0; i < all.size(); ++i) {
        if (!without.contains(names.at(i)))
            parts.append(all.at(i));
    }
    Redactor redactor;
    OwnNames::AddTo(redactor);
    redactor.SetWords(words);
    const QString reason = Report(parts, redactor).Save(path);
    if (reason.isEmpty())
        m_answer = path.toLocal8Bit() + '\n';
    else
        m_error = QObject::tr("Could not save %1: %2").arg(path, reason);
}

} // namespace Velocor
