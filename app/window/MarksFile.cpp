// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MarksFile.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QDir>
#include <QFileInfo>
#include <QSet>
#include <QStringList>

namespace Velocor {

namespace {

// Identities of the line, the line above and the line below, "-" for none; its start; the note.
QString TextOf(LogMark const& mark)
{
    const auto field = [](QByteArray const& identity) {
        return identity.isEmpty() ? QStringLiteral("-") : QString::fromLatin1(identity);
    };
    return QStringList({field(mark.line), field(mark.above), field(mark.below),
                        QString::number(mark.start), mark.note})
        .join(QLatin1Char(' '));
}

bool ReadMark(QString const& text, LogMark& mark)
{
    const QStringList fields = text.split(QLatin1Char(' '));
    if (fields.size() < 5)
        return false;
    const auto identity = [&](int at) {
        return fields.at(at) == QLatin1String("-") ? QByteArray() : fields.at(at).toLatin1();
    };
    mark.line = identity(0);
    mark.above = identity(1);
    mark.below = identity(2);
    bool isNumber = false;
    mark.start = fields.at(3).toLongLong(&isNumber);
    mark.note = QStringList(fields.mid(4)).join(QLatin1Char(' ')).left(LogMark::MaximumNote);
    return isNumber;
}

} // namespace

MarksFile::MarksFile(QString const& dataPath) : m_fileName(dataPath + QLatin1String("marks.cfg")) {}

QVector<MarksFile::Log> MarksFile::read(QString& error) const
{
    QVector<Log> logs;
    if (!QFileInfo::exists(m_fileName))
        return logs;
    const SettingsDocument document = SettingsFileReader::Read(m_fileName);
    if (!document.isReadable || !document.isParsed) {
        error = QObject::tr("%1 is damaged, so marks are not saved").arg(m_fileName);
        return logs;
    }
    for (SettingsDocument::Section const& section : document.sections) {
        Log log;
        for (SettingsDocument::Item const& item : section.items) {
            const QString value = TorkConfigText::DecodeValue(item.value);
            LogMark mark;
            if (item.key == QLatin1String("path"))
                log.path = value;
            else if (log.marks.size() < LogMark::MaximumMarks && ReadMark(value, mark))
                log.marks.append(mark);
        }
        if (!log.path.isEmpty() && logs.size() < MaximumFiles)
            logs.append(log);
    }
    return logs;
}

QVector<LogMark> MarksFile::Marks(QString const& path)
{
    QString error;
    const QVector<Log> logs = read(error);
    QVector<LogMark>& known = m_known[path];
    known.clear();
    for (Log const& log : logs) {
        if (log.path == path)
            known = log.marks;
    }
    return known;
}

// With the marks in the file that another program has added. Only the line tells: its neighbors and
// its place change with the log.
QVector<LogMark> MarksFile::withOthers(QString const& path, QVector<LogMark> const& marks,
                                       QVector<Log> const& logs) const
{
    QSet<QByteArray> mine;
    for (LogMark const& mark : m_known.value(path) + marks)
        mine.insert(mark.line);
    QVector<LogMark> all = marks;
    for (Log const& log : logs) {
        for (LogMark const& mark : log.marks) {
            if (log.path == path && !mine.contains(mark.line))
                all.append(mark);
        }
    }
    return all;
}

QString MarksFile::SetMarks(QString const& path, QVector<LogMark> const& marks)
{
    QString error;
    QVector<Log> logs = read(error);
    if (!error.isEmpty())
        return error;
    const QVector<LogMark> all = withOthers(path, marks, logs);
    logs.erase(
        std::remove_if(logs.begin(), logs.end(), [&](Log const& log) { return log.path == path; }),
        logs.end());
    if (!all.isEmpty())
        logs.prepend({path, all});

    TorkConfigFile file(m_fileName);
    for (int i = 0; i < logs.size() && i < MaximumFiles; ++i) {
        const QString section = QStringLiteral("Log%1").arg(i + 1);
        file.WriteItem(section, QStringLiteral("path"),
                       TorkConfigText::EncodeValue(logs.at(i).path));
        int number = 0;
        for (LogMark const& mark : logs.at(i).marks)
            file.WriteItem(section, QStringLiteral("mark%1").arg(++number),
                           TorkConfigText::EncodeValue(TextOf(mark)));
    }
    QDir().mkpath(QFileInfo(m_fileName).path());
    if (!file.SaveAtomically())
        return file.m_lastError;
    m_known[path] = marks;
    return QString();
}

} // namespace Velocor
