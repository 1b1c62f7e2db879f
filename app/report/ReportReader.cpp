// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/ReportReader.h"

#include "app/history/HistoryCursor.h"
#include "app/history/HistoryTime.h"
#include "app/history/LogFormats.h"
#include "app/history/LogHistory.h"
#include "app/logfile/LogSeverities.h"
#include "app/report/SecretFinder.h"

#include <QCoreApplication>
#include <QFile>
#include <QFileInfo>
#include <QLocale>
#include <QRegularExpression>
#include <QSysInfo>

#include <algorithm>
#include <deque>
#include <numeric>
#include <vector>

namespace Velocor {

namespace {

// How many entries before the end problems are looked for in.
constexpr size_t MaximumEntries = 100000;

QString FactLine(QString const& caption, QString const& text)
{
    return caption + QLatin1String(": ") + text + QLatin1Char('\n');
}

QString FolderLine(QString const& caption, char const* property)
{
    const QString path = QCoreApplication::instance()->property(property).toString();
    const QString state = QFileInfo(path).isDir() ? QString() : QObject::tr(" (does not exist)");
    return FactLine(caption, path + state);
}

QString ExitText(HistoryRun::Exit exit)
{
    switch (exit) {
    case HistoryRun::Normal:
        return QObject::tr("it ended normally");
    case HistoryRun::Abnormal:
        return QObject::tr("it was killed or crashed");
    case HistoryRun::Running:
        return QObject::tr("it is running");
    case HistoryRun::Unknown:
        break;
    }
    return QObject::tr("nothing tells how it ended");
}

QString TimeText(qint64 time)
{
    return time < 0 ? QObject::tr("unknown") : QString::fromLatin1(HistoryTime::Text(time));
}

QString RunText(HistoryRun const& run)
{
    const auto problems =
        run.counts[LogEntry::Warning] + run.counts[LogEntry::Error] + run.counts[LogEntry::Fatal];
    return QObject::tr("from %1 to %2, %3 lines, problems: %4; %5")
        .arg(TimeText(run.start), TimeText(run.end))
        .arg(run.endLine - run.firstLine)
        .arg(problems)
        .arg(ExitText(run.exit));
}

QString LineText(HistoryCursor const& cursor)
{
    const bool isLong = cursor.content().size() > ReportReader::LineLimit;
    return cursor.file().parser().Text(cursor.content().left(ReportReader::LineLimit)) +
           (isLong ? QString(QChar(0x2026)) : QString()) + QLatin1Char('\n');
}

struct Entry
{
    QString text; // of all lines
    bool isProblem;
    size_t run;
};

// The last runs of a log and its last entries, collected line by line.
class LogCollector
{
public:
    explicit LogCollector(LogHistory const& history) : m_history(history)
    {
        HistoryCursor cursor(history, false);
        while (cursor.Next())
            add(cursor);
    }

    ReportPart Runs() const;
    QString Problems() const;

private:
    void add(HistoryCursor& cursor);
    QString endOf(size_t run) const;

    LogHistory const& m_history;
    std::deque<QString> m_lines[2]; // of the last run and the one before
    std::deque<Entry> m_entries;
};

void LogCollector::add(HistoryCursor& cursor)
{
    const QString line = LineText(cursor);
    const auto run = static_cast<size_t>(&cursor.run() - m_history.runs().data());
    const size_t runsAfter = m_history.runs().size() - 1 - run;
    if (runsAfter < 2) {
        std::deque<QString>& lines = m_lines[runsAfter];
        lines.push_back(line);
        if (lines.size() > ReportReader::MaximumRunLines)
            lines.pop_front();
    }
    const LogEntry entry =
        cursor.file().parser().Parse(cursor.content().left(ReportReader::LineLimit));
    if (entry.isEntry || m_entries.empty() || m_entries.back().run != run) {
        m_entries.push_back({line, LogSeverities::IsProblem(entry.severity), run});
        if (m_entries.size() > MaximumEntries)
            m_entries.pop_front();
    } else if (m_entries.back().text.size() < ReportReader::LineLimit) {
        m_entries.back().text += line;
    }
}

QString LogCollector::endOf(size_t run) const
{
    return std::accumulate(m_lines[run].begin(), m_lines[run].end(), QString());
}

ReportPart LogCollector::Runs() const
{
    ReportPart part;
    part.title = QObject::tr("This run and the one before");
    std::vector<HistoryRun> const& runs = m_history.runs();
    if (runs.empty())
        part.text = QObject::tr("The log is empty.\n");
    static const QString names[] = {QStringLiteral("last-run.log"),
                                    QStringLiteral("run-before.log")};
    const QString captions[] = {QObject::tr("The last run"), QObject::tr("The run before")};
    for (size_t i = 0; i < std::min<size_t>(2, runs.size()); ++i) {
        part.text += FactLine(QStringLiteral("%1 (%2)").arg(captions[i], names[i]),
                              RunText(runs[runs.size() - 1 - i]));
        part.files.append({names[i], endOf(i)});
    }
    return part;
}

QString LogCollector::Problems() const
{
    constexpr size_t around = ReportReader::EntriesAround;
    std::vector<bool> isShown(m_entries.size());
    int problems = 0;
    for (size_t i = m_entries.size(); i-- > 0 && problems < ReportReader::MaximumProblems;) {
        if (!m_entries[i].isProblem)
            continue;
        ++problems;
        const size_t first = i < around ? 0 : i - around;
        for (size_t j = first; j < std::min(m_entries.size(), i + around + 1); ++j)
            isShown[j] = isShown[j] || m_entries[j].run == m_entries[i].run;
    }
    QString text;
    for (size_t i = 0; i < m_entries.size(); ++i) {
        if (!isShown[i])
            continue;
        const bool isAfterGap =
            i > 0 && (!isShown[i - 1] || m_entries[i - 1].run != m_entries[i].run);
        if (isAfterGap && !text.isEmpty())
            text += QStringLiteral("...\n");
        text += m_entries[i].text;
    }
    return text.isEmpty() ? QObject::tr("None.\n") : text;
}

} // namespace

QString ReportReader::Versions()
{
    return FactLine(QObject::tr("Program"),
                    QStringLiteral("Velocor %1").arg(QLatin1String(VELOCOR_VERSION))) +
           FactLine(QObject::tr("Built with Qt"), QLatin1String(QT_VERSION_STR)) +
           FactLine(QObject::tr("Running with Qt"), QLatin1String(qVersion())) +
           FactLine(QObject::tr("Build ABI"), QSysInfo::buildAbi()) +
           FactLine(QObject::tr("System"), QSysInfo::prettyProductName()) +
           FactLine(QObject::tr("Kernel"),
                    QSysInfo::kernelType() + QLatin1Char(' ') + QSysInfo::kernelVersion()) +
           FactLine(QObject::tr("Processor"), QSysInfo::currentCpuArchitecture()) +
           FactLine(QObject::tr("Locale"), QLocale::system().name());
}

QString ReportReader::Places()
{
    return FactLine(QObject::tr("Organization"), QCoreApplication::organizationName()) +
           FactLine(QObject::tr("Product"), QCoreApplication::applicationName()) +
           FolderLine(QObject::tr("Installation"), "RootPath") +
           FolderLine(QObject::tr("Data"), "DataPath") +
           FolderLine(QObject::tr("Documents"), "DocPath");
}

ReportPart ReportReader::Settings(QString const& title, QStringList const& paths)
{
    ReportPart part;
    part.title = title;
    for (QString const& path : paths) {
        QFile file(path);
        if (!QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly))
            continue;
        // Settings files are in Latin-1.
        const QString text = QString::fromLatin1(file.read(MaximumFileSize));
        const QString name = QStringLiteral("settings/%1").arg(QFileInfo(path).fileName());
        part.text += FactLine(name, QObject::tr("%1 bytes").arg(file.size()));
        part.files.append({name, WithoutSecretValues(text)});
    }
    if (part.files.isEmpty())
        part.text = QObject::tr("There are none.\n");
    return part;
}

QList<ReportPart> ReportReader::Log(QString const& path)
{
    LogHistory history(LogFormats::ParserFor(path));
    if (!path.isEmpty()) {
        history.ReadLog(path);
        history.ReadTimes();
        history.ReadEnds(path);
    }
    const LogCollector collector(history);
    ReportPart runs = collector.Runs();
    for (QString const& error : history.errors())
        runs.text += error + QLatin1Char('\n');
    return {runs, {QObject::tr("Problems"), collector.Problems(), {}}};
}

QString ReportReader::EndOfAbnormalRun(QString const& path)
{
    LogHistory history(LogFormats::ParserFor(path));
    history.ReadLog(path);
    history.ReadTimes();
    history.ReadEnds(path);
    std::vector<HistoryRun> const& runs = history.runs();
    auto wanted = std::find_if(runs.rbegin(), runs.rend(), [](HistoryRun const& run) {
        return run.exit == HistoryRun::Abnormal;
    });
    if (wanted == runs.rend() && runs.size() > 1)
        wanted = runs.rbegin() + 1;
    std::deque<QString> lines;
    HistoryCursor cursor(history, false);
    while (wanted != runs.rend() && cursor.Next()) {
        if (&cursor.run() != &*wanted)
            continue;
        lines.push_back(LineText(cursor));
        if (lines.size() > LastLines)
            lines.pop_front();
    }
    return std::accumulate(lines.begin(), lines.end(), QString());
}

QString ReportReader::WithoutSecretValues(QString const& text)
{
    static const QRegularExpression start(QStringLiteral(
        "<([A-Za-z_][\\w.-]*)(?:\\s[^<>]*?(?:key|name)\\s*=\\s*[\"']([^\"'<>]*)[\"'])?"
        "[^<>]*(?<!/)>"));
    QString safe;
    int from = 0;
    for (;;) {
        const QRegularExpressionMatch element = start.match(text, from);
        if (!element.hasMatch())
            return safe + text.mid(from);
        const int valueStart = static_cast<int>(element.capturedEnd());
        safe += text.mid(from, valueStart - from);
        from = valueStart;
        if (!SecretFinder::IsSecretName(element.captured(1)) &&
            !SecretFinder::IsSecretName(element.captured(2)))
            continue;
        const QString end = QStringLiteral("</%1>").arg(element.captured(1));
        const int valueEnd = static_cast<int>(text.indexOf(end, valueStart));
        from = valueEnd < 0 ? static_cast<int>(text.size()) : valueEnd;
        safe += QLatin1String("(left out)"); // which is known to be no password
    }
}

} // namespace Velocor
