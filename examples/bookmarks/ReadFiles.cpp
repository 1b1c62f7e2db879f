// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "ReadFiles.h"

#include "common/config/TorkConfigText.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QMap>
#include <QTextStream>

ReadFiles::ReadFiles(QString const& settingsFile)
    : m_settingsFile(settingsFile), m_settings(settingsFile)
{
    if (QFile::exists(settingsFile) && !m_settings.Load())
        m_broken = settingsFile + ": " + m_settings.m_lastError;
}

QString ReadFiles::Note(QString const& path, QString const& title)
{
    if (!m_broken.isEmpty())
        return m_broken;

    QDir().mkpath(QFileInfo(m_settingsFile).path());
    m_settings.WriteItem("Files", TorkConfigText::EncodeName(path),
                         TorkConfigText::EncodeValue(title));
    return m_settings.SaveAtomically() ? QString() : m_settings.m_lastError;
}

void ReadFiles::Print(QTextStream& out)
{
    QMap<QString, QString> titles;
    const QStringList keys = m_settings.keyList("Files");
    for (QString const& key : keys) {
        QString none, title;
        m_settings.ReadItem("Files", key, none, title);
        titles[TorkConfigText::DecodeName(key)] = TorkConfigText::DecodeValue(title);
    }
    for (auto file = titles.constBegin(); file != titles.constEnd(); ++file)
        out << file.key() << ": " << file.value() << '\n';
}
