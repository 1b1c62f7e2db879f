// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/TerminalOptions.h"

#include "app/history/HistoryTime.h"
#include "app/logfile/LogSeverities.h"

#include <QCommandLineParser>
#include <QObject>

namespace Velocor {

namespace {

constexpr int MaximumContext = 1000000;

QString Name(char const* name)
{
    return QString::fromLatin1(name);
}

// Severities by their English names, as in the files.
class SeverityList
{
public:
    // Returns false if the text is none.
    bool Read(QString const& text, LogFilter& filter)
    {
        const QStringList names = text.split(QLatin1Char(','));
        for (QString const& name : names) {
            if (!add(name.trimmed()))
                return false;
        }
        for (int severity = LogEntry::Trace; severity <= LogEntry::None; ++severity)
            filter.SetSeverity(static_cast<LogEntry::Severity>(severity), m_shown[severity]);
        return true;
    }

private:
    bool add(QString name)
    {
        const bool isOrWorse = name.endsWith(QLatin1Char('+'));
        if (isOrWorse)
            name.chop(1);
        if (!isOrWorse && name.compare(QLatin1String("none"), Qt::CaseInsensitive) == 0) {
            m_shown[LogEntry::None] = true;
            return true;
        }
        for (int severity = LogEntry::Trace; severity < LogEntry::None; ++severity) {
            char const* known =
                LogSeverities::LoggedName(static_cast<LogEntry::Severity>(severity));
            if (name.compare(QLatin1String(known), Qt::CaseInsensitive) != 0)
                continue;
            const int end = isOrWorse ? LogEntry::None : severity + 1;
            for (int shown = severity; shown < end; ++shown)
                m_shown[shown] = true;
            return true;
        }
        return false;
    }

    bool m_shown[LogEntry::None + 1] = {};
};

// The parser of the command line, and what it makes of the values.
class Parser
{
public:
    Parser();
    TerminalOptions parse(QStringList const& arguments);

private:
    void add(char const* name, QString const& description, char const* value = nullptr);
    void read(TerminalOptions& options) const;
    void readFilter(TerminalOptions& options) const;
    void checkCombination(TerminalOptions& options, bool selectsLines) const;
    void readContext(TerminalOptions& options) const;
    void readFormat(TerminalOptions& options) const;
    bool readTime(char const* name, qint64& time, QString& error) const;
    bool isSet(char const* name) const { return m_parser.isSet(Name(name)); }
    QString value(char const* name) const { return m_parser.value(Name(name)); }

    QCommandLineParser m_parser;
};

Parser::Parser()
{
    m_parser.setApplicationDescription(QObject::tr(
        "Prints log files, or the logs of programs with all of their runs, oldest "
        "first. Without arguments, lists the programs and their runs. \"velocor-log report\" "
        "saves a report of a problem; see \"velocor-log report --help\".\n\n"
        "A TIME is a date, a time or both (2026-11-20, 14:03, \"2026-11-20 14:03\"), or "
        "an interval until now such as -2h, -30m or -1d."));
    m_parser.addOption({{Name("h"), Name("help")}, QObject::tr("Print this help and exit.")});
    m_parser.addOption({{Name("v"), Name("version")}, QObject::tr("Print the version and exit.")});
    add("merge", QObject::tr("Print the lines of several logs by time."));
    add("since", QObject::tr("Only entries from this time on."), "TIME");
    add("until", QObject::tr("Only entries up to this time."), "TIME");
    add("severity",
        QObject::tr("Only entries of these severities: trace, notification, warning, error, fatal; "
                    "none for other lines; warning+ for warnings and worse."),
        "LIST");
    add("match", QObject::tr("Only entries that match a regular expression."), "EXPRESSION");
    add("exclude", QObject::tr("No entries that contain this text. May be repeated."), "TEXT");
    add("context", QObject::tr("Also this many lines before and after each match."), "LINES");
    add("follow", QObject::tr("Then print new lines as they are written, until interrupted."));
    add("runs", QObject::tr("List the runs instead of their lines."));
    add("patterns", QObject::tr("List what messages have in common, numbers and names aside."));
    add("program", QObject::tr("Print the program or file before each line."));
    add("format", QObject::tr("Print text, markdown, csv or json."), "FORMAT");
    m_parser.addPositionalArgument(Name("NAME"),
                                   QObject::tr("Files and programs; \"-\" is standard input."),
                                   Name("[NAME...]"));
}

void Parser::add(char const* name, QString const& description, char const* value)
{
    m_parser.addOption({Name(name), description, value ? Name(value) : QString()});
}

// Not QCommandLineParser::process(), which ends the program itself.
TerminalOptions Parser::parse(QStringList const& arguments)
{
    TerminalOptions options;
    if (!m_parser.parse(arguments))
        options.error = m_parser.errorText();
    else if (isSet("help"))
        options.answer = m_parser.helpText().toLocal8Bit();
    else if (isSet("version"))
        options.answer = "velocor-log " VELOCOR_VERSION "\n";
    else
        read(options);
    return options;
}

void Parser::read(TerminalOptions& options) const
{
    options.names = m_parser.positionalArguments();
    options.isMerged = isSet("merge");
    options.showsProgram = isSet("program");
    options.follows = isSet("follow");
    readFilter(options);
    readContext(options);
    readFormat(options);
    if (!readTime("since", options.span.since, options.error) ||
        !readTime("until", options.span.until, options.error))
        return;

    const bool selectsLines = isSet("severity") || isSet("match") || isSet("exclude") ||
                              isSet("context") || options.span.isLimited();
    options.showsPatterns = isSet("patterns");
    options.showsRuns =
        isSet("runs") || (options.names.isEmpty() && !selectsLines && !options.isMerged &&
                          !options.showsPatterns && !options.follows);
    checkCombination(options, selectsLines);
}

void Parser::checkCombination(TerminalOptions& options, bool selectsLines) const
{
    if (options.follows && (isSet("runs") || options.showsPatterns))
        options.error = QObject::tr("--follow prints lines, so there is no end of a table.");
    if (options.follows && options.format == TerminalOptions::Markdown)
        options.error = QObject::tr("--follow prints lines, so there is no end of a code block.");
    if (options.follows && options.names.contains(QStringLiteral("-")))
        options.error = QObject::tr("Standard input cannot be followed.");
    if (isSet("runs") && options.showsPatterns)
        options.error = QObject::tr("Either --runs or --patterns.");
    if (isSet("runs") && selectsLines)
        options.error = QObject::tr("--runs lists whole runs, so no lines can be selected.");
}

void Parser::readFilter(TerminalOptions& options) const
{
    LogFilter& filter = options.filter;
    if (isSet("severity") && !SeverityList().Read(value("severity"), filter))
        options.error = QObject::tr("Not a list of severities: %1").arg(value("severity"));
    if (m_parser.values(Name("match")).size() > 1)
        options.error = QObject::tr("--match can be given only once. Use \"(this|that)\".");
    if (!filter.SetText(value("match"), true, true))
        options.error =
            QObject::tr("Not a regular expression: %1").arg(LogFilter::ErrorOf(value("match")));
    QStringList excluded;
    const QStringList texts = m_parser.values(Name("exclude"));
    for (QString const& text : texts) {
        if (!text.isEmpty())
            excluded.append(LogTerms::Quoted(text));
    }
    filter.SetTerms(LogTerms(), LogTerms(excluded.join(QLatin1Char(' ')), true));
}

void Parser::readContext(TerminalOptions& options) const
{
    if (!isSet("context"))
        return;
    bool isNumber = false;
    const int lines = value("context").toInt(&isNumber);
    if (!isNumber || lines < 0 || lines > MaximumContext)
        options.error = QObject::tr("Not a number of lines: %1").arg(value("context"));
    else
        options.filter.SetContext(lines);
}

void Parser::readFormat(TerminalOptions& options) const
{
    static const QStringList names = {Name("text"), Name("markdown"), Name("csv"), Name("json")};
    if (!isSet("format"))
        return;
    const int format = names.indexOf(value("format"));
    if (format < 0)
        options.error = QObject::tr("Not a format: %1").arg(value("format"));
    else
        options.format = static_cast<TerminalOptions::Format>(format);
}

// Returns false if the value of an option is no time.
bool Parser::readTime(char const* name, qint64& time, QString& error) const
{
    if (!isSet(name))
        return true;
    time = HistoryTime::OfUser(value(name), HistoryTime::Now());
    if (time < 0)
        error = QObject::tr("Not a time: %1. Times are such as 2026-11-20, 14:03, \"2026-11-20 "
                            "14:03\" or, until now, -2h, -30m and -1d.")
                    .arg(value(name));
    return time >= 0;
}

} // namespace

TerminalOptions TerminalOptions::Parse(QStringList const& arguments)
{
    return Parser().parse(arguments);
}

} // namespace Velocor
