// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How a configuration file is written.

#include "common/config/TorkConfigFile.h"

#include "common/config/TorkConfigFileSection.h"
#include "common/config/TorkOrderedHash_p.h"
#include "common/log/TorkLatin1_p.h"

#include <QFile>

#include <algorithm>

#ifdef Q_OS_UNIX
#include <sys/stat.h>
#endif

namespace {

// What a character requires of the line that it is saved in.
enum : uchar { Nothing = 0, Wrapping = 1, Formatting = 2 };

struct Needs
{
    uchar of[0x100] = {};
};

constexpr Needs MakeNeeds()
{
    Needs needs;
    for (char markup : {'&', '\'', '<', '>', '"'})
        needs.of[static_cast<uchar>(markup)] = Wrapping;
    needs.of[static_cast<uchar>('%')] = Formatting;
    return needs;
}

constexpr Needs NeedsOnLine = MakeNeeds();

bool HasMarkup(QString const& text)
{
    return std::any_of(text.begin(), text.end(), [](QChar character) {
        const char latin1 = TorkToLatin1(character.unicode()); // no markup beyond Latin-1
        return NeedsOnLine.of[static_cast<uchar>(latin1)] == Wrapping;
    });
}

// A value as it is written to the file.
QString Filtered(QString const& value)
{
    return HasMarkup(value) ? QLatin1String("<![CDATA[") + value + QLatin1String("]]>") : value;
}

char* Copy(char* to, QLatin1String text)
{
    return std::copy(text.begin(), text.end(), to);
}

char* Copy(char* to, QString const& text)
{
    return std::transform(text.utf16(), text.utf16() + text.length(), to, TorkToLatin1);
}

// Appends all pieces after reserving space once, without a temporary byte array for each.
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

// Arguments are substituted one at a time, for compatibility: a key or value that contains a
// placeholder itself comes out changed, and files with such lines exist.
QString FormattedItem(QString const& key, QString const& value)
{
    const QString line = QStringLiteral("<%1>%2</%3>\n");
    return line.arg(key).arg(Filtered(value)).arg(key); // clazy:exclude=qstring-arg
}

// Copies a text and notes what its characters need. Characters that share only
// the low byte with a special one are noted too, so their line is formatted again in vain.
char* CopyNoting(char* to, QString const& text, uchar& needs)
{
    for (QChar character : text) {
        const ushort unit = character.unicode();
        *to++ = TorkToLatin1(unit);
        needs |= NeedsOnLine.of[unit & 0xff];
    }
    return to;
}

// Appends the line of FormattedItem(), without its temporary strings: this is the inner loop of a
// save. Written as if key and value had no special characters; if one turns up, the line is
// formatted again. For the goal "save, against pugixml" in docs/performance.md;
// tests/plain/tst_PlainSave.cpp compares the two.
void AppendItem(QByteArray& xml, QString const& key, QString const& value)
{
    const int end = xml.size();
    xml.resize(end + 2 * key.size() + value.size() + 6);
    char* const line = xml.data() + end;
    uchar keyNeeds = Nothing;
    uchar valueNeeds = Nothing;

    char* to = line;
    *to++ = '<';
    to = CopyNoting(to, key, keyNeeds);
    *to++ = '>';
    to = CopyNoting(to, value, valueNeeds);
    *to++ = '<';
    *to++ = '/';
    to = std::copy_n(line + 1, key.size(), to);
    *to++ = '>';
    *to = '\n';

    if (valueNeeds != Nothing || (keyNeeds & Formatting)) {
        xml.resize(end);
        Append(xml, FormattedItem(key, value));
    }
}

// Opening one blocks until it has a reader, possibly forever.
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
    // Two characters here, but one in Load(): existing callers rely on both.
    if (m_fileName.length() < 2)
        return true;

    // Serialize before truncating the file, so that as little as possible can happen in between.
    const QByteArray xml = ToXml();
    QFile file(m_fileName);
    if (IsPipe(m_fileName) || !file.open(QIODevice::WriteOnly)) {
        m_lastError = QStringLiteral("Unable to open file: %1").arg(m_fileName);
        return true;
    }
    file.write(xml);
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

// cppcheck-suppress constParameter ; part of the public interface
void TorkConfigFile::FilterContent(QString& in, QString& out)
{
    out = Filtered(in);
}
