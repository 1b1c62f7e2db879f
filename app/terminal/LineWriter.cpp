// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/LineWriter.h"

#include "app/logfile/LogRows.h"
#include "app/logfile/LogSeverities.h"
#include "app/terminal/TextFormats.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr QLatin1Char Blank(' ');

// The columns of text: those of programs, of their widest name, and the lines.
class ProgramColumn
{
public:
    ProgramColumn(bool isShown, QStringList const& names) : m_isShown(isShown)
    {
        for (QString const& name : names)
            m_width = std::max<int>(m_width, name.size());
    }

    bool isShown() const { return m_isShown; }

    QString text(QString const& program) const
    {
        return m_isShown ? TextFormats::Harmless(program).leftJustified(m_width) + Blank + Blank
                         : QString();
    }

private:
    bool m_isShown;
    int m_width = 0;
};

// The bytes of the lines as they are in the files. Those in UTF-16 become UTF-8: their line ends
// could not be told from others'.
class TextLines : public LineWriter
{
public:
    TextLines(ProgramColumn const& programs, OutputBuffer& output)
        : m_programs(programs), m_output(&output)
    {}

    void Write(PrintedLine const& line) override
    {
        if (m_isIncomplete)
            m_output->Write("\n", 1);
        m_isIncomplete = false;
        if (m_programs.isShown())
            m_output->Write(m_programs.text(line.program).toLocal8Bit());
        if (line.parser.fileType().encoding.isWide()) {
            m_output->Write(line.parser.Text(line.content).toUtf8() + '\n');
            return;
        }
        m_output->Write(line.bytes);
        m_isIncomplete = !line.bytes.endsWith('\n');
    }

private:
    ProgramColumn m_programs;
    OutputBuffer* m_output;
    bool m_isIncomplete = false; // the last line has no end, which it gets if another one follows
};

// The same for people at a terminal, which knows one encoding and obeys escape sequences.
class TerminalLines : public LineWriter
{
public:
    TerminalLines(ProgramColumn const& programs, OutputBuffer& output)
        : m_programs(programs), m_output(&output)
    {
        const QByteArray terminal = qgetenv("TERM");
        m_isColored = qEnvironmentVariableIsEmpty("NO_COLOR") && terminal != "dumb";
    }

    void Write(PrintedLine const& line) override
    {
        const QString shown = TextFormats::Harmless(line.parser.Text(line.content));
        const QByteArray text = (m_programs.text(line.program) + shown).toLocal8Bit();
        if (m_isColored && LogSeverities::IsProblem(line.severity))
            m_output->Write((line.severity == LogEntry::Warning ? "\033[33m" : "\033[31m") + text +
                            "\033[0m\n");
        else
            m_output->Write(text + '\n');
    }

private:
    ProgramColumn m_programs;
    OutputBuffer* m_output;
    bool m_isColored;
};

class MarkdownLines : public LineWriter
{
public:
    MarkdownLines(ProgramColumn const& programs, OutputBuffer& output)
        : m_programs(programs), m_output(&output)
    {}

    void Write(PrintedLine const& line) override
    {
        const QString text = line.parser.Text(line.content);
        m_lines += (m_programs.text(line.program) + text).toUtf8() + '\n';
    }

    void End() override { m_output->Write(TextFormats::MarkdownBlock(m_lines)); }

private:
    ProgramColumn m_programs;
    OutputBuffer* m_output;
    QByteArray m_lines; // the fence has to be longer than any in them
};

class CsvLines : public LineWriter
{
public:
    explicit CsvLines(OutputBuffer& output) : m_output(&output)
    {
        m_output->Write(TextFormats::CsvRecord(
            {QStringLiteral("program"), QStringLiteral("file"), QStringLiteral("line"),
             QStringLiteral("time"), QStringLiteral("severity"), QStringLiteral("elapsed"),
             QStringLiteral("message")}));
    }

    void Write(PrintedLine const& line) override
    {
        const LogEntry entry = line.parser.Parse(line.content);
        m_output->Write(TextFormats::CsvRecord(
            {line.program, line.path, QString::number(line.number), TextFormats::Time(line.time),
             QString::fromLatin1(LogSeverities::LoggedName(entry.severity)), entry.elapsed,
             entry.message}));
    }

private:
    OutputBuffer* m_output;
};

class JsonLines : public LineWriter
{
public:
    explicit JsonLines(OutputBuffer& output) : m_output(&output) {}

    void Write(PrintedLine const& line) override
    {
        const LogEntry entry = line.parser.Parse(line.content);
        QVector<QPair<char const*, QString>> members = {
            {"program", TextFormats::JsonText(line.program)},
            {"file", TextFormats::JsonText(line.path)},
            {"line", QString::number(line.number)}};
        const auto add = [&members](char const* name, QString const& text) {
            if (!text.isEmpty())
                members.append({name, TextFormats::JsonText(text)});
        };
        add("time", TextFormats::Time(line.time));
        add("severity", QString::fromLatin1(LogSeverities::LoggedName(entry.severity)));
        if (!entry.elapsed.isEmpty())
            members.append({"elapsed", QString::number(entry.elapsed.toLongLong())});
        members.append({"message", TextFormats::JsonText(entry.message)});
        m_output->Write(TextFormats::JsonLine(members));
    }

private:
    OutputBuffer* m_output;
};

} // namespace

std::unique_ptr<LineWriter> LineWriter::Make(TerminalOptions const& options, bool isTerminal,
                                             QStringList const& names, OutputBuffer& output)
{
    const ProgramColumn programs(options.showsProgram, names);
    switch (options.format) {
    case TerminalOptions::Text:
        break;
    case TerminalOptions::Markdown:
        return std::make_unique<MarkdownLines>(programs, output);
    case TerminalOptions::Csv:
        return std::make_unique<CsvLines>(output);
    case TerminalOptions::Json:
        return std::make_unique<JsonLines>(output);
    }
    if (isTerminal)
        return std::make_unique<TerminalLines>(programs, output);
    return std::make_unique<TextLines>(programs, output);
}

} // namespace Velocor
