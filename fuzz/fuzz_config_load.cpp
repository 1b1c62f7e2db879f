// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Configuration files: any bytes load or fail; what was loaded, if it lies in the range that the
// store promises, survives saving and loading again.

#include "FuzzInput.h"

#include "common/config/TorkConfigFile.h"

#include <QFile>
#include <QMap>
#include <QTemporaryDir>

namespace {

using Sections = QMap<QString, QMap<QString, QString>>;

bool IsPlainName(QString const& name)
{
    bool plain = !name.isEmpty() && name[0].isLetter();
    for (QChar c : name)
        plain = plain && c.unicode() < 128 && (c.isLetterOrNumber() || c == '_');
    return plain;
}

// Printable ASCII, not a terminator of CDATA, no placeholder, and no white space that a reader
// would be free to change.
bool IsPlainValue(QString const& value)
{
    bool plain = !value.isEmpty() && !value.contains("]]>") && !value.contains('%');
    for (QChar c : value)
        plain = plain && c.unicode() >= ' ' && c.unicode() < 127;
    return plain;
}

void Write(QString const& path, QByteArray const& bytes)
{
    QFile file(path);
    Require(file.open(QIODevice::WriteOnly));
    file.write(bytes);
}

// The names cannot be asked of the store, so they are guessed from the words of the document.
QStringList Words(QByteArray const& bytes)
{
    QStringList words;
    QString word;
    for (char c : bytes + ' ') {
        const QChar letter = QLatin1Char(c);
        if (letter.unicode() < 128 && (letter.isLetterOrNumber() || letter == '_')) {
            word += letter;
        } else if (IsPlainName(word)) {
            words.append(word);
            word.clear();
        } else {
            word.clear();
        }
    }
    words.removeDuplicates();
    return words.mid(0, 64);
}

Sections Contents(TorkConfigFile& settings, QStringList const& names)
{
    Sections sections;
    for (QString const& name : names) {
        const QStringList keys = settings.keyList(name);
        for (QString const& key : keys) {
            QString none, value;
            if (settings.ReadItem(name, key, none, value))
                sections[name][key] = value;
        }
    }
    return sections;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static QTemporaryDir folder;
    const QString path = folder.path() + "/settings.cfg";
    const QByteArray bytes(reinterpret_cast<char const*>(data), int(size));
    Write(path, bytes);

    TorkConfigFile settings(path);
    const bool loaded = settings.Load();
    Require(loaded == settings.m_lastError.isEmpty());

    const QStringList names = Words(bytes);
    TorkConfigFile plain(path);
    const Sections before = Contents(settings, names);
    for (auto section = before.begin(); section != before.end(); ++section) {
        for (auto item = section->begin(); item != section->end(); ++item) {
            const bool isPlain = section.key() != "VelocorSettings" && IsPlainName(item.key()) &&
                                 item.key() != "VelocorSettings" && IsPlainValue(*item);
            if (isPlain)
                plain.WriteItem(section.key(), item.key(), *item);
        }
    }
    const Sections written = Contents(plain, names);
    Require(plain.Save());

    TorkConfigFile again(path);
    Require(again.Load());
    Require(Contents(again, names) == written);
    return 0;
}
