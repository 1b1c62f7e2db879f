// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How a configuration file is written.

#include "common/config/TorkConfigFile.h"

#include "common/config/TorkConfigFileSection.h"
#include "common/config/TorkOrderedHash_p.h"

#include <QFile>

#include <algorithm>

#ifdef Q_OS_UNIX
#include <sys/stat.h>
#endif

namespace {

// What a character asks of the line it is saved in.
enum : uchar { Nothing = 0, Wrapping = 1, Filling = 2 };

struct Demands
{
    uchar of[0x100] = {};
};

constexpr Demands MakeDemands()
{
    Demands demands;
    for (char markup : {'&', '\'', '<', '>', '"'})
        demands.of[static_cast<uchar>(markup)] = Wrapping;
    demands.of[static_cast<uchar>('%')] = Filling;
    return demands;
}

constexpr Demands DemandsOnLine = MakeDemands();

bool HoldsMarkup(QString const& text)
{
    return std::any_of(text.begin(), text.end(), [](QChar character) {
        const ushort unit = character.unicode();
        return unit <= 0xff && DemandsOnLine.of[unit] == Wrapping;
    });
}

// A value as it stands in the file.
QString Filtered(QString const& value)
{
    return HoldsMarkup(value) ? QLatin1String("<![CDATA[") + value + QLatin1String("]]>") : value;
}

char* Copy(char* to, QLatin1String text)
{
    return std::copy(text.begin(), text.end(), to);
}

// As QString::toLatin1() converts.
char* Copy(char* to, QString const& text)
{
    return std::transform(text.constBegin(), text.constEnd(), to, [](QChar character) {
        return character.unicode() > 0xff ? '?' : static_cast<char>(character.unicode());
    });
}

// Appends all pieces after making room once, without a byte array of its own for each: half the
// time of a save.
template <class... Pieces>
void Append(QByteArray& xml, Pieces const&... pieces)
{
    const int end = xml.size();
    xml.resize((end + ... + pieces.size()));
    char* to = xml.data() + end;
    ((to = Copy(to, pieces)), ...);
}

void AppendTag(QByteArray& xml, char const* opening, QString const& name)
{
    Append(xml, QLatin1String(opening), name, QLatin1String(">\n"));
}

// Filled one after another, as ever: a key or value that holds a placeholder of its own comes out
// changed, and files that hold such lines exist.
QString FilledItem(QString const& key, QString const& value)
{
    const QString line = QStringLiteral("<%1>%2</%3>\n");
    return line.arg(key).arg(Filtered(value)).arg(key); // clazy:exclude=qstring-arg
}

// As QString::toLatin1() converts, noting what the characters demand. Other characters with the
// same low byte are taken for them, which only costs time.
char* CopyNoting(char* to, QString const& text, uchar& demands)
{
    for (QChar character : text) {
        const ushort unit = character.unicode();
        *to++ = unit > 0xff ? '?' : static_cast<char>(unit);
        demands |= DemandsOnLine.of[unit & 0xff];
    }
    return to;
}

// The line of FilledItem(), which alone makes a save take three to four times as long as pugixml
// does. Made as if key and value held nothing special, which is seen on the way; where they do, it
// is made again. tests/plain/tst_PlainSave.cpp compares the two.
void AppendItem(QByteArray& xml, QString const& key, QString const& value)
{
    const int end = xml.size();
    xml.resize(end + 2 * key.size() + value.size() + 6);
    char* const line = xml.data() + end;
    uchar keyDemands = Nothing;
    uchar valueDemands = Nothing;

    char* to = line;
    *to++ = '<';
    to = CopyNoting(to, key, keyDemands);
    *to++ = '>';
    to = CopyNoting(to, value, valueDemands);
    *to++ = '<';
    *to++ = '/';
    to = std::copy_n(line + 1, key.size(), to);
    *to++ = '>';
    *to = '\n';

    if (valueDemands != Nothing || (keyDemands & Filling)) {
        xml.resize(end);
        Append(xml, FilledItem(key, value));
    }
}

// Opening one waits until somebody reads from it, which may be never.
bool IsPipe(QString const& fileName)
{
#ifdef Q_OS_UNIX
    struct stat status = {};
    return stat(QFile::encodeName(fileName).constData(), &status) == 0 && S_ISFIFO(status.st_mode);
#else
    Q_UNUSED(fileName)
    return false;
#endif
}

} // namespace

bool TorkConfigFile::Save()
{
    // Two characters here but one in Load(): existing callers rely on both.
    if (m_fileName.length() < 2)
        return true;

    // Made before the file is emptied, so that as little as possible can come between.
    const QByteArray xml = ToXml();
    QFile file(m_fileName);
    if (IsPipe(m_fileName) || !file.open(QIODevice::WriteOnly)) {
        m_lastError = QStringLiteral("Unable to open file: %1").arg(m_fileName);
        return true;
    }
    file.write(xml);
    file.close();
    return true;
}

QByteArray TorkConfigFile::ToXml() const
{
    QByteArray xml;
    AppendTag(xml, "<", m_rootElementName);
    for (auto const& section : *m_sections) {
        AppendTag(xml, "<", section.value->name());
        for (auto const& item : *section.value->m_values)
            AppendItem(xml, item.key, item.value);
        AppendTag(xml, "</", section.value->name());
    }
    AppendTag(xml, "</", m_rootElementName);
    return xml;
}

// cppcheck-suppress constParameter ; the interface stands
void TorkConfigFile::FilterContent(QString& in, QString& out)
{
    out = Filtered(in);
}
