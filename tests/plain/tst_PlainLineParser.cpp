// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares what is found in a line when the beginning of the stamp before it is known with what is
// found without: for stamps in all kinds of formats, all of a day, and lines of all kinds. Stamps
// in random formats with the moments that Qt wrote in them, and the severity after a stamp with the
// first of the names that is there.

#include "app/logfile/DayNumber.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogSeverities.h"

#include "Rounds.h"

#include <QDateTime>
#include <QHash>
#include <QTranslator>
#include <QtTest>

#include <map>
#include <random>
#include <vector>

using namespace Velocor;

class tst_PlainLineParser : public QObject
{
    Q_OBJECT

private slots:
    void everyFormat_data();
    void everyFormat();
    void everyStampOfADay();
    void randomFormats();
    void lines_data();
    void lines();
    void names_data();
    void names();
    void cleanupTestCase();

private:
    int m_stamps = 0;
    int m_lines = 0;
    int m_names = 0;
};

namespace {

class Random
{
public:
    int below(int limit) { return int(m_random() % unsigned(limit)); }
    bool once(int times) { return below(times) == 0; }

    template <class T, size_t count>
    T const& oneOf(T const (&values)[count])
    {
        return values[below(int(count))];
    }

    // Mostly a little later than the one before.
    QDateTime moment()
    {
        static qint64 const steps[] = {0, 1, 15, 999, 1000, 30000, 60000, 3600000, -1, -70000};
        m_time += steps[below(once(8) ? 10 : 6)];
        if (once(200))
            m_time += (below(2000) - 1000) * qint64(86400000);
        return QDateTime::fromMSecsSinceEpoch(m_time, Qt::UTC);
    }

    // As a line that was torn, or that something else wrote.
    QByteArray damaged(QByteArray text)
    {
        static char const characters[] = "0159 :.-,xT";
        const int at = below(text.size() + 1);
        const char character = characters[below(int(sizeof characters) - 1)];
        switch (below(5)) {
        case 0:
            return text.left(at);
        case 1:
            return text.mid(at);
        case 2:
            return text.insert(at, character);
        case 3:
            return text.remove(at, 1);
        default:
            return at < text.size() ? text.replace(at, 1, &character, 1) : text;
        }
    }

private:
    std::mt19937 m_random{Rounds::seed()};
    qint64 m_time = 1772496000000; // 3 March 2026
};

// A date format, and what a reader should make of stamps in it.
struct PlainFormat
{
    QString text;
    QHash<QChar, int> counts; // of its letters

    bool has(char letter) const { return counts.value(QLatin1Char(letter)) > 0; }
    bool hasDay() const { return has('d') && counts['d'] != 3 && counts['d'] != 4; }
    bool hasHour() const { return has('h') || has('H'); }

    // One letter for the year is text.
    bool hasDate() const { return counts.value('y') > 1 && has('M') && hasDay(); }

    int resolution() const { return has('z') ? 1 : has('s') ? 1000 : 60000; }

    qint64 key(QDateTime const& moment) const
    {
        if (!hasHour() || !has('m'))
            return -1;
        const int letters = counts.value('y');
        const int year = moment.date().year();
        const int longYear = letters >= 4 ? year : 0;
        const int shortYear = letters == 2 || letters == 3 || letters == 6 ? year % 100 : 0;
        const QTime time = moment.time();
        const qint64 day = DayNumber(longYear + shortYear, has('M') ? moment.date().month() : 0,
                                     hasDay() ? moment.date().day() : 0);
        return day * 86400000 + time.hour() * 3600000 + time.minute() * 60000 +
               (has('s') ? time.second() * 1000 : 0) + (has('z') ? time.msec() : 0);
    }
};

PlainFormat Format(Random& random)
{
    static char const* const separators[] = {" ", "-", ".", "''", "':'", "[", "{", "@", "`", "/"};
    PlainFormat format;
    QByteArray letters("yMdmsz");
    letters += "hH"[random.below(2)];
    const bool isHalved = random.once(3);
    for (int i = 0; i < 3; ++i)
        letters.remove(random.once(2) ? letters.size() : random.below(letters.size()), 1);
    if (isHalved || letters.contains('h')) // without AM or PM, h may be beyond twelve
        letters += random.once(2) ? 'a' : 'A';
    if (random.once(8))
        letters += 't';
    while (!letters.isEmpty()) {
        const int at = random.below(letters.size());
        const char letter = letters.at(at);
        letters.remove(at, 1);
        const bool isWord = letter == 'a' || letter == 'A' || letter == 't';
        const int count = isWord ? 1 : 1 + random.below(6);
        format.counts[QLatin1Char(letter)] = count;
        format.text += QString(count, QLatin1Char(letter));
        if (letter == 'a' || letter == 'A')
            format.text += QString(random.below(2), QChar(letter + 'p' - 'a'));
        const bool isNumber = !isWord && letter != 'M' && letter != 'd';
        format.text += isNumber && random.once(6) ? "'o''clock'" : random.oneOf(separators);
    }
    return format;
}

bool IsSame(LogTimeReader::Stamp const& one, LogTimeReader::Stamp const& other)
{
    return one.length == other.length && one.key == other.key;
}

bool IsSame(LogLineParser::Parts const& one, LogLineParser::Parts const& other)
{
    return one.timeLength == other.timeLength && one.timeKey == other.timeKey &&
           one.hasDate == other.hasDate && one.resolution == other.resolution &&
           one.severity == other.severity && one.elapsed == other.elapsed &&
           one.elapsedLength == other.elapsedLength && one.message == other.message &&
           one.isEntry == other.isEntry;
}

// Translates the names of the severities: to longer ones, of two words, that begin alike.
class Translator : public QTranslator
{
public:
    QString translate(char const* context, char const* text, char const*, int) const override
    {
        static std::map<QByteArray, QString> const names = {{"Trace", "T"},
                                                            {"Notification", "Benachrichtigung"},
                                                            {"Warning", "Warnungen, alle"},
                                                            {"Error", "Fehler"},
                                                            {"Fatal", "Schwerwiegender Fehler"}};
        const auto found = names.find(text);
        return context != QByteArray("QObject") || found == names.end() ? QString() : found->second;
    }
    bool isEmpty() const override { return false; }
};

struct PlainName
{
    QByteArray text;
    LogEntry::Severity severity = LogEntry::None;
};

std::vector<PlainName> PlainNames()
{
    std::vector<PlainName> names;
    for (int i = 0; i < LogEntry::None; ++i) {
        const auto severity = static_cast<LogEntry::Severity>(i);
        names.push_back({LogSeverities::LoggedName(severity), severity});
        names.push_back({LogSeverities::NameInLog(severity).toLatin1(), severity});
    }
    return names;
}

PlainName PlainNameAt(std::vector<PlainName> const& names, QByteArray const& text)
{
    for (PlainName const& name : names) {
        if (text == name.text || text.startsWith(name.text + ' '))
            return name;
    }
    return PlainName();
}

// Of a line that begins with a stamp of so many bytes and a blank.
PlainName PlainNameIn(std::vector<PlainName> const& names, QByteArray const& line, int stampLength)
{
    const PlainName name = PlainNameAt(names, line.mid(stampLength + 1));
    if (!name.text.isEmpty() || line.mid(stampLength + 1, 1) == " ")
        return name;
    for (int at = 0; at < qMin(line.size(), 80); ++at) {
        const PlainName later = PlainNameAt(names, line.mid(at + 1));
        if (line.at(at) == ' ' && !later.text.isEmpty())
            return later;
    }
    return PlainName();
}

} // namespace

void tst_PlainLineParser::everyFormat_data()
{
    QTest::addColumn<QString>("format");
    for (char const* format : {"yyyy-MM-dd hh:mm:ss.z",
                               "yyyy-MM-dd hh:mm:ss.zzz",
                               "yyyy-MM-dd hh:mm:ss",
                               "yyyy-MM-dd hh:mm",
                               "hh:mm:ss.zzz",
                               "hh:mm:ss",
                               "h:m:s",
                               "d.M.yy h:m:s.z",
                               "yyyyMMddhhmmss",
                               "yyyyMMdd-hhmm-ss,z",
                               "hh:mm:ss dd.MM.yyyy",
                               "ddd MMM d hh:mm:ss yyyy",
                               "d MMMM yyyy hh:mm:ss",
                               "h:mm ap ss.z",
                               "h:mm:ss ap",
                               "hh:mm:ss t",
                               "ss.zzz",
                               "z",
                               "'at' s",
                               "hh'h'mm'm'ss's'z",
                               "'it is' hh:mm 'and' ss 'seconds'",
                               "mm:ss",
                               "hms",
                               "hh:mm:ss ss",
                               "hh:mm s's' s",
                               "hh:mm:ssz",
                               "h:m:sz",
                               "hh:mm z s",
                               "hh:mm s.z s",
                               "hh:mm s.z z",
                               "hh:mm z.z",
                               "hhmmsszzzs",
                               "hhssmm",
                               "ss:hh:mm",
                               "z hh:mm",
                               "h:m",
                               "hh:mm z 'ms'",
                               "hh:mm s.z 'ms'",
                               "yyyyyy-MM-dd hh:mm:ss",
                               "'a very long text before it' hh:mm:ss",
                               "dd hh:mm",
                               ""})
        QTest::newRow(format) << QString(format);
}

void tst_PlainLineParser::everyFormat()
{
    QFETCH(QString, format);
    const LogTimeReader reader(format);
    LogTimeReader::Beginning last;
    Random random;
    const int count = Rounds::count(3000, 300000);
    for (int i = 0; i < count; ++i, ++m_stamps) {
        QByteArray text = random.moment().toString(format).toLatin1();
        if (random.once(2))
            text += " Trace x";
        if (random.once(4))
            text = random.damaged(text);
        const LogTimeReader::Stamp plain = reader.Read(text.constData(), text.size());
        const LogTimeReader::Stamp stamp = reader.Read(text.constData(), text.size(), last);
        if (!IsSame(stamp, plain))
            QFAIL(qPrintable(QStringLiteral("\"%1\" is read as %2, not as %3")
                                 .arg(QString::fromLatin1(text))
                                 .arg(stamp.key)
                                 .arg(plain.key)));
    }
}

// At usual size, some milliseconds of each second.
void tst_PlainLineParser::everyStampOfADay()
{
    const LogTimeReader reader(QStringLiteral("yyyy-MM-dd hh:mm:ss.z"));
    LogTimeReader::Beginning last;
    const int step = Rounds::count(499, 1);
    for (int time = 0; time < 24 * 60 * 60 * 1000; time += step, ++m_stamps) {
        char text[32];
        const int length =
            std::snprintf(text, sizeof text, "2026-03-03 %02d:%02d:%02d.%03d", time / 3600000,
                          time / 60000 % 60, time / 1000 % 60, time % 1000);
        if (!IsSame(reader.Read(text, length, last), reader.Read(text, length)))
            QFAIL(text);
    }
}

void tst_PlainLineParser::randomFormats()
{
    Random random;
    const int count = Rounds::count(10000, 1000000);
    for (int i = 0; i < count; ++i, ++m_stamps) {
        const PlainFormat format = Format(random);
        QDateTime moment = random.moment();
        moment = moment.addMSecs(111 + 222 * random.below(4) - moment.time().msec());
        const QByteArray text = moment.toString(format.text).toLatin1();
        const LogTimeReader reader(format.text);
        const LogTimeReader::Stamp stamp = reader.Read(text.constData(), text.size());
        const QString shown = format.text + ": " + QString::fromLatin1(text);
        QVERIFY2(stamp.length == text.size(), qPrintable(shown));
        QVERIFY2(stamp.key == format.key(moment), qPrintable(shown));
        QVERIFY2(reader.hasDate() == format.hasDate(), qPrintable(shown));
        QVERIFY2(reader.resolution() == format.resolution(), qPrintable(shown));
    }
}

void tst_PlainLineParser::lines_data()
{
    QTest::addColumn<QStringList>("formats");
    QTest::addColumn<bool>("isForeign");
    QTest::newRow("default format") << QStringList() << false;
    QTest::newRow("time alone") << QStringList("hh:mm:ss") << false;
    QTest::newRow("several formats")
        << QStringList({"hh:mm:ss.zzz", "dd.MM.yyyy hh:mm", "d MMM hh:mm:ss"}) << false;
    QTest::newRow("formats that begin alike")
        << QStringList({"hh:mm:ss.zzz", "hh:mm:ss", "hh:mm 'Uhr'"}) << false;
    QTest::newRow("another program's") << QStringList() << true;
}

void tst_PlainLineParser::lines()
{
    QFETCH(QStringList, formats);
    QFETCH(bool, isForeign);
    static char const* const severities[] = {
        " Trace", " Notification", " Warning", " Error",   " Fatal", " ",
        "",       " INFO",         " Traced",  " warning:"};
    static char const* const messages[] = {
        " text", " dT:[12] text", " dT:[-5]", "  more", " dT:[] text", "", " dT:[12]x", " [12] x"};
    LogLineParser parser(formats, {"dT:", "["});
    LogFileType type;
    type.isForeign = isForeign;
    type.latest = QDate(2026, 3, 3);
    parser.SetFileType(type);
    formats.append("yyyy-MM-dd hh:mm:ss.z");
    if (isForeign)
        formats.append({"yyyy-MM-ddThh:mm:ss.zzzZ", "MMM dd hh:mm:ss", "[hh:mm:ss]"});

    LogLineParser::Beginnings last;
    Random random;
    const int count = Rounds::count(20000, 1000000);
    for (int i = 0; i < count; ++i, ++m_lines) {
        QByteArray line =
            random.moment().toString(formats.at(random.below(formats.size()))).toLatin1();
        if (random.once(10))
            line = "it goes on";
        line += severities[random.below(random.once(3) ? 10 : 5)];
        line += messages[random.below(8)];
        if (random.once(5))
            line = random.damaged(line);
        const LogLineParser::Parts plain = parser.Find(line.constData(), line.size());
        if (!IsSame(parser.Find(line.constData(), line.size(), last), plain))
            QFAIL(qPrintable("different parts: " + line));
    }
}

void tst_PlainLineParser::names_data()
{
    QTest::addColumn<bool>("isTranslated");
    QTest::newRow("in English") << false;
    QTest::newRow("in another language") << true;
}

void tst_PlainLineParser::names()
{
    QFETCH(bool, isTranslated);
    Translator translator;
    if (isTranslated)
        QCoreApplication::installTranslator(&translator);
    const std::vector<PlainName> names = PlainNames();
    const LogLineParser parser;
    Random random;
    const int count = Rounds::count(10000, 2000000);
    for (int i = 0; i < count; ++i, ++m_names) {
        QByteArray text = names[size_t(random.below(int(names.size())))].text;
        if (random.once(3))
            text = random.damaged(text);
        if (random.once(2))
            text += ' ' + names[size_t(random.below(int(names.size())))].text;
        text += QByteArray(" a text of some words").left(random.below(21));
        const QByteArray line = "2026-03-03 09:02:11.031 " + text;
        const LogLineParser::Parts parts = parser.Find(line.constData(), line.size());
        const PlainName plain = PlainNameIn(names, line, 23);
        const int messageStart = parts.timeLength + 2 + plain.text.size();
        if (parts.severity != plain.severity ||
            (parts.isEntry && parts.message != qMin(line.size(), messageStart)))
            QFAIL(qPrintable("another severity: " + line));
    }
}

void tst_PlainLineParser::cleanupTestCase()
{
    std::printf("plain line parser: %d stamps, %d lines and %d names compared\n", m_stamps, m_lines,
                m_names);
}

QTEST_GUILESS_MAIN(tst_PlainLineParser)
#include "tst_PlainLineParser.moc"
