// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The cost of one unit of each kind of work when there are few, more and many of them.
//
// Each benchmark is named "growth|WHAT|COUNT" and counts its units.

#include "app/AppUtils.h"
#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlFile.h"
#include "support/BenchmarkMain.h"
#include "support/ScratchFolder.h"
#include "support/XmlDocuments.h"

#include <QFile>

#include <benchmark/benchmark.h>

#include <array>
#include <memory>

namespace {

// A log in its own folder that writes up to the given size before it rotates.
class OwnLog
{
public:
    explicit OwnLog(int maximumSize)
    {
        TorkConfigFile settings(m_folder.file("logsettings.cfg"), "LogSettings");
        settings.WriteItem("config", "maxLogFileSize", maximumSize);
        settings.WriteItem("config", "filePrefix", "bench");
        settings.Save();

        m_log.setPreferencesFileName(m_folder.file("logsettings.cfg"));
        m_log.loadPreferences();
    }

    TorkLog& log() { return m_log; }

    void write(int entries)
    {
        for (int i = 0; i < entries; ++i)
            m_log.write(TorkLog::Notification, m_message);
    }

    QString path() const { return m_folder.path(); }

    qint64 size() const { return QFile(m_folder.file("bench.log")).size(); }

private:
    ScratchFolder m_folder;
    TorkLog m_log{m_folder.path()};
    QString m_message = QString(100, 'x');
};

void WriteEntries(benchmark::State& state, int entries)
{
    for (auto _ : state) {
        state.PauseTiming();
        auto own = std::make_unique<OwnLog>(2000000000);
        state.ResumeTiming();
        own->write(entries);
        state.PauseTiming();
        Require(own->size() > entries * 100LL, QStringLiteral("entries are missing"));
        own.reset();
        state.ResumeTiming();
    }
}

// 10,000 entries after the given number of others. `maximumSize` decides whether the file is below
// its limit or well past it.
void WriteEntriesAfter(benchmark::State& state, int present, int maximumSize)
{
    constexpr int entries = 10000;
    OwnLog own(maximumSize);
    own.write(present);
    for (auto _ : state)
        own.write(entries);
    Require(own.size() > (present + entries) * 100LL, QStringLiteral("entries are missing"));
    state.counters["units"] = entries;
}

constexpr int KeysOfSection = 100;

void FillSettings(TorkConfigFile& settings, int values)
{
    for (int i = 0; i < values; ++i)
        settings.WriteItem(QStringLiteral("Section%1").arg(i / KeysOfSection),
                           QStringLiteral("Key%1").arg(i % KeysOfSection),
                           QStringLiteral("Text of the value number %1").arg(i));
}

void LoadValues(benchmark::State& state, int values)
{
    const ScratchFolder folder;
    const QString fileName = folder.file("settings.cfg");
    {
        TorkConfigFile settings(fileName);
        FillSettings(settings, values);
        settings.Save();
    }
    for (auto _ : state) {
        TorkConfigFile settings(fileName);
        Require(settings.Load(), settings.m_lastError);
    }
}

void SaveValues(benchmark::State& state, int values)
{
    const ScratchFolder folder;
    TorkConfigFile settings(folder.file("settings.cfg"));
    FillSettings(settings, values);
    for (auto _ : state)
        settings.Save();
}

void StoreValues(benchmark::State& state, int values)
{
    for (auto _ : state) {
        TorkConfigFile settings{QString()};
        FillSettings(settings, values);
    }
}

void WriteElements(benchmark::State& state, int elements)
{
    const ScratchFolder folder;
    const QString name = QStringLiteral("title");
    const QString text = QStringLiteral("Bookmark number 1234");
    for (auto _ : state) {
        TorkXmlFile writer(folder.file("written.xml"));
        Require(writer.open(QIODevice::WriteOnly), writer.errorString());
        for (int i = 0; i < elements; ++i)
            writer.WriteElement(name, text);
        writer.flush();
    }
}

void ParseStates(benchmark::State& state, int elements)
{
    const ScratchFolder folder;
    const QString fileName = folder.file("generated.xml");
    WriteGeneratedDocument(fileName, 0, elements);
    for (auto _ : state) {
        SkippingManager manager;
        Require(ReadDocument(fileName, manager), QStringLiteral("not parsed"));
    }
}

// The oldest entry moves to the front, so that all the others move.
void UpdateRecentFiles(benchmark::State& state, int entries)
{
    QStringList files;
    for (int i = 0; i < entries; ++i)
        files.append(QStringLiteral("/usr/share/documents/chapter%1.txt").arg(i));
    const QString list = files.join('|');
    const QString oldest = files.last();
    for (auto _ : state) {
        QString updated = list;
        AppUtils::AddToMRUList(oldest, updated, entries);
        benchmark::DoNotOptimize(updated);
    }
}

// All older files move up by one, and the current one becomes the first of them.
void RotateFiles(benchmark::State& state, int files)
{
    for (auto _ : state) {
        state.PauseTiming();
        auto own = std::make_unique<OwnLog>(2000000000);
        TorkConfigFile settings(own->path() + "logsettings.cfg", "LogSettings");
        settings.Load();
        settings.WriteItem("config", "maxLogFiles", files + 10);
        settings.Save();
        own->log().loadPreferences();
        own->write(1);
        own->log().close();
        for (int number = 1; number <= files; ++number) {
            QFile file(own->path() + QStringLiteral("bench.log.%1").arg(number));
            Require(file.open(QIODevice::WriteOnly), file.errorString());
        }
        state.ResumeTiming();
        own->log().deleteOldFiles();
        state.PauseTiming();
        Require(QFile::exists(own->path() + QStringLiteral("bench.log.%1").arg(files + 1)),
                QStringLiteral("the older files did not move"));
        own.reset();
        state.ResumeTiming();
    }
}

// Ten and a hundred times the smallest size follow. The smaller the size the more often it is
// measured, so that all take about the same time and none is measured cold.
template <class Function>
void Register(std::string const& what, int smallest, Function const& function)
{
    int count = smallest;
    for (int times : {100, 10, 1}) {
        const std::string name = "growth|" + what + '|' + std::to_string(count);
        benchmark::RegisterBenchmark(name.c_str(),
                                     [=](benchmark::State& state) {
                                         function(state, count);
                                         state.counters["units"] = count;
                                     })
            ->Iterations(times)
            ->UseRealTime();
        count *= 10;
    }
}

void RegisterAfter(std::string const& what, int smallest, int maximumSize)
{
    for (int present : {smallest, smallest * 10, smallest * 100}) {
        const std::string name = "growth|" + what + '|' + std::to_string(present);
        benchmark::RegisterBenchmark(name.c_str(), WriteEntriesAfter, present, maximumSize)
            ->Iterations(1)
            ->UseRealTime();
    }
}

} // namespace

void RegisterBenchmarks(bool quick)
{
    const int less = quick ? 10 : 1;
    Register("log entry, by total entries", 10000 / less, WriteEntries);
    RegisterAfter("log entry below the size limit, by entries before it", 10000 / less, 2000000000);
    RegisterAfter("log entry past the size limit, by entries before it", 10000 / less, 2048);
    Register("value stored, by number of values", 1000 / less, StoreValues);
    Register("value loaded, by number of values", 1000 / less, LoadValues);
    Register("value saved, by number of values", 1000 / less, SaveValues);
    Register("element written, by number of elements", 10000 / less, WriteElements);
    Register("state parsed, by number of states", 10000 / less, ParseStates);
    Register("MRU entry, by number of entries", 100 / less, UpdateRecentFiles);
    Register("numbered log file moved, by number of files", 10, RotateFiles);
}
