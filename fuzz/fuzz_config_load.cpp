// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Configuration files: any bytes load or fail; whatever was loaded, if it is in the range that the
// store promises, survives saving and loading again.

#include "FuzzInput.h"
#include "XmlMutator.h"

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigFileSection.h"
#include "common/config/TorkOrderedHash_p.h"
#include "support/PrivateField.h"

#include <QFile>
#include <QMap>
#include <QTemporaryDir>

// The store has no operation that lists its sections.
struct SectionTable
{
    using Field = QScopedPointer<TorkOrderedHash<TorkConfigFileSection*>> TorkConfigFile::*;
    friend Field privateField(SectionTable);
};
template struct PrivateField<SectionTable, &TorkConfigFile::m_sections>;

namespace {

using Sections = QMap<QString, QMap<QString, QString>>;

bool IsPlainName(QString const& name)
{
    bool plain = !name.isEmpty() && name[0].unicode() < 128 && name[0].isLetter();
    for (QChar c : name)
        plain = plain && c.unicode() < 128 && (c.isLetterOrNumber() || c == '_');
    return plain;
}

// Printable ASCII and line ends, not a terminator of CDATA, no placeholder.
bool IsPlainValue(QString const& value)
{
    bool plain = !value.isEmpty() && !value.contains("]]>") && !value.contains('%');
    for (QChar c : value)
        plain = plain && ((c.unicode() >= ' ' && c.unicode() < 127) || c == '\n' || c == '\t');
    return plain;
}

// An element with the root's name is another root to the loader.
bool IsPromised(QString const& section, QString const& key, QString const& value)
{
    const QString root = "VelocorSettings";
    return IsPlainName(section) && section != root && IsPlainName(key) && key != root &&
           IsPlainValue(value);
}

void Write(QString const& path, QByteArray const& bytes)
{
    QFile file(path);
    Require(file.open(QIODevice::WriteOnly));
    Require(file.write(bytes) == bytes.size());
}

Sections Contents(TorkConfigFile const& settings)
{
    Sections contents;
    for (auto const& section : *(settings.*privateField(SectionTable()))) {
        Require(section.key == section.value->name());
        auto& items = contents[section.key];
        const auto stored = section.value->values();
        for (auto const& item : stored)
            items[item.key] = item.value;
    }
    return contents;
}

Sections Promised(Sections const& contents)
{
    Sections promised;
    for (auto section = contents.begin(); section != contents.end(); ++section) {
        for (auto item = section->begin(); item != section->end(); ++item) {
            if (IsPromised(section.key(), item.key(), *item))
                promised[section.key()][item.key()] = *item;
        }
    }
    return promised;
}

void Fill(TorkConfigFile& settings, Sections const& contents)
{
    for (auto section = contents.begin(); section != contents.end(); ++section) {
        for (auto item = section->begin(); item != section->end(); ++item)
            Require(settings.WriteItem(section.key(), item.key(), *item));
    }
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    return 0;
}

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    return MutateDocument(data, size, maximum, seed, {"VelocorSettings", "Section", "key"});
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static QTemporaryDir folder;
    const QString path = folder.path() + "/settings.cfg";
    Write(path, QByteArray(reinterpret_cast<char const*>(data), int(size)));

    TorkConfigFile settings(path);
    const bool loaded = settings.Load();
    Require(loaded == settings.m_lastError.isEmpty());

    // Whatever was loaded can be saved, and the result can be checked.
    const Sections contents = Contents(settings);
    Require(settings.Save());
    TorkConfigFile saved(path);
    const bool loadedAgain = saved.Load();

    const Sections promised = Promised(contents);
    if (promised == contents) {
        Require(loadedAgain);
        Require(Contents(saved) == contents);
        return 0;
    }

    TorkConfigFile rest(path);
    Fill(rest, promised);
    Require(rest.Save());
    Require(saved.Load());
    Require(Contents(saved) == promised);
    return 0;
}
