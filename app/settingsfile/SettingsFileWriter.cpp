// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsFileWriter.h"

#include "app/language/LeftToRight.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>
#include <QObject>
#include <QSaveFile>

#include <algorithm>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

namespace Velocor {

namespace {

using Loss = SettingsDocument::Loss;

bool IsLatin1(QString const& text)
{
    return std::all_of(text.begin(), text.end(), [](QChar c) { return c.unicode() < 256; });
}

// Why a value does not read back unchanged.
QString ReasonOf(QString const& value)
{
    if (value.contains(QLatin1String("]]>")))
        return QObject::tr("a value with \"]]>\" makes the file unreadable");
    if (!IsLatin1(value))
        return QObject::tr("characters outside Latin-1 become \"?\"");
    if (value.isEmpty())
        return QObject::tr("empty values are not saved");
    return QObject::tr("the value would change when read back");
}

Loss LossOf(SettingsDocument::Section const& section, SettingsDocument::Item const& item,
            QString const& reason)
{
    return {section.name, item.key,
            QStringLiteral("%1 / %2: %3").arg(section.name, item.key, reason)};
}

Loss LossOf(SettingsDocument::Section const& section, QString const& reason)
{
    return {section.name, QString(), QStringLiteral("%1: %2").arg(section.name, reason)};
}

// Returns the section with only the items that the store can write.
SettingsDocument::Section WithoutLosses(SettingsDocument::Section const& section,
                                        QVector<Loss>& losses)
{
    SettingsDocument::Section writable{section.name, {}};
    for (SettingsDocument::Item const& item : section.items) {
        if (!TorkConfigText::IsPlainName(item.key))
            losses.append(LossOf(section, item, QObject::tr("the key is not a valid name")));
        if (!TorkConfigText::IsPlainValue(item.value))
            losses.append(LossOf(section, item, ReasonOf(item.value)));
        else if (TorkConfigText::IsPlainName(item.key))
            writable.items.append(item);
    }
    return writable;
}

void Fill(TorkConfigFile& store, SettingsDocument const& document)
{
    for (SettingsDocument::Section const& section : document.sections) {
        if (!store.HasSection(section.name)) // one that is replaced would be nobody's
            store.AppendSection(new TorkConfigFileSection(section.name.toUtf8().constData()));
        // The store rejects null strings; the sum is never one.
        for (SettingsDocument::Item const& item : section.items)
            store.WriteItem(section.name, item.key, QLatin1String("") + item.value);
    }
}

// Whether a file that this process creates would have the same owner and group.
bool IsOurs(QFileInfo const& file)
{
#ifdef Q_OS_UNIX
    return file.ownerId() == geteuid() && file.groupId() == getegid();
#else
    Q_UNUSED(file)
    return true;
#endif
}

// In pieces, because a file may be larger than what fits into memory.
bool CopyAll(QIODevice& from, QIODevice& to)
{
    QByteArray piece(1 << 16, '\0');
    qint64 size = 0;
    while ((size = from.read(piece.data(), piece.size())) > 0) {
        if (to.write(piece.constData(), size) != size)
            return false;
    }
    return size == 0;
}

bool SaveContent(QString const& path, QIODevice& content, QString* error)
{
    const QFileInfo info(path);
    if (info.exists() && !info.isFile()) {
        *error = QObject::tr("Not a regular file");
        return false;
    }
    QSaveFile replacement(path);
    replacement.setDirectWriteFallback(true); // where the folder is read-only, as the store does
    QFile original(path);
    QFileDevice& file =
        info.exists() && !IsOurs(info) ? static_cast<QFileDevice&>(original) : replacement;
    bool isSaved = file.open(QIODevice::WriteOnly) && CopyAll(content, file);
    if (&file == &replacement)
        isSaved = isSaved && replacement.commit();
    else
        isSaved = isSaved && original.flush();
    if (!isSaved)
        *error = file.errorString();
    return isSaved;
}

} // namespace

QString SettingsFileWriter::ValueProblem(QString const& value)
{
    return TorkConfigText::IsPlainValue(value) ? QString() : ReasonOf(value);
}

QByteArray SettingsFileWriter::ToBytes(SettingsDocument const& document)
{
    TorkConfigFile store(QString(), document.rootName);
    Fill(store, document);
    return store.ToXml();
}

QVector<Loss> SettingsFileWriter::Losses(SettingsDocument const& document)
{
    QVector<Loss> losses;
    SettingsDocument writable;
    for (SettingsDocument::Section const& section : document.sections) {
        const SettingsDocument::Section kept = WithoutLosses(section, losses);
        if (!TorkConfigText::IsPlainName(section.name))
            losses.append(LossOf(section, QObject::tr("the section name is not valid")));
        else if (section.name == document.rootName)
            losses.append(
                LossOf(section, QObject::tr("the section has the same name as the root element")));
        else
            writable.sections.append(kept);
    }

    // Any other loss shows when the text is read back.
    writable.rootName = document.rootName;
    const SettingsValues readBack = SettingsFileReader::ReadBytes(ToBytes(writable)).AllValues();
    for (SettingsDocument::Section const& section : qAsConst(writable.sections)) {
        for (SettingsDocument::Item const& item : section.items) {
            if (readBack.value({section.name, item.key}) != item.value)
                losses.append(LossOf(section, item, ReasonOf(item.value)));
        }
    }
    return losses;
}

bool SettingsFileWriter::Save(QString const& path, SettingsDocument const& document, QString* error)
{
    if (QFileInfo::exists(path) && !QFileInfo(path).isFile()) {
        *error = QObject::tr("Not a regular file");
        return false;
    }
    TorkConfigFile store(path, document.rootName);
    Fill(store, document);
    if (!store.SaveAtomically()) {
        *error = store.m_lastError;
        return false;
    }

    // The store does not verify what was written to disk.
    const SettingsDocument readBack = SettingsFileReader::Read(path);
    const bool arrived = readBack.isParsed && readBack.sections.size() == document.sections.size();
    if (!arrived)
        *error = QObject::tr("The file was written, but does not read back completely. "
                             "The disk may be full.");
    return arrived;
}

bool SettingsFileWriter::SaveBytes(QString const& path, QByteArray const& bytes, QString* error)
{
    QBuffer content;
    content.setData(bytes);
    content.open(QIODevice::ReadOnly);
    return SaveContent(path, content, error);
}

bool SettingsFileWriter::SaveCopy(QString const& path, QString const& original, QString* error)
{
    QFile content(original);
    if (!QFileInfo(original).isFile() || !content.open(QIODevice::ReadOnly)) {
        *error = QObject::tr("%1 cannot be read any more.").arg(LeftToRight(original));
        return false;
    }
    return SaveContent(path, content, error);
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

    // The copy before stays until there is another one.
    const QString next = copy + QLatin1String(".saving");
    QFile::remove(next);
    QFile file(path);
    if (!file.copy(next)) {
        *error = file.errorString();
        return false;
    }
    if ((!QFile::exists(copy) || QFile::remove(copy)) && QFile::rename(next, copy))
        return true;
    QFile::remove(next);
    *error = QObject::tr("Cannot replace the file %1.").arg(LeftToRight(copy));
    return false;
}

} // namespace Velocor
