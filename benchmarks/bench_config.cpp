// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Loading, saving and reading settings of two sizes.

#include "common/config/TorkConfigFile.h"
#include "support/BenchmarkMain.h"
#include "support/ScratchFolder.h"

#include <KConfig>
#include <KConfigGroup>
#include <QFile>
#include <QHash>
#include <QSettings>
#include <QXmlDefaultHandler>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

#include <benchmark/benchmark.h>
#include <boost/property_tree/ptree.hpp>
#include <boost/property_tree/xml_parser.hpp>
#include <pugixml.hpp>

#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <functional>
#include <random>
#include <utility>
#include <vector>

namespace {

namespace property_tree = boost::property_tree;

struct Size
{
    int sections;
    int keys;

    std::string text() const
    {
        return std::to_string(sections) + "x" + std::to_string(keys) + " values";
    }
};

QString Section(int section)
{
    return QStringLiteral("Section%1").arg(section);
}

QString Key(int key)
{
    return QStringLiteral("Key%1").arg(key);
}

// The contents of the settings, without characters that one of the formats would have to escape.
QString Value(int section, int key)
{
    const int number = section * 7919 + key * 104729;
    switch (key % 4) {
    case 0:
        return QString::number(number);
    case 1:
        return number % 2 ? QStringLiteral("yes") : QStringLiteral("no");
    case 2:
        return QStringLiteral("Text of the value number %1").arg(number);
    default:
        return QStringLiteral("/usr/share/application/icons/file%1.png").arg(number);
    }
}

using Store = std::function<void(int section, int key, QString const& value)>;
using ValueMaker = QString (*)(int section, int key);

void ForEach(Size size, Store const& store, ValueMaker value)
{
    for (int section = 0; section < size.sections; ++section) {
        for (int key = 0; key < size.keys; ++key)
            store(section, key, value(section, key));
    }
}

// Each contestant: how its settings are created, filled, changed, saved and loaded.

class Tork
{
public:
    static constexpr char const* Name = "TorkConfigFile";

    explicit Tork(QString const& file) : m_settings(file) {}

    void set(int section, int key, QString const& value)
    {
        m_settings.WriteItem(Section(section), Key(key), value);
    }
    void save() { m_settings.Save(); }

    static void load(QString const& file, Size size)
    {
        TorkConfigFile settings(file);
        settings.Load();
        RequireValue(settings, size);
    }

private:
    static void RequireValue(TorkConfigFile& settings, Size size)
    {
        QString none;
        QString value;
        settings.ReadItem(Section(size.sections - 1), Key(size.keys - 1), none, value);
        Require(!value.isEmpty(), QStringLiteral("TorkConfigFile did not load"));
    }

    TorkConfigFile m_settings;
};

class QtSettings
{
public:
    static constexpr char const* Name = "QSettings";

    explicit QtSettings(QString const& file) : m_settings(file, QSettings::IniFormat) {}

    void set(int section, int key, QString const& value)
    {
        m_settings.setValue(Section(section) + '/' + Key(key), value);
    }
    void save() { m_settings.sync(); }

    // The sections are parsed on first access, so each is accessed once.
    static void load(QString const& file, Size size)
    {
        const QSettings settings(file, QSettings::IniFormat);
        const QString key = '/' + Key(size.keys - 1);
        for (int section = 0; section < size.sections; ++section)
            Require(settings.contains(Section(section) + key),
                    QStringLiteral("QSettings did not load"));
    }

private:
    QSettings m_settings;
};

class KdeConfig
{
public:
    static constexpr char const* Name = "KConfig";

    explicit KdeConfig(QString const& file) : m_settings(file, KConfig::SimpleConfig) {}

    void set(int section, int key, QString const& value)
    {
        KConfigGroup(&m_settings, Section(section)).writeEntry(Key(key), value);
    }
    void save() { m_settings.sync(); }

    static void load(QString const& file, Size size)
    {
        const KConfig settings(file, KConfig::SimpleConfig);
        Require(KConfigGroup(&settings, Section(size.sections - 1)).hasKey(Key(size.keys - 1)),
                QStringLiteral("KConfig did not load"));
    }

private:
    KConfig m_settings;
};

class BoostTree
{
public:
    static constexpr char const* Name = "boost::property_tree";

    explicit BoostTree(QString const& file) : m_file(file.toStdString()) {}

    void set(int section, int key, QString const& value)
    {
        m_tree.put(("Settings." + Section(section) + '.' + Key(key)).toStdString(),
                   value.toStdString());
    }
    void save() { property_tree::write_xml(m_file, m_tree); }

    static void load(QString const& file, Size size)
    {
        property_tree::ptree tree;
        property_tree::read_xml(file.toStdString(), tree,
                                property_tree::xml_parser::trim_whitespace);
        const QString last = "Settings." + Section(size.sections - 1) + '.' + Key(size.keys - 1);
        Require(!tree.get<std::string>(last.toStdString()).empty(),
                QStringLiteral("property_tree did not load"));
    }

private:
    std::string m_file;
    property_tree::ptree m_tree;
};

class Pugi
{
public:
    static constexpr char const* Name = "pugixml";

    explicit Pugi(QString const& file) : m_file(file.toStdString())
    {
        m_root = m_document.append_child("Settings");
    }

    void set(int section, int key, QString const& value)
    {
        pugi::xml_node node = child(child(m_root, Section(section)), Key(key));
        node.text().set(value.toUtf8().constData());
    }

    void save()
    {
        const unsigned int flags = pugi::format_indent | pugi::format_no_declaration;
        Require(m_document.save_file(m_file.c_str(), "", flags),
                QStringLiteral("pugixml did not save"));
    }

private:
    static pugi::xml_node child(pugi::xml_node parent, QString const& name)
    {
        const QByteArray utf8 = name.toUtf8();
        const pugi::xml_node present = parent.child(utf8.constData());
        return present ? present : parent.append_child(utf8.constData());
    }

    std::string m_file;
    pugi::xml_document m_document;
    pugi::xml_node m_root;
};

// Sets the file's time so that a library with a cache reads the file again.
void MakeYounger(QString const& fileName, int seconds)
{
    timespec times[2] = {};
    times[0].tv_sec = times[1].tv_sec = 1000000000 + seconds;
    Require(utimensat(AT_FDCWD, QFile::encodeName(fileName).constData(), times, 0) == 0,
            QStringLiteral("the time of a file cannot be set"));
}

template <class Contestant>
void Fill(Contestant& settings, Size size)
{
    ForEach(
        size,
        [&settings](int section, int key, QString const& value) {
            settings.set(section, key, value);
        },
        Value);
}

template <class Load>
void TimeLoads(benchmark::State& state, QString const& file, Load const& load)
{
    static int age = 0;
    for (auto _ : state) {
        state.PauseTiming();
        MakeYounger(file, ++age);
        state.ResumeTiming();
        load(file);
    }
}

template <class Contestant>
void LoadSettings(benchmark::State& state, Size size)
{
    const ScratchFolder folder;
    const QString file = folder.file("settings");
    {
        Contestant settings(file);
        Fill(settings, size);
        settings.save();
    }
    TimeLoads(state, file, [size](QString const& name) { Contestant::load(name, size); });
}

// The minimum that a store has to do: allocate the key and text of each item.
class KeepingHandler : public QXmlDefaultHandler
{
public:
    bool startElement(QString const&, QString const& name, QString const&,
                      QXmlAttributes const&) override
    {
        m_name = QString(name.constData(), name.length());
        m_isFirst = true;
        return true;
    }

    bool characters(QString const& text) override
    {
        if (m_isFirst)
            m_items.emplace_back(m_name, QString(text.constData(), text.length()));
        m_isFirst = false;
        return true;
    }

private:
    QString m_name;
    bool m_isFirst = false;
    std::vector<std::pair<QString, QString>> m_items;
};

// The file of TorkConfigFile, read by the same reader.
template <class Handler>
void LoadWithReader(benchmark::State& state, Size size)
{
    const ScratchFolder folder;
    const QString file = folder.file("settings");
    Tork settings(file);
    Fill(settings, size);
    settings.save();

    TimeLoads(state, file, [](QString const& name) {
        QFile device(name);
        QXmlInputSource source(&device);
        Handler handler;
        QXmlSimpleReader reader;
        reader.setContentHandler(&handler);
        reader.setErrorHandler(&handler);
        Require(reader.parse(source), QStringLiteral("the reader failed"));
    });
}

// One value changes before each save, as some libraries do not save what has not changed.
template <class Contestant>
void SaveSettings(benchmark::State& state, Size size)
{
    const ScratchFolder folder;
    const QString file = folder.file("settings");
    Contestant settings(file);
    Fill(settings, size);

    int round = 1000000;
    for (auto _ : state) {
        settings.set(size.sections - 1, size.keys - 1, QString::number(++round));
        settings.save();
    }
    Require(ReadAll(file).contains(QByteArray::number(round)),
            QStringLiteral("%1 did not save").arg(QLatin1String(Contestant::Name)));
}

void SaveFloor(benchmark::State& state, Size size)
{
    const ScratchFolder folder;
    const QString file = folder.file("settings");
    Tork settings(file);
    Fill(settings, size);
    settings.save();

    const QByteArray bytes = ReadAll(file);
    for (auto _ : state) {
        QFile device(file);
        device.open(QIODevice::WriteOnly | QIODevice::Unbuffered);
        device.write(bytes);
    }
}

// Typed reads: the numbers of 20 sections with 50 keys each, in random order, because nobody reads
// settings sequentially.

constexpr Size ReadSize{20, 50};

int Expected(int section, int key)
{
    return section * 1000 + key;
}

QString Number(int section, int key)
{
    return QString::number(Expected(section, key));
}

QStringList Names(int count, QString (*name)(int))
{
    QStringList names;
    for (int i = 0; i < count; ++i)
        names.append(name(i));
    return names;
}

struct Place
{
    int section;
    int key;
};

std::vector<Place> MixedPlaces()
{
    std::vector<Place> places;
    for (int section = 0; section < ReadSize.sections; ++section) {
        for (int key = 0; key < ReadSize.keys; ++key)
            places.push_back({section, key});
    }
    std::shuffle(places.begin(), places.end(), std::mt19937(42));
    return places;
}

// One number per iteration; `read` gets the indices of section and key.
template <class Read>
void TimeReads(benchmark::State& state, Read const& read)
{
    const std::vector<Place> places = MixedPlaces();
    auto place = places.begin();
    for (auto _ : state) {
        const int number = read(place->section, place->key);
        if (number != Expected(place->section, place->key)) {
            state.SkipWithError("a wrong number was read");
            break;
        }
        if (++place == places.end())
            place = places.begin();
    }
}

void ReadFloor(benchmark::State& state)
{
    QHash<QString, QHash<QString, int>> numbers;
    ForEach(
        ReadSize,
        [&numbers](int section, int key, QString const& value) {
            numbers[Section(section)][Key(key)] = value.toInt();
        },
        Number);
    const QStringList sections = Names(ReadSize.sections, Section);
    const QStringList keys = Names(ReadSize.keys, Key);
    TimeReads(state, [&](int section, int key) {
        return *numbers.constFind(sections.at(section))->constFind(keys.at(key));
    });
}

void ReadTork(benchmark::State& state)
{
    TorkConfigFile settings{QString()};
    ForEach(
        ReadSize,
        [&settings](int section, int key, QString const& value) {
            settings.WriteItem(Section(section), Key(key), value);
        },
        Number);
    const QStringList sections = Names(ReadSize.sections, Section);
    const QStringList keys = Names(ReadSize.keys, Key);
    TimeReads(state, [&](int section, int key) {
        int number = -1;
        settings.ReadInt(sections.at(section), keys.at(key), 0, number);
        return number;
    });
}

void ReadQtSettings(benchmark::State& state)
{
    const ScratchFolder folder;
    QSettings settings(folder.file("settings"), QSettings::IniFormat);
    ForEach(
        ReadSize,
        [&settings](int section, int key, QString const& value) {
            settings.setValue(Section(section) + '/' + Key(key), value);
        },
        Number);
    settings.sync();
    QVector<QStringList> names;
    for (int section = 0; section < ReadSize.sections; ++section) {
        names.append(QStringList());
        for (int key = 0; key < ReadSize.keys; ++key)
            names.last().append(Section(section) + '/' + Key(key));
    }
    TimeReads(state, [&](int section, int key) {
        return settings.value(names.at(section).at(key), 0).toInt();
    });
}

void ReadKdeConfig(benchmark::State& state)
{
    const ScratchFolder folder;
    KConfig settings(folder.file("settings"), KConfig::SimpleConfig);
    ForEach(
        ReadSize,
        [&settings](int section, int key, QString const& value) {
            KConfigGroup(&settings, Section(section)).writeEntry(Key(key), value);
        },
        Number);
    std::vector<KConfigGroup> groups;
    for (int section = 0; section < ReadSize.sections; ++section)
        groups.push_back(KConfigGroup(&settings, Section(section)));
    QList<QByteArray> keys;
    for (int key = 0; key < ReadSize.keys; ++key)
        keys.append(Key(key).toUtf8());
    TimeReads(state, [&](int section, int key) {
        return groups[size_t(section)].readEntry(keys.at(key).constData(), 0);
    });
}

void ReadPugi(benchmark::State& state)
{
    pugi::xml_document document;
    pugi::xml_node root = document.append_child("Settings");
    std::vector<std::string> sections;
    std::vector<std::string> keys;
    for (int key = 0; key < ReadSize.keys; ++key)
        keys.push_back(Key(key).toStdString());
    for (int section = 0; section < ReadSize.sections; ++section) {
        sections.push_back(Section(section).toStdString());
        pugi::xml_node node = root.append_child(sections.back().c_str());
        for (int key = 0; key < ReadSize.keys; ++key)
            node.append_child(keys[size_t(key)].c_str()).text().set(Expected(section, key));
    }
    TimeReads(state, [&](int section, int key) {
        const char* sectionName = sections[size_t(section)].c_str();
        return root.child(sectionName).child(keys[size_t(key)].c_str()).text().as_int();
    });
}

template <class Function, class... Arguments>
void Register(std::string const& group, std::string const& name, int iterations,
              Function const& function, Arguments... arguments)
{
    benchmark::RegisterBenchmark((group + '|' + name).c_str(), function, arguments...)
        ->Iterations(iterations)
        ->UseRealTime();
}

void RegisterSize(Size size)
{
    // About the same duration for either size.
    const int times = size.sections * size.keys > 10000 ? 1 : 20;

    const std::string load = "load " + size.text();
    Register(load, "floor: SAX reader, empty handler", times, LoadWithReader<QXmlDefaultHandler>,
             size);
    Register(load, "SAX reader, texts kept", times, LoadWithReader<KeepingHandler>, size);
    Register(load, Tork::Name, times, LoadSettings<Tork>, size);
    Register(load, QtSettings::Name, times, LoadSettings<QtSettings>, size);
    Register(load, KdeConfig::Name, times, LoadSettings<KdeConfig>, size);
    Register(load, BoostTree::Name, times, LoadSettings<BoostTree>, size);

    const std::string save = "save " + size.text();
    Register(save, "floor: one write of the ready bytes", times * 2, SaveFloor, size);
    Register(save, Tork::Name, times * 2, SaveSettings<Tork>, size);
    Register(save, Pugi::Name, times * 2, SaveSettings<Pugi>, size);
    Register(save, BoostTree::Name, times, SaveSettings<BoostTree>, size);
    Register(save, KdeConfig::Name, times, SaveSettings<KdeConfig>, size);
    Register(save, QtSettings::Name, times, SaveSettings<QtSettings>, size);
}

} // namespace

void RegisterBenchmarks(bool quick)
{
    RegisterSize({20, 50});
    RegisterSize({200, 500});

    const int reads = quick ? 200000 : 1000000;
    Register("typed reads", "floor: two hash lookups", reads, ReadFloor);
    Register("typed reads", "TorkConfigFile", reads, ReadTork);
    Register("typed reads", "QSettings", reads, ReadQtSettings);
    Register("typed reads", "KConfig", reads, ReadKdeConfig);
    Register("typed reads", "pugixml", reads, ReadPugi);
}
