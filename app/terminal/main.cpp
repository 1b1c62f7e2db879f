// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppPaths.h"
#include "app/history/HistoryMerge.h"
#include "app/history/LogFormats.h"
#include "app/terminal/LineWriter.h"
#include "app/terminal/LogFollower.h"
#include "app/terminal/LogSources.h"
#include "app/terminal/OutputBuffer.h"
#include "app/terminal/ReportCommand.h"
#include "app/terminal/RunTable.h"
#include "app/terminal/TerminalOptions.h"
#include "app/terminal/TextFormats.h"

#include <QCoreApplication>
#include <QObject>

#include <cstdio>
#include <memory>
#include <unistd.h>
#include <vector>

namespace {

using namespace Velocor; // NOLINT(google-build-using-namespace): all of this file is about it

// As grep has them.
enum ExitCode { Found = 0, NothingFound = 1, Trouble = 2 };

// Names of files and what users type may have characters that control the terminal.
void PrintError(QString const& error)
{
    std::fprintf(stderr, "velocor-log: %s\n",
                 TextFormats::Harmless(error).toLocal8Bit().constData());
}

class Command
{
public:
    explicit Command(TerminalOptions options)
        : m_options(std::move(options)), m_sources(m_options.names, m_options.isMerged)
    {}

    int run();

private:
    std::unique_ptr<LogHistory> read(PrintedLog const& source, LogFilter const& filter);
    void complain(QString const& problem);
    void printRuns();
    void printLines();
    void printOneByOne(LineWriter& writer, bool withTimes);
    void printMerged(LineWriter& writer);
    void printPatterns();
    void print(TextTable const& table);
    void print(PrintedLog const& source, HistoryCursor& cursor, LineWriter& writer);
    void addFollower(PrintedLog const& source, LogHistory const& history, LineWriter& writer);
    void follow();

    TerminalOptions m_options;
    LogSources m_sources;
    OutputBuffer m_output;
    std::vector<std::unique_ptr<LogFollower>> m_followers;
    bool m_isFound = false;
    bool m_hasTrouble = false;
};

void Command::complain(QString const& problem)
{
    m_hasTrouble = true;
    m_output.Flush(); // so that the complaint comes after the lines before it
    PrintError(problem);
}

std::unique_ptr<LogHistory> Command::read(PrintedLog const& source, LogFilter const& filter)
{
    auto history = std::make_unique<LogHistory>(LogFormats::ParserFor(source.path()), filter);
    source.Read(*history);
    // Users do not know the copy of standard input.
    const auto shown = [&source](QString text) {
        return source.isInput ? text.replace(source.path(), source.name) : text;
    };
    for (QString const& error : history->errors())
        complain(shown(error));
    for (HistoryFile const& file : history->files()) {
        if (file.parser().fileType().content == LogFileType::Binary)
            complain(QObject::tr("%1: A binary file, printed as if it were text")
                         .arg(shown(file.path())));
        if (file.slowLine() > 0)
            complain(QObject::tr("%1: line %2: the expression takes too long, so all lines count "
                                 "as matches")
                         .arg(shown(file.path()))
                         .arg(file.slowLine()));
    }
    return history;
}

void Command::printRuns()
{
    RunTable table;
    for (PrintedLog const& source : m_sources.sources()) {
        const std::unique_ptr<LogHistory> history = read(source, LogFilter());
        history->ReadTimes();
        history->ReadEnds(source.CurrentPath());
        table.Add(source.name, *history);
    }
    if (m_options.isMerged)
        table.SortByTime();
    print(table.Table());
}

void Command::print(TextTable const& table)
{
    m_isFound = !table.isEmpty();
    table.Print(m_options.format, m_output);
}

// Of entries; their further lines do not count.
void Command::printPatterns()
{
    PatternList patterns;
    for (PrintedLog const& source : m_sources.sources()) {
        const std::unique_ptr<LogHistory> history = read(source, m_options.filter);
        HistoryCursor cursor(*history, true);
        while (cursor.Next()) {
            const LogEntry entry = cursor.file().parser().Parse(cursor.content());
            if (entry.isEntry && m_options.span.Contains(cursor.time()))
                patterns.Add(entry.severity, entry.message, cursor.time());
        }
    }
    print(PatternTable(patterns));
}

void Command::print(PrintedLog const& source, HistoryCursor& cursor, LineWriter& writer)
{
    // It is printed once it is complete.
    const bool isIncomplete =
        m_options.follows && cursor.start() >= cursor.file().rows().complete();
    if (isIncomplete || !m_options.span.Contains(cursor.time()))
        return;
    m_isFound = true;
    writer.Write({source.name, cursor.file().path(), cursor.file().parser(), cursor.bytes(),
                  cursor.content(), cursor.severity(), cursor.line() + 1, cursor.time()});
}

void Command::addFollower(PrintedLog const& source, LogHistory const& history, LineWriter& writer)
{
    if (!m_options.follows)
        return;
    const QString path = source.log.isEmpty() ? source.files.last() : source.log;
    const auto print = [this, &writer](PrintedLine const& line) {
        if (m_options.span.Contains(line.time))
            writer.Write(line);
    };
    const auto flush = [this] {
        if (!m_output.Flush())
            QCoreApplication::quit();
    };
    m_followers.push_back(std::make_unique<LogFollower>(source.name, path, print, flush));
    if (!history.files().empty() && history.files().back().path() == path)
        m_followers.back()->NotePrinted(history.files().back());
}

// Until a signal ends the program.
void Command::follow()
{
    m_output.Flush();
    for (int i = 0; i < m_sources.sources().size(); ++i)
        m_followers[static_cast<size_t>(i)]->Start(
            LogFormats::ParserFor(m_sources.sources().at(i).path()), m_options.filter);
    QCoreApplication::exec();
}

// One log after the other, so that only one is in memory.
void Command::printOneByOne(LineWriter& writer, bool withTimes)
{
    for (PrintedLog const& source : m_sources.sources()) {
        const std::unique_ptr<LogHistory> history = read(source, m_options.filter);
        HistoryCursor cursor(*history, withTimes);
        while (m_output.error() == 0 && cursor.Next())
            print(source, cursor, writer);
        addFollower(source, *history, writer);
    }
}

void Command::printMerged(LineWriter& writer)
{
    std::vector<std::unique_ptr<LogHistory>> histories;
    std::vector<HistoryCursor> cursors;
    for (PrintedLog const& source : m_sources.sources()) {
        histories.push_back(read(source, m_options.filter));
        cursors.emplace_back(*histories.back(), true);
    }
    HistoryMerge merge(std::move(cursors));
    while (m_output.error() == 0 && merge.Next())
        print(m_sources.sources().at(static_cast<int>(merge.log())), merge.cursor(), writer);
    for (size_t log = 0; log < histories.size(); ++log)
        addFollower(m_sources.sources().at(static_cast<int>(log)), *histories[log], writer);
}

void Command::printLines()
{
    QStringList names;
    for (PrintedLog const& source : m_sources.sources())
        names.append(source.name);
    const auto writer = LineWriter::Make(m_options, isatty(STDOUT_FILENO) == 1, names, m_output);
    const bool withTimes = m_options.span.isLimited() || m_options.format == TerminalOptions::Csv ||
                           m_options.format == TerminalOptions::Json;
    if (m_options.isMerged)
        printMerged(*writer);
    else
        printOneByOne(*writer, withTimes);
    if (!m_followers.empty() && m_output.error() == 0)
        follow();
    writer->End();
}

int Command::run()
{
    for (QString const& error : m_sources.errors())
        complain(error);
    if (m_options.names.isEmpty() && m_sources.sources().isEmpty())
        PrintError(QObject::tr("No logs of programs in %1").arg(LogSources::FamilyFolder()));
    if (m_options.showsRuns)
        printRuns();
    else if (m_options.showsPatterns)
        printPatterns();
    else
        printLines();
    if (!m_output.Flush())
        complain(QObject::tr("Standard output cannot be written: %1")
                     .arg(qt_error_string(m_output.error())));
    if (m_hasTrouble)
        return Trouble;
    return m_isFound ? Found : NothingFound;
}

int Print(QByteArray const& answer)
{
    OutputBuffer output;
    output.Write(answer);
    return output.Flush() ? Found : Trouble;
}

int MakeReport(QStringList const& arguments)
{
    const ReportCommand command(arguments);
    if (command.error().isEmpty())
        return Print(command.answer());
    PrintError(command.error());
    return Trouble;
}

} // namespace

int main(int argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct();
    if (QCoreApplication::arguments().value(1) == QLatin1String("report"))
        return MakeReport(QCoreApplication::arguments().mid(1));
    TerminalOptions options = TerminalOptions::Parse(QCoreApplication::arguments());
    if (!options.error.isEmpty()) {
        PrintError(options.error);
        return Trouble;
    }
    if (!options.answer.isEmpty())
        return Print(options.answer);
    return Command(std::move(options)).run();
}
