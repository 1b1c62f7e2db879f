// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsFileWriter.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "common/config/TorkConfigFile.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QObject>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QVariant>

#include <algorithm>

namespace Velocor {

namespace {

bool IsLatin1(QString const& text)
{
    return std::all_of(text.begin(), text.end(), [](QChar c) { return c.unicode() < 256; });
}

QString Quoted(SettingsDocument::Item const& item, QString const& section)
{
    return QStringLiteral("%1 / %2").arg(section, item.key);
}

// Where a file is saved to see what the store makes of it: settings are nobody else's business, so
// not in a folder that all users share, unless the program has no other.
QString TrialFolder()
{
    const QString data = QCoreApplication::instance()->property("DataPath").toString();
    const bool isThere = !data.isEmpty() && QDir().mkpath(data);
    return (isThere ? data : QDir::tempPath() + QLatin1Char('/')) + QLatin1String("trial-XXXXXX");
}

} // namespace

bool SettingsFileWriter::IsName(QString const& name)
{
    static const QRegularExpression pattern(QStringLiteral("\\A[A-Za-z_][A-Za-z0-9_.-]*\\z"));
    return pattern.match(name).hasMatch();
}

// The losses whose reason can be named. Others show only when a saved file is read back.
bool SettingsFileWriter::StartsLoss(SettingsDocument::Item const& item, QString const& section,
                                    QStringList& losses)
{
    const QString where = Quoted(item, section);
    const int before = losses.size();
    if (!IsName(item.key))
        losses.append(QObject::tr("%1: the key is no name that the store can write").arg(where));
    if (item.value.contains(QLatin1String("]]>")))
        losses.append(QObject::tr("%1: a value with \"]]>\" makes the file unreadable").arg(where));
    else if (!IsLatin1(item.value))
        losses.append(QObject::tr("%1: characters outside Latin-1 become \"?\"").arg(where));
    else if (item.value.isEmpty())
        losses.append(QObject::tr("%1: an empty value is not kept").arg(where));
    return losses.size() > before;
}

QStringList SettingsFileWriter::Losses(SettingsDocument const& document)
{
    QStringList losses;
    SettingsDocument harmless = document;
    for (SettingsDocument::Section& section : harmless.sections) {
        if (!IsName(section.name))
            losses.append(QObject::tr("%1: the section has no name that the store can write")
                              .arg(section.name));
        for (SettingsDocument::Item& item : section.items) {
            if (StartsLoss(item, section.name, losses))
                item.value = QStringLiteral("x");
            if (!IsName(item.key))
                return losses;
        }
        if (!IsName(section.name) || section.name == document.rootName)
            return losses;
    }

    const QTemporaryDir folder(TrialFolder());
    const QString path = folder.filePath(QStringLiteral("trial.cfg"));
    if (!folder.isValid() || !SaveUnchecked(path, harmless).isEmpty())
        return losses;
    const SettingsValues readBack = SettingsFileReader::Read(path).AllValues();
    for (SettingsDocument::Section const& section : qAsConst(harmless.sections)) {
        for (SettingsDocument::Item const& item : section.items) {
            if (readBack.value({section.name, item.key}) != item.value)
                losses.append(QObject::tr("%1: the value would read differently afterwards")
                                  .arg(Quoted(item, section.name)));
        }
    }
    return losses;
}

// The reason of a failure that the store knows of.
QString SettingsFileWriter::SaveUnchecked(QString const& path, SettingsDocument const& document)
{
    TorkConfigFile store(path, document.rootName);
    for (SettingsDocument::Section const& section : document.sections) {
        store.AppendSection(new TorkConfigFileSection(section.name.toUtf8().constData()));
        for (SettingsDocument::Item const& item : section.items)
            store.WriteItem(section.name, item.key,
                            item.value.isNull() ? QString(QLatin1String("")) : item.value);
    }
    return store.SaveAtomically() ? QString() : store.m_lastError;
}

bool SettingsFileWriter::Save(QString const& path, SettingsDocument const& document, QString* error)
{
    if (QFileInfo::exists(path) && !QFileInfo(path).isFile())
        *error = QObject::tr("Not a regular file");
    else
        *error = SaveUnchecked(path, document);
    if (!error->isEmpty())
        return false;

    // The store does not look at what the disk makes of its bytes.
    const SettingsDocument readBack = SettingsFileReader::Read(path);
    const bool arrived = readBack.isParsed && readBack.sections.size() == document.sections.size();
    if (!arrived)
        *error = QObject::tr("The file was written, but does not read back whole. "
                             "The disk may be full.");
    return arrived;
}

bool SettingsFileWriter::KeepBackup(QString const& path, QString* error)
{
    const QString copy = path + QLatin1String(".bak");
    if (!QFile::exists(path))
        return true;
    if (!QFileInfo(path).isFile()) {
        *error = QObject::tr("Not a regular file");
        return false;
    }
    if (QFile::exists(copy) && !QFile::remove(copy)) {
        *error = QObject::tr("The file %1 cannot be replaced.").arg(copy);
        return false;
    }
    QFile file(path);
    if (file.copy(copy))
        return true;
    *error = file.errorString();
    return false;
}

} // namespace Velocor
