// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MarksFile.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/widgets/PlainText.h"
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

// By LogEncoding::Kind.
char const* const EncodingNames[] = {"", "latin-1", "utf-8", "utf-16le", "utf-16be"};

LogEncoding EncodingOf(QString const& name)
{
    for (int kind = LogEncoding::Utf16Be; kind > LogEncoding::Automatic; --kind) {
        if (name == QLatin1String(EncodingNames[kind]))
            return static_cast<LogEncoding::Kind>(kind);
    }
    return LogEncoding::Automatic;
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
        error = QObject::tr("%1 is damaged, so marks and encodings are not saved")
                    .arg(LeftToRight(m_fileName));
        return logs;
    }
    for (SettingsDocument::Section const& section : document.sections) {
        Log log;
        for (SettingsDocument::Item const& item : section.items) {
            const QString value = TorkConfigText::DecodeValue(item.value);
            LogMark mark;
            if (item.key == QLatin1String("path"))
                log.path = value;
            else if (item.key == QLatin1String("encoding"))
                log.encoding = EncodingOf(value);
            else if (log.marks.size() < LogMark::MaximumMarks && ReadMark(value, mark))
                log.marks.append(mark);
        }
        if (!log.path.isEmpty() && logs.size() < MaximumFiles)
            logs.append(log);
    }
    return logs;
}

MarksFile::Log MarksFile::find(QString const& path) const
{
    QString error;
    const QVector<Log> logs = read(error);
    for (Log const& log : logs) {
        if (log.path == path)
            return log;
    }
    Log none;
    none.path = path;
    return none;
}

QVector<LogMark> MarksFile::Marks(QString const& path)
{
    QVector<LogMark>& known = m_known[path];
    known = find(path).marks;
    return known;
}

// With the marks in the file that another program has added. Only the line tells: its neighbors and
// its place change with the log.
QVector<LogMark> MarksFile::withOthers(QString const& path, QVector<LogMark> const& marks,
                                       QVector<LogMark> const& inFile) const
{
    QSet<QByteArray> mine;
    const QVector<LogMark> known = m_known.value(path) + marks;
    for (LogMark const& mark : known)
        mine.insert(mark.line);
    QVector<LogMark> all = marks;
    for (LogMark const& mark : inFile) {
        if (!mine.contains(mark.line))
            all.append(mark);
    }
    return all;
}

QString MarksFile::SetMarks(QString const& path, QVector<LogMark> const& marks)
{
    Log log = find(path);
    log.marks = withOthers(path, marks, log.marks);
    const QString error = replace(log);
    if (error.isEmpty())
        m_known[path] = marks;
    return error;
}

LogEncoding MarksFile::Encoding(QString const& path)
{
    return find(path).encoding;
}

QString MarksFile::SetEncoding(QString const& path, LogEncoding encoding)
{
    Log log = find(path);
    log.encoding = encoding;
    return replace(log);
}

// It becomes the first one.
QString MarksFile::replace(Log const& log) const
{
    QString error;
    QVector<Log> logs = read(error);
    if (!error.isEmpty())
        return error;
    logs.erase(std::remove_if(logs.begin(), logs.end(),
                              [&](Log const& other) { return other.path == log.path; }),
               logs.end());
    if (!log.marks.isEmpty() || log.encoding != LogEncoding::Automatic)
        logs.prepend(log);

    TorkConfigFile file(m_fileName);
    for (int i = 0; i < logs.size() && i < MaximumFiles; ++i) {
        const QString section = QStringLiteral("Log%1").arg(i + 1);
        const auto write = [&](QString const& key, QString const& value) {
            file.WriteItem(section, key, TorkConfigText::EncodeValue(value));
        };
        write(QStringLiteral("path"), logs.at(i).path);
        if (logs.at(i).encoding != LogEncoding::Automatic)
            write(QStringLiteral("encoding"),
                  QLatin1String(EncodingNames[logs.at(i).encoding.kind()]));
        int number = 0;
        for (LogMark const& mark : logs.at(i).marks)
            write(QStringLiteral("mark%1").arg(++number), TextOf(mark));
    }
    QDir().mkpath(QFileInfo(m_fileName).path());
    return file.SaveAtomically() ? QString() : file.m_lastError;
}

} // namespace Velocor
