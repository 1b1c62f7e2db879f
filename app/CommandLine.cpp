// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/CommandLine_p.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QFileInfo>

namespace Velocor {

namespace {

constexpr int MaximumComplaints = 20;
constexpr int MaximumComplaintLength = 100; // characters

QString Tr(char const* text)
{
    return QCoreApplication::translate("CommandLine", text);
}

QByteArray Complaint(QString const& option)
{
    const QString text = Tr("velocor: unknown option \"%1\" is ignored\n");
    return text.arg(option.left(MaximumComplaintLength)).toLocal8Bit();
}

} // namespace

// Not QCommandLineParser::process(), which ends the program itself.
CommandLine::CommandLine(QStringList const& arguments)
{
    if (arguments.size() < 2)
        return;
    const QCommandLineOption help({QStringLiteral("h"), QStringLiteral("help")},
                                  Tr("Print this help and exit."));
    const QCommandLineOption version({QStringLiteral("v"), QStringLiteral("version")},
                                     Tr("Print the version and exit."));
    QCommandLineParser parser;
    parser.setSingleDashWordOptionMode(QCommandLineParser::ParseAsLongOptions);
    parser.setApplicationDescription(
        Tr("Shows log files and settings files, and the log of this program."));
    parser.addOption(help);
    parser.addOption(version);
    parser.addPositionalArgument(QStringLiteral("FILE"),
                                 Tr("Files to open; \"-\" is standard input."),
                                 QStringLiteral("[FILE...]"));
    parser.parse(arguments);

    const QStringList unknown = parser.unknownOptionNames().mid(0, MaximumComplaints);
    for (QString const& option : unknown)
        m_complaints += Complaint(option);
    if (parser.isSet(help))
        m_answer = parser.helpText().toLocal8Bit();
    else if (parser.isSet(version))
        m_answer = "velocor " VELOCOR_VERSION "\n";

    const QStringList files = parser.positionalArguments();
    for (QString const& file : files) {
        const bool isInput = file == QLatin1String("-");
        if (!isInput)
            m_files.append(QFileInfo(file).absoluteFilePath());
        else if (!m_files.contains(file))
            m_files.append(file);
    }
}

} // namespace Velocor
